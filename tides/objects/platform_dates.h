// The platform's date conversions, as the tide objects use them: day-count dates
// (days since 1899-12-30) to calendar dates and back, and local standard midnight.
#pragma once

#include "tides/engine/calendar.h"

namespace br::tides {

// The calendar date of a day-count date; false when the platform cannot convert it.
bool SplitDayCountDate(double date, CalendarDate& out);

// The day-count date of a date at hour:minute:00; false for a time that is not a valid
// time of day or a date the platform refuses.
bool ComposeDayCountDate(const CalendarDate& date, int hour, int minute, double& out);

// Seconds since 1970 UT of a date's local standard midnight, from the time zone's
// standard bias (valid for any date, summer time never applied).
LocalMidnightFunction PlatformLocalMidnight();

}  // namespace br::tides
