#include "tides/engine/station_folder_check.h"

#include <cstdio>
#include <cstdlib>
#include <map>

#include "tides/engine/station_files.h"

namespace br::tides {
namespace {

// Names of the bytes below 32 that a terminal acts on, for the message.
std::string ControlName(unsigned char c) {
  switch (c) {
    case 7: return "BEL";
    case 8: return "BS";
    case 9: return "TAB";
    case 10: return "LF";
    case 13: return "CR";
    case 27: return "ESC";
    case 127: return "DEL";
    default: {
      char text[8];
      std::snprintf(text, sizeof text, "0x%02X", c);
      return text;
    }
  }
}

std::string Angle(int minutes, int degreeDigits, const char* hemispheres) {
  const int size = minutes < 0 ? -minutes : minutes;
  char text[32];
  std::snprintf(text, sizeof text, "%0*d\xC2\xB0%02d'%c", degreeDigits, size / 60, size % 60,
                minutes < 0 ? hemispheres[1] : hemispheres[0]);
  return text;
}

// "01°00'N 001°00'E" (UTF-8).
std::string Position(const StationIndexRecord& r) {
  return WholeMinutePositionText(r.latitude, r.longitude);
}

std::vector<StationIndexRecord> Records(const std::vector<std::uint8_t>& bytes) {
  std::vector<StationIndexRecord> records;
  for (std::size_t at = 0; at + StationIndexRecord::kSize <= bytes.size(); at += StationIndexRecord::kSize)
    records.push_back(DecodeStationIndexRecord(&bytes[at]));
  return records;
}

bool SameRecord(const StationIndexRecord& a, const StationIndexRecord& b) {
  return a.station == b.station && a.latitude == b.latitude && a.longitude == b.longitude && a.offset == b.offset;
}

class FolderChecker {
 public:
  explicit FolderChecker(const StationFolderBytes& image)
      : image_(image), stations_(Records(image.stationIndex)), sorted_(Records(image.coordinateIndex)) {}

  std::vector<std::string> Run() {
    CheckLengths();
    CheckStationIndex();
    CheckCoordinateIndex();
    CheckCopiesAgree();
    for (std::size_t i = 0; i < stations_.size(); ++i) CheckBlock(i);
    return problems_;
  }

 private:
  void Problem(const std::string& text) { problems_.push_back(text); }

  void CheckLengths() {
    const char* names[] = {kStationIndexFileName, kCoordinateIndexFileName};
    const std::vector<std::uint8_t>* files[] = {&image_.stationIndex, &image_.coordinateIndex};
    for (int f = 0; f < 2; ++f) {
      const std::size_t size = files[f]->size();
      if (size % StationIndexRecord::kSize != 0) {
        Problem(std::string(names[f]) + ": length " + std::to_string(size) +
                " bytes is not a whole number of 10-byte records (" + std::to_string(size % StationIndexRecord::kSize) +
                " bytes left over)");
      }
    }
    if (stations_.size() != sorted_.size()) {
      Problem(std::string("td_crd.ntx: holds ") + std::to_string(sorted_.size()) + " records but td_num.ntx holds " +
              std::to_string(stations_.size()) + "; both index files must hold the same stations");
    }
    if (stations_.size() > static_cast<std::size_t>(kMaxStationCount)) {
      Problem("td_num.ntx: " + std::to_string(stations_.size()) + " stations; a folder holds at most " +
              std::to_string(kMaxStationCount));
    }
  }

  void CheckStationIndex() {
    std::map<std::uint32_t, std::size_t> first;
    for (std::size_t i = 0; i < stations_.size(); ++i) {
      const StationIndexRecord& r = stations_[i];
      const std::string where = "td_num.ntx: station " + std::to_string(i) + ": ";
      if (!LatitudeIsPossible(r.latitude))
        Problem(where + "latitude " + std::to_string(r.latitude) + "' is outside -5400..5400 minutes (90 degrees)");
      if (!LongitudeIsPossible(r.longitude))
        Problem(where + "longitude " + std::to_string(r.longitude) + "' is outside -10800..10800 minutes (180 degrees)");
      const auto [it, added] = first.emplace(StationKey(r), i);
      if (!added)
        Problem(where + "duplicate key: same position (" + Position(r) + ") as station " + std::to_string(it->second));
    }
  }

  void CheckCoordinateIndex() {
    for (std::size_t k = 1; k < sorted_.size(); ++k) {
      const std::uint32_t before = StationKey(sorted_[k - 1]);
      const std::uint32_t key = StationKey(sorted_[k]);
      const std::string where = "td_crd.ntx: record " + std::to_string(k) + ": ";
      if (key < before) {
        Problem(where + "key " + std::to_string(key) + " follows " + std::to_string(before) +
                ": not sorted by ascending StationKey");
      } else if (key == before) {
        Problem(where + "duplicate key: same position (" + Position(sorted_[k]) + ") as record " + std::to_string(k - 1));
      }
    }
  }

