#include <doctest/doctest.h>

#include "host/brtide/clock_text.h"
#include "host/brtide/day_report.h"

#include <algorithm>
#include <sstream>

using namespace br::brtide;

namespace {

constexpr double kDay = 45413.0;  // 2024-05-01

double At(int hour, int minute) { return kDay + (hour * 60 + minute) / 1440.0; }

std::vector<std::string> Lines(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream in(text);
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

bool HasLine(const std::vector<std::string>& lines, const std::string& wanted) {
  return std::find(lines.begin(), lines.end(), wanted) != lines.end();
}

void CheckLines(const std::vector<std::string>& lines, std::initializer_list<std::string> wanted) {
  for (const std::string& line : wanted) CHECK_MESSAGE(HasLine(lines, line), line);
}

// A six-hourly day: low 0.5 m at 06:00, high 4.25 m at 12:00 (first of two equal highs).
DayReport SampleDay() {
  DayReport day;
  day.station = 1491;
  day.name = "Brest";
  day.position = {48.383333333333333, -4.5};
  day.zone = -1;
  day.predictionDate = kDay;
  day.step = 6.0;
  day.computerOffsetMinutes = 0;
  day.sun = {At(6, 2), At(6, 41), At(21, 27), At(22, 6)};
  day.heights = {2.0, 0.5, 4.25, 1.0, 4.25};
  day.maxIndex = 2;
  day.minIndex = 1;
  day.maxValue = 4.25;
  day.minValue = 0.5;
  return day;
}

}  // namespace

TEST_CASE("the day text shows station, zone, sun, extremes and every height") {
  std::ostringstream out;
  WriteDayText(SampleDay(), out);
  const std::vector<std::string> lines = Lines(out.str());
  CHECK(lines.at(0) == "Station   1491  Brest");
  CHECK(lines.at(1) == "Position  48\xC2\xB0 23'.000 N  004\xC2\xB0 30'.000 W");
  CHECK(lines.at(2) == "Zone      -1 (station time UTC+01:00)");
  CHECK(lines.at(3) == "Date      2024-05-01");
  // Bars run from nothing at the lowest point to 40 marks at the highest.
  CheckLines(lines, {"  twilight begins  06:02", "  sunrise          06:41", "  sunset           21:27",
                     "  twilight ends    22:06", "Highest   4.250 m at 12:00", "Lowest    0.500 m at 06:00",
                     "Heights   metres, every 6 hours, times in this computer's standard time UTC+00:00",
                     "  00:00     2.000  ################", "  06:00     0.500    low",
                     "  12:00     4.250  " + std::string(40, '#') + "  high", "  24:00     4.250  " + std::string(40, '#')});
  CHECK(lines.size() == 17);
}

TEST_CASE("the day text tells polar days and missing twilight") {
  DayReport day = SampleDay();
  day.sun = {At(0, 0), At(0, 0), At(23, 59), At(23, 59)};
  std::ostringstream polarDay;
  WriteDayText(day, polarDay);
  CHECK(polarDay.str().find("\n  the sun stays above the horizon all day\n") != std::string::npos);
  CHECK(polarDay.str().find("sunrise") == std::string::npos);

  day.sun = {At(0, 0), At(0, 0), At(0, 0), At(0, 0)};
  std::ostringstream polarNight;
  WriteDayText(day, polarNight);
  CHECK(polarNight.str().find("\n  the sun stays below the horizon all day\n") != std::string::npos);

  // Latitude 60 N at midsummer: the sun never reaches -12 degrees; both twilight times
  // come as the sunset hour.
  day.sun = {At(21, 0), At(2, 35), At(21, 27), At(21, 0)};
  std::ostringstream light;
  WriteDayText(day, light);
  const std::vector<std::string> lines = Lines(light.str());
  CheckLines(lines, {"  twilight begins  --:--  (the sun stays above -12\xC2\xB0)", "  sunrise          02:35",
                     "  twilight ends    --:--  (the sun stays above -12\xC2\xB0)"});
}

TEST_CASE("the nearest-station line gives the distance from the asked position") {
  DayReport day = SampleDay();
  day.askedNear = Position{48.0, -4.5};
  std::ostringstream out;
  WriteDayText(day, out);
  CHECK(Lines(out.str()).at(2) == "Nearest   to 48\xC2\xB0 00'.000 N  004\xC2\xB0 30'.000 W, 42.6 km away");
}

TEST_CASE("steps that are not whole minutes print seconds") {
  DayReport day = SampleDay();
  day.step = 0.01;  // 36 seconds
  day.heights.assign(2401, 1.0);
  day.heights[100] = 2.0;
  day.maxIndex = 100;
  day.minIndex = 0;
  day.maxValue = 2.0;
  day.minValue = 1.0;
  std::ostringstream out;
  WriteDayText(day, out);
  const std::vector<std::string> lines = Lines(out.str());
  CheckLines(lines, {"Highest   2.000 m at 01:00:00", "  00:00:36     1.000", "  24:00:00     1.000"});
  CHECK(PointSeconds(day, 2400) == 86400);
}

TEST_CASE("CSV has one row per point with an ISO local time") {
  DayReport day = SampleDay();
  day.computerOffsetMinutes = 60;
  std::ostringstream out;
  WriteDayCsv(day, out);
  CHECK(out.str() ==
        "time,height_m\n"
        "2024-05-01T00:00:00+01:00,2.000\n"
        "2024-05-01T06:00:00+01:00,0.500\n"
        "2024-05-01T12:00:00+01:00,4.250\n"
        "2024-05-01T18:00:00+01:00,1.000\n"
        "2024-05-02T00:00:00+01:00,4.250\n");
}
