#include "toolkit/widgets/edit/MonthPicture.h"

#include <algorithm>
#include <cmath>

namespace toolkit {

namespace {

bool isDigit(char c) { return c >= '0' && c <= '9'; }

// Days from 1970-01-01 of a proleptic Gregorian date.
long long daysFromCivil(long long y, int m, int d) {
  y -= m <= 2;
  const long long era = (y >= 0 ? y : y - 399) / 400;
  const long long yoe = y - era * 400;
  const long long doy = (153 * (m + (m > 2 ? -3 : 9)) + 2) / 5 + d - 1;
  const long long doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
  return era * 146097 + doe - 719468;
}

CivilDate civilFromDays(long long z) {
  z += 719468;
  const long long era = (z >= 0 ? z : z - 146096) / 146097;
  const long long doe = z - era * 146097;
  const long long yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
  const long long doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
  const long long mp = (5 * doy + 2) / 153;
  CivilDate date;
  date.day = static_cast<int>(doy - (153 * mp + 2) / 5 + 1);
  date.month = static_cast<int>(mp < 10 ? mp + 3 : mp - 9);
  date.year = static_cast<int>(yoe + era * 400 + (date.month <= 2));
  return date;
}

const long long kPlatformEpoch = daysFromCivil(1899, 12, 30);

// Reads up to `maxDigits` digits at `pos`; answers -1 when there is none.
int readNumber(std::string_view text, size_t& pos, int maxDigits) {
  int value = -1;
  for (int n = 0; n < maxDigits && pos < text.size() && isDigit(text[pos]); ++n, ++pos)
    value = (value < 0 ? 0 : value * 10) + (text[pos] - '0');
  return value;
}

}  // namespace

int MonthPicture::daysInMonth(int year, int month) {
  static const int kDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  if (month < 1 || month > 12) return 31;
  if (month == 2) {
    const bool leap = (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
    return leap ? 29 : 28;
  }
  return kDays[month - 1];
}

CivilDate MonthPicture::parse(std::string_view picture, std::string_view text, const CivilDate& base) {
  CivilDate date = base;
  size_t p = 0, t = 0;
  while (p < picture.size()) {
    const char c = picture[p];
    if (c == '\'') {  // quoted literal: as many text characters as it holds
      size_t end = p + 1;
      while (end < picture.size() && picture[end] != '\'') ++end;
      t += end - p - 1;
      p = end < picture.size() ? end + 1 : end;
      continue;
    }
    size_t run = 1;
    while (p + run < picture.size() && picture[p + run] == c) ++run;
    if (c == 'd' || c == 'M' || c == 'y') {
      if ((c == 'd' || c == 'M') && run >= 3) {
        while (t < text.size() && !isDigit(text[t]) &&
               !(p + run < picture.size() && text[t] == picture[p + run]))
          ++t;  // a day or month name
      } else {
        const int maxDigits = c == 'y' && run >= 3 ? 5 : 2;
        const int value = readNumber(text, t, maxDigits);
        if (value >= 0) {
          if (c == 'd') date.day = value;
          else if (c == 'M') date.month = value;
          else if (run >= 3) date.year = value;
          else date.year = value < 30 ? 2000 + value : 1900 + value;
        }
      }
    } else if (c == 'g') {
      while (t < text.size() && !isDigit(text[t]) &&
             !(p + run < picture.size() && text[t] == picture[p + run]))
        ++t;  // the era
    } else {
      t += run;  // copied characters
    }
    p += run;
  }
  date.year = std::clamp(date.year, 100, 9999);
  date.month = std::clamp(date.month, 1, 12);
  date.day = std::clamp(date.day, 1, daysInMonth(date.year, date.month));
  return date;
}

double MonthPicture::toPlatformDate(const CivilDate& date) {
  return static_cast<double>(daysFromCivil(date.year, date.month, date.day) - kPlatformEpoch);
}

bool MonthPicture::fromPlatformDate(double value, CivilDate& date) {
  // Years 100 and 9999 bound the platform's own date range.
  if (!std::isfinite(value) || value < -657434.0 || value >= 2958466.0) return false;
  // Before the epoch the whole part still counts the days and the fraction the
  // time of day: -1.5 is noon of 1899-12-29.
  date = civilFromDays(static_cast<long long>(std::trunc(value)) + kPlatformEpoch);
  return true;
}

}  // namespace toolkit
