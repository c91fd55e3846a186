#include <doctest/doctest.h>

#include <cmath>

#include "station_folder.h"
#include "tides/engine/prediction.h"
#include "tides/engine/station_files.h"
#include "tides/engine/tide_engine.h"

using namespace br::tides;
using namespace br::tides::testing;
namespace fs = std::filesystem;

TEST_CASE("record images are little-endian whatever the host") {
  const auto b = EncodeStationIndexRecord({0x1234, -630, -315, 0xA1B2C3D4u});
  const std::uint8_t expected[10] = {0x34, 0x12, 0x8A, 0xFD, 0xC5, 0xFE, 0xD4, 0xC3, 0xB2, 0xA1};
  for (int i = 0; i < 10; ++i) CHECK(b[static_cast<std::size_t>(i)] == expected[i]);
  const StationIndexRecord back = DecodeStationIndexRecord(b.data());
  CHECK((back.station == 0x1234 && back.latitude == -630 && back.longitude == -315 && back.offset == 0xA1B2C3D4u));
  // Headers and constituent records go through the same helpers: the folder cases read them back.
}

TEST_CASE("opening a folder") {
  Closer closer;
  TempFolder tmp;
  WriteStationFolder(tmp.path(), {Station(100, 200), Station(-630, -315), Station(0, 60)});
  const std::string plain = tmp.str();

  SUBCASE("with or without the trailing separator") {
    std::vector<std::string> forms = {plain, plain + "/"};
#ifdef _WIN32
    forms.push_back(plain + "\\");
#endif
    for (const std::string& form : forms) {
      REQUIRE(OpenTideFiles(form.c_str()) == 0);
      CHECK(StationCount() == 3);
    }
  }
  SUBCASE("station numbers follow td_num.ntx") {
    REQUIRE(OpenTideFiles(plain.c_str()) == 0);
    StationIndexRecord r;
    REQUIRE(ReadStationIndexRecord(1, r));
    CHECK((r.latitude == -630 && r.longitude == -315));
    REQUIRE(ReadStationIndexRecord(2, r));
    CHECK(r.longitude == 60);
    CHECK_FALSE(ReadStationIndexRecord(3, r));
    CHECK_FALSE(ReadStationIndexRecord(-1, r));
    CHECK(r.longitude == 60);
  }
  SUBCASE("null, empty or missing folders fail") {
    CHECK(OpenTideFiles(nullptr) == -1);
    CHECK(OpenTideFiles("") == -1);
    CHECK(OpenTideFiles((plain + "/nowhere").c_str()) == -1);
    CHECK(StationCount() == 0);
  }
  SUBCASE("a folder without td_pnt.dat fails, and a later open succeeds") {
    TempFolder broken;
    WriteStationFolder(broken.path(), {Station(1, 1)});
    fs::remove(broken.path() / kStationDataFileName);
    CHECK(OpenTideFiles(broken.str().c_str()) == -1);
    CHECK(StationCount() == 0);
    StationHeader h;
    CHECK_FALSE(FindStation(Key(1, 1), h));
    REQUIRE(OpenTideFiles(plain.c_str()) == 0);
    CHECK(StationCount() == 3);
  }
  SUBCASE("a second open replaces the first folder") {
    TempFolder other;
    WriteStationFolder(other.path(), {Station(5, 5)});
    REQUIRE(OpenTideFiles(plain.c_str()) == 0);
    REQUIRE(OpenTideFiles(other.str().c_str()) == 0);
    CHECK(StationCount() == 1);
    CloseTideFiles();
    CHECK(StationCount() == 0);
  }
}

TEST_CASE("folder path length: 240 characters accepted, 241 refused") {
  Closer closer;
  TempFolder tmp;
  auto folderOfLength = [&](std::size_t length, char fill) {
    std::string p = tmp.str() + "/";
    // Components of at most 100 characters keep within the file system's name limit.
    while (p.size() < length) {
      const std::size_t room = length - p.size();
      p += room > 101 ? std::string(100, fill) + "/" : std::string(room, fill);
    }
    return p;
  };
  const std::string p240 = folderOfLength(240, 'a'), p241 = folderOfLength(241, 'b');
  REQUIRE((p240.size() == 240 && p241.size() == 241 && p240.back() != '/' && p241.back() != '/'));
  WriteStationFolder(p240, {Station(1, 2)});
  WriteStationFolder(p241, {Station(1, 2)});
  CHECK(OpenTideFiles(p240.c_str()) == 0);
  CHECK(OpenTideFiles(p241.c_str()) == -1);
  // A trailing separator makes a 240-character folder 241 long: refused as written.
  CHECK(OpenTideFiles((p240 + "/").c_str()) == -1);
}

