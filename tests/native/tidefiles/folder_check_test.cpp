// Every check rule detects a made-up fault in an otherwise sound folder.
#include <doctest/doctest.h>

#include <functional>
#include <string>

#include "tests/native/tidefiles/tidefiles_test_support.h"
#include "tools/tidefiles/folder_check.h"

using namespace br::tidefiles;
using namespace br::tidefiles::test;
namespace bt = br::tides;

namespace {

// Three stations; td_crd.ntx order: B (0,0), A (60,60), C (-630,-315).
FolderImage SoundFolder() {
  return BuildFromJson(R"([
    {"name": "A", "latitude": 1, "longitude": 1, "zone": 0, "mean_level": 1,
     "constituents": [{"name": "M2", "amplitude": 1, "phase": 10}, {"name": "S2", "amplitude": 0.3, "phase": 20}]},
    {"name": "B", "latitude": 0, "longitude": 0, "zone": 0, "mean_level": 2, "constituents": []},
    {"name": "C", "latitude": -10.5, "longitude": -5.25, "zone": 0, "mean_level": 3,
     "constituents": [{"name": "K1", "amplitude": 0.2, "phase": 30}]}])");
}

void SetIndex(std::vector<std::uint8_t>& file, std::size_t record, const bt::StationIndexRecord& r) {
  const auto bytes = bt::EncodeStationIndexRecord(r);
  std::copy(bytes.begin(), bytes.end(), file.begin() + static_cast<std::ptrdiff_t>(record * 10));
}

bt::StationIndexRecord IndexAt(const std::vector<std::uint8_t>& file, std::size_t record) {
  return bt::DecodeStationIndexRecord(&file[record * 10]);
}

// Rewrites one index record through change.
void Patch(std::vector<std::uint8_t>& file, std::size_t record, const std::function<void(bt::StationIndexRecord&)>& change) {
  auto r = IndexAt(file, record);
  change(r);
  SetIndex(file, record, r);
}

void MoveTo60(bt::StationIndexRecord& r) { r.latitude = 60, r.longitude = 60; }
void MoveSouth(bt::StationIndexRecord& r) { r.latitude = -631; }

// Station A's block starts at 0: header at 0, records at 46, 52, 58.
void PutI16(FolderImage& image, std::size_t at, int value) {
  bt::PutU16(&image.stationData[at], static_cast<std::uint16_t>(value));
}

std::string Problems(const FolderImage& image) {
  std::string all;
  for (const std::string& p : CheckFolderImage(image)) all += p + "\n";
  return all;
}

struct Fault {
  const char* what;
  std::function<void(FolderImage&)> make;
  const char* expected;
};

}  // namespace

TEST_CASE("a sound folder has no problems") { CHECK(Problems(SoundFolder()).empty()); }

