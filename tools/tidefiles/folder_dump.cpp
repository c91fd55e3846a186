#include "tools/tidefiles/folder_dump.h"

#include <map>

#include "tides/engine/station_files.h"
#include "tools/tidefiles/codepage.h"
#include "tools/tidefiles/constituent_names.h"

namespace br::tidefiles {

using br::tides::ConstituentRecord;
using br::tides::StationHeader;
using br::tides::StationIndexRecord;

std::vector<StationEntry> DumpFolderImage(const FolderImage& image, Diagnostics& diagnostics) {
  std::vector<StationEntry> stations;
  std::map<std::uint32_t, std::uint32_t> offsetByKey;
  for (std::size_t at = 0; at + StationIndexRecord::kSize <= image.coordinateIndex.size(); at += StationIndexRecord::kSize) {
    const StationIndexRecord r = br::tides::DecodeStationIndexRecord(&image.coordinateIndex[at]);
    offsetByKey.emplace(br::tides::StationKey(r), r.offset);
  }
  const std::size_t count = image.stationIndex.size() / StationIndexRecord::kSize;
  const std::vector<std::uint8_t>& data = image.stationData;
  for (std::size_t i = 0; i < count; ++i) {
    const StationIndexRecord record = br::tides::DecodeStationIndexRecord(&image.stationIndex[i * StationIndexRecord::kSize]);
    const std::string where = "td_num.ntx: station " + std::to_string(i);
    const auto found = offsetByKey.find(br::tides::StationKey(record));
    if (found == offsetByKey.end()) {
      diagnostics.Error(where + ": its position is not in td_crd.ntx; left out");
      continue;
    }
    const std::uint64_t offset = found->second;
    if (offset + StationHeader::kSize > data.size()) {
      diagnostics.Error(where + ": block at offset " + std::to_string(offset) + " lies beyond td_pnt.dat; left out");
      continue;
    }
    const StationHeader header = br::tides::DecodeStationHeader(&data[offset]);
    const std::size_t records = header.constituentCount > 0 ? static_cast<std::size_t>(header.constituentCount) : 0;
    if (offset + StationHeader::kSize + records * ConstituentRecord::kSize > data.size()) {
      diagnostics.Error(where + ": block at offset " + std::to_string(offset) + " is cut short by the end of td_pnt.dat; left out");
      continue;
    }
    StationEntry entry;
    entry.index = i;
    entry.name = Windows1252ToUtf8(br::tides::StationName(header));
    entry.latitude = record.latitude / 60.0;
    entry.longitude = record.longitude / 60.0;
    entry.zone = header.zone;
    entry.tag = record.station;
    for (std::size_t k = 0; k < records; ++k) {
      const ConstituentRecord c =
          br::tides::DecodeConstituentRecord(&data[offset + StationHeader::kSize + k * ConstituentRecord::kSize]);
      if (c.number < 0 || c.number >= br::tides::kConstituentCount) {
        diagnostics.Error(where + ": constituent number " + std::to_string(c.number) + " is outside 0..68; left out");
        continue;
      }
      // A plain level: phase 0, or half a turn round a non-zero amplitude (a level below
      // chart datum). Anything else stays a constituent 0 record so it builds back the same.
      if (k == 0 && c.number == 0 && (c.phase == 0 || (c.phase == 1800 && c.amplitude > 0))) {
        entry.meanLevel = (c.phase == 0 ? 1.0 : -1.0) * c.amplitude / 1000.0;
        continue;
      }
      ConstituentEntry e;
      e.row = c.number;
      e.label = std::string(UsualConstituentName(c.number));
      e.amplitude = c.amplitude / 1000.0;
      e.phase = c.phase / 10.0;
      entry.constituents.push_back(e);
    }
    stations.push_back(std::move(entry));
  }
  return stations;
}

}  // namespace br::tidefiles
