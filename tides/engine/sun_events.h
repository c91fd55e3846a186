// Sunrise, sunset and twilight for a station's position and date, in the station's zone
// time. Low-precision solar formula in Julian centuries from J2000; each event iterates on
// the hour angle at which the sun's centre reaches the event's altitude.
#pragma once

#include <array>
#include <cstdint>

#include "tides/engine/calendar.h"

namespace br::tides {

inline constexpr double kSunriseAltitude = -0.8333333333333334;  // degrees (-50')
inline constexpr double kTwilightAltitude = -12.0;               // degrees
inline constexpr double kNoSunEvent = -1.0;

// Why an event does or does not happen on the day.
enum class SunEventOutcome : std::uint8_t {
  kOccurs,
  kSunStaysBelow,  // never reaches the altitude (polar night for sunrise/sunset)
  kSunStaysAbove,  // never falls to the altitude (polar day for sunrise/sunset)
  kNoConvergence,  // the iteration did not settle, or the geometry gave no number
};

struct HourMinute {
  std::int16_t hour = 0;
  std::int16_t minute = 0;
};

// Index of each event in the arrays below.
enum SunEventIndex : int { kTwilightBegin = 0, kSunrise = 1, kSunset = 2, kTwilightEnd = 3 };

// (hour, minute) of twilight begin, sunrise, sunset and twilight end; hour -1 marks an event
// that does not happen. The split is the engine's raw one: it does not wrap times before
// 00:00 (-0.25 h gives 0, -15); use PublishSunTimes for times of day.
struct SunEventTimes {
  std::array<HourMinute, 4> events{};
};

// Everything the engine knows about a day's four events.
struct SunDay {
  std::array<double, 4> zoneHours{};             // zone time in hours, or kNoSunEvent
  std::array<SunEventOutcome, 4> outcomes{};
  SunEventTimes times;                           // zoneHours split into hour and minute
};

// Greenwich hour angle and declination of the sun (degrees) at day number J, t hours UT.
void SunPosition(std::int32_t J, double t, double& gha, double& declination);

// Universal time in hours at which the sun's centre reaches altitude h0 (degrees) at
// latitude phi and longitude lambda (degrees, north and east positive), rising (sign +1)
// or setting (-1); kNoSunEvent when it does not. outcome, when given, tells why.
double ComputeSunEvent(std::int32_t J, double phi, double lambda, int sign, double h0,
                       SunEventOutcome* outcome = nullptr);

// The raw split of one zone-time value: above 24 loses 24 once; truncation towards zero.
HourMinute SplitHours(double x);

// The four events of a date at a position, shifted to zone time (UT = zone time + zone).
SunDay ComputeSunDay(const CalendarDate& date, double latitude, double longitude, int zone);

// What a day of sun times is, for drawing and for the published times.
enum class SunDayKind : std::uint8_t { kNormal, kPolarDay, kPolarNight };

struct PublishedSunTimes {
  SunDayKind kind = SunDayKind::kNormal;
  std::array<HourMinute, 4> events{};  // always a valid time of day, 00:00..23:59
};

// The four times a port publishes. Every event that happens is brought into the day
// (24 h added or taken off once) before it is split, so a zone far from the longitude
// still gives times. Without a sunrise or a sunset the day is polar: a polar day (the sun
// stays above the horizon) reads 00:00, 00:00, 23:59, 23:59, a polar night 00:00 four times.
// A twilight that does not happen takes the sunset's hour with minute 0, except a morning
// twilight that would then lie before the sunrise (a sunset after midnight, brought back
// into the day): it takes the sunrise's time. So a reader tells a missing twilight by its
// time: the morning one at the sunrise or the sunset's hour, the evening one at the
// sunset's hour.
PublishedSunTimes PublishSunTimes(const SunDay& day);

// The day a published event belongs to, from its zone time: -1 the day before the date
// (a zone time before 00:00), +1 the day after (24:00 or later), else 0.
int EventDayOffset(double zoneHours);

}  // namespace br::tides
