#include <doctest/doctest.h>

#include <string>

#include "tides/engine/sun_events.h"
#include "tides/engine/TideEngine.h"

using namespace br::tides;

namespace {

bool Same(const HourMinute& hm, int hour, int minute) { return hm.hour == hour && hm.minute == minute; }

// The four events as "HH:MM" (a sign kept), for one comparison against the expected day.
std::string Times(const std::array<HourMinute, 4>& events) {
  std::string text;
  for (const HourMinute& hm : events) text += std::to_string(hm.hour) + ":" + std::to_string(hm.minute) + " ";
  return text;
}

}  // namespace

TEST_CASE("the equator at the March equinox") {
  const SunDay d = ComputeSunDay({2000, 3, 20}, 0, 0, 0);
  CHECK(Times(d.times.events) == "5:19 6:3 18:10 18:55 ");
  const PublishedSunTimes p = PublishSunTimes(d);
  CHECK(p.kind == SunDayKind::kNormal);
  CHECK(Times(p.events) == Times(d.times.events));
}

TEST_CASE("midsummer at 50 and 60 degrees north") {
  const SunDay d50 = ComputeSunDay({2000, 6, 21}, 50, 0, 0);
  const double hours[4][2] = {{2.006, 5e-4}, {3.846, 3e-4}, {20.218, 2e-4}, {22.057, 2e-4}};
  for (int i = 0; i < 4; ++i) CHECK(d50.zoneHours[i] == doctest::Approx(hours[i][0]).epsilon(hours[i][1]));

  const SunDay d60 = ComputeSunDay({2000, 6, 21}, 60, 0, 0);
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

TEST_CASE("a sunset after midnight: the missing morning twilight is not put before the sunrise") {
  // Reykjavik (64 09'N 21 56'W, zone 0) at midsummer: the sun sets four minutes after
  // midnight and never gets down to -12 degrees. The sunset's hour would put the missing
  // twilight at 00:00, before the sunrise, where it reads as a twilight at night.
  const SunDay d = ComputeSunDay({2026, 6, 21}, 64.15, -21.933333, 0);
  REQUIRE(d.outcomes[kSunset] == SunEventOutcome::kOccurs);
  CHECK(d.zoneHours[kSunset] == doctest::Approx(24.07).epsilon(1e-3));
  CHECK((d.outcomes[kTwilightBegin] == SunEventOutcome::kSunStaysAbove && d.outcomes[kTwilightEnd] == SunEventOutcome::kSunStaysAbove));
  const PublishedSunTimes p = PublishSunTimes(d);
  CHECK(p.kind == SunDayKind::kNormal);
  CHECK(Times(p.events) == "2:55 2:55 0:4 0:0 ");
  CHECK(EventDayOffset(d.zoneHours[kSunset]) == 1);
  CHECK(EventDayOffset(d.zoneHours[kSunrise]) == 0);
  CHECK(EventDayOffset(-1.934) == -1);
}

TEST_CASE("80 degrees north: midnight sun and polar night; elsewhere told by the sun, not by the month") {
  const SunDay june = ComputeSunDay({2000, 6, 21}, 80, 0, 0);
  CHECK(june.outcomes[1] == SunEventOutcome::kSunStaysAbove);
  PublishedSunTimes p = PublishSunTimes(june);
  CHECK(p.kind == SunDayKind::kPolarDay);
  CHECK(Times(p.events) == "0:0 0:0 23:59 23:59 ");

  const SunDay december = ComputeSunDay({2000, 12, 21}, 80, 0, 0);
  CHECK(december.outcomes[1] == SunEventOutcome::kSunStaysBelow);
  p = PublishSunTimes(december);
  CHECK(p.kind == SunDayKind::kPolarNight);
  CHECK(Times(p.events) == "0:0 0:0 0:0 0:0 ");

  // Early September at 85 N the sun still circles above the horizon; end of March at 88 S
  // it has set for the winter, in a month a calendar rule would call southern summer.
  CHECK(PublishSunTimes(ComputeSunDay({2000, 9, 5}, 85, 0, 0)).kind == SunDayKind::kPolarDay);
  CHECK(PublishSunTimes(ComputeSunDay({2000, 3, 31}, -88, 0, 0)).kind == SunDayKind::kPolarNight);
}

TEST_CASE("longitude and zone shift the events; events outside the zone's day are brought into it") {
  // Longitude moves the events the other way: 15 degrees east is an hour earlier in UT.
  const SunDay utc = ComputeSunDay({2000, 3, 20}, 0, 0, 0), east = ComputeSunDay({2000, 3, 20}, 0, 15, 0);
  CHECK(east.zoneHours[1] == doctest::Approx(utc.zoneHours[1] - 1.0).epsilon(1e-3));
  // Zone +8 at longitude 0: sunrise at -1.93 h zone time; the raw split keeps the sign.
  const SunDay d = ComputeSunDay({2000, 3, 20}, 0, 0, 8);
  CHECK(d.zoneHours[1] == doctest::Approx(-1.934).epsilon(1e-3));
  CHECK(Same(d.times.events[1], -1, -56));
  const PublishedSunTimes p = PublishSunTimes(d);
  CHECK(p.kind == SunDayKind::kNormal);
  CHECK(Times(p.events) == "21:19 22:3 10:10 10:55 ");
  // Zone -12 pushes sunset past midnight.
  const PublishedSunTimes late = PublishSunTimes(ComputeSunDay({2000, 3, 20}, 0, 0, -12));
  CHECK(Same(late.events[2], 6, 10));
}
