#include "host/brtide/clock_text.h"

#include <cmath>
#include <cstdio>
#include <cstdlib>

namespace br::brtide {

namespace {

// Day-count day of 1970-01-01.
constexpr std::int64_t kUnixEpochDay = 25569;
constexpr std::int64_t kSecondsPerDay = 86400;

std::int64_t FloorDiv(std::int64_t a, std::int64_t b) {
  const std::int64_t q = a / b;
  return (a % b != 0 && ((a < 0) != (b < 0))) ? q - 1 : q;
}

}  // namespace

double DayCountOfDate(const br::tides::CalendarDate& date) {
  return static_cast<double>(br::tides::DaysFromCivil(date) + kUnixEpochDay);
}

br::tides::CalendarDate DateOfDayCount(std::int64_t day) {
  // Civil date from days since 1970-01-01 in the proleptic Gregorian calendar, counted in
  // 400-year eras that start on 1 March so that the leap day ends each year.
  const std::int64_t z = day - kUnixEpochDay + 719468;
  const std::int64_t era = FloorDiv(z, 146097);
  const std::int64_t dayOfEra = z - era * 146097;
  const std::int64_t yearOfEra = (dayOfEra - dayOfEra / 1460 + dayOfEra / 36524 - dayOfEra / 146096) / 365;
  const std::int64_t dayOfYear = dayOfEra - (365 * yearOfEra + yearOfEra / 4 - yearOfEra / 100);
  const std::int64_t monthFromMarch = (5 * dayOfYear + 2) / 153;
  const std::int64_t dayOfMonth = dayOfYear - (153 * monthFromMarch + 2) / 5 + 1;
  const std::int64_t month = monthFromMarch < 10 ? monthFromMarch + 3 : monthFromMarch - 9;
  const std::int64_t year = yearOfEra + era * 400 + (month <= 2 ? 1 : 0);
  br::tides::CalendarDate date;
  date.year = static_cast<std::int16_t>(year);
  date.month = static_cast<std::uint8_t>(month);
  date.day = static_cast<std::uint8_t>(dayOfMonth);
  return date;
}

DateTime AfterMidnight(std::int64_t day, std::int64_t seconds) {
  DateTime time;
  time.date = DateOfDayCount(day + FloorDiv(seconds, kSecondsPerDay));
  time.secondOfDay = static_cast<int>(seconds - FloorDiv(seconds, kSecondsPerDay) * kSecondsPerDay);
  return time;
}

DateTime SplitDayCount(double date) {
  const double day = std::floor(date);
  const auto seconds = static_cast<std::int64_t>(std::llround((date - day) * kSecondsPerDay));
  return AfterMidnight(static_cast<std::int64_t>(day), seconds);
}

std::string IsoDate(const br::tides::CalendarDate& date) {
  char text[16];
  std::snprintf(text, sizeof text, "%04d-%02d-%02d", date.year, date.month, date.day);
  return text;
}

std::string ClockText(std::int64_t secondsSinceMidnight, bool withSeconds) {
  const std::int64_t hours = secondsSinceMidnight / 3600;
  const int minutes = static_cast<int>(secondsSinceMidnight / 60 % 60);
  const int seconds = static_cast<int>(secondsSinceMidnight % 60);
  char text[32];
  if (withSeconds) {
    std::snprintf(text, sizeof text, "%02lld:%02d:%02d", static_cast<long long>(hours), minutes, seconds);
  } else {
    std::snprintf(text, sizeof text, "%02lld:%02d", static_cast<long long>(hours), minutes);
  }
  return text;
}

std::string OffsetText(int minutes) {
  char text[16];
  const int size = std::abs(minutes);
  std::snprintf(text, sizeof text, "%c%02d:%02d", minutes < 0 ? '-' : '+', size / 60, size % 60);
  return text;
}

std::string ZoneOffsetText(long zone) { return OffsetText(static_cast<int>(-zone * 60)); }

std::string IsoDateTime(const DateTime& time, int offsetMinutes) {
  return IsoDate(time.date) + "T" + ClockText(time.secondOfDay, true) + OffsetText(offsetMinutes);
}

}  // namespace br::brtide
