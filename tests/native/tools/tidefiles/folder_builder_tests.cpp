// Reading and building: constituent names, rounding, duplicate positions, station names,
// clipping, round trip. (Malformed JSON: the command-line suite's failures. Every
// built folder passes the check and the engine finds each station in it: the tidefiles_json
// fuzz harness, which also rebuilds each dump to the same bytes.)
#include <doctest/doctest.h>

#include <cmath>
#include <string>

#include "tests/native/tools/tidefiles/tidefiles_test_support.h"
#include "tools/tidefiles/folder_dump.h"

using namespace br::tidefiles;
using namespace br::tidefiles::test;
namespace bt = br::tides;

namespace {

// The bytes of one record, inside the file.
const std::uint8_t* At(const std::vector<std::uint8_t>& bytes, std::size_t at, std::size_t size) {
  REQUIRE(at + size <= bytes.size());
  return &bytes[at];
}

std::uint32_t OffsetOf(const FolderImage& f, std::size_t k) {
  return bt::DecodeStationIndexRecord(At(f.stationIndex, k * 10, 10)).offset;
}
bt::StationHeader HeaderAt(const FolderImage& f, std::uint32_t at) {
  return bt::DecodeStationHeader(At(f.stationData, at, bt::StationHeader::kSize));
}
bt::ConstituentRecord RecordAt(const FolderImage& f, std::uint32_t block, int k) {
  return bt::DecodeConstituentRecord(At(f.stationData, block + bt::StationHeader::kSize + 6u * k, 6));
}

}  // namespace

TEST_CASE("a station block: mean level first, then the constituents; names in Windows-1252; clips and duplicates") {
  Diagnostics d;
  const std::string forty = std::string(39, 'a') + "\xC3\xA9";  // 39 letters and é: 40 bytes in 1252
  const FolderImage image = BuildFromJson(R"([
    {"name": "Port", "latitude": 50.103, "longitude": -5.54275, "zone": -1, "mean_level": 3.265,
     "constituents": [{"name": "M2", "amplitude": 1.7116, "phase": 133.71}, {"name": "S2", "amplitude": 0.572, "phase": 177.79}]},
    {"name": "T\u0159eboň Łódź", "latitude": 1, "longitude": 1, "zone": 0, "mean_level": -0.106, "constituents": []},
    {"name": ")" + forty + R"(xyz", "latitude": 2, "longitude": 2, "zone": 0, "constituents": []},
    {"name": "Second", "latitude": 50.1002, "longitude": -5.5499, "zone": 0, "constituents": []},
    {"name": "Big", "latitude": 3, "longitude": 3, "zone": 0, "mean_level": 70, "constituents": [{"name": "M2", "amplitude": 66, "phase": 0}]}])",
                                          d);
  // Positions that round to the same whole minutes: the later station is dropped.
  REQUIRE(image.stationIndex.size() == 40);
  CHECK(Mentions(d, Severity::Warning, "station 3 \"Second\": same whole-minute position (50.1000, -5.5500) as station 0; dropped"));
  CHECK((RecordAt(image, OffsetOf(image, 3), 0).amplitude == 65535 && RecordAt(image, OffsetOf(image, 3), 1).amplitude == 65535));
  CHECK(Mentions(d, Severity::Warning, "mean level does not fit in 65.535 m; clipped"));
  CHECK(Mentions(d, Severity::Warning, "M2 amplitude 66 m clipped to 65.535 m"));
  CHECK((OffsetOf(image, 0) == 0 && OffsetOf(image, 1) == 46 + 3 * 6));
  const bt::StationHeader h = HeaderAt(image, 0);
  CHECK(bt::StationName(h) == "Port");
  CHECK((h.latitude == 3006 && h.longitude == -333 && h.zone == -1 && h.constituentCount == 3));
  const int expected[3][3] = {{0, 3265, 0}, {29, 1712, 1337}, {36, 572, 1778}};  // number, amplitude, phase
  for (int k = 0; k < 3; ++k) {
    const bt::ConstituentRecord r = RecordAt(image, 0, k);
    CHECK((r.number == expected[k][0] && r.amplitude == expected[k][1] && r.phase == expected[k][2]));
  }
  // A level below chart datum is stored as its size half a turn round.
  const bt::ConstituentRecord below = RecordAt(image, OffsetOf(image, 1), 0);
  CHECK((below.number == 0 && below.amplitude == 106 && below.phase == 1800));
  CHECK(bt::StationName(HeaderAt(image, OffsetOf(image, 1))) == "Trebon L\xF3" "dz");
  CHECK(Mentions(d, Severity::Note, "name stored as \"Trebon L\xC3\xB3" "dz\""));
  // Without a mean level the station still starts with a zero constituent 0; the name fills the field.
  const bt::StationHeader cut = HeaderAt(image, OffsetOf(image, 2));
  CHECK((cut.constituentCount == 1 && RecordAt(image, OffsetOf(image, 2), 0).amplitude == 0));
  CHECK(bt::StationName(cut) == std::string(39, 'a') + "\xE9");
  CHECK(cut.name[39] == '\xE9');  // the full field, no terminator
  CHECK(Mentions(d, Severity::Note, "name cut to 40 bytes"));
}

