// Building the three files: rounding, key order, duplicate positions, names, round trip.
#include <doctest/doctest.h>

#include <algorithm>
#include <cmath>
#include <string>

#include "tests/native/tidefiles/tidefiles_test_support.h"
#include "tools/tidefiles/folder_builder.h"
#include "tools/tidefiles/folder_check.h"
#include "tools/tidefiles/folder_dump.h"
#include "tools/tidefiles/station_json.h"

using namespace br::tidefiles;
using namespace br::tidefiles::test;
namespace bt = br::tides;

// Positions and amplitudes are rounded and clipped in the station-block and clipping cases below.
TEST_CASE("phases are stored in tenths of a degree within one turn") {
  bool clipped = false;
  CHECK((AmplitudeField(65.535, clipped) == 65535 && !clipped));  // the largest that fits
  const std::pair<double, int> phases[] = {{-5.0, 3550}, {359.96, 0}, {720.04, 0}, {-0.04, 0}};
  for (const auto& [degrees, field] : phases) CHECK(PhaseField(degrees) == field);
  CHECK(PhaseField(1e18) < 3600);
}

TEST_CASE("a station block: mean level first, then the constituents in order") {
  const FolderImage image = BuildFromJson(R"([
    {"name": "Port", "latitude": 50.103, "longitude": -5.54275, "zone": -1, "mean_level": 3.265,
     "constituents": [{"name": "M2", "amplitude": 1.7116, "phase": 133.71}, {"name": "S2", "amplitude": 0.572, "phase": 177.79}]},
    {"name": "Below", "latitude": 1, "longitude": 1, "zone": 0, "mean_level": -0.106, "constituents": []},
    {"name": "None", "latitude": 2, "longitude": 2, "zone": 0, "constituents": []}])");
  const auto index = IndexRecords(image.stationIndex);
  REQUIRE(index.size() == 3);
  CHECK((index[0].offset == 0 && index[1].offset == 46 + 3 * 6));
  const bt::StationHeader h = HeaderAt(image, 0);
  CHECK(bt::StationName(h) == "Port");
  CHECK((h.latitude == 3006 && h.longitude == -333 && h.zone == -1 && h.constituentCount == 3));
  const auto records = RecordsAt(image, 0);
  const int expected[3][3] = {{0, 3265, 0}, {29, 1712, 1337}, {36, 572, 1778}};  // number, amplitude, phase
  for (int k = 0; k < 3; ++k)
    CHECK((records[k].number == expected[k][0] && records[k].amplitude == expected[k][1] && records[k].phase == expected[k][2]));
  // A level below chart datum is stored as its size half a turn round.
  const auto below = RecordsAt(image, index[1].offset);
  REQUIRE(below.size() == 1);
  CHECK((below[0].amplitude == 106 && below[0].phase == 1800));
  // Without a mean level the station still starts with a zero constituent 0.
  const auto none = RecordsAt(image, index[2].offset);
  REQUIRE(none.size() == 1);
  CHECK((none[0].number == 0 && none[0].amplitude == 0));
  CHECK(CheckFolderImage(image).empty());
}

TEST_CASE("td_crd.ntx is sorted by the unsigned key: negative positions sort last in their half") {
  const FolderImage image = BuildFromJson(R"([
    {"name": "SouthWest", "latitude": -10.5, "longitude": -5.25, "zone": 0, "constituents": []},
    {"name": "NorthEast", "latitude": 10.5, "longitude": 5.25, "zone": 0, "constituents": []},
    {"name": "SouthEast", "latitude": -10.5, "longitude": 179.9, "zone": 0, "constituents": []},
    {"name": "Origin", "latitude": 0, "longitude": 0, "zone": 0, "constituents": []},
    {"name": "NorthWest", "latitude": 1, "longitude": -0.1, "zone": 0, "constituents": []}])");
  const auto numbered = IndexRecords(image.stationIndex);
  const auto sorted = IndexRecords(image.coordinateIndex);
  REQUIRE(sorted.size() == 5);
  // td_num.ntx keeps the given order.
  CHECK((numbered[0].latitude == -630 && numbered[0].longitude == -315));
  for (std::size_t k = 1; k < sorted.size(); ++k) CHECK(bt::StationKey(sorted[k - 1]) < bt::StationKey(sorted[k]));
  // Non-negative longitudes first (origin, north-east, south-east), then the negative ones.
  // Longitude -315' reads 65221 and -6' reads 65530: 10 30'S 5 15'W comes before 0 06'W.
  const int positions[5][2] = {{0, 0}, {630, 315}, {-630, 10794}, {-630, -315}, {60, -6}};
  for (int k = 0; k < 5; ++k) CHECK((sorted[k].latitude == positions[k][0] && sorted[k].longitude == positions[k][1]));
}

