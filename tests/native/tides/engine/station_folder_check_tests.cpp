// Every check rule detects a made-up fault in an otherwise sound folder. (Sound folders
// passing: the world-set check and the tidefiles_json fuzz harness.)
#include <doctest/doctest.h>

#include <algorithm>
#include <functional>
#include <string>

#include "tests/common/station_writer.h"
#include "tides/engine/station_folder_check.h"

using namespace br::tides;
using namespace br::tides::testing;

namespace {

using Change = std::function<void(StationIndexRecord&)>;

// Rewrites one index record through change.
void Patch(std::vector<std::uint8_t>& file, std::size_t record, const Change& change) {
  auto r = DecodeStationIndexRecord(&file[record * 10]);
  change(r);
  const auto bytes = EncodeStationIndexRecord(r);
  std::copy(bytes.begin(), bytes.end(), file.begin() + static_cast<std::ptrdiff_t>(record * 10));
}

// Station A's block starts at 0: name at 0, position at 40 and 42, zone 44, count 45,
// records at 46, 52, 58.
void PutI16(StationFolderBytes& image, std::size_t at, int value) {
  PutU16(&image.stationData[at], static_cast<std::uint16_t>(value));
}

// Three stations; td_crd.ntx order: B (0,0), A (60,60), C (-630,-315).
StationFolderBytes SoundFolder() {
  return StationFolderImage({{"A", 60, 60, 0, {{0, 0, 1000}, {29, 100, 1000}, {36, 200, 300}}},
                             {"B", 0, 0, 0, {{0, 0, 2000}}},
                             {"C", -630, -315, 0, {{0, 0, 3000}, {15, 300, 200}}}});
}

}  // namespace

TEST_CASE("each fault gives its own clear line, naming its station") {
  REQUIRE(CheckStationFolder(SoundFolder()).empty());
  const Change moveTo60 = [](StationIndexRecord& r) { r.latitude = 60, r.longitude = 60; };
  const struct {
    std::function<void(StationFolderBytes&)> make;
    const char* expected;
  } faults[] = {
      {[](StationFolderBytes& f) { f.stationIndex.resize(f.stationIndex.size() + 3); },
       "td_num.ntx: length 33 bytes is not a whole number of 10-byte records (3 bytes left over)"},
      {[](StationFolderBytes& f) { f.coordinateIndex.resize(20); }, "td_crd.ntx: holds 2 records but td_num.ntx holds 3"},
      {[](StationFolderBytes& f) { std::swap_ranges(&f.coordinateIndex[0], &f.coordinateIndex[10], &f.coordinateIndex[10]); },
       "td_crd.ntx: record 1: key 0 follows 3932220: not sorted by ascending StationKey"},
      {[&](StationFolderBytes& f) { Patch(f.stationIndex, 1, moveTo60), Patch(f.coordinateIndex, 0, moveTo60); },
       "td_num.ntx: station 1: duplicate key: same position (01\xC2\xB0" "00'N 001\xC2\xB0" "00'E) as station 0"},
      {[](StationFolderBytes& f) { Patch(f.coordinateIndex, 1, [](StationIndexRecord& r) { r.offset += 6; }); },
       "td_crd.ntx: station 0: record 1 differs from the td_num.ntx copy (offset 6 vs 0"},
      {[](StationFolderBytes& f) { f.stationData.resize(f.stationData.size() - 1); },
       "td_pnt.dat: station 2: block of 58 bytes at offset 116 runs past the end of the file (173 bytes)"},
      {[](StationFolderBytes& f) { f.stationData[45] = 70; }, "td_pnt.dat: station 0: constituent count 70 is outside 0..69"},
      {[](StationFolderBytes& f) { f.stationData[45] = 0xFF; }, "td_pnt.dat: station 0: constituent count -1 is outside 0..69"},
      {[](StationFolderBytes& f) { PutI16(f, 52, 69); }, "td_pnt.dat: station 0: constituent record 1: number 69 is outside 0..68"},
      {[](StationFolderBytes& f) { PutI16(f, 46, 29); },
       "td_pnt.dat: station 0: constituent record 0: is constituent 29; the first record must be the mean level (0)"},
      {[](StationFolderBytes& f) { PutI16(f, 54, 0xFFFF); },
       "td_pnt.dat: station 0: constituent record 1: phase 65535 is outside 0..3599 tenths of a degree"},
      {[](StationFolderBytes& f) { PutI16(f, 40, 61); },
       "td_pnt.dat: station 0: header position (01\xC2\xB0" "01'N 001\xC2\xB0" "00'E) differs from its index record (01\xC2\xB0" "00'N 001\xC2\xB0" "00'E)"},
      {[](StationFolderBytes& f) { PutI16(f, 40, 0x7FFF); },
       "td_pnt.dat: station 0: header latitude 32767' is outside -5400..5400 minutes (90 degrees)"},
      {[](StationFolderBytes& f) { f.stationData[44] = 127; },
       "td_pnt.dat: station 0: zone description 127 is outside -14..12 hours (UTC+14 to UTC-12)"},
      {[](StationFolderBytes& f) { f.stationData[44] = 13; }, "td_pnt.dat: station 0: zone description 13 is outside"},
      {[](StationFolderBytes& f) { f.stationData[1] = 0x1B; },
       "td_pnt.dat: station 0: name holds the control character ESC at byte 1"},
      {[](StationFolderBytes& f) { f.stationData[0] = 0x9D; }, "td_pnt.dat: station 0: name holds the undefined byte 0x9D at byte 0"},
  };
  for (const auto& fault : faults) {
    StationFolderBytes image = SoundFolder();
    fault.make(image);
    std::string problems;
    for (const std::string& p : CheckStationFolder(image)) problems += p + "\n";
    CHECK_MESSAGE(problems.find(fault.expected) != std::string::npos, fault.expected, "\n", problems);
  }
  // Zones of the real world's ends pass: UTC+14 and UTC-12.
  for (int zone : {-14, 12}) {
    StationFolderBytes image = SoundFolder();
    image.stationData[44] = static_cast<std::uint8_t>(zone);
    CHECK(CheckStationFolder(image).empty());
  }
}

TEST_CASE("a problem line names its station, or the folder as a whole") {
  CHECK(ProblemStation("td_pnt.dat: station 12: zone description 127 is outside -14..12 hours") == 12);
  CHECK(ProblemStation("td_crd.ntx: station 0: no record for its position") == 0);
  CHECK(ProblemStation("td_crd.ntx: record 1: key 0 follows 3932220") == -1);
  CHECK(ProblemStation("td_num.ntx: length 33 bytes is not a whole number of 10-byte records") == -1);
  CHECK(ProblemStation("x: station : y") == -1);
}
