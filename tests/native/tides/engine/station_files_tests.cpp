// Opening, separators, missing files, the 241-character path, positions and names: the Wine
// database suites. Arbitrary folders, record images and loaded values: the station_files fuzz harness.
#include <doctest/doctest.h>

#include <fstream>

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

TEST_CASE("bad station data is skipped or refused without reading past it") {
  Closer closer;
  TempFolder tmp;
  // A count of 69 with its records is whole; above 69, or below 0, no station has it.
  TestStation full = Station(10, 10, {}), many = Station(11, 11, {});
  for (int i = 0; i < 80; ++i) {
    const ConstituentRecord record{static_cast<std::int16_t>(i % 69), static_cast<std::uint16_t>(i), 10};
    if (i < kConstituentCount) full.constituents.push_back(record);
    many.constituents.push_back(record);
  }
  const TestStation bad = Station(20, 20, {{0, 0, 100}, {-1, 0, 500}, {69, 0, 500}, {29, 0, 1000}, {300, 0, 9}});
  const TestStation negativeCount{"N", 2, 2, 0, {{29, 0, 1000}}, true, -1};
  // Headers no station has: a zone of UTC-127 hours, UTC+15, a latitude of 546 degrees.
  const TestStation farZone{"Z", 3, 3, 127, {{0, 0, 100}}}, pastKiribati{"K", 4, 4, -15, {{0, 0, 100}}};
  TestStation offTheGlobe{"L", 5, 5, 0, {{0, 0, 100}}};
  // Last block in the file: its count promises more records than remain.
  const TestStation cut = Station(30, 30, {{0, 0, 100}, {29, 0, 1000}, {36, 0, 500}});
  WriteStationFolder(tmp.path(), {full, many, bad, Station(1, 1, {}), negativeCount, farZone, pastKiribati, offTheGlobe, cut});
  const fs::path data = tmp.path() / kStationDataFileName;
  {
    // The header's latitude alone goes off the globe; the index still finds the block.
    std::vector<std::uint8_t> bytes(fs::file_size(data));
    std::ifstream(data, std::ios::binary).read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
    const std::size_t block = (46 + 69 * 6) + (46 + 80 * 6) + (46 + 5 * 6) + 46 + (46 + 6) + 2 * (46 + 6);
    REQUIRE(bytes[block] == 'L');
    PutU16(&bytes[block + 40], 0x7FFF);
    WriteBytes(data, bytes);
  }
  REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
  const TideEngine& engine = TheTideEngine();

  StationHeader h;
  REQUIRE(FindStation(Key(10, 10), h));
  REQUIRE(engine.workingCount == kConstituentCount);
  CHECK(engine.working[68].number == 68);
  CHECK(engine.working[68].g == doctest::Approx(6.8 * kPi / 180.0));

  REQUIRE(FindStation(Key(20, 20), h));
  REQUIRE(engine.workingCount == 2);
  CHECK((engine.working[0].number == 0 && engine.working[1].number == 29));
  CHECK(engine.working[1].H == doctest::Approx(100.0));

  SUBCASE("an impossible header counts as no station and leaves the working records as they were") {
    StationHeader kept;
    SetStationName(kept, "kept");
    for (auto key : {Key(11, 11), Key(2, 2), Key(3, 3), Key(4, 4), Key(5, 5)}) {
      CHECK_FALSE(FindStation(key, kept));
      CHECK(StationName(kept) == "kept");
      CHECK(engine.workingCount == 2);
      float samples[25];
      SunDay sun;
      CHECK_FALSE(PredictDay(key, kept, CalendarDate{2000, 1, 1}, 1.0, samples, 25, sun, FixedOffsetLocalMidnight(0)).stationFound);
    }
  }
  SUBCASE("a header count of 0 loads nothing and predicts a flat 0") {
    REQUIRE(FindStation(Key(1, 1), h));
    CHECK(engine.workingCount == 0);
    float samples[25];
    for (float& s : samples) s = 99.0f;
    SunDay sun;
    const DayPrediction d = PredictDay(Key(1, 1), h, CalendarDate{2000, 1, 1}, 1.0, samples, 25, sun, FixedOffsetLocalMidnight(0));
    CHECK((d.stationFound && d.sampleCount == 25));
    for (float s : samples) CHECK(s == 0.0f);
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

TEST_CASE("blocks read once are served again the same, and never after the folder is opened anew") {
  Closer closer;
  TempFolder tmp, other("engine-other");
  const TestStation a{"Alpha", 10, 10, -1, {{0, 0, 500}, {29, 1200, 1000}, {36, 3599, 20}}};
  const TestStation b{"Beta", 20, 20, 3, {{0, 0, 700}, {8, 900, 300}}};
  WriteStationFolder(tmp.path(), {a, b});
  WriteStationFolder(other.path(), {TestStation{"Other", 10, 10, 5, {{0, 0, 42}}}});
  const TideEngine& engine = TheTideEngine();
  const auto working = [&] {
    std::vector<std::array<double, 3>> rows;
    for (int i = 0; i < engine.workingCount; ++i) {
      const StationConstituent& w = engine.working[static_cast<std::size_t>(i)];
      rows.push_back({static_cast<double>(w.number), w.g, w.H});
    }
    return rows;
  };

  REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
  StationHeader h;
  REQUIRE(FindStation(Key(10, 10), h));
  const auto first = working();
  REQUIRE(first.size() == 3);
  CHECK(first[2][1] == doctest::Approx(359.9 * kPi / 180.0));
  CHECK(first[1][2] == doctest::Approx(100.0));
  // Another station in between, then the first again: the same header and records.
  REQUIRE(FindStation(Key(20, 20), h));
  CHECK((StationName(h) == "Beta" && h.zone == 3 && engine.workingCount == 2));
  REQUIRE(FindStation(Key(10, 10), h));
  CHECK((StationName(h) == "Alpha" && h.zone == -1));
  CHECK(working() == first);
  CHECK(engine.constituents[29].used == 1);
  CHECK(engine.constituents[8].used == 0);

  SUBCASE("the same folder rewritten and opened again") {
    WriteStationFolder(tmp.path(), {TestStation{"Gamma", 10, 10, 2, {{0, 0, 9}}}, b});
    REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
    REQUIRE(FindStation(Key(10, 10), h));
    CHECK((StationName(h) == "Gamma" && h.zone == 2 && engine.workingCount == 1));
    CHECK(engine.working[0].H == doctest::Approx(0.9));
  }
  SUBCASE("another folder with a station at the same place") {
    REQUIRE(OpenTideFiles(other.str().c_str()) == 0);
    REQUIRE(FindStation(Key(10, 10), h));
    CHECK((StationName(h) == "Other" && h.zone == 5 && engine.workingCount == 1));
    CHECK_FALSE(FindStation(Key(20, 20), h));
  }
  SUBCASE("closed, nothing is found") {
    CloseTideFiles();
    CHECK_FALSE(FindStation(Key(10, 10), h));
  }
}
