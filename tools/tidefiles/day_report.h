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
  double step = 1.0;        // hours
  double utcOffset = 0.0;   // the computer's standard time minus UT, hours
  bool json = false;
};

// Largest day accepted: a step of about 0.000024 hour (under a tenth of a second).
inline constexpr std::int32_t kMaxDaySamples = 1000000;

// Predicts and prints the day (samples in metres, the first highest and lowest points, the
// four sun events as the engine gives them: hour -1 where an event does not happen).
// Returns the exit status: 0, or 1 with a message on err.
int PrintPredictedDay(const PredictOptions& options, std::ostream& out, std::ostream& err);

}  // namespace br::tidefiles
