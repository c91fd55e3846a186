// brtide's text: the command line, dates and positions, the day as text and as CSV.
#include <doctest/doctest.h>

#include "host/brtide/ArgumentParser.h"
#include "host/brtide/clock_text.h"
#include "host/brtide/day_report.h"
#include "host/brtide/position_text.h"
#include "host/brtide/requests.h"  // BrtideCommands
#include "host/brtide/value_parsers.h"

#include <sstream>

using namespace br::brtide;

// Good command lines: the Wine suites run brtide with them.
TEST_CASE("command line mistakes give one clear line each") {
  const ArgumentParser parser(BrtideCommands());
  const std::pair<std::vector<std::string>, const char*> mistakes[] = {
      {{}, "no command given (try --help)"},
      {{"tides"}, "unknown command \"tides\" (try --help)"},
      {{"ports", "--folder", "f", "--box", "1", "2", "3"}, "--box needs 4 values: LATMIN LONMIN LATMAX LONMAX"},
      {{"ports", "--folder", "f", "--folder", "g", "--box", "1", "2", "3", "4"}, "--folder is given twice"},
      {{"ports", "--folder", "f", "--port", "1"}, "unknown option --port for ports (try ports --help)"},
      {{"ports", "--folder", "f", "stray"}, "unexpected argument \"stray\" for ports"},
      {{"day", "--folder", "f", "--port", "1"}, "day needs --date YYYY-MM-DD"},
      {{"day", "--csv=yes"}, "--csv does not take \"=\""},
  };
  for (const auto& [args, error] : mistakes) {
    const ParseOutcome m = parser.Parse(args);
    CHECK((!m.ok && m.error == error));
  }
}

TEST_CASE("dates are real days as YYYY-MM-DD; day counts run from 1899-12-30 and round to the second") {
  CHECK(ParseIsoDate("2000-02-29"));
  for (const char* bad : {"2023-02-29", "1900-02-29", "2024-04-31", "2024-13-01", "2024-4-01", "2024-04-01x"})
    CHECK_FALSE(ParseIsoDate(bad));
  CHECK((DayCountOfDate({1899, 12, 30}) == 0.0 && IsoDate(DateOfDayCount(36585)) == "2000-02-29"));
  // 23:59 as the platform stores it, a hair off in binary, still reads 23:59.
  CHECK(SplitDayCount(36526.0 + (23 * 60 + 59) / 1440.0).secondOfDay == (23 * 60 + 59) * 60);
  // Half a second before midnight rounds into the next day.
  const DateTime t = SplitDayCount(36526.0 + 86399.6 / 86400.0);
  CHECK((IsoDate(t.date) == "2000-01-02" && t.secondOfDay == 0));
  // 48 deg 23 min as the library stores it, a hair below 23 minutes: not 22'.999.
  CHECK(LatitudeText(2903 * 0.016666666666666666) == "48\xC2\xB0 23'.000 N");
}

constexpr double kDay = 45413.0;  // 2024-05-01
static double At(int hour, int minute) { return kDay + (hour * 60 + minute) / 1440.0; }
// A six-hourly day: low 0.5 m at 06:00, high 4.25 m at 12:00 (first of two equal highs).
const DayReport kDayReport = {1491, "Brest", {48.383333333333333, -4.5}, std::nullopt, -1, kDay, 6.0, 60,
                              {At(6, 2), At(6, 41), At(21, 27), At(22, 6)}, {2.0, 0.5, 4.25, 1.0, 4.25}, 2, 1, 4.25, 0.5};

TEST_CASE("the day as text and as CSV") {
  std::ostringstream text, csv;
  WriteDayText(kDayReport, text);
  // Bars run from nothing at the lowest point to 40 marks at the highest.
  CHECK(text.str() == "Station   1491  Brest\n"
                      "Position  48\xC2\xB0 23'.000 N  004\xC2\xB0 30'.000 W\n"
                      "Zone      -1 (station time UTC+01:00)\n"
                      "Date      2024-05-01\n"
                      "Sun       station time UTC+01:00\n"
                      "  twilight begins  06:02\n"
                      "  sunrise          06:41\n"
                      "  sunset           21:27\n"
                      "  twilight ends    22:06\n"
                      "Highest   4.250 m at 12:00\n"
                      "Lowest    0.500 m at 06:00\n"
                      "Heights   metres, every 6 hours, times in this computer's standard time UTC+01:00\n"
                      "  00:00     2.000  ################\n"
                      "  06:00     0.500    low\n"
                      "  12:00     4.250  " + std::string(40, '#') + "  high\n"
                      "  18:00     1.000  #####\n"
                      "  24:00     4.250  " + std::string(40, '#') + "\n");
  WriteDayCsv(kDayReport, csv);
  CHECK(csv.str() == "time,height_m\n2024-05-01T00:00:00+01:00,2.000\n2024-05-01T06:00:00+01:00,0.500\n"
                     "2024-05-01T12:00:00+01:00,4.250\n2024-05-01T18:00:00+01:00,1.000\n"
                     "2024-05-02T00:00:00+01:00,4.250\n");
}