TEST_CASE("each fault gives its own clear line") {
  const Fault faults[] = {
      {"td_num.ntx with a partial record", [](FolderImage& f) { f.stationIndex.resize(f.stationIndex.size() + 3); },
       "td_num.ntx: length 33 bytes is not a whole number of 10-byte records (3 bytes left over)"},
      {"td_crd.ntx with a partial record", [](FolderImage& f) { f.coordinateIndex.resize(25); },
       "td_crd.ntx: length 25 bytes is not a whole number of 10-byte records"},
      {"index files of different counts", [](FolderImage& f) { f.coordinateIndex.resize(20); },
       "td_crd.ntx: holds 2 records but td_num.ntx holds 3"},
      {"td_crd.ntx out of order",
       [](FolderImage& f) {
         const auto a = IndexAt(f.coordinateIndex, 0), b = IndexAt(f.coordinateIndex, 1);
         SetIndex(f.coordinateIndex, 0, b);
         SetIndex(f.coordinateIndex, 1, a);
       },
       "td_crd.ntx: record 1: key 0 follows 3932220: not sorted by ascending StationKey"},
      {"duplicate key in both indexes",
       [](FolderImage& f) { Patch(f.stationIndex, 1, MoveTo60), Patch(f.coordinateIndex, 0, MoveTo60); },
       "td_num.ntx: station 1: duplicate key: same position (latitude 60', longitude 60') as station 0"},
      {"duplicate key in td_crd.ntx", [](FolderImage& f) { Patch(f.coordinateIndex, 0, MoveTo60); },
       "td_crd.ntx: record 1: duplicate key: same position (latitude 60', longitude 60') as record 0"},
      {"index copies with different offsets",
       [](FolderImage& f) { Patch(f.coordinateIndex, 1, [](bt::StationIndexRecord& r) { r.offset += 6; }); },
       "td_crd.ntx: station 0: record 1 differs from the td_num.ntx copy (offset 6 vs 0"},
      {"a station missing from td_crd.ntx", [](FolderImage& f) { Patch(f.coordinateIndex, 2, MoveSouth); },
       "td_crd.ntx: station 2: no record for its position (latitude -630', longitude -315')"},
      {"a td_crd.ntx record of no station", [](FolderImage& f) { Patch(f.coordinateIndex, 2, MoveSouth); },
       "td_crd.ntx: record 2: position (latitude -631', longitude -315') belongs to no station of td_num.ntx"},
      {"an offset beyond td_pnt.dat",
       [](FolderImage& f) {
         for (auto* file : {&f.stationIndex, &f.coordinateIndex})
           for (std::size_t k = 0; k < 3; ++k)
             Patch(*file, k, [](bt::StationIndexRecord& r) { r.offset = r.latitude == 0 ? 100000 : r.offset; });
       },
       "td_pnt.dat: station 1: block offset 100000 leaves no room for the 46-byte header (file has 174 bytes)"},
      {"td_pnt.dat cut short", [](FolderImage& f) { f.stationData.resize(f.stationData.size() - 1); },
       "td_pnt.dat: station 2: block of 58 bytes at offset 116 runs past the end of the file (173 bytes)"},
      {"a constituent count above 69", [](FolderImage& f) { f.stationData[45] = 70; },
       "td_pnt.dat: station 0: constituent count 70 is outside 0..69"},
      {"a negative constituent count", [](FolderImage& f) { f.stationData[45] = 0xFF; },
       "td_pnt.dat: station 0: constituent count -1 is outside 0..69"},
      {"a constituent number above 68", [](FolderImage& f) { PutI16(f, 52, 69); },
       "td_pnt.dat: station 0: constituent record 1: number 69 is outside 0..68"},
      {"a negative constituent number", [](FolderImage& f) { PutI16(f, 58, -1); },
       "td_pnt.dat: station 0: constituent record 2: number -1 is outside 0..68"},
      {"a first record that is not the mean level", [](FolderImage& f) { PutI16(f, 46, 29); },
       "td_pnt.dat: station 0: constituent record 0: is constituent 29; the first record must be the mean level (0)"},
      {"a phase of a full turn", [](FolderImage& f) { PutI16(f, 54, 3600); },
       "td_pnt.dat: station 0: constituent record 1: phase 3600 is outside 0..3599 tenths of a degree"},
      {"a header position unlike the index", [](FolderImage& f) { PutI16(f, 40, 61); },
       "td_pnt.dat: station 0: header position (latitude 61', longitude 60') differs from its index record"},
      {"a zone description out of range", [](FolderImage& f) { f.stationData[44] = 20; },
       "td_pnt.dat: station 0: zone description 20 is outside -14..14 hours"},
      {"a latitude beyond the pole",
       [](FolderImage& f) { Patch(f.stationIndex, 1, [](bt::StationIndexRecord& r) { r.latitude = 5401; }); },
       "td_num.ntx: station 1: latitude 5401' is outside -5400..5400 minutes"},
      {"a longitude beyond the date line",
       [](FolderImage& f) { Patch(f.stationIndex, 1, [](bt::StationIndexRecord& r) { r.longitude = -10801; }); },
       "td_num.ntx: station 1: longitude -10801' is outside -10800..10800 minutes"},
  };
  for (const Fault& fault : faults) {
    FolderImage image = SoundFolder();
    fault.make(image);
    const std::string problems = Problems(image);
    CHECK_MESSAGE(problems.find(fault.expected) != std::string::npos, fault.what, "\n", problems);
  }
}

TEST_CASE("more than 32767 records is a problem") {
  FolderImage image;
  image.stationIndex.assign(32768u * 10u, 0);
  image.coordinateIndex = image.stationIndex;
  CHECK(Problems(image).find("td_num.ntx: 32768 stations; a folder holds at most 32767") != std::string::npos);
}
