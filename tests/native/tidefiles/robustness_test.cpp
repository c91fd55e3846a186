// Damaged folders never crash the checker or the dump (run under ASan/UBSan), and a folder
// the check passes dumps whole. Damaged JSON is the tidefiles_json fuzz harness's.
#include <doctest/doctest.h>

#include <random>
#include <string>

#include "tests/native/tidefiles/tidefiles_test_support.h"
#include "tools/tidefiles/folder_check.h"
#include "tools/tidefiles/folder_dump.h"

using namespace br::tidefiles;
using namespace br::tidefiles::test;

namespace {

const char kJson[] = R"([
  {"name": "Ålesund", "latitude": 62.47, "longitude": 6.15, "zone": -1, "mean_level": 1.2,
   "constituents": [{"name": "M2", "amplitude": 0.8, "phase": 300}, {"name": "2MK3", "amplitude": 0.004, "phase": 12}]},
  {"name": "South", "latitude": -33.86, "longitude": 151.21, "zone": -10, "mean_level": -0.05,
   "constituents": [{"number": 15, "amplitude": 0.3, "phase": 359.99}, {"name": "S2", "amplitude": 0.1, "phase": 1}]},
  {"name": "West", "latitude": 10, "longitude": -120, "zone": 8, "constituents": []}])";

}  // namespace

TEST_CASE("damaged station folders: check and dump survive, and a folder check passes dumps whole") {
  const FolderImage sound = BuildFromJson(kJson);
  std::mt19937 random(19960101);
  int passed = 0;
  for (int round = 0; round < 3000; ++round) {
    FolderImage image = sound;
    std::vector<std::uint8_t>* files[] = {&image.stationIndex, &image.coordinateIndex, &image.stationData};
    std::vector<std::uint8_t>& file = *files[random() % 3];
    switch (random() % 4) {
      case 0: file.resize(random() % (file.size() + 1)); break;
      case 1: file.resize(file.size() + random() % 12, static_cast<std::uint8_t>(random())); break;
      default:
        for (int e = 0; e < 3 && !file.empty(); ++e) file[random() % file.size()] = static_cast<std::uint8_t>(random());
        break;
    }
    const auto problems = CheckFolderImage(image);
    Diagnostics d;
    const auto stations = DumpFolderImage(image, d);
    if (problems.empty()) {
      ++passed;
      CHECK_FALSE(d.HasErrors());
      CHECK(stations.size() == image.stationIndex.size() / 10);
    }
  }
  CHECK(passed > 100);  // byte changes in names and amplitudes keep a folder sound
}
