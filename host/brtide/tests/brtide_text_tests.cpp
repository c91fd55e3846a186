// brtide's text: the command line, dates and positions, the day as text and as CSV.
#include <doctest/doctest.h>

#include "host/brtide/ArgumentParser.h"
#include "host/brtide/clock_text.h"
#include "host/brtide/day_report.h"
#include "host/brtide/picture_title.h"
#include "host/brtide/position_text.h"
#include "host/brtide/printable_text.h"
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
      {{"ports", "--folder", "f", "--box", "1", "2", "3"}, "--box needs 4 values: SOUTH WEST NORTH EAST"},
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

// A six-hourly day at Brest: lowest point 0.5 m at 06:00, highest 4.25 m at 12:00 (the
// first of two equal highs); a low and a high water between the points.
DayReport SixHourlyDay() {
  DayReport day;
  day.station = 1491;
  day.name = "Brest";
  day.position = {48.383333333333333, -4.5};
  day.zone = -1;
  day.predictionDate = kDay;
  day.step = 6.0;
  day.clockOffsetMinutes = 60;
  day.sun = {At(6, 2), At(6, 41), At(21, 27), At(22, 6)};
  day.heights = {2.0, 0.5, 4.25, 1.0, 4.25};
  day.tides = {{352.4, 0.47, false}, {735.6, 4.31, true}};
  return day;
}

TEST_CASE("the day as text, CSV and JSON") {
  std::ostringstream text, csv, json;
  WriteDayText(SixHourlyDay(), text);
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
                      "Tides     high and low water, times in this computer's standard time UTC+01:00\n"
                      "  low   05:52    0.47 m\n"
                      "  high  12:16    4.31 m\n"
                      "Heights   metres, every 6 hours, times in this computer's standard time UTC+01:00\n"
                      "  00:00     2.000  ################\n"
                      "  06:00     0.500    lowest\n"
                      "  12:00     4.250  " + std::string(40, '#') + "  highest\n"
                      "  18:00     1.000  #####\n"
                      "  24:00     4.250  " + std::string(40, '#') + "\n");
  // On a computer kept on UTC the sun stays on the station's clock, in its time order: the
  // twilight at 06:02 there is 05:02 UTC and the sunrise 05:41 UTC, before the low water
  // at 05:52 UTC. The evening twilight does not happen: an empty time, last.
  DayReport utc = SixHourlyDay();
  utc.clockOffsetMinutes = 0;
  utc.sun.endTwilight = At(21, 0);  // the library's mark: the sunset's hour
  WriteDayCsv(utc, csv);
  CHECK(csv.str() == "time,height_m,event\n2024-05-01T00:00:00+00:00,2.000,\n2024-05-01T06:02:00+01:00,,twilight begins\n"
                     "2024-05-01T06:41:00+01:00,,sunrise\n2024-05-01T05:52:00+00:00,0.470,low water\n"
                     "2024-05-01T06:00:00+00:00,0.500,\n2024-05-01T12:00:00+00:00,4.250,\n"
                     "2024-05-01T12:16:00+00:00,4.310,high water\n2024-05-01T18:00:00+00:00,1.000,\n"
                     "2024-05-01T21:27:00+01:00,,sunset\n2024-05-02T00:00:00+00:00,4.250,\n,,twilight ends\n");
  WriteDayJson(utc, json);
  CHECK(json.str() == "{\n  \"station\": 1491, \"name\": \"Brest\", \"latitude\": 48.383333, \"longitude\": -4.500000, \"zone\": -1,\n"
                      "  \"date\": \"2024-05-01\",\n"
                      "  \"sun\": {\"day\": \"ordinary\", \"twilight_begins\": \"2024-05-01T06:02:00+01:00\", "
                      "\"sunrise\": \"2024-05-01T06:41:00+01:00\", \"sunset\": \"2024-05-01T21:27:00+01:00\", "
                      "\"twilight_ends\": null},\n"
                      "  \"tides\": [\n    {\"time\": \"2024-05-01T05:52:00+00:00\", \"height_m\": 0.470, \"type\": \"low\"},\n"
                      "    {\"time\": \"2024-05-01T12:16:00+00:00\", \"height_m\": 4.310, \"type\": \"high\"}\n  ],\n"
                      "  \"step_hours\": 6,\n  \"heights\": [\n"
                      "    {\"time\": \"2024-05-01T00:00:00+00:00\", \"height_m\": 2.000},\n"
                      "    {\"time\": \"2024-05-01T06:00:00+00:00\", \"height_m\": 0.500},\n"
                      "    {\"time\": \"2024-05-01T12:00:00+00:00\", \"height_m\": 4.250},\n"
                      "    {\"time\": \"2024-05-01T18:00:00+00:00\", \"height_m\": 1.000},\n"
                      "    {\"time\": \"2024-05-02T00:00:00+00:00\", \"height_m\": 4.250}\n  ]\n}\n");
}


