// Opening, separators, missing files, the 241-character path, positions and names: the Wine
// database suites. Arbitrary folders, record images and loaded values: the station_files fuzz harness.
#include <doctest/doctest.h>

#include "tests/common/station_writer.h"
#include "tides/engine/prediction.h"
#include "tides/engine/TideEngine.h"

using namespace br::tides;
using namespace br::tides::testing;
namespace fs = std::filesystem;

TEST_CASE("index files of odd or short lengths") {
  Closer closer;
  TempFolder tmp;
  WriteStationFolder(tmp.path(), {Station(10, 10), TestStation{"Two", 20, 20, 0, {{0, 0, 1234}}}, Station(30, 30)});

  SUBCASE("a 25-byte td_num.ntx gives two stations") {
    TruncateFile(tmp.path() / kStationIndexFileName, 25);
    REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
    CHECK(StationCount() == 2);
    // The count holds for td_crd.ntx too: only its first two records are searched.
    StationHeader h;
    CHECK(FindStation(Key(20, 20), h));
    CHECK(StationName(h) == "Two");
    CHECK_FALSE(FindStation(Key(30, 30), h));
  }
  SUBCASE("a td_crd.ntx shorter than the count fails the open") {
    TruncateFile(tmp.path() / kCoordinateIndexFileName, 29);
    CHECK(OpenTideFiles(tmp.str().c_str()) == -1);
    CHECK(StationCount() == 0);
  }
}

TEST_CASE("bad station data is clipped, skipped or refused without reading past it") {
  Closer closer;
  TempFolder tmp;
  // A count above 69 with 80 records on file: only the first 69 are loaded.
  TestStation many = Station(10, 10, {});
  for (int i = 0; i < 80; ++i)
    many.constituents.push_back({static_cast<std::int16_t>(i % 69), static_cast<std::uint16_t>(i), 10});
  const TestStation bad = Station(20, 20, {{0, 0, 100}, {-1, 0, 500}, {69, 0, 500}, {29, 0, 1000}, {300, 0, 9}});
  const TestStation negativeCount{"N", 2, 2, 0, {{29, 0, 1000}}, true, -5};
  // Last block in the file: its count promises more records than remain.
  const TestStation cut = Station(30, 30, {{0, 0, 100}, {29, 0, 1000}, {36, 0, 500}});
  WriteStationFolder(tmp.path(), {many, bad, Station(1, 1, {}), negativeCount, cut});
  REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
  const TideEngine& engine = TheTideEngine();
  const fs::path data = tmp.path() / kStationDataFileName;

  StationHeader h;
  REQUIRE(FindStation(Key(10, 10), h));
  CHECK(h.constituentCount == 80);
  REQUIRE(engine.workingCount == kConstituentCount);
  CHECK(engine.working[68].number == 68);
  CHECK(engine.working[68].g == doctest::Approx(6.8 * kPi / 180.0));

  REQUIRE(FindStation(Key(20, 20), h));
  REQUIRE(engine.workingCount == 2);
  CHECK((engine.working[0].number == 0 && engine.working[1].number == 29));
  CHECK(engine.working[1].H == doctest::Approx(100.0));

  SUBCASE("header counts of 0 or below load nothing and predict a flat 0") {
    for (auto key : {Key(1, 1), Key(2, 2)}) {
      REQUIRE(FindStation(key, h));
      CHECK(engine.workingCount == 0);
      float samples[25];
      for (float& s : samples) s = 99.0f;
      SunDay sun;
      const DayPrediction d = PredictDay(key, h, CalendarDate{2000, 1, 1}, 1.0, samples, 25, sun, FixedOffsetLocalMidnight(0));
      CHECK((d.stationFound && d.sampleCount == 25));
      for (float s : samples) CHECK(s == 0.0f);
    }
  }
  SUBCASE("a block cut short counts as not found") {
    TruncateFile(data, fs::file_size(data) - 1);
    REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
    CHECK_FALSE(FindStation(Key(30, 30), h));
    CHECK(FindStation(Key(20, 20), h));
  }
  SUBCASE("a header cut short counts as not found and leaves the header as it was") {
    TruncateFile(data, fs::file_size(data) - 3 * ConstituentRecord::kSize - 10);
    REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
    StationHeader kept;
    SetStationName(kept, "kept");
    CHECK_FALSE(FindStation(Key(30, 30), kept));
    CHECK(StationName(kept) == "kept");
  }
  SUBCASE("an offset past the end of td_pnt.dat counts as not found") {
    const auto b = EncodeStationIndexRecord({0, 40, 40, 0xFFFFFFF0u});
    WriteBytes(tmp.path() / kStationIndexFileName, {b.begin(), b.end()});
    WriteBytes(tmp.path() / kCoordinateIndexFileName, {b.begin(), b.end()});
    REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
    CHECK_FALSE(FindStation(Key(40, 40), h));
  }
}
