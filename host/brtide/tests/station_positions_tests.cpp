#include <doctest/doctest.h>

#include "host/brtide/position_text.h"
#include "host/brtide/station_positions.h"

using namespace br::brtide;

namespace {
constexpr double kMinute = 0.016666666666666666;  // how the library turns file minutes into degrees
}

TEST_CASE("distances on the sphere") {
  CHECK(DistanceKm({0, 0}, {1, 0}) == doctest::Approx(111.195).epsilon(1e-4));
  CHECK(DistanceKm({0, 179.5}, {0, -179.5}) == doctest::Approx(111.195).epsilon(1e-4));
  CHECK(DistanceKm({48.38, -4.5}, {48.38, -4.5}) == 0.0);
  // Brest to Plymouth, about 200 km.
  CHECK(DistanceKm({48.383, -4.495}, {50.368, -4.185}) == doctest::Approx(221.9).epsilon(0.01));
}

TEST_CASE("the nearest station is the first of the nearest") {
  const std::vector<Position> stations = {{10, 10}, {48.4, -4.5}, {48.4, -4.5}, {50.4, -4.2}};
  CHECK((NearestStation(stations, {48.0, -4.0}) == 1 && NearestStation(stations, {51, -4}) == 3));
  CHECK(NearestStation({}, {0, 0}) == -1);
}

TEST_CASE("ports from a box get their station numbers back in order") {
  const std::vector<Position> stations = {{1, 1}, {2, 2}, {1, 1}, {3, 3}};
  // Two stations share a position: the ports come in station order, so they match in turn.
  CHECK(MatchStationNumbers(stations, {{1, 1}, {1, 1}, {3, 3}}) == std::vector<long>{0, 2, 3});
  CHECK(MatchStationNumbers(stations, {{2, 2}, {9, 9}}) == std::vector<long>{1, -1});
  CHECK(MatchStationNumbers(stations, {}).empty());
}

TEST_CASE("positions print in the library's degree-minute format as UTF-8") {
  // 48 deg 23 min as stored: a hair below 23 minutes, which must not print as 22'.999.
  CHECK(LatitudeText(2903 * kMinute) == "48\xC2\xB0 23'.000 N");
  CHECK(LongitudeText(-270 * kMinute) == "004\xC2\xB0 30'.000 W");
  CHECK(LatitudeText(-33.5) == "33\xC2\xB0 30'.000 S");
  CHECK(LongitudeText(0.0) == "000\xC2\xB0 00'.000 E");
  CHECK(PositionText({-0.5, 151.25}) == "00\xC2\xB0 30'.000 S  151\xC2\xB0 15'.000 E");
}

TEST_CASE("columns count characters, not bytes") {
  CHECK((Utf8Width("Br\xC3\xA9hat") == 6 && PadRight("Br\xC3\xA9hat", 8) == "Br\xC3\xA9hat  "));
  CHECK((PadLeft("12", 5) == "   12" && PadRight("longer", 3) == "longer"));
}
