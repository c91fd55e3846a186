// One station's predicted day, as "tidefiles predict" prints it.
#pragma once

#include <cstdint>
#include <optional>
#include <ostream>
#include <string>

#include "tides/engine/calendar.h"

namespace br::tidefiles {

struct PredictOptions {
  std::string folder;
  std::optional<std::int32_t> station;  // station number, or
  std::optional<double> latitude;       // a position in degrees, rounded to whole minutes
  std::optional<double> longitude;
  br::tides::CalendarDate date;
  double step = 1.0;        // hours, within the command line's checked range
  double utcOffset = 0.0;   // the computer's standard time minus UT, hours
  bool json = false;
};

// Predicts and prints the day: samples in metres (a point past 24:00 marked as the next
// day's), the first highest and lowest points, and the four sun events as a TidesPort
// publishes them, each marked when it falls on the day before or after and "--:--" (null
// in JSON) when it does not happen. A folder the check finds damaged is refused.
// Returns the exit status: 0, or 1 with a message on err.
int PrintPredictedDay(const PredictOptions& options, std::ostream& out, std::ostream& err);

}  // namespace br::tidefiles
