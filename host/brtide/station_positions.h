// Station positions: the nearest station to a place, and the station numbers of the ports
// that a box query returns (ports carry a position, not their number).
#pragma once

#include <vector>

namespace br::brtide {

struct Position {
  double latitude = 0.0;   // degrees, north positive
  double longitude = 0.0;  // degrees, east positive
};

// Distance along the earth's surface in kilometres (a sphere of the mean radius).
double DistanceKm(const Position& a, const Position& b);

// Number of the station nearest to target (the first of equally near ones); -1 when the
// list is empty.
long NearestStation(const std::vector<Position>& stations, const Position& target);

// Ports come in ascending station order, so each one's number is the next station at or
// after the previous match whose position equals the port's exactly (both are whole
// minutes divided the same way). -1 for a port no station matches.
std::vector<long> MatchStationNumbers(const std::vector<Position>& stations, const std::vector<Position>& ports);

}  // namespace br::brtide
