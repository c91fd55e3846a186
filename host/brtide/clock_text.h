// Dates and times as brtide prints them. The library hands out day-count dates (days since
// 1899-12-30, the fraction being the time of day); these turn them into calendar text.
#pragma once

#include <cstdint>
#include <string>

#include "tides/engine/calendar.h"

namespace br::brtide {

// Day-count date of a date's midnight.
double DayCountOfDate(const br::tides::CalendarDate& date);

// The date of whole day-count day (1899-12-30 is day 0).
br::tides::CalendarDate DateOfDayCount(std::int64_t day);

struct DateTime {
  br::tides::CalendarDate date;
  int secondOfDay = 0;  // 0..86399
};

// A day-count date to the nearest second.
DateTime SplitDayCount(double date);

// The instant seconds after the midnight of day (whole day-count day), carried into later days.
DateTime AfterMidnight(std::int64_t day, std::int64_t seconds);

std::string IsoDate(const br::tides::CalendarDate& date);  // "2024-05-01"

// "07:05", or "07:05:30" with seconds; hours past 23 are kept ("24:00" ends a day).
std::string ClockText(std::int64_t secondsSinceMidnight, bool withSeconds);

// "+01:00", "-03:30" for an offset from universal time in minutes.
std::string OffsetText(int minutes);

// Zone description (universal time = zone time + zone) as an offset text: zone -1 is "+01:00".
std::string ZoneOffsetText(long zone);

// "2024-05-01T13:30:00+01:00".
std::string IsoDateTime(const DateTime& time, int offsetMinutes);

}  // namespace br::brtide
