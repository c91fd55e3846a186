// Reading the station JSON: required fields, bad values, constituent mapping and merging.
#include <doctest/doctest.h>

#include <cmath>
#include <string>

#include "tests/native/tidefiles/tidefiles_test_support.h"
#include "tools/tidefiles/station_json.h"

using br::tidefiles::Diagnostics;
using br::tidefiles::ReadStationsJson;
using br::tidefiles::Severity;
using br::tidefiles::StationEntry;
using br::tidefiles::test::Mentions;

namespace {

std::string Station(const std::string& fields, const std::string& constituents = "[]") {
  return R"({"name": "Port", "latitude": 50.5, "longitude": -4.25, "zone": 0, )" + fields +
         (fields.empty() ? "" : ", ") + R"("constituents": )" + constituents + "}";
}

std::vector<StationEntry> Read(const std::string& json, Diagnostics& d) { return ReadStationsJson(json, d); }

}  // namespace

TEST_CASE("a complete station reads with its values") {
  Diagnostics d;
  const auto stations = Read(
      "[" + Station(R"("mean_level": 3.265, "tag": 7)",
                    R"([{"name": "M2", "amplitude": 1.7116, "phase": 133.71}, {"number": 36, "amplitude": 0.5, "phase": -10}])") +
          "]",
      d);
  REQUIRE(stations.size() == 1);
  CHECK(d.All().empty());
  const StationEntry& s = stations[0];
  CHECK((s.name == "Port" && s.latitude == 50.5 && s.longitude == -4.25 && s.meanLevel == 3.265 && s.tag == 7));
  REQUIRE(s.constituents.size() == 2);
  CHECK((s.constituents[0].row == 29 && s.constituents[0].amplitude == 1.7116 && s.constituents[0].phase == 133.71));
  CHECK((s.constituents[1].row == 36 && s.constituents[1].amplitude == 0.5 && s.constituents[1].phase == -10));
}

TEST_CASE("malformed input is an error with a clear message") {
  struct Case {
    std::string json;
    std::string message;
  };
  const Case cases[] = {
      {"[", "not valid JSON"},
      {"{}", "must be an array"},
      {"[1]", "station 0: is not a JSON object"},
      {R"([{"latitude": 1, "longitude": 2, "zone": 0, "constituents": []}])", "has no \"name\""},
      {R"([{"name": "", "latitude": 1, "longitude": 2, "zone": 0, "constituents": []}])", "empty \"name\""},
      {R"([{"name": "A", "latitude": 1, "longitude": 2, "zone": 0}])", "no \"constituents\""},
      {R"([{"name": "A", "latitude": 90.5, "longitude": 2, "zone": 0, "constituents": []}])", "\"latitude\" must be"},
      {R"([{"name": "A", "latitude": "1", "longitude": 2, "zone": 0, "constituents": []}])", "\"latitude\" must be"},
      {R"([{"name": "A", "latitude": 1, "longitude": -181, "zone": 0, "constituents": []}])", "\"longitude\" must be"},
      {R"([{"name": "A", "latitude": 1, "longitude": 2, "zone": 0.5, "constituents": []}])", "\"zone\" must be"},
      {R"([{"name": "A", "latitude": 1, "longitude": 2, "zone": 15, "constituents": []}])", "\"zone\" must be"},
      {R"([{"name": "A", "latitude": 1, "longitude": 2, "zone": 0, "tag": 70000, "constituents": []}])", "\"tag\""},
      {R"([{"name": "A", "latitude": 1, "longitude": 2, "zone": 0, "mean_level": null, "constituents": []}])", "\"mean_level\""},
      {R"([{"name": "A", "latitude": 1, "longitude": 2, "zone": 0, "constituents": {}}])", "not an array"},
      {"[" + Station("", R"([{"amplitude": 1, "phase": 0}])") + "]", "neither \"name\" nor \"number\""},
      {"[" + Station("", R"([{"name": "M2", "phase": 0}])") + "]", "needs a number \"amplitude\""},
      {"[" + Station("", R"([{"name": "M2", "amplitude": 1}])") + "]", "needs a number \"phase\""},
      {"[" + Station("", R"([{"number": 69, "amplitude": 1, "phase": 0}])") + "]", "\"number\" must be"},
      {"[" + Station("", R"([{"number": 2.5, "amplitude": 1, "phase": 0}])") + "]", "\"number\" must be"},
      {"[" + Station("", R"([{"name": "M2", "number": 36, "amplitude": 1, "phase": 0}])") + "]", "is not table row 36"},
      {"[" + Station("", R"([{"name": "", "amplitude": 1, "phase": 0}])") + "]", "non-empty string"},
      {"[" + Station(R"("mean_level": 1)", R"([{"name": "Z0", "amplitude": 1, "phase": 0}])") + "]", "mean level is given twice"},
  };
  for (const Case& c : cases) {
    Diagnostics d;
    const auto stations = Read(c.json, d);
    CHECK_MESSAGE(stations.empty(), c.json);
    CHECK_MESSAGE(Mentions(d, Severity::Error, c.message), c.json);
  }
}

