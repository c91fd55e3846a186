#include "tides/engine/sun_events.h"

#include <cmath>

namespace br::tides {

namespace {
constexpr double kRad = 0.017453292519943295;
constexpr double kDeg = 57.29577951308232;
constexpr int kMaxPasses = 26;
}  // namespace

void SunPosition(std::int32_t J, double t, double& gha, double& declination) {
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

double ComputeSunEvent(std::int32_t J, double phi, double lambda, int sign, double h0,
                       SunEventOutcome* outcome) {
  SunEventOutcome why = SunEventOutcome::kNoConvergence;
  double result = kNoSunEvent;
  const double sinH0 = std::sin(h0 * kRad);
  const double sinPhi = std::sin(phi * kRad);
  const double cosPhi = std::cos(phi * kRad);
  double t = 12.0;
  for (int pass = 0; pass < kMaxPasses; ++pass) {
    double gha = 0.0, delta = 0.0;
    SunPosition(J, t, gha, delta);
    const double c = (sinH0 - sinPhi * std::sin(delta * kRad)) / (cosPhi * std::cos(delta * kRad));
    if (!(std::fabs(c) < 1.0)) {
      // c >= 1: even the sun's highest point is below h0; c <= -1: its lowest is above.
      if (c >= 1.0) why = SunEventOutcome::kSunStaysBelow;
      else if (c <= -1.0) why = SunEventOutcome::kSunStaysAbove;
      break;
    }
    const double H = std::acos(c) * kDeg;
    const double correction = std::fmod(sign * H + gha + lambda, 360.0);
    const double next = t - correction / 15.0;
    if (std::fabs(next - t) < 1e-7) {
      why = SunEventOutcome::kOccurs;
      result = next;
      break;
    }
    t = next;
  }
  if (outcome) *outcome = why;
  return result;
}

HourMinute SplitHours(double x) {
  if (x > 24.0) x -= 24.0;
  HourMinute hm;
  const double hour = std::trunc(x);
  hm.hour = static_cast<std::int16_t>(hour);
  hm.minute = static_cast<std::int16_t>(std::trunc((x - hour) * 60.0));
  return hm;
}

SunDay ComputeSunDay(const CalendarDate& date, double latitude, double longitude, int zone) {
  static constexpr int kSigns[4] = {+1, +1, -1, -1};
  static constexpr double kAltitudes[4] = {kTwilightAltitude, kSunriseAltitude, kSunriseAltitude,
                                           kTwilightAltitude};
  const std::int32_t J = JulianDayNumber(date);
  SunDay day;
  for (int i = 0; i < 4; ++i) {
    double x = ComputeSunEvent(J, latitude, longitude, kSigns[i], kAltitudes[i], &day.outcomes[i]);
    // The outcome, not the value, says whether the event happens: a real event at -1.0 UT
    // is still shifted.
    if (day.outcomes[i] == SunEventOutcome::kOccurs) x -= zone;
    day.zoneHours[i] = x;
    day.times.events[i] = SplitHours(x);
  }
  return day;
}

namespace {
// A zone time brought into [0, 24) and split; never gives hour 24 or a negative minute.
HourMinute TimeOfDay(double x) {
  if (x < 0.0) x += 24.0;
  else if (x >= 24.0) x -= 24.0;
  if (!(x >= 0.0 && x < 24.0)) x = 0.0;  // -1e-17 + 24 rounds to 24; far-off values too
  HourMinute hm;
  hm.hour = static_cast<std::int16_t>(x);
  hm.minute = static_cast<std::int16_t>((x - hm.hour) * 60.0);
  if (hm.minute > 59) hm.minute = 59;
  return hm;
}
int MinuteOfDay(const HourMinute& t) { return t.hour * 60 + t.minute; }

}  // namespace

PublishedSunTimes PublishSunTimes(const SunDay& day) {
  PublishedSunTimes out;
  const SunEventOutcome rise = day.outcomes[kSunrise];
  const SunEventOutcome set = day.outcomes[kSunset];
  if (rise != SunEventOutcome::kOccurs || set != SunEventOutcome::kOccurs) {
    const bool above = rise == SunEventOutcome::kSunStaysAbove || set == SunEventOutcome::kSunStaysAbove;
    out.kind = above ? SunDayKind::kPolarDay : SunDayKind::kPolarNight;
    if (above) out.events[kSunset] = out.events[kTwilightEnd] = HourMinute{23, 59};
    return out;
  }
  for (int i = 0; i < 4; ++i)
    if (day.outcomes[i] == SunEventOutcome::kOccurs) out.events[i] = TimeOfDay(day.zoneHours[i]);
  // A twilight that does not happen takes the sunset's hour: after the sunrise and not
  // after the sunset, where no reader takes it for a real twilight. A sunset brought back
  // from after midnight puts that hour before the sunrise, where it would read as a
  // twilight at night: the morning twilight then takes the sunrise itself (no twilight).
  const HourMinute missing{out.events[kSunset].hour, 0};
  if (day.outcomes[kTwilightEnd] != SunEventOutcome::kOccurs) out.events[kTwilightEnd] = missing;
  if (day.outcomes[kTwilightBegin] != SunEventOutcome::kOccurs)
    out.events[kTwilightBegin] = MinuteOfDay(missing) < MinuteOfDay(out.events[kSunrise]) ? out.events[kSunrise] : missing;
  return out;
}

int EventDayOffset(double zoneHours) {
  if (zoneHours < 0.0) return -1;
  return zoneHours >= 24.0 ? 1 : 0;
}

}  // namespace br::tides
