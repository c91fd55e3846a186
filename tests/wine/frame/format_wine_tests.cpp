// Date and time texts through the platform's locale formatting, and the
// portable formats as the Windows C runtime builds them.
#include <doctest/doctest.h>

#include <cmath>

#include "frame/format/CoordFormat.h"
#include "frame/format/DateTimeFormat.h"
#include "frame/format/NumberFormat.h"

TEST_CASE("dates and times: fixed patterns whatever the locale, platform dates counted from 1899-12-30") {
  SYSTEMTIME afternoon{2024, 3, 0, 5, 14, 7, 0, 0};
  CHECK(FormatDate(afternoon) == "05.03.2024");
  CHECK(FormatTime(afternoon) == "14:07");
  CHECK(FormatDate(afternoon, MONTH_PATTERN) == "03-2024");
  CHECK(FormatDate(45356.58819444444) == "05.03.2024");
  CHECK(FormatTime(45356.58819444444) == "14:07");
  CHECK(FormatDate(-1.5) == "29.12.1899");
  // Dates the platform refuses give empty text.
  afternoon.wMonth = 13;
  CHECK(FormatDate(afternoon).empty());
  CHECK(FormatDate(std::nan("")).empty());
  CHECK(FormatDate(1e12).empty());
}

// The other masks and widths are the native format suites'; here what the C runtime prints.
TEST_CASE("coordinates and numbers read the same as in the native build") {
  CHECK(FormatCoord("DD MM SS", COORD_LATITUDE, 12.2583333) == "12 15 29");
  CHECK(FormatLatitudeDM(-33.99999) == "33\xB0 59'.999 S");
  CHECK(FormatNumber(0.1, 20) == "0.10000000000000000555");
}