namespace {
SunTimes Published(int beginH, int beginM, int riseH, int riseM, int setH, int setM, int endH, int endM) {
  return {At(beginH, beginM), At(riseH, riseM), At(setH, setM), At(endH, endM)};
}
// "happens/day/HH:MM" of each event, for one comparison.
std::string Reading(const SunDay& sun) {
  std::string text;
  for (const SunEvent& e : sun.events)
    text += e.happens ? std::to_string(e.dayOffset) + "/" + ClockText(e.minuteOfDay * 60, false) + " " : "none ";
  return text;
}
}  // namespace

TEST_CASE("published sun times read as a sailor reads them") {
  // Reykjavik at midsummer (zone 0, 21 56'W): the sunset after midnight belongs to the
  // next day; neither twilight happens, whether marked at the sunrise or, as the library
  // published it before, at the sunset's hour (00:00).
  CHECK(Reading(ReadSunDay(Published(2, 55, 2, 55, 0, 4, 0, 0), -21.933, 0)) == "none 0/02:55 1/00:04 none ");
  CHECK(Reading(ReadSunDay(Published(0, 0, 2, 55, 0, 4, 0, 0), -21.933, 0)) == "none 0/02:55 1/00:04 none ");
  // A station kept on UTC-8 at Greenwich: its morning falls on the day before.
  CHECK(Reading(ReadSunDay(Published(21, 19, 22, 3, 10, 10, 10, 55), 0.0, 8)) == "-1/21:19 -1/22:03 0/10:10 0/10:55 ");
  // 60 N at midsummer: no twilight, marked at the sunset's hour; Brest in June: the
  // evening twilight ends after midnight.
  CHECK(Reading(ReadSunDay(Published(21, 0, 2, 35, 21, 27, 21, 0), 0.0, 0)) == "none 0/02:35 0/21:27 none ");
  CHECK(Reading(ReadSunDay(Published(4, 10, 6, 5, 22, 30, 0, 20), -4.5, -1)) == "0/04:10 0/06:05 0/22:30 1/00:20 ");
  CHECK(ReadSunDay(Published(0, 0, 0, 0, 23, 59, 23, 59), 15.0, -1).kind == SunDayKind::PolarDay);
  CHECK(ReadSunDay(Published(0, 0, 0, 0, 0, 0, 0, 0), 15.0, -1).kind == SunDayKind::PolarNight);

  // In the day's text: "--:--" for what does not happen, the next day marked, and points
  // of a step that does not divide 24 hours past 24:00 marked as the next day's.
  DayReport day = SixHourlyDay();
  day.sun = Published(2, 55, 2, 55, 0, 4, 0, 0);
  day.position = {64.15, -21.933};
  day.zone = 0;
  day.step = 5.0;
  day.heights = {2.0, 0.5, 4.25, 1.0, 4.25, 3.0};
  std::ostringstream text;
  WriteDayText(day, text);
  for (const char* line : {"  twilight begins  --:--  (the sun stays above -12\xC2\xB0)\n", "  sunrise          02:55\n",
                           "  sunset           00:04 (next day)\n", "  00:00                2.000",
                           "  01:00 (next day)     3.000  ###"}) {
    CHECK_MESSAGE(text.str().find(line) != std::string::npos, line, "\n", text.str());
  }
}

TEST_CASE("the picture's title names the clock of the curve and of the sun bands") {
  DayReport day = SixHourlyDay();
  day.clockOffsetMinutes = 0;
  CHECK(PictureTitle(day) == std::vector<std::string>{"Brest (station 1491)  2024-05-01  heights in metres",
                                                      "curve: this computer's standard time UTC+00:00    sun bands: station time UTC+01:00"});
  day.stationTime = true;
  day.clockOffsetMinutes = 60;
  CHECK(PictureTitle(day)[1] == "curve and sun bands: station time UTC+01:00");
}

TEST_CASE("names are data: control characters never reach the terminal, quotes never break the JSON") {
  // ESC [2J would clear the screen; CR, LF and BEL, and the 8-bit CSI (U+009B), likewise.
  CHECK(PrintableText("Bad\x1B[2Jname\r\n\a") == "Bad?[2Jname???");
  CHECK(PrintableText("Csi\xC2\x9B" "1m ok") == "Csi?1m ok");
  CHECK(PrintableText("Saint-Nazaire \xC3\xA9t\xC3\xA9") == "Saint-Nazaire \xC3\xA9t\xC3\xA9");
  CHECK(JsonString("Say \"hi\"\\\x1B") == "\"Say \\\"hi\\\"\\\\\\u001b\"");
}
