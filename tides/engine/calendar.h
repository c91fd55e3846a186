// Calendar arithmetic the engine needs, valid for every year a 16-bit year holds.
#pragma once

#include <cstdint>
#include <functional>

namespace br::tides {

struct CalendarDate {
  std::int16_t year = 1970;
  std::uint8_t month = 1;  // 1..12
  std::uint8_t day = 1;    // 1..31
};

// Days from 1970-01-01 to date in the proleptic Gregorian calendar (negative before it).
std::int64_t DaysFromCivil(const CalendarDate& date);

// Integer Julian day number by the Fliegel-Van Flandern formula with truncating division
// (2000-01-01 gives 2451545).
std::int32_t JulianDayNumber(const CalendarDate& date);

// The platform's day-count date (days since 1899-12-30, fraction = time of day) of a
// date's hour and minute.
double DayCountDate(const CalendarDate& date, int hour, int minute);

// Seconds since 1970-01-01 00:00 UT of 00:00 local standard time on a date. The engine is
// given this conversion so that the tide day starts at the computer's local midnight.
using LocalMidnightFunction = std::function<std::int64_t(const CalendarDate&)>;

// The conversion for a fixed standard time of UT + offsetSeconds (UTC-5: -18000). On
// Windows pass -60 x the time zone's standard bias (Bias + StandardBias, minutes).
LocalMidnightFunction FixedOffsetLocalMidnight(std::int32_t offsetSeconds);

}  // namespace br::tides
