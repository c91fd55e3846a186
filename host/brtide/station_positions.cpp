#include "host/brtide/station_positions.h"

#include <algorithm>
#include <cmath>

namespace br::brtide {

namespace {
constexpr double kEarthRadiusKm = 6371.0088;
constexpr double kRadiansPerDegree = 0.017453292519943295;
}  // namespace

double DistanceKm(const Position& a, const Position& b) {
  const double lat1 = a.latitude * kRadiansPerDegree;
  const double lat2 = b.latitude * kRadiansPerDegree;
  const double dLat = lat2 - lat1;
  const double dLon = (b.longitude - a.longitude) * kRadiansPerDegree;
  // Haversine: stays accurate for short distances.
  const double h = std::sin(dLat / 2) * std::sin(dLat / 2) +
                   std::cos(lat1) * std::cos(lat2) * std::sin(dLon / 2) * std::sin(dLon / 2);
  return 2.0 * kEarthRadiusKm * std::asin(std::min(1.0, std::sqrt(h)));
}

long NearestStation(const std::vector<Position>& stations, const Position& target) {
  long best = -1;
  double bestDistance = 0.0;
  for (std::size_t i = 0; i < stations.size(); ++i) {
    const double distance = DistanceKm(stations[i], target);
    if (best < 0 || distance < bestDistance) {
      best = static_cast<long>(i);
      bestDistance = distance;
    }
  }
  return best;
}

std::vector<long> MatchStationNumbers(const std::vector<Position>& stations, const std::vector<Position>& ports) {
  std::vector<long> numbers;
  numbers.reserve(ports.size());
  std::size_t next = 0;
  for (const Position& port : ports) {
    long found = -1;
    for (std::size_t i = next; i < stations.size(); ++i) {
      if (stations[i].latitude == port.latitude && stations[i].longitude == port.longitude) {
        found = static_cast<long>(i);
        next = i + 1;
        break;
      }
    }
    numbers.push_back(found);
  }
  return numbers;
}

}  // namespace br::brtide