TEST_CASE("constituent names: an equal-speed one is added, a repeat dropped, unknown ones reported in one line") {
  Diagnostics d;
  const auto stations = ReadStationsJson(R"([{"name": "Port", "latitude": 50.5, "longitude": -4.25, "zone": 0,
      "constituents": [{"name": "SA_KV", "amplitude": 0.1, "phase": 1}, {"name": "MO3", "amplitude": 0.02, "phase": 0},
      {"name": "2MK3", "amplitude": 0.02, "phase": 90}, {"name": "RHO", "amplitude": 0.3, "phase": 5},
      {"name": "rho1", "amplitude": 0.4, "phase": 6}, {"name": "OO1", "amplitude": 0.01, "phase": 2}]}])", d);
  REQUIRE(stations.size() == 1);
  const auto& c = stations[0].constituents;
  REQUIRE(c.size() == 2);
  CHECK(c[0].row == 40);
  CHECK(c[0].amplitude == doctest::Approx(0.02 * std::sqrt(2.0)));
  CHECK(c[0].phase == doctest::Approx(45.0));
  CHECK((c[1].row == 7 && c[1].amplitude == 0.3));
  CHECK(Mentions(d, Severity::Warning, "rho1 repeats RHO (table row 7); dropped"));
  CHECK(Mentions(d, Severity::Note, "2MK3 has the Doodson numbers of MO3"));
  CHECK(Mentions(d, Severity::Warning, "station 0 \"Port\": no table row for SA_KV, OO1; dropped"));
  CHECK_FALSE(d.HasErrors());
}

TEST_CASE("build then dump gives the same JSON, and building that gives the same files") {
  const FolderImage first = BuildFromJson(R"([
    {"name": "Ålesund", "latitude": 62.469414, "longitude": 6.151946, "zone": -1, "mean_level": 1.2, "tag": 513,
     "constituents": [{"name": "M2", "amplitude": 0.8, "phase": 300}, {"name": "2MK3", "amplitude": 0.004, "phase": 12.34},
                      {"name": "MA2", "amplitude": 0.01, "phase": 1}]},
    {"name": "Odd level", "latitude": 3, "longitude": -3, "zone": 5, "constituents": [{"name": "Z0", "amplitude": 0.5, "phase": 90}]},
    {"name": "Tiny level", "latitude": 4, "longitude": -4, "zone": 0, "mean_level": -0.0004, "constituents": []}])");
  Diagnostics d;
  const std::vector<StationEntry> dumped = DumpFolderImage(first, d);
  CHECK(d.All().empty());
  REQUIRE(dumped.size() == 3);
  CHECK((dumped[0].name == "Ålesund" && dumped[0].tag == 513 && dumped[0].meanLevel == 1.2));
  // A level with phase 90 stays a constituent.
  CHECK((!dumped[1].meanLevel.has_value() && dumped[1].constituents.size() == 1 && dumped[1].constituents[0].row == 0));
  CHECK(dumped[2].meanLevel == 0.0);  // -0.4 mm rounds to a level of +0, not -0
  CHECK_FALSE(std::signbit(*dumped[2].meanLevel));
  const std::string text = WriteStationsJson(dumped);
  CHECK(text.find("\"name\": \"MO3\"") != std::string::npos);  // 2MK3 stored in the MO3 row
  CHECK(text.find("\"number\": 28") != std::string::npos);     // MA2's row has no usual name
  const FolderImage second = BuildFromJson(text);
  CHECK((second.stationIndex == first.stationIndex && second.coordinateIndex == first.coordinateIndex &&
         second.stationData == first.stationData));
}