TEST_CASE("stations whose positions round to the same whole minutes: the first is kept") {
  Diagnostics d;
  const FolderImage image = BuildFromJson(R"([
    {"name": "First", "latitude": 50.1, "longitude": -5.55, "zone": 0, "constituents": []},
    {"name": "Other", "latitude": 51, "longitude": 0, "zone": 0, "constituents": []},
    {"name": "Second", "latitude": 50.1004, "longitude": -5.5496, "zone": 0, "constituents": []}])",
                                          d);
  const auto index = IndexRecords(image.stationIndex);
  REQUIRE(index.size() == 2);
  CHECK(bt::StationName(HeaderAt(image, index[0].offset)) == "First");
  CHECK(bt::StationName(HeaderAt(image, index[1].offset)) == "Other");
  CHECK(Mentions(d, Severity::Warning, "station 2 \"Second\": same whole-minute position (50.1000, -5.5500) as station 0; dropped"));
}

TEST_CASE("names go to Windows-1252 and are cut to the 40-byte field") {
  Diagnostics d;
  const std::string forty = std::string(39, 'a') + "\xC3\xA9";  // 39 letters and é: 40 bytes in 1252
  const FolderImage image = BuildFromJson(R"([
    {"name": "T\u0159eboň Łódź", "latitude": 1, "longitude": 1, "zone": 0, "constituents": []},
    {"name": ")" + forty + R"(xyz", "latitude": 2, "longitude": 2, "zone": 0, "constituents": []},
    {"name": "short", "latitude": 3, "longitude": 3, "zone": 0, "constituents": []}])",
                                          d);
  const auto index = IndexRecords(image.stationIndex);
  REQUIRE(index.size() == 3);
  CHECK(bt::StationName(HeaderAt(image, index[0].offset)) == "Trebon L\xF3" "dz");
  const bt::StationHeader cut = HeaderAt(image, index[1].offset);
  CHECK(bt::StationName(cut) == std::string(39, 'a') + "\xE9");
  CHECK(cut.name[39] == '\xE9');  // the full field, no terminator
  const bt::StationHeader shortName = HeaderAt(image, index[2].offset);
  CHECK(std::all_of(shortName.name.begin() + 5, shortName.name.end(), [](char c) { return c == '\0'; }));
  CHECK(Mentions(d, Severity::Note, "name cut to 40 bytes"));
  CHECK(Mentions(d, Severity::Note, "name stored as \"Trebon L\xC3\xB3" "dz\""));
}

TEST_CASE("oversized amplitudes are clipped with a warning") {
  Diagnostics d;
  const FolderImage image = BuildFromJson(R"([
    {"name": "Big", "latitude": 1, "longitude": 1, "zone": 0, "mean_level": 70,
     "constituents": [{"name": "M2", "amplitude": 66, "phase": 0}]}])",
                                          d);
  const auto records = RecordsAt(image, 0);
  CHECK((records[0].amplitude == 65535 && records[1].amplitude == 65535));
  CHECK(Mentions(d, Severity::Warning, "mean level does not fit in 65.535 m; clipped"));
  CHECK(Mentions(d, Severity::Warning, "M2 amplitude 66 m clipped to 65.535 m"));
}

