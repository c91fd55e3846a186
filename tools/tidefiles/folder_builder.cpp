#include "tools/tidefiles/folder_builder.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <limits>
#include <map>

#include "tides/engine/station_files.h"
#include "tools/tidefiles/codepage.h"

namespace br::tidefiles {
namespace {

using br::tides::ConstituentRecord;
using br::tides::StationHeader;
using br::tides::StationIndexRecord;

std::string Position(std::int16_t latitude, std::int16_t longitude) {
  char text[48];
  std::snprintf(text, sizeof text, "%.4f, %.4f", latitude / 60.0, longitude / 60.0);
  return text;
}

std::string Metres(double value) {
  char text[48];
  std::snprintf(text, sizeof text, "%g m", value);
  return text;
}

}  // namespace

std::int16_t WholeMinutes(double degrees) {
  const double minutes = std::round(degrees * 60.0);
  return static_cast<std::int16_t>(std::clamp(minutes, -32768.0, 32767.0));
}

std::uint16_t AmplitudeField(double metres, bool& clipped) {
  const double field = std::round(metres * 1000.0);
  clipped = !(field <= 65535.0);
  if (clipped) return 65535;
  return static_cast<std::uint16_t>(std::max(field, 0.0));
}

std::uint16_t PhaseField(double degrees) {
  double d = std::fmod(degrees, 360.0);
  if (d < 0.0) d += 360.0;
  const long tenths = std::lround(d * 10.0);
  return static_cast<std::uint16_t>(tenths % 3600);
}

namespace {

// The station's name in the files' code page, with a note where it changed.
void SetName(StationHeader& header, const StationEntry& s, const std::string& where, Diagnostics& diagnostics) {
  const CodePageResult name = Utf8ToWindows1252(s.name);
  if (name.approximated) diagnostics.Note(where + ": name stored as \"" + Windows1252ToUtf8(name.text) + "\"");
  if (name.text.size() > StationHeader::kNameSize) {
    diagnostics.Note(where + ": name cut to " + std::to_string(StationHeader::kNameSize) + " bytes");
  }
  br::tides::SetStationName(header, name.text);
}

// The mean level first, then the constituents in their given order; nothing when they
// are more than the table's rows.
std::optional<std::vector<ConstituentRecord>> ConstituentRecords(const StationEntry& s, const std::string& where,
                                                                  Diagnostics& diagnostics) {
  std::vector<ConstituentRecord> records;
  ConstituentRecord level;
  bool clipped = false;
  const ConstituentEntry* levelEntry = nullptr;
  for (const ConstituentEntry& c : s.constituents) levelEntry = c.row == 0 ? &c : levelEntry;
  if (levelEntry != nullptr) {
    level.amplitude = AmplitudeField(levelEntry->amplitude, clipped);
    level.phase = PhaseField(levelEntry->phase);
  } else {
    const double meanLevel = s.meanLevel.value_or(0.0);
    level.amplitude = AmplitudeField(std::fabs(meanLevel), clipped);
    // A level that rounds to nothing is stored as +0, never as 0 turned half round.
    level.phase = meanLevel < 0.0 && level.amplitude > 0 ? 1800 : 0;
  }
  if (clipped) diagnostics.Warning(where + ": mean level does not fit in 65.535 m; clipped");
  records.push_back(level);
  for (const ConstituentEntry& c : s.constituents) {
    if (c.row == 0) continue;
    ConstituentRecord r;
    r.number = static_cast<std::int16_t>(c.row);
    r.amplitude = AmplitudeField(c.amplitude, clipped);
    if (clipped) diagnostics.Warning(where + ": " + c.label + " amplitude " + Metres(c.amplitude) + " clipped to 65.535 m");
    r.phase = PhaseField(c.phase);
    records.push_back(r);
  }
  // Each row at most once: never more than the table's 69 rows.
  if (records.size() > static_cast<std::size_t>(br::tides::kConstituentCount)) {
    diagnostics.Error(where + ": more than 69 constituent records");
    return std::nullopt;
  }
  return records;
}

// Appends header and records to "td_pnt.dat"; the offset they start at, or nothing when
// the file would pass what 32-bit offsets reach.
std::optional<std::uint32_t> AppendStationData(FolderImage& image, const StationHeader& header,
                                               const std::vector<ConstituentRecord>& records,
                                               Diagnostics& diagnostics) {
  const std::uint64_t offset = image.stationData.size();
  const std::uint64_t end = offset + StationHeader::kSize + records.size() * ConstituentRecord::kSize;
  if (end > std::numeric_limits<std::uint32_t>::max()) {
    diagnostics.Error("\"td_pnt.dat\" would pass 4 GiB: offsets are 32-bit");
    return std::nullopt;
  }
  const StationHeader::Bytes headerBytes = br::tides::EncodeStationHeader(header);
  image.stationData.insert(image.stationData.end(), headerBytes.begin(), headerBytes.end());
  for (const ConstituentRecord& r : records) {
    const ConstituentRecord::Bytes bytes = br::tides::EncodeConstituentRecord(r);
    image.stationData.insert(image.stationData.end(), bytes.begin(), bytes.end());
  }
  return static_cast<std::uint32_t>(offset);
}

// "td_num.ntx" in station order, "td_crd.ntx" the same records by position key.
void WriteIndexes(FolderImage& image, const std::vector<StationIndexRecord>& index) {
  for (const StationIndexRecord& r : index) {
    const StationIndexRecord::Bytes bytes = br::tides::EncodeStationIndexRecord(r);
    image.stationIndex.insert(image.stationIndex.end(), bytes.begin(), bytes.end());
  }
  std::vector<StationIndexRecord> sorted = index;
  std::stable_sort(sorted.begin(), sorted.end(), [](const StationIndexRecord& a, const StationIndexRecord& b) {
    return br::tides::StationKey(a) < br::tides::StationKey(b);
  });
  for (const StationIndexRecord& r : sorted) {
    const StationIndexRecord::Bytes bytes = br::tides::EncodeStationIndexRecord(r);
    image.coordinateIndex.insert(image.coordinateIndex.end(), bytes.begin(), bytes.end());
  }
}

}  // namespace

std::optional<FolderImage> BuildFolderImage(const std::vector<StationEntry>& stations, Diagnostics& diagnostics) {
  FolderImage image;
  std::vector<StationIndexRecord> index;
  std::map<std::uint32_t, std::size_t> seen;  // key -> input index of the station kept

  for (const StationEntry& s : stations) {
    const std::string where = DescribeStation(s.index, s.name);
    StationHeader header;
    header.latitude = WholeMinutes(s.latitude);
    header.longitude = WholeMinutes(s.longitude);
    const std::uint32_t key = br::tides::StationKey(header.latitude, header.longitude);
    if (const auto earlier = seen.find(key); earlier != seen.end()) {
      diagnostics.Warning(where + ": same whole-minute position (" + Position(header.latitude, header.longitude) +
                          ") as station " + std::to_string(earlier->second) + "; dropped");
      continue;
    }
    if (index.size() >= static_cast<std::size_t>(br::tides::kMaxStationCount)) {
      diagnostics.Error("more than " + std::to_string(br::tides::kMaxStationCount) +
                        " stations: a station folder holds at most that many");
      return std::nullopt;
    }
    SetName(header, s, where, diagnostics);
    header.zone = static_cast<std::int8_t>(std::clamp(s.zone, -128, 127));

    const auto records = ConstituentRecords(s, where, diagnostics);
    if (!records) return std::nullopt;
    header.constituentCount = static_cast<std::int8_t>(records->size());
    const auto offset = AppendStationData(image, header, *records, diagnostics);
    if (!offset) return std::nullopt;

    StationIndexRecord record;
    record.station = s.tag;
    record.latitude = header.latitude;
    record.longitude = header.longitude;
    record.offset = *offset;
    index.push_back(record);
    seen.emplace(key, s.index);
  }
  WriteIndexes(image, index);
  return image;
}

}  // namespace br::tidefiles
