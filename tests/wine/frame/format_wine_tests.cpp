// Date and time texts through the platform's locale formatting, and the
// portable formats as the Windows C runtime builds them.
#include <doctest/doctest.h>

#include <cmath>

#include "frame/format/CoordFormat.h"
#include "frame/format/DateTimeFormat.h"
#include "frame/format/NumberFormat.h"

namespace {
SYSTEMTIME MakeTime(WORD year, WORD month, WORD day, WORD hour, WORD minute) {
  SYSTEMTIME when{};
  when.wYear = year;
  when.wMonth = month;
  when.wDay = day;
  when.wHour = hour;
  when.wMinute = minute;
  return when;
}
}  // namespace

TEST_CASE("dates and times use the fixed patterns whatever the locale's own formats") {
  const SYSTEMTIME afternoon = MakeTime(2024, 3, 5, 14, 7);
  CHECK(FormatDate(afternoon) == "05.03.2024");
  CHECK(FormatTime(afternoon) == "14:07");
  CHECK(FormatDate(afternoon, MONTH_PATTERN) == "03-2024");
  CHECK(FormatTime(MakeTime(2000, 1, 1, 0, 5)) == "00:05");
  CHECK(FormatDate(MakeTime(1601, 1, 1, 0, 0)) == "01.01.1601");
}

TEST_CASE("platform dates are days since 1899-12-30") {
  const double afternoon = 45356.58819444444;  // 2024-03-05 14:07
  CHECK(FormatDate(afternoon) == "05.03.2024");
  CHECK(FormatTime(afternoon) == "14:07");
  CHECK(FormatDate(0.0) == "30.12.1899");
  CHECK(FormatDate(-1.5) == "29.12.1899");
}

TEST_CASE("dates the platform refuses give empty text") {
  CHECK(FormatDate(MakeTime(2024, 13, 1, 0, 0)).empty());
  CHECK(FormatTime(MakeTime(2024, 1, 1, 25, 0)).empty());
  CHECK(FormatDate(std::nan("")).empty());
  CHECK(FormatDate(1e12).empty());
}

// The no-value texts and plain widths are the native format suites'; here what the C runtime prints.
TEST_CASE("coordinates and numbers read the same as in the native build") {
  CHECK(FormatCoord("DD\xB0MM.mmm'$", COORD_LATITUDE, 12.5) == "12\xB0" "30.000'N");
  CHECK(FormatCoord("DD MM SS", COORD_LATITUDE, 12.2583333) == "12 15 29");
  CHECK(FormatLatitudeDM(-33.99999) == "33\xB0 59'.999 S");
  CHECK(FormatNumber(0.1, 20) == "0.10000000000000000555");
}
