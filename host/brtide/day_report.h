// One station's predicted day as brtide reports it: gathered from a TidesPort by the COM
// side, printed here as a readable table, as CSV or as JSON.
#pragma once

#include <optional>
#include <ostream>
#include <string>
#include <vector>

#include "host/brtide/station_positions.h"
#include "host/brtide/sun_reading.h"
#include "host/brtide/tide_turns.h"

namespace br::brtide {

struct DayReport {
  long station = -1;  // number in the folder
  std::string name;   // UTF-8, as the library gives it (printed through PrintableText)
  Position position;
  std::optional<Position> askedNear;  // the position given to --near
  long zone = 0;                      // universal time = zone time + zone
  double predictionDate = 0.0;        // day-count date of the day
  double step = 1.0;                  // hours
  // The clock of the heights and the high and low waters: the computer's standard time
  // (the port's), or the station's when stationTime is set. Minutes east of UTC.
  int clockOffsetMinutes = 0;
  bool stationTime = false;
  SunTimes sun;
  std::vector<double> heights;  // metres, point k at midnight + k x step
  std::vector<TideTurn> tides;  // the day's high and low waters, minutes after midnight
};

// Seconds after the day's midnight of point k (rounded to the second).
long long PointSeconds(const DayReport& day, std::size_t k);

// The first highest and the first lowest point, as the library picks them.
std::size_t HighestPoint(const DayReport& day);
std::size_t LowestPoint(const DayReport& day);

// "01:00 (next day)" for a time of day after the day's 24:00, "22:03 (previous day)" for
// one before its 00:00, else the plain time ("24:00" itself ends the day).
std::string DayClock(long long secondsAfterMidnight, bool withSeconds);

// The readable day: station, position, zone, sun, high and low waters, and every height
// with a bar.
void WriteDayText(const DayReport& day, std::ostream& out);

// "time,height_m,event": every point (event empty), every high and low water ("high
// water", "low water") and the sun ("twilight begins", "sunrise", "sunset", "twilight
// ends", height empty), in time order; an event that does not happen comes last with an
// empty time. Times are ISO 8601 with their offset: the sun's in the station's zone time.
void WriteDayCsv(const DayReport& day, std::ostream& out);

// The same as one JSON object; an event that does not happen is null.
void WriteDayJson(const DayReport& day, std::ostream& out);

// Pieces the tide table over several days reuses: the CSV rows without the header line,
// and the "sun" and "tides" members of the JSON object (lines after the first start with
// indent).
void WriteDayCsvRows(const DayReport& day, std::ostream& out);
std::string DayEventsJson(const DayReport& day, const std::string& indent);
// "\"station\": N, \"name\": ..., \"latitude\": ..., \"longitude\": ..., \"zone\": Z" and, for a
// station found by position, the "nearest_to" member.
std::string StationJson(long station, const std::string& name, const Position& position, long zone,
                        const std::optional<Position>& askedNear);

}  // namespace br::brtide
