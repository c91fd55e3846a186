// Damaged input never crashes the reader, builder, checker or dump (run under ASan/UBSan),
// and what one part accepts the next accepts too.
#include <doctest/doctest.h>

#include <random>
#include <string>

#include "tests/native/tidefiles/tidefiles_test_support.h"
#include "tools/tidefiles/folder_builder.h"
#include "tools/tidefiles/folder_check.h"
#include "tools/tidefiles/folder_dump.h"
#include "tools/tidefiles/station_json.h"

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

TEST_CASE("damaged station JSON: whatever build accepts, check accepts and dump gives back") {
  std::mt19937 random(20240601);
  const std::string alphabet = "[]{}:,\"-.0123456789eE aMNSKZ\\u";
  int built = 0;
  for (int round = 0; round < 3000; ++round) {
    std::string text = kJson;
    const int edits = 1 + static_cast<int>(random() % 4);
    for (int e = 0; e < edits && !text.empty(); ++e) {
      const std::size_t at = random() % text.size();
      switch (random() % 3) {
        case 0: text[at] = alphabet[random() % alphabet.size()]; break;
        case 1: text.erase(at, 1 + random() % 3); break;
        default: text.insert(at, 1, alphabet[random() % alphabet.size()]); break;
      }
    }
    Diagnostics d;
    const auto stations = ReadStationsJson(text, d);
    if (d.HasErrors()) continue;
    const auto image = BuildFolderImage(stations, d);
    REQUIRE(image.has_value());
    CHECK(CheckFolderImage(*image).empty());
    // Its dump builds exactly the same files again.
    Diagnostics again;
    const auto rebuilt = BuildFolderImage(ReadStationsJson(WriteStationsJson(DumpFolderImage(*image, again)), again), again);
    REQUIRE(rebuilt.has_value());
    CHECK(rebuilt->stationIndex == image->stationIndex);
    CHECK(rebuilt->coordinateIndex == image->coordinateIndex);
    CHECK(rebuilt->stationData == image->stationData);
    ++built;
  }
  CHECK(built > 100);  // the edits leave many texts valid, so the property is exercised
}

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
