#include <doctest/doctest.h>

#include <cmath>

#include "host/brchart/chart_position.h"
#include "host/chartscene/model/scene_geometry.h"

using namespace br::brchart;
using br::chartscene::GeoPosition;
using br::chartscene::SceneProjectionModel;

namespace {

SceneProjectionModel Chart(bool mercator) {
  SceneProjectionModel p;
  p.name = "chart";
  p.mercator = mercator;
  p.centreLat = 48.3550;
  p.centreLon = -4.5600;
  p.pixelsPerDegree = 12000;
  p.width = 1024;
  p.height = 768;
  return p;
}

}  // namespace

TEST_CASE("pixels back to positions: the centre, and the inverse of the host's projection") {
  for (const bool mercator : {true, false}) {
    CAPTURE(mercator);
    const SceneProjectionModel p = Chart(mercator);
    GeoPosition at;
    REQUIRE(PixelToPosition(p, 512, 384, at));
    CHECK(at.lat == doctest::Approx(48.355).epsilon(1e-12));
    CHECK(at.lon == doctest::Approx(-4.56).epsilon(1e-12));
    for (const GeoPosition& geo : {GeoPosition{48.3403, -4.6165}, GeoPosition{48.3700, -4.5000},
                                   GeoPosition{48.3300, -4.6300}}) {
      const auto pixel = br::chartscene::ProjectToPixel(p, geo.lat, geo.lon);
      GeoPosition back;
      REQUIRE(PixelToPosition(p, pixel.x, pixel.y, back));
      // Within the half pixel the host rounds to.
      CHECK(std::fabs(back.lon - geo.lon) <= 0.5 / 12000 + 1e-12);
      CHECK(std::fabs(back.lat - geo.lat) <= 0.5 / 12000 + 1e-12);
    }
  }
  // Mercator stretches latitude: a pixel north is less than 1/12000 degree at 48°N.
  GeoPosition a, b;
  REQUIRE(PixelToPosition(Chart(true), 0, 0, a));
  REQUIRE(PixelToPosition(Chart(true), 0, 1, b));
  CHECK(a.lat - b.lat == doctest::Approx(std::cos(48.376 * 3.14159265358979 / 180) / 12000).epsilon(1e-3));

  SceneProjectionModel flat = Chart(true);
  flat.pixelsPerDegree = 0;
  CHECK_FALSE(PixelToPosition(flat, 1, 1, a));
  flat.pixelsPerDegree = std::nan("");
  CHECK_FALSE(PixelToPosition(flat, 1, 1, a));
}

TEST_CASE("positions as the status line shows them") {
  CHECK(PositionText({48.3403, -4.6165}) == "48\xC2\xB0" "20.418'N 004\xC2\xB0" "36.990'W");
  CHECK(PositionText({-33.5, 151.25}) == "33\xC2\xB0" "30.000'S 151\xC2\xB0" "15.000'E");
  CHECK(PositionText({0, 0}) == "00\xC2\xB0" "00.000'N 000\xC2\xB0" "00.000'E");
  // Rounding to the thousandth of a minute carries into the degree.
  CHECK(PositionText({10.99999999, -0.0000001}) == "11\xC2\xB0" "00.000'N 000\xC2\xB0" "00.000'W");
}
