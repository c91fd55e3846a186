#include "tides/engine/sun_events.h"

#include <climits>
#include <cmath>

namespace br::tides {

namespace {
constexpr double kRad = 0.017453292519943295;
constexpr double kDeg = 57.29577951308232;
constexpr int kMaxPasses = 26;

// fmod(x, 360), the same bits: below 360 in size fmod gives x itself, and for 360 <= |x| < 2^40
// the remainder x - 360 n is exact (x and 360 n are both whole multiples of x's last place),
// so only the quotient needs finding, not the library's digit-by-digit division.
inline double Mod360(double x) {
  const double size = std::fabs(x);
  if (size < 360.0) return x;
  if (!(size < 0x1p40)) return std::fmod(x, 360.0);  // and NaN
  double r = size - 360.0 * std::trunc(size / 360.0);
  // The rounded quotient can be one off; a turn either way is exact too.
  if (r < 0.0) r += 360.0;
  else if (r >= 360.0) r -= 360.0;
  return x < 0.0 ? -r : r;  // fmod keeps the sign of x, a zero's too
}

// The sun at one instant, as each pass of an event's iteration needs it.
struct SunSky {
  double gha = 0.0;
  double sinDeclination = 0.0;
  double cosDeclination = 0.0;
};

SunSky SkyAt(std::int32_t J, double t) {
  SunSky sky;
  double delta = 0.0;
  SunPosition(J, t, sky.gha, delta);
  sky.sinDeclination = std::sin(delta * kRad);
  sky.cosDeclination = std::cos(delta * kRad);
  return sky;
}

// The sun at noon UT of day J, where every event's iteration starts: the same for every
// station of a day, so the last day's is kept (the engine runs on one thread at a time).
const SunSky& NoonSky(std::int32_t J) {
  static std::int32_t day = INT32_MIN;
  static SunSky sky;
  if (J != day) {
    sky = SkyAt(J, 12.0);
    day = J;
  }
  return sky;
}

// What an event's iteration needs of the place and the altitude, worked out once a day.
struct SunPlace {
  double sinPhi = 0.0;
  double cosPhi = 0.0;
  double lambda = 0.0;
};

// The first pass of every event of a day starts from noon: its sky, and per altitude its
// cosine of the hour angle and the angle itself (a rising and a setting share them).
struct NoonPass {
  SunSky sky;
  double c = 0.0;
  double H = 0.0;
};

NoonPass FirstPass(const SunSky& noon, const SunPlace& place, double sinH0) {
  NoonPass first;
  first.sky = noon;
  first.c = (sinH0 - place.sinPhi * noon.sinDeclination) / (place.cosPhi * noon.cosDeclination);
  if (std::fabs(first.c) < 1.0) first.H = std::acos(first.c) * kDeg;
  return first;
}

// One event from noon: each pass moves t by the hour angle still to go, until it settles.
double IterateSunEvent(std::int32_t J, const SunPlace& place, int sign, double sinH0, const NoonPass& first,
                       SunEventOutcome& why) {
  why = SunEventOutcome::kNoConvergence;
  double t = 12.0;
  for (int pass = 0; pass < kMaxPasses; ++pass) {
    double c = first.c, H = first.H;
    SunSky sky = first.sky;
    if (pass > 0) {
      sky = SkyAt(J, t);
      c = (sinH0 - place.sinPhi * sky.sinDeclination) / (place.cosPhi * sky.cosDeclination);
    }
    if (!(std::fabs(c) < 1.0)) {
      // c >= 1: even the sun's highest point is below h0; c <= -1: its lowest is above.
      if (c >= 1.0) why = SunEventOutcome::kSunStaysBelow;
      else if (c <= -1.0) why = SunEventOutcome::kSunStaysAbove;
      return kNoSunEvent;
    }
    if (pass > 0) H = std::acos(c) * kDeg;
    const double correction = Mod360(sign * H + sky.gha + place.lambda);
    const double next = t - correction / 15.0;
    if (std::fabs(next - t) < 1e-7) {
      why = SunEventOutcome::kOccurs;
      return next;
    }
    t = next;
  }
  return kNoSunEvent;
}

SunPlace PlaceOf(double phi, double lambda) {
  return SunPlace{std::sin(phi * kRad), std::cos(phi * kRad), lambda};
}

}  // namespace

void SunPosition(std::int32_t J, double t, double& gha, double& declination) {
  const double T = (t * 0.041666666666666664 + J - 2451545.0) * 2.7378507871321012e-05;
  const double L = Mod360(280.46 + 36000.77 * T);
  const double G = Mod360(357.528 + 35999.05 * T);
  const double C = 1.915 * std::sin(G * kRad) + 0.02 * std::sin(2.0 * G * kRad);
  const double lambda = Mod360(L + C);
  const double epsilon = Mod360(23.4393 - 0.013 * T);
  const double E = -C + 2.466 * std::sin(2.0 * lambda * kRad) - 0.053 * std::sin(4.0 * lambda * kRad);
  gha = Mod360(15.0 * t - 180.0 + E);
  declination = std::asin(std::sin(epsilon * kRad) * std::sin(lambda * kRad)) * kDeg;
}

double ComputeSunEvent(std::int32_t J, double phi, double lambda, int sign, double h0,
                       SunEventOutcome* outcome) {
  const SunPlace place = PlaceOf(phi, lambda);
  const double sinH0 = std::sin(h0 * kRad);
  SunEventOutcome why = SunEventOutcome::kNoConvergence;
  const double result = IterateSunEvent(J, place, sign, sinH0, FirstPass(SkyAt(J, 12.0), place, sinH0), why);
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
  static const double sinTwilight = std::sin(kTwilightAltitude * kRad);
  static const double sinSunrise = std::sin(kSunriseAltitude * kRad);
  const std::int32_t J = JulianDayNumber(date);
  const SunPlace place = PlaceOf(latitude, longitude);
  const SunSky& noon = NoonSky(J);
  const NoonPass twilight = FirstPass(noon, place, sinTwilight), sunrise = FirstPass(noon, place, sinSunrise);
  SunDay day;
  for (int i = 0; i < 4; ++i) {
    const bool isTwilight = i == kTwilightBegin || i == kTwilightEnd;
    double x = IterateSunEvent(J, place, kSigns[i], isTwilight ? sinTwilight : sinSunrise,
                               isTwilight ? twilight : sunrise, day.outcomes[i]);
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
