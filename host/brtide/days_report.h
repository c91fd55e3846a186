// A tide table over several days, as "brtide days" prints it: for each day the sun and
// the high and low waters, as printed tide tables give them.
#pragma once

#include <optional>
#include <ostream>
#include <string>
#include <vector>

#include "host/brtide/station_positions.h"
#include "host/brtide/sun_reading.h"
#include "host/brtide/tide_turns.h"

namespace br::brtide {

struct TableDay {
  double date = 0.0;            // day-count date
  SunTimes sun;                 // as the port publishes them for that date
  std::vector<TideTurn> tides;  // minutes after the day's midnight (the table's clock)
};

struct DaysReport {
  long station = -1;
  std::string name;  // UTF-8, as the library gives it
  Position position;
  std::optional<Position> askedNear;
  long zone = 0;  // universal time = zone time + zone
  int clockOffsetMinutes = 0;  // of the tides: the computer's standard time or the station's
  bool stationTime = false;
  std::vector<TableDay> days;
};

void WriteDaysText(const DaysReport& table, std::ostream& out);
// "time,height_m,event" rows: each day's sun and high and low waters in time order, an
// event that does not happen with an empty time after its day's others.
void WriteDaysCsv(const DaysReport& table, std::ostream& out);
void WriteDaysJson(const DaysReport& table, std::ostream& out);

}  // namespace br::brtide
