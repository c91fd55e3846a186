#include "host/brtide/sun_reading.h"

#include <cmath>

#include "host/brtide/clock_text.h"

namespace br::brtide {

namespace {

constexpr int kMinutesPerDay = 1440;

// Minutes after midnight of a published time (they are whole minutes).
int MinuteOf(double date) { return SplitDayCount(date).secondOfDay / 60; }

int FloorDiv(int a, int b) { return a >= 0 ? a / b : -((-a + b - 1) / b); }

SunEvent Placed(int minutes) {
  SunEvent event;
  event.happens = true;
  event.dayOffset = FloorDiv(minutes, kMinutesPerDay);
  event.minuteOfDay = minutes - event.dayOffset * kMinutesPerDay;
  return event;
}

}  // namespace

SunDay ReadSunDay(const SunTimes& sun, double longitude, long zone) {
  SunDay day;
  const int begin = MinuteOf(sun.beginTwilight), rise = MinuteOf(sun.sunrise);
  const int set = MinuteOf(sun.sunset), end = MinuteOf(sun.endTwilight);
  if (rise == 0 && set == kMinutesPerDay - 1 && begin == 0 && end == kMinutesPerDay - 1) {
    day.kind = SunDayKind::PolarDay;
    return day;
  }
  if (rise == 0 && set == 0 && begin == 0 && end == 0) {
    day.kind = SunDayKind::PolarNight;
    return day;
  }

  // The sunset follows the sunrise by less than a day; the pair sits about solar noon.
  int placedRise = rise;
  int placedSet = set > rise ? set : set + kMinutesPerDay;
  const double noon = 720.0 - longitude * 4.0 - static_cast<double>(zone) * 60.0;
  const int days = static_cast<int>(std::lround((noon - (placedRise + placedSet) / 2.0) / kMinutesPerDay));
  placedRise += days * kMinutesPerDay;
  placedSet += days * kMinutesPerDay;
  day.events[kSunrise] = Placed(placedRise);
  day.events[kSunset] = Placed(placedSet);

  const int missing = set / 60 * 60;  // the sunset's hour, minute 0
  if (begin != missing && begin != rise) {
    int placed = begin + (placedRise - rise);
    if (placed >= placedRise) placed -= kMinutesPerDay;
    day.events[kTwilightBegins] = Placed(placed);
  }
  if (end != missing && end != set) {
    int placed = end + (placedSet - set);
    if (placed <= placedSet) placed += kMinutesPerDay;
    day.events[kTwilightEnds] = Placed(placed);
  }
  return day;
}

}  // namespace br::brtide
