#include <doctest/doctest.h>

#include <string>

#include "tides/engine/calendar.h"
#include "tides/engine/sun_events.h"
#include "tides/engine/tide_engine.h"

using namespace br::tides;

namespace {

bool Same(const HourMinute& hm, int hour, int minute) { return hm.hour == hour && hm.minute == minute; }

// The four events as "HH:MM" (a sign kept), for one comparison against the expected day.
std::string Times(const std::array<HourMinute, 4>& events) {
  std::string text;
  for (const HourMinute& hm : events) text += std::to_string(hm.hour) + ":" + std::to_string(hm.minute) + " ";
  return text;
}

SunDay Day(CalendarDate date, double lat, double lon, int zone) { return ComputeSunDay(date, lat, lon, zone); }

}  // namespace

TEST_CASE("calendar arithmetic") {
  CHECK(JulianDayNumber({2000, 1, 1}) == 2451545);
  CHECK(DaysFromCivil({1970, 1, 1}) == 0);
  CHECK(DaysFromCivil({1996, 1, 1}) * 86400 == kPredictionEpochSeconds);
  CHECK(DaysFromCivil({1969, 12, 31}) == -1);
  CHECK(DaysFromCivil({2000, 3, 1}) - DaysFromCivil({2000, 2, 28}) == 2);
  CHECK(DaysFromCivil({2100, 3, 1}) - DaysFromCivil({2100, 2, 28}) == 1);
  CHECK(DaysFromCivil({1601, 1, 1}) == -134774);
  CHECK(DayCountDate({2000, 1, 1}, 18, 0) == 36526.75);
  CHECK(DayCountDate({1899, 12, 29}, 6, 0) == -1.25);
  CHECK(FixedOffsetLocalMidnight(-5 * 3600)({1996, 1, 1}) == kPredictionEpochSeconds + 5 * 3600);
  CHECK(FixedOffsetLocalMidnight(0)({2038, 1, 20}) > 2147483647LL);
}

TEST_CASE("the equator at the March equinox") {
  const SunDay d = Day({2000, 3, 20}, 0, 0, 0);
  CHECK(Times(d.times.events) == "5:19 6:3 18:10 18:55 ");
  const PublishedSunTimes p = PublishSunTimes(d);
  CHECK(p.kind == SunDayKind::kNormal);
  CHECK(Times(p.events) == Times(d.times.events));
}

TEST_CASE("midsummer at 50 and 60 degrees north") {
  const SunDay d50 = Day({2000, 6, 21}, 50, 0, 0);
  const double hours[4][2] = {{2.006, 5e-4}, {3.846, 3e-4}, {20.218, 2e-4}, {22.057, 2e-4}};
  for (int i = 0; i < 4; ++i) CHECK(d50.zoneHours[i] == doctest::Approx(hours[i][0]).epsilon(hours[i][1]));

  const SunDay d60 = Day({2000, 6, 21}, 60, 0, 0);
  CHECK(d60.zoneHours[1] == doctest::Approx(2.598).epsilon(4e-4));
  CHECK(d60.zoneHours[2] == doctest::Approx(21.466).epsilon(2e-4));
  // The sun never gets down to -12 degrees: no twilight events.
  CHECK((d60.zoneHours[0] == kNoSunEvent && d60.zoneHours[3] == kNoSunEvent));
  CHECK(d60.outcomes[0] == SunEventOutcome::kSunStaysAbove);
  CHECK(Same(d60.times.events[0], -1, 0));
  const PublishedSunTimes p = PublishSunTimes(d60);
  CHECK(p.kind == SunDayKind::kNormal);
  CHECK(Times(p.events) == "21:0 2:35 21:27 21:0 ");
}

TEST_CASE("a day with its morning twilight but no evening one") {
  // Near the date the sun stops reaching -12 degrees, one twilight can happen without the
  // other; the missing one alone takes the sunset's hour.
  SunDay d;
  d.zoneHours = {1.5, 3.25, 21.75, kNoSunEvent};
  d.outcomes = {SunEventOutcome::kOccurs, SunEventOutcome::kOccurs, SunEventOutcome::kOccurs,
                SunEventOutcome::kSunStaysAbove};
  const PublishedSunTimes p = PublishSunTimes(d);
  CHECK(p.kind == SunDayKind::kNormal);
  CHECK(Times(p.events) == "1:30 3:15 21:45 21:0 ");
}