TEST_CASE("one bad station does not hide the good ones, and every error is listed") {
  Diagnostics d;
  const auto stations = Read(
      "[" + Station("") + R"(, {"name": "B"}, {"name": "C", "latitude": 100, "longitude": 0, "zone": 0, "constituents": []}])",
      d);
  CHECK(stations.size() == 1);
  CHECK(Mentions(d, Severity::Error, "station 1 \"B\": has no \"latitude\""));
  CHECK(Mentions(d, Severity::Error, "station 2 \"C\": \"latitude\" must be"));
}

TEST_CASE("unknown constituent names are reported in one line and dropped") {
  Diagnostics d;
  const auto stations = Read(
      "[" +
          Station("", R"([{"name": "SA_KV", "amplitude": 0.1, "phase": 1}, {"name": "M2", "amplitude": 1, "phase": 0},
                          {"name": "OO1", "amplitude": 0.01, "phase": 2}])") +
          "]",
      d);
  REQUIRE(stations.size() == 1);
  REQUIRE(stations[0].constituents.size() == 1);
  CHECK(stations[0].constituents[0].row == 29);
  CHECK(Mentions(d, Severity::Warning, "station 0 \"Port\": no table row for SA_KV, OO1; dropped"));
  CHECK_FALSE(d.HasErrors());
}

TEST_CASE("two constituents of one row: a repeat is dropped, an equal-speed constituent is added") {
  Diagnostics d;
  const auto stations = Read(
      "[" +
          Station("", R"([{"name": "MO3", "amplitude": 0.02, "phase": 0}, {"name": "2MK3", "amplitude": 0.02, "phase": 90},
                          {"name": "RHO", "amplitude": 0.3, "phase": 5}, {"name": "rho1", "amplitude": 0.4, "phase": 6}])") +
          "]",
      d);
  REQUIRE(stations.size() == 1);
  const auto& c = stations[0].constituents;
  REQUIRE(c.size() == 2);
  CHECK(c[0].row == 40);
  CHECK(c[0].amplitude == doctest::Approx(0.02 * std::sqrt(2.0)));
  CHECK(c[0].phase == doctest::Approx(45.0));
  CHECK((c[1].row == 7 && c[1].amplitude == 0.3));
  CHECK(Mentions(d, Severity::Warning, "rho1 repeats RHO (table row 7); dropped"));
  CHECK(Mentions(d, Severity::Note, "2MK3 has the Doodson numbers of MO3"));
}

TEST_CASE("values that cannot be stored: negative amplitude dropped, longitude beyond 180 wrapped") {
  Diagnostics d;
  const auto stations = Read(
      R"([{"name": "East", "latitude": 0, "longitude": 350, "zone": 0, "mystery": 1,
           "constituents": [{"name": "M2", "amplitude": -1, "phase": 0, "kind": "x"}]}])",
      d);
  REQUIRE(stations.size() == 1);
  CHECK((stations[0].longitude == -10.0 && stations[0].constituents.empty()));
  for (const char* warning : {"M2: negative amplitude cannot be stored; dropped", "unknown field \"mystery\" ignored",
                              "unknown field \"kind\" ignored"})
    CHECK_MESSAGE(Mentions(d, Severity::Warning, warning), warning);
}