  void CheckCopiesAgree() {
    std::map<std::uint32_t, std::size_t> sortedByKey;
    for (std::size_t k = 0; k < sorted_.size(); ++k) sortedByKey.emplace(StationKey(sorted_[k]), k);
    std::map<std::uint32_t, std::size_t> stationByKey;
    for (std::size_t i = 0; i < stations_.size(); ++i) {
      const StationIndexRecord& r = stations_[i];
      stationByKey.emplace(StationKey(r), i);
      const auto found = sortedByKey.find(StationKey(r));
      const std::string where = "td_crd.ntx: station " + std::to_string(i) + ": ";
      if (found == sortedByKey.end()) {
        Problem(where + "no record for its position (" + Position(r) + "); the search cannot find it");
        continue;
      }
      const StationIndexRecord& copy = sorted_[found->second];
      if (!SameRecord(r, copy)) {
        Problem(where + "record " + std::to_string(found->second) + " differs from the td_num.ntx copy (offset " +
                std::to_string(copy.offset) + " vs " + std::to_string(r.offset) + ", field " +
                std::to_string(copy.station) + " vs " + std::to_string(r.station) + ")");
      }
    }
    for (std::size_t k = 0; k < sorted_.size(); ++k) {
      if (stationByKey.count(StationKey(sorted_[k])) == 0)
        Problem("td_crd.ntx: record " + std::to_string(k) + ": position (" + Position(sorted_[k]) +
                ") belongs to no station of td_num.ntx");
    }
    sortedByKey_ = std::move(sortedByKey);
  }

  // The block as the engine reads it: at the offset of the station's td_crd.ntx record.
  void CheckBlock(std::size_t i) {
    const auto found = sortedByKey_.find(StationKey(stations_[i]));
    if (found == sortedByKey_.end()) return;  // reported above
    const StationIndexRecord& r = sorted_[found->second];
    const std::string where = "td_pnt.dat: station " + std::to_string(i) + ": ";
    const std::vector<std::uint8_t>& data = image_.stationData;
    const std::uint64_t offset = r.offset;
    if (offset + StationHeader::kSize > data.size()) {
      Problem(where + "block offset " + std::to_string(offset) + " leaves no room for the 46-byte header (file has " +
              std::to_string(data.size()) + " bytes)");
      return;
    }
    const StationHeader header = DecodeStationHeader(&data[offset]);
    if (header.latitude != r.latitude || header.longitude != r.longitude) {
      const StationIndexRecord stated{0, header.latitude, header.longitude, 0};
      Problem(where + "header position (" + Position(stated) + ") differs from its index record (" + Position(r) + ")");
    }
    if (!LatitudeIsPossible(header.latitude))
      Problem(where + "header latitude " + std::to_string(header.latitude) + "' is outside -5400..5400 minutes (90 degrees)");
    if (!LongitudeIsPossible(header.longitude))
      Problem(where + "header longitude " + std::to_string(header.longitude) +
              "' is outside -10800..10800 minutes (180 degrees)");
    if (!ZoneIsPossible(header.zone))
      Problem(where + "zone description " + std::to_string(header.zone) + " is outside " + std::to_string(kMinZone) +
              ".." + std::to_string(kMaxZone) + " hours (UTC+14 to UTC-12)");
    CheckName(where, header);
    const int count = header.constituentCount;
    if (count < 0 || count > kConstituentCount) {
      Problem(where + "constituent count " + std::to_string(count) + " is outside 0..69");
      if (count < 0) return;
    }
    const std::uint64_t length = StationHeader::kSize + static_cast<std::uint64_t>(count) * ConstituentRecord::kSize;
    if (offset + length > data.size()) {
      Problem(where + "block of " + std::to_string(length) + " bytes at offset " + std::to_string(offset) +
              " runs past the end of the file (" + std::to_string(data.size()) + " bytes)");
      return;
    }
    for (int k = 0; k < count; ++k) {
      const ConstituentRecord c =
          DecodeConstituentRecord(&data[offset + StationHeader::kSize + static_cast<std::uint64_t>(k) * ConstituentRecord::kSize]);
      const std::string record = where + "constituent record " + std::to_string(k) + ": ";
      if (c.number < 0 || c.number >= kConstituentCount) {
        Problem(record + "number " + std::to_string(c.number) + " is outside 0..68");
      } else if (k == 0 && c.number != 0) {
        Problem(record + "is constituent " + std::to_string(c.number) + "; the first record must be the mean level (0)");
      }
      if (c.phase > 3599) Problem(record + "phase " + std::to_string(c.phase) + " is outside 0..3599 tenths of a degree");
    }
  }

  // Names are printed by every tool: a control character in one would drive the terminal.
  void CheckName(const std::string& where, const StationHeader& header) {
    const std::string name = StationName(header);
    for (std::size_t k = 0; k < name.size(); ++k) {
      const auto c = static_cast<unsigned char>(name[k]);
      if (c < 0x20 || c == 0x7F) {
        Problem(where + "name holds the control character " + ControlName(c) + " at byte " + std::to_string(k));
        return;
      }
      // Windows-1252 leaves these undefined; read as Unicode they are 8-bit controls.
      if (c == 0x81 || c == 0x8D || c == 0x8F || c == 0x90 || c == 0x9D) {
        Problem(where + "name holds the undefined byte " + ControlName(c) + " at byte " + std::to_string(k));
        return;
      }
    }
  }

  const StationFolderBytes& image_;
  std::vector<StationIndexRecord> stations_;
  std::vector<StationIndexRecord> sorted_;
  std::map<std::uint32_t, std::size_t> sortedByKey_;
  std::vector<std::string> problems_;
};

}  // namespace

std::vector<std::string> CheckStationFolder(const StationFolderBytes& folder) { return FolderChecker(folder).Run(); }

std::string WholeMinutePositionText(int latitudeMinutes, int longitudeMinutes) {
  return Angle(latitudeMinutes, 2, "NS") + " " + Angle(longitudeMinutes, 3, "EW");
}

long ProblemStation(const std::string& problem) {
  static const char kMark[] = ": station ";
  const std::size_t at = problem.find(kMark);
  if (at == std::string::npos) return -1;
  const char* digits = problem.c_str() + at + sizeof kMark - 1;
  char* end = nullptr;
  const long number = std::strtol(digits, &end, 10);
  return end != digits && *end == ':' ? number : -1;
}

}  // namespace br::tides