TEST_CASE("80 degrees north: midnight sun and polar night") {
  const SunDay june = Day({2000, 6, 21}, 80, 0, 0);
  CHECK((june.zoneHours[1] == kNoSunEvent && june.zoneHours[2] == kNoSunEvent));
  CHECK(Same(june.times.events[1], -1, 0));
  CHECK(june.outcomes[1] == SunEventOutcome::kSunStaysAbove);
  PublishedSunTimes p = PublishSunTimes(june);
  CHECK(p.kind == SunDayKind::kPolarDay);
  CHECK(Times(p.events) == "0:0 0:0 23:59 23:59 ");

  const SunDay december = Day({2000, 12, 21}, 80, 0, 0);
  CHECK(december.outcomes[1] == SunEventOutcome::kSunStaysBelow);
  p = PublishSunTimes(december);
  CHECK(p.kind == SunDayKind::kPolarNight);
  CHECK(Times(p.events) == "0:0 0:0 0:0 0:0 ");
}

TEST_CASE("polar day and night are told by the sun, not by the month") {
  // Early September at 85 N: the sun still circles above the horizon.
  PublishedSunTimes p = PublishSunTimes(Day({2000, 9, 5}, 85, 0, 0));
  CHECK(p.kind == SunDayKind::kPolarDay);
  CHECK(Same(p.events[2], 23, 59));
  // End of March at 88 S: the sun has set for the winter, in a month a calendar rule
  // would call southern summer.
  p = PublishSunTimes(Day({2000, 3, 31}, -88, 0, 0));
  CHECK(p.kind == SunDayKind::kPolarNight);
  p = PublishSunTimes(Day({2000, 12, 21}, -80, 0, 0));
  CHECK(p.kind == SunDayKind::kPolarDay);
}

// The zone's sign is pinned by the zone +8 and -12 days below.
TEST_CASE("longitude shifts the events") {
  const SunDay utc = Day({2000, 3, 20}, 0, 0, 0);
  // Longitude moves the events the other way: 15 degrees east is an hour earlier in UT.
  const SunDay east = Day({2000, 3, 20}, 0, 15, 0);
  CHECK(east.zoneHours[1] == doctest::Approx(utc.zoneHours[1] - 1.0).epsilon(1e-3));
}

TEST_CASE("events outside the zone's day are brought into it before splitting") {
  // Zone +8 at longitude 0: sunrise at -1.93 h zone time.
  const SunDay d = Day({2000, 3, 20}, 0, 0, 8);
  CHECK(d.zoneHours[1] == doctest::Approx(-1.934).epsilon(1e-3));
  // The raw split keeps the sign: hour -1 would read as "no event".
  CHECK(Same(d.times.events[1], -1, -56));
  const PublishedSunTimes p = PublishSunTimes(d);
  CHECK(p.kind == SunDayKind::kNormal);
  CHECK(Times(p.events) == "21:19 22:3 10:10 10:55 ");
  // Zone -12 pushes sunset past midnight.
  const PublishedSunTimes late = PublishSunTimes(Day({2000, 3, 20}, 0, 0, -12));
  CHECK(Same(late.events[2], 6, 10));
  for (const HourMinute& hm : late.events) CHECK((hm.hour >= 0 && hm.hour <= 23 && hm.minute >= 0 && hm.minute <= 59));
}

TEST_CASE("hour and minute split") {
  CHECK(Same(SplitHours(-1.0), -1, 0));
  CHECK(Same(SplitHours(-0.25), 0, -15));
  CHECK(Same(SplitHours(24.5), 0, 30));
  CHECK(Same(SplitHours(24.0), 24, 0));
  CHECK(Same(SplitHours(6.066), 6, 3));
}
