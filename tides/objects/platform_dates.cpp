#include "tides/objects/platform_dates.h"

#include <windows.h>
#include <oleauto.h>

#include <cmath>

namespace br::tides {

bool SplitDayCountDate(double date, CalendarDate& out) {
  // Wine's conversion turns NaN into a date (its range checks are comparisons): refuse it first.
  if (!std::isfinite(date)) return false;
  SYSTEMTIME st = {};
  if (!VariantTimeToSystemTime(date, &st)) return false;
  out.year = static_cast<std::int16_t>(st.wYear);
  out.month = static_cast<std::uint8_t>(st.wMonth);
  out.day = static_cast<std::uint8_t>(st.wDay);
  return true;
}

bool ComposeDayCountDate(const CalendarDate& date, int hour, int minute, double& out) {
  if (hour < 0 || hour > 23 || minute < 0 || minute > 59) return false;
  SYSTEMTIME st = {};
  st.wYear = static_cast<WORD>(date.year);
  st.wMonth = date.month;
  st.wDay = date.day;
  st.wHour = static_cast<WORD>(hour);
  st.wMinute = static_cast<WORD>(minute);
  return SystemTimeToVariantTime(&st, &out) != 0;
}

LocalMidnightFunction PlatformLocalMidnight() {
  TIME_ZONE_INFORMATION zone = {};
  const DWORD kind = GetTimeZoneInformation(&zone);
  LONG biasMinutes = 0;  // UTC = local + bias
  if (kind != TIME_ZONE_ID_INVALID) biasMinutes = zone.Bias + zone.StandardBias;
  return FixedOffsetLocalMidnight(static_cast<std::int32_t>(-60 * biasMinutes));
}

}  // namespace br::tides
