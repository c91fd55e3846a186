// The four sun times a TidesPort publishes, read as a sailor reads them. The port gives
// each as a time of day on the prediction date and cannot say that none happens or that
// one falls on the day before or after; this reading recovers both.
#pragma once

#include <array>

namespace br::brtide {

// The port's published times: day-count dates in the station's zone time.
struct SunTimes {
  double beginTwilight = 0.0;
  double sunrise = 0.0;
  double sunset = 0.0;
  double endTwilight = 0.0;
};

enum class SunDayKind {
  Ordinary,    // the sun rises and sets
  PolarDay,    // published as rise 00:00, set 23:59: the sun stays up
  PolarNight,  // published as four times 00:00: the sun stays down
};

struct SunEvent {
  bool happens = false;
  int minuteOfDay = 0;  // 0..1439, station time
  int dayOffset = 0;    // -1 the day before, 0 the date itself, +1 the day after
};

// Events in the order twilight begins, sunrise, sunset, twilight ends.
enum SunEventIndex : int { kTwilightBegins = 0, kSunrise = 1, kSunset = 2, kTwilightEnds = 3 };

struct SunDay {
  SunDayKind kind = SunDayKind::Ordinary;
  std::array<SunEvent, 4> events{};
};

// longitude in degrees east, zone as the port gives it (universal time = zone time +
// zone). Sunrise and sunset are placed about the station's solar noon (12:00 - longitude
// / 15 - zone), so a sunset after midnight is the next day's and a sunrise before it the
// day before's; each twilight goes before its sunrise or after its sunset. A twilight
// published at the sunset's hour (minute 0) or at its own sun event is one that does not
// happen: the library's mark for it.
SunDay ReadSunDay(const SunTimes& sun, double longitude, long zone);

}  // namespace br::brtide