TEST_CASE("more stations than a folder holds is refused") {
  std::vector<StationEntry> stations(static_cast<std::size_t>(bt::kMaxStationCount) + 1);
  for (std::size_t i = 0; i < stations.size(); ++i) {
    stations[i].index = i;
    stations[i].name = "S";
    stations[i].latitude = static_cast<double>(i / 300) / 60.0;
    stations[i].longitude = static_cast<double>(i % 300) / 60.0;
  }
  Diagnostics d;
  CHECK_FALSE(BuildFolderImage(stations, d).has_value());
  CHECK(Mentions(d, Severity::Error, "more than 32767 stations"));
  stations.pop_back();
  Diagnostics fits;
  const auto image = BuildFolderImage(stations, fits);
  REQUIRE(image.has_value());
  CHECK(image->stationIndex.size() == 32767u * 10u);
}

TEST_CASE("build then dump gives the same JSON, and building that gives the same files") {
  const std::string json = R"([
    {"name": "Ålesund", "latitude": 62.469414, "longitude": 6.151946, "zone": -1, "mean_level": 1.2, "tag": 513,
     "constituents": [{"name": "M2", "amplitude": 0.8, "phase": 300}, {"name": "2MK3", "amplitude": 0.004, "phase": 12.34},
                      {"name": "MA2", "amplitude": 0.01, "phase": 1}, {"name": "LAM2", "amplitude": 0.02, "phase": 2}]},
    {"name": "South", "latitude": -33.86, "longitude": 151.21, "zone": -10, "mean_level": -0.05,
     "constituents": [{"name": "K1", "amplitude": 0.3, "phase": 359.99}]},
    {"name": "Odd level", "latitude": 3, "longitude": -3, "zone": 5,
     "constituents": [{"name": "Z0", "amplitude": 0.5, "phase": 90}]},
    {"name": "Tiny level", "latitude": 4, "longitude": -4, "zone": 0, "mean_level": -0.0004, "constituents": []},
    {"name": "Zero turned", "latitude": 5, "longitude": -5, "zone": 0,
     "constituents": [{"name": "Z0", "amplitude": 0, "phase": 180}]}])";
  const FolderImage first = BuildFromJson(json);
  Diagnostics dumpDiagnostics;
  const std::vector<StationEntry> dumped = DumpFolderImage(first, dumpDiagnostics);
  CHECK(dumpDiagnostics.All().empty());
  REQUIRE(dumped.size() == 5);
  CHECK((dumped[0].name == "Ålesund" && dumped[0].tag == 513 && dumped[0].meanLevel == 1.2));
  CHECK(dumped[1].meanLevel == -0.05);
  CHECK_FALSE(dumped[2].meanLevel.has_value());  // a level with phase 90 stays a constituent
  REQUIRE(dumped[2].constituents.size() == 1);
  CHECK(dumped[2].constituents[0].row == 0);
  CHECK(dumped[3].meanLevel == 0.0);  // -0.4 mm rounds to a level of +0, not -0
  CHECK_FALSE(std::signbit(*dumped[3].meanLevel));
  CHECK_FALSE(dumped[4].meanLevel.has_value());  // zero amplitude half a turn round: kept as given
  const std::string text = WriteStationsJson(dumped);
  CHECK(text.find("\"name\": \"MO3\"") != std::string::npos);  // 2MK3 stored in the MO3 row
  CHECK(text.find("\"number\": 28") != std::string::npos);     // MA2's row has no usual name
  CHECK(text.find("\"phase\": 0.0") != std::string::npos);     // 359.99 rounds to a full turn

  const FolderImage second = BuildFromJson(text);
  CHECK((second.stationIndex == first.stationIndex && second.coordinateIndex == first.coordinateIndex &&
         second.stationData == first.stationData));
  Diagnostics again;
  CHECK(WriteStationsJson(DumpFolderImage(second, again)) == text);
}

TEST_CASE("an empty array makes an empty folder") {
  const FolderImage image = BuildFromJson("[]");
  CHECK((image.stationIndex.empty() && image.coordinateIndex.empty() && image.stationData.empty()));
  CHECK(CheckFolderImage(image).empty());
  Diagnostics d;
  CHECK(WriteStationsJson(DumpFolderImage(image, d)) == "[]\n");
}