TEST_CASE("index files of odd or short lengths") {
  Closer closer;
  TempFolder tmp;
  WriteStationFolder(tmp.path(), {Station(10, 10), Station(20, 20, {{0, 0, 1234}}, "Two"), Station(30, 30)});

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
  SUBCASE("an empty folder index opens with no stations") {
    TruncateFile(tmp.path() / kStationIndexFileName, 9);
    REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
    CHECK(StationCount() == 0);
  }
  SUBCASE("more than 32767 stations is refused") {
    std::vector<std::uint8_t> big(static_cast<std::size_t>(kMaxStationCount + 1) * StationIndexRecord::kSize, 0);
    for (int fits = 0; fits < 2; ++fits) {
      if (fits) big.resize(big.size() - StationIndexRecord::kSize);
      WriteBytes(tmp.path() / kStationIndexFileName, big);
      WriteBytes(tmp.path() / kCoordinateIndexFileName, big);
      CHECK(OpenTideFiles(tmp.str().c_str()) == (fits ? 0 : -1));
    }
    CHECK(StationCount() == kMaxStationCount);
  }
}

TEST_CASE("finding stations and loading their constituents") {
  Closer closer;
  TempFolder tmp;
  TestStation brest = Station(2903, -269, {{0, 0, 4500}, {29, 1053, 2050}, {36, 1450, 750}}, "Brest");
  brest.zone = -1;
  TestStation negativeCount = Station(2, 2, {{29, 0, 1000}});
  negativeCount.overrideCount = true;
  negativeCount.count = -5;
  WriteStationFolder(tmp.path(), {brest, Station(-630, -315, {{0, 900, 1000}}, "Negative"), Station(1, 1, {}),
                                  negativeCount});
  REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
  const TideEngine& engine = TheTideEngine();

  SUBCASE("header and working records") {
    StationHeader h;
    REQUIRE(FindStation(Key(2903, -269), h));
    CHECK(StationName(h) == "Brest");
    CHECK((h.latitude == 2903 && h.longitude == -269 && h.zone == -1 && h.constituentCount == 3));
    REQUIRE(engine.workingCount == 3);
    CHECK(engine.working[1].number == 29);
    CHECK(engine.working[1].g == doctest::Approx(105.3 * kPi / 180.0));
    CHECK(engine.working[1].H == doctest::Approx(205.0));
    CHECK(engine.working[1].V == 0.0);
    CHECK(engine.working[2].number == 36);
    for (int n : {0, 29, 36, 38}) CHECK(engine.constituents[static_cast<std::size_t>(n)].used == (n != 38 ? 1 : 0));
  }
  SUBCASE("negative keys sort last and are still found") {
    StationHeader h;
    REQUIRE(FindStation(Key(-630, -315), h));
    CHECK(StationName(h) == "Negative");
    CHECK(engine.working[0].g == doctest::Approx(kPi / 2.0));
  }
  SUBCASE("an unknown key: not found, used flags cleared, working records kept") {
    StationHeader h;
    REQUIRE(FindStation(Key(2903, -269), h));
    StationHeader untouched;
    SetStationName(untouched, "unchanged");
    CHECK_FALSE(FindStation(Key(2903, -268), untouched));
    CHECK(StationName(untouched) == "unchanged");
    for (const auto& c : engine.constituents) CHECK(c.used == 0);
    CHECK(engine.workingCount == 3);
  }
  SUBCASE("header counts of 0 or below load nothing and predict a flat 0") {
    for (auto key : {Key(1, 1), Key(2, 2)}) {
      StationHeader h;
      REQUIRE(FindStation(key, h));
      CHECK(engine.workingCount == 0);
      float samples[25];
      for (float& s : samples) s = 99.0f;
      SunDay sun;
      const DayPrediction d =
          PredictDay(key, h, CalendarDate{2000, 1, 1}, 1.0, samples, 25, sun, FixedOffsetLocalMidnight(0));
      CHECK(d.stationFound);
      REQUIRE(d.sampleCount == 25);
      for (float s : samples) CHECK(s == 0.0f);
    }
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
  // Last block in the file: its count promises more records than remain.
  const TestStation cut = Station(30, 30, {{0, 0, 100}, {29, 0, 1000}, {36, 0, 500}});
  WriteStationFolder(tmp.path(), {many, bad, cut});
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

  SUBCASE("a block cut short counts as not found") {
    TruncateFile(data, fs::file_size(data) - 1);
    REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
    CHECK_FALSE(FindStation(Key(30, 30), h));
    CHECK(FindStation(Key(20, 20), h));
  }
  SUBCASE("a header cut short counts as not found") {
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
