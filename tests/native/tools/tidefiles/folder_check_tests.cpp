// Every check rule detects a made-up fault in an otherwise sound folder. (Sound folders
// passing: the world-set check and the tidefiles_json fuzz harness.)
#include <doctest/doctest.h>

#include <algorithm>
#include <functional>
#include <string>

#include "tests/native/tools/tidefiles/tidefiles_test_support.h"
#include "tools/tidefiles/folder_check.h"

using namespace br::tidefiles;
using namespace br::tidefiles::test;
namespace bt = br::tides;

namespace {

using Change = std::function<void(bt::StationIndexRecord&)>;

// Rewrites one index record through change.
void Patch(std::vector<std::uint8_t>& file, std::size_t record, const Change& change) {
  auto r = bt::DecodeStationIndexRecord(&file[record * 10]);
  change(r);
  const auto bytes = bt::EncodeStationIndexRecord(r);
  std::copy(bytes.begin(), bytes.end(), file.begin() + static_cast<std::ptrdiff_t>(record * 10));
}

// Station A's block starts at 0: header at 0, records at 46, 52, 58.
void PutI16(FolderImage& image, std::size_t at, int value) {
  bt::PutU16(&image.stationData[at], static_cast<std::uint16_t>(value));
}

}  // namespace

TEST_CASE("each fault gives its own clear line") {
  const Change moveTo60 = [](bt::StationIndexRecord& r) { r.latitude = 60, r.longitude = 60; };
  const struct {
    std::function<void(FolderImage&)> make;
    const char* expected;
  } faults[] = {
      {[](FolderImage& f) { f.stationIndex.resize(f.stationIndex.size() + 3); },
       "td_num.ntx: length 33 bytes is not a whole number of 10-byte records (3 bytes left over)"},
      {[](FolderImage& f) { f.coordinateIndex.resize(20); }, "td_crd.ntx: holds 2 records but td_num.ntx holds 3"},
      {[](FolderImage& f) { std::swap_ranges(&f.coordinateIndex[0], &f.coordinateIndex[10], &f.coordinateIndex[10]); },
       "td_crd.ntx: record 1: key 0 follows 3932220: not sorted by ascending StationKey"},
      {[&](FolderImage& f) { Patch(f.stationIndex, 1, moveTo60), Patch(f.coordinateIndex, 0, moveTo60); },
       "td_num.ntx: station 1: duplicate key: same position (latitude 60', longitude 60') as station 0"},
      {[](FolderImage& f) { Patch(f.coordinateIndex, 1, [](bt::StationIndexRecord& r) { r.offset += 6; }); },
       "td_crd.ntx: station 0: record 1 differs from the td_num.ntx copy (offset 6 vs 0"},
      {[](FolderImage& f) { f.stationData.resize(f.stationData.size() - 1); },
       "td_pnt.dat: station 2: block of 58 bytes at offset 116 runs past the end of the file (173 bytes)"},
      {[](FolderImage& f) { f.stationData[45] = 70; }, "td_pnt.dat: station 0: constituent count 70 is outside 0..69"},
      {[](FolderImage& f) { PutI16(f, 52, 69); }, "td_pnt.dat: station 0: constituent record 1: number 69 is outside 0..68"},
      {[](FolderImage& f) { PutI16(f, 46, 29); },
       "td_pnt.dat: station 0: constituent record 0: is constituent 29; the first record must be the mean level (0)"},
      {[](FolderImage& f) { PutI16(f, 54, 3600); },
       "td_pnt.dat: station 0: constituent record 1: phase 3600 is outside 0..3599 tenths of a degree"},
      {[](FolderImage& f) { PutI16(f, 40, 61); },
       "td_pnt.dat: station 0: header position (latitude 61', longitude 60') differs from its index record"},
      {[](FolderImage& f) { f.stationData[44] = 20; }, "td_pnt.dat: station 0: zone description 20 is outside -14..14 hours"},
  };
  for (const auto& fault : faults) {
    // Three stations; td_crd.ntx order: B (0,0), A (60,60), C (-630,-315).
    FolderImage image = BuildFromJson(R"([{"name": "A", "latitude": 1, "longitude": 1, "zone": 0, "mean_level": 1,
      "constituents": [{"name": "M2", "amplitude": 1, "phase": 10}, {"name": "S2", "amplitude": 0.3, "phase": 20}]},
      {"name": "B", "latitude": 0, "longitude": 0, "zone": 0, "mean_level": 2, "constituents": []}, {"name": "C",
      "latitude": -10.5, "longitude": -5.25, "zone": 0, "mean_level": 3, "constituents": [{"name": "K1", "amplitude": 0.2, "phase": 30}]}])");
    fault.make(image);
    std::string problems;
    for (const std::string& p : CheckFolderImage(image)) problems += p + "\n";
    CHECK_MESSAGE(problems.find(fault.expected) != std::string::npos, fault.expected, "\n", problems);
  }
}
