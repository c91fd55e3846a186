#include "host/brchart/chart_position.h"

#include <cmath>
#include <cstdio>

namespace br::brchart {

namespace {

constexpr double kPi = 3.14159265358979323846;

double MercatorDegrees(double lat) {
  const double limited = std::fmax(-89.5, std::fmin(89.5, lat));
  return std::log(std::tan(kPi / 4 + limited * kPi / 360)) * 180 / kPi;
}

double LatitudeOfMercator(double degrees) { return (2 * std::atan(std::exp(degrees * kPi / 180)) - kPi / 2) * 180 / kPi; }

std::string Part(double value, int degreeDigits, char positive, char negative) {
  const char hemisphere = value < 0 ? negative : positive;
  // Rounded to thousandths of a minute first, so 59.9996' becomes the next degree.
  long long thousandths = std::llround(std::fabs(value) * 60000.0);
  const long long degrees = thousandths / 60000;
  thousandths %= 60000;
  char text[48];
  std::snprintf(text, sizeof text, "%0*lld\xC2\xB0%02lld.%03lld'%c", degreeDigits, degrees, thousandths / 1000,
                thousandths % 1000, hemisphere);
  return text;
}

}  // namespace

bool PixelToPosition(const chartscene::SceneProjectionModel& projection, double x, double y,
                     chartscene::GeoPosition& position) {
  if (!(projection.pixelsPerDegree > 0) || !std::isfinite(projection.pixelsPerDegree)) return false;
  const double lon = projection.centreLon + (x - projection.width / 2.0) / projection.pixelsPerDegree;
  const double north = (y - projection.height / 2.0) / projection.pixelsPerDegree;
  const double lat = projection.mercator ? LatitudeOfMercator(MercatorDegrees(projection.centreLat) - north)
                                         : projection.centreLat - north;
  if (!std::isfinite(lat) || !std::isfinite(lon)) return false;
  position.lat = std::fmax(-90.0, std::fmin(90.0, lat));
  position.lon = lon;
  return true;
}

std::string PositionText(const chartscene::GeoPosition& position) {
  return Part(position.lat, 2, 'N', 'S') + " " + Part(position.lon, 3, 'E', 'W');
}

}  // namespace br::brchart
