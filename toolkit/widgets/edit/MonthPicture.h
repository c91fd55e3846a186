#pragma once
// Reads a date back from a text that the platform's date formatting made with a
// picture such as "MM-yyyy" or "dd.MM.yyyy", and converts between calendar dates
// and platform dates (days since 1899-12-30).

#include <string_view>

namespace toolkit {

struct CivilDate {
  int year = 1899;
  int month = 12;
  int day = 30;
};

class MonthPicture {
public:
  // Walks picture and text together: numeric fields (d, dd, M, MM, y, yy, yyyy)
  // take their digits from the text; names (ddd, MMM, ...), eras and quoted
  // literals are stepped over. Fields the picture lacks keep the values of
  // `base`. The result is a valid date: month 1..12, day within the month,
  // year 100..9999 (two-digit years fall in 1930..2029).
  static CivilDate parse(std::string_view picture, std::string_view text, const CivilDate& base);

  static double toPlatformDate(const CivilDate& date);
  // Dates outside years 100..9999, and values that are not finite, give false.
  static bool fromPlatformDate(double value, CivilDate& date);

  static int daysInMonth(int year, int month);
};

}  // namespace toolkit
