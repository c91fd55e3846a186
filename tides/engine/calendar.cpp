#include "tides/engine/calendar.h"

namespace br::tides {

std::int64_t DaysFromCivil(const CalendarDate& date) {
  // Howard Hinnant's days_from_civil: March-based years, 400-year eras.
  std::int64_t y = date.year;
  const std::int64_t m = date.month;
  const std::int64_t d = date.day;
  y -= m <= 2 ? 1 : 0;
  const std::int64_t era = (y >= 0 ? y : y - 399) / 400;
  const std::int64_t yoe = y - era * 400;
  const std::int64_t doy = (153 * (m > 2 ? m - 3 : m + 9) + 2) / 5 + d - 1;
  const std::int64_t doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
  return era * 146097 + doe - 719468;
}

std::int32_t JulianDayNumber(const CalendarDate& date) {
  const std::int32_t year = date.year, month = date.month, day = date.day;
  const std::int32_t a = (month - 14) / 12;
  return (1461 * (year + 4800 + a)) / 4 + (367 * (month - 2 - 12 * a)) / 12 -
         (3 * ((year + 4900 + a) / 100)) / 4 + day - 32075;
}

double DayCountDate(const CalendarDate& date, int hour, int minute) {
  constexpr std::int64_t kDaysFrom1899To1970 = 25569;
  const double days = static_cast<double>(DaysFromCivil(date) + kDaysFrom1899To1970);
  const double time = (hour * 60 + minute) / 1440.0;
  // Before 1899-12-30 the day count is negative and the time of day still counts away from
  // zero (-1.25 is 1899-12-29 06:00).
  return days < 0.0 ? days - time : days + time;
}

LocalMidnightFunction FixedOffsetLocalMidnight(std::int32_t offsetSeconds) {
  return [offsetSeconds](const CalendarDate& date) {
    return DaysFromCivil(date) * 86400 - offsetSeconds;
  };
}

}  // namespace br::tides
