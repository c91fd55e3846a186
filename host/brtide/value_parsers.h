// Values of brtide's options: dates, coordinates, steps and station numbers. Every parser
// takes the whole text or nothing, independent of the C locale.
#pragma once

#include <optional>
#include <string>

#include "tides/engine/calendar.h"

namespace br::brtide {

// A real calendar date "YYYY-MM-DD" with a year from 100 to 9999 (the platform date range).
std::optional<br::tides::CalendarDate> ParseIsoDate(const std::string& text);

// A finite decimal number ("-4.5", "+12", "1e1").
std::optional<double> ParseNumber(const std::string& text);

// Decimal degrees, north and east positive; a trailing hemisphere letter is allowed
// instead of a sign ("48.38N", "4.5W"). Latitudes -90..90, longitudes -180..180.
std::optional<double> ParseLatitude(const std::string& text);
std::optional<double> ParseLongitude(const std::string& text);

// Step between heights in hours, up to a whole day. The smallest step keeps the day's
// 24001 points well inside the engine's 16-bit sample count.
inline constexpr double kMinStepHours = 0.001;
inline constexpr double kMaxStepHours = 24.0;
std::optional<double> ParseStep(const std::string& text);

// A station number: a whole number 0..32766 (station numbers are signed 16-bit).
std::optional<long> ParseStationNumber(const std::string& text);

}  // namespace br::brtide
