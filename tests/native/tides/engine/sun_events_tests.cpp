#include <doctest/doctest.h>

#include <cmath>
#include <cstdlib>
#include <cstring>
#include <string>

#include "tides/engine/station_files.h"
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

// The events by their definition, each on its own from noon with the library's fmod, as a
// reference for the day's shared passes.
namespace definition {
constexpr double kRad = 0.017453292519943295;
constexpr double kDeg = 57.29577951308232;

void Sun(std::int32_t J, double t, double& gha, double& declination) {
  const double T = (t * 0.041666666666666664 + J - 2451545.0) * 2.7378507871321012e-05;
  const double L = std::fmod(280.46 + 36000.77 * T, 360.0);
  const double G = std::fmod(357.528 + 35999.05 * T, 360.0);
  const double C = 1.915 * std::sin(G * kRad) + 0.02 * std::sin(2.0 * G * kRad);
  const double lambda = std::fmod(L + C, 360.0);
  const double epsilon = std::fmod(23.4393 - 0.013 * T, 360.0);
  const double E = -C + 2.466 * std::sin(2.0 * lambda * kRad) - 0.053 * std::sin(4.0 * lambda * kRad);
  gha = std::fmod(15.0 * t - 180.0 + E, 360.0);
  declination = std::asin(std::sin(epsilon * kRad) * std::sin(lambda * kRad)) * kDeg;
}

double Event(std::int32_t J, double phi, double lambda, int sign, double h0, SunEventOutcome& why) {
  why = SunEventOutcome::kNoConvergence;
  double t = 12.0;
  for (int pass = 0; pass < 26; ++pass) {
    double gha = 0.0, delta = 0.0;
    Sun(J, t, gha, delta);
    const double c = (std::sin(h0 * kRad) - std::sin(phi * kRad) * std::sin(delta * kRad)) /
                     (std::cos(phi * kRad) * std::cos(delta * kRad));
    if (!(std::fabs(c) < 1.0)) {
      if (c >= 1.0) why = SunEventOutcome::kSunStaysBelow;
      else if (c <= -1.0) why = SunEventOutcome::kSunStaysAbove;
      return kNoSunEvent;
    }
    const double next = t - std::fmod(sign * std::acos(c) * kDeg + gha + lambda, 360.0) / 15.0;
    if (std::fabs(next - t) < 1e-7) {
      why = SunEventOutcome::kOccurs;
      return next;
    }
    t = next;
  }
  return kNoSunEvent;
}
}  // namespace definition

// Compares a day's four events with the definition bit for bit; counts the mismatches.
int Mismatches(const CalendarDate& date, double latitude, double longitude, int zone) {
  const SunDay day = ComputeSunDay(date, latitude, longitude, zone);
  const int signs[4] = {+1, +1, -1, -1};
  const double altitudes[4] = {kTwilightAltitude, kSunriseAltitude, kSunriseAltitude, kTwilightAltitude};
  int wrong = 0;
  const auto same = [](double a, double b) { return std::memcmp(&a, &b, sizeof a) == 0; };
  for (int i = 0; i < 4; ++i) {
    const std::int32_t J = JulianDayNumber(date);
    SunEventOutcome why, alone;
    const double ut = definition::Event(J, latitude, longitude, signs[i], altitudes[i], why);
    const double zoneTime = why == SunEventOutcome::kOccurs ? ut - zone : ut;
    if (why != day.outcomes[i] || !same(zoneTime, day.zoneHours[i])) ++wrong;
    if (!same(ut, ComputeSunEvent(J, latitude, longitude, signs[i], altitudes[i], &alone)) || alone != why) ++wrong;
  }
  return wrong;
}

}  // namespace

TEST_CASE("the day's events are those of the definition, bit for bit") {
  SUBCASE("the world set's stations over dates from 1900 to 2100") {
    const char* root = std::getenv("BR_SOURCE_DIR");
    REQUIRE_MESSAGE(root != nullptr, "BR_SOURCE_DIR names the source tree");
    std::string folder = std::string(root) + "/data/world";
#ifdef _WIN32
    if (folder.front() == '/') folder = "Z:" + folder;
    for (char& c : folder) c = c == '/' ? '\\' : c;
#endif
    REQUIRE(OpenTideFiles(folder.c_str()) == 0);
    const CalendarDate dates[] = {{1900, 1, 1}, {1987, 3, 20}, {2000, 6, 21}, {2026, 12, 21}, {2100, 9, 23}};
    int stations = 0, wrong = 0;
    for (std::int32_t i = 0; i < StationCount(); i += 7) {
      StationIndexRecord key;
      StationHeader h;
      if (!ReadStationIndexRecord(i, key) || !FindStation(key, h)) continue;
      ++stations;
      for (const CalendarDate& d : dates) wrong += Mismatches(d, h.latitude / 60.0, h.longitude / 60.0, h.zone);
    }
    CloseTideFiles();
    CHECK(stations > 500);
    CHECK(wrong == 0);
  }
  SUBCASE("poles, the date line and far years") {
    int wrong = 0;
    for (int year : {1700, 1999, 2000, 2400})
      for (int month = 1; month <= 12; month += 2)
        for (double latitude : {-89.9, -66.5, -12.25, 0.0, 48.5, 66.6, 78.2, 90.0})
          for (double longitude : {-180.0, -97.75, 0.0, 13.4, 179.9})
            wrong += Mismatches({static_cast<std::int16_t>(year), static_cast<std::uint8_t>(month), 11}, latitude,
                                longitude, static_cast<int>(-longitude / 15.0));
    CHECK(wrong == 0);
  }
}

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
