#include <doctest/doctest.h>

#include "host/brtide/clock_text.h"

using namespace br::brtide;
using br::tides::CalendarDate;

namespace {
CalendarDate Date(int y, int m, int d) {
  return {static_cast<std::int16_t>(y), static_cast<std::uint8_t>(m), static_cast<std::uint8_t>(d)};
}
}  // namespace

TEST_CASE("day-count dates count days from 1899-12-30") {
  CHECK((DayCountOfDate(Date(1899, 12, 30)) == 0.0 && DayCountOfDate(Date(2000, 1, 1)) == 36526.0));
  CHECK(DayCountOfDate(Date(1970, 1, 1)) == 25569.0);
  CHECK((IsoDate(DateOfDayCount(36526)) == "2000-01-01" && IsoDate(DateOfDayCount(-1)) == "1899-12-29"));
  CHECK(IsoDate(DateOfDayCount(36585)) == "2000-02-29");
  // Every day of four centuries comes back as itself.
  for (std::int64_t day = -36500; day < 110000; ++day) {
    const CalendarDate date = DateOfDayCount(day);
    if (DayCountOfDate(date) != static_cast<double>(day)) {
      FAIL("day " << day << " came back as " << IsoDate(date));
    }
  }
}

TEST_CASE("a day-count date splits into its date and second of day") {
  DateTime t = SplitDayCount(36526.75);
  CHECK((IsoDate(t.date) == "2000-01-01" && t.secondOfDay == 18 * 3600));
  // 23:59 as the platform stores it, a hair off in binary, still reads 23:59.
  t = SplitDayCount(36526.0 + (23 * 60 + 59) / 1440.0);
  CHECK(t.secondOfDay == (23 * 60 + 59) * 60);
  // Half a second before midnight rounds into the next day.
  t = SplitDayCount(36526.0 + 86399.6 / 86400.0);
  CHECK((IsoDate(t.date) == "2000-01-02" && t.secondOfDay == 0));
}

TEST_CASE("instants after a midnight carry into the next day") {
  const DateTime t = AfterMidnight(36526, 24 * 3600);
  CHECK((IsoDate(t.date) == "2000-01-02" && t.secondOfDay == 0));
  CHECK(IsoDateTime(AfterMidnight(36526, 13 * 3600 + 30 * 60 + 5), 60) == "2000-01-01T13:30:05+01:00");
  CHECK(IsoDateTime(AfterMidnight(36526, 0), -210) == "2000-01-01T00:00:00-03:30");
}

TEST_CASE("clock and offset texts") {
  CHECK((ClockText(7 * 3600 + 5 * 60, false) == "07:05" && ClockText(24 * 3600, false) == "24:00"));
  CHECK(ClockText(3600 + 36, true) == "01:00:36");
  CHECK((OffsetText(0) == "+00:00" && OffsetText(330) == "+05:30" && OffsetText(-600) == "-10:00"));
  // Zone descriptions count the other way: universal time = zone time + zone.
  CHECK((ZoneOffsetText(-1) == "+01:00" && ZoneOffsetText(5) == "-05:00"));
}
