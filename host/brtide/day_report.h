// One station's predicted day as brtide reports it: gathered from a TidesPort by the COM
// side, printed here as a readable table or as CSV.
#pragma once

#include <optional>
#include <ostream>
#include <string>
#include <vector>

#include "host/brtide/station_positions.h"

namespace br::brtide {

// The four sun events as the port publishes them: day-count dates in the station's zone time.
struct SunTimes {
  double beginTwilight = 0.0;
  double sunrise = 0.0;
  double sunset = 0.0;
  double endTwilight = 0.0;
};

enum class SunDayKind {
  Ordinary,    // the sun rises and sets
  PolarDay,    // published as rise 00:00, set 23:59: the sun stays up
  PolarNight,  // published as four times 00:00: the sun stays down
};

SunDayKind ClassifySunDay(const SunTimes& sun);
// When the sun does not reach the twilight depth the port gives the sunset hour instead;
// such a time lies after sunrise (morning) or not after sunset (evening).
bool HasMorningTwilight(const SunTimes& sun);
bool HasEveningTwilight(const SunTimes& sun);

struct DayReport {
  long station = -1;  // number in the folder
  std::string name;   // UTF-8
  Position position;
  std::optional<Position> askedNear;  // the position given to --near
  long zone = 0;                      // universal time = zone time + zone
  double predictionDate = 0.0;        // day-count date of the day
  double step = 1.0;                  // hours
  int computerOffsetMinutes = 0;      // the computer's standard time minus universal time
  SunTimes sun;
  std::vector<double> heights;        // metres, point k at midnight + k x step
  long maxIndex = 0;
  long minIndex = 0;
  double maxValue = 0.0;
  double minValue = 0.0;
};

// Seconds after the day's midnight of point k (rounded to the second).
long long PointSeconds(const DayReport& day, std::size_t k);

// The readable day: station, position, zone, sun, extremes and every height with a bar.
void WriteDayText(const DayReport& day, std::ostream& out);

// "time,height_m" and one row per point; the time is ISO 8601 in the computer's standard
// time with its offset ("2024-05-01T13:00:00+00:00"), the height in metres.
void WriteDayCsv(const DayReport& day, std::ostream& out);

}  // namespace br::brtide
