// Validation of a station folder held whole in memory: everything the engine relies on
// when it opens the folder, searches it and loads a station, and what readers of its
// texts rely on. Tools check a folder with it before they trust a single number of it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace br::tides {

// The three files of a station folder.
struct StationFolderBytes {
  std::vector<std::uint8_t> stationIndex;     // "td_num.ntx"
  std::vector<std::uint8_t> coordinateIndex;  // "td_crd.ntx"
  std::vector<std::uint8_t> stationData;      // "td_pnt.dat"
};

// One line per problem, "<file>: station <n>: <what is wrong>" (station numbers are the
// "td_num.ntx" order; records of "td_crd.ntx" that match no station are named by record).
// Empty when the folder is sound.
std::vector<std::string> CheckStationFolder(const StationFolderBytes& folder);

// The station number a problem line names ("td_pnt.dat: station 12: ..." gives 12), or -1
// for a problem of the folder as a whole.
long ProblemStation(const std::string& problem);

// A whole-minute position as the check's lines give it: "48°23'N 004°30'W" (UTF-8).
std::string WholeMinutePositionText(int latitudeMinutes, int longitudeMinutes);

}  // namespace br::tides
