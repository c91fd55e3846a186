// Date and time texts through the platform's locale formatting (the portable formats:
// the native format suite).
#include <doctest/doctest.h>

#include <cmath>

#include "frame/format/date_time_format.h"

using namespace br;

TEST_CASE("dates and times: fixed patterns whatever the locale, platform dates counted from 1899-12-30") {
  SYSTEMTIME afternoon{2024, 3, 0, 5, 14, 7, 0, 0};
  CHECK((FormatDate(afternoon) == "05.03.2024" && FormatTime(afternoon) == "14:07"));
  CHECK(FormatDate(afternoon, MONTH_PATTERN) == "03-2024");
  CHECK((FormatDate(45356.58819444444) == "05.03.2024" && FormatTime(45356.58819444444) == "14:07"));
  CHECK(FormatDate(-1.5) == "29.12.1899");
  afternoon.wMonth = 13;  // dates the platform refuses give empty text
  CHECK((FormatDate(afternoon).empty() && FormatDate(std::nan("")).empty() && FormatDate(1e12).empty()));
}
