#include "host/brtide/day_report.h"

#include <cmath>
#include <cstdio>

#include "host/brtide/clock_text.h"
#include "host/brtide/position_text.h"

namespace br::brtide {

namespace {

constexpr int kBarWidth = 40;

// Minutes after midnight of a published sun time (they are whole minutes).
long MinuteOfDay(double date) { return SplitDayCount(date).secondOfDay / 60; }

std::string SunClock(double date) { return ClockText(static_cast<long long>(MinuteOfDay(date)) * 60, false); }

std::string Metres(double value) {
  char text[32];
  std::snprintf(text, sizeof text, "%.3f", value);
  return text;
}

std::string StepText(double step) {
  char text[32];
  std::snprintf(text, sizeof text, "%g", step);
  return std::string(text) + (step == 1.0 ? " hour" : " hours");
}

// Whether any point falls between whole minutes, so that times need seconds.
bool NeedsSeconds(const DayReport& day) {
  for (std::size_t k = 0; k < day.heights.size(); ++k) {
    if (PointSeconds(day, k) % 60 != 0) return true;
  }
  return false;
}

std::string PointClock(const DayReport& day, std::size_t k, bool withSeconds) {
  return ClockText(PointSeconds(day, k), withSeconds);
}

}  // namespace

SunDayKind ClassifySunDay(const SunTimes& sun) {
  const long rise = MinuteOfDay(sun.sunrise);
  const long set = MinuteOfDay(sun.sunset);
  if (rise == 0 && set == 23 * 60 + 59 && MinuteOfDay(sun.beginTwilight) == 0 &&
      MinuteOfDay(sun.endTwilight) == 23 * 60 + 59) {
    return SunDayKind::PolarDay;
  }
  if (rise == 0 && set == 0 && MinuteOfDay(sun.beginTwilight) == 0 && MinuteOfDay(sun.endTwilight) == 0) {
    return SunDayKind::PolarNight;
  }
  return SunDayKind::Ordinary;
}

bool HasMorningTwilight(const SunTimes& sun) { return MinuteOfDay(sun.beginTwilight) < MinuteOfDay(sun.sunrise); }

bool HasEveningTwilight(const SunTimes& sun) { return MinuteOfDay(sun.endTwilight) > MinuteOfDay(sun.sunset); }

long long PointSeconds(const DayReport& day, std::size_t k) {
  return std::llround(static_cast<double>(k) * day.step * 3600.0);
}

void WriteDayText(const DayReport& day, std::ostream& out) {
  const std::string zoneOffset = ZoneOffsetText(day.zone);
  const std::string computerOffset = OffsetText(day.computerOffsetMinutes);
  const DateTime date = SplitDayCount(day.predictionDate);

  out << "Station   " << day.station << "  " << day.name << '\n';
  out << "Position  " << PositionText(day.position) << '\n';
  if (day.askedNear) {
    char distance[32];
    std::snprintf(distance, sizeof distance, "%.1f km", DistanceKm(*day.askedNear, day.position));
    out << "Nearest   to " << PositionText(*day.askedNear) << ", " << distance << " away\n";
  }
  out << "Zone      " << day.zone << " (station time UTC" << zoneOffset << ")\n";
  out << "Date      " << IsoDate(date.date) << '\n';

  out << "Sun       station time UTC" << zoneOffset << '\n';
  switch (ClassifySunDay(day.sun)) {
    case SunDayKind::PolarDay:
      out << "  the sun stays above the horizon all day\n";
      break;
    case SunDayKind::PolarNight:
      out << "  the sun stays below the horizon all day\n";
      break;
    case SunDayKind::Ordinary: {
      const std::string none = "--:--  (the sun stays above -12\xC2\xB0)";
      out << "  twilight begins  " << (HasMorningTwilight(day.sun) ? SunClock(day.sun.beginTwilight) : none) << '\n';
      out << "  sunrise          " << SunClock(day.sun.sunrise) << '\n';
      out << "  sunset           " << SunClock(day.sun.sunset) << '\n';
      out << "  twilight ends    " << (HasEveningTwilight(day.sun) ? SunClock(day.sun.endTwilight) : none) << '\n';
      break;
    }
  }

  const bool withSeconds = NeedsSeconds(day);
  const auto maxAt = static_cast<std::size_t>(day.maxIndex);
  const auto minAt = static_cast<std::size_t>(day.minIndex);
  out << "Highest   " << Metres(day.maxValue) << " m at " << PointClock(day, maxAt, withSeconds) << '\n';
  out << "Lowest    " << Metres(day.minValue) << " m at " << PointClock(day, minAt, withSeconds) << '\n';

  out << "Heights   metres, every " << StepText(day.step) << ", times in this computer's standard time UTC"
      << computerOffset << '\n';
  const double range = day.maxValue - day.minValue;
  for (std::size_t k = 0; k < day.heights.size(); ++k) {
    const double h = day.heights[k];
    const int bar = range > 0 ? static_cast<int>(std::lround((h - day.minValue) / range * kBarWidth)) : 0;
    std::string line = "  " + PointClock(day, k, withSeconds) + "  " + PadLeft(Metres(h), 8) + "  " +
                       std::string(static_cast<std::size_t>(bar < 0 ? 0 : bar), '#');
    if (k == maxAt) line += "  high";
    if (k == minAt) line += "  low";
    line.erase(line.find_last_not_of(' ') + 1);  // no trailing blanks under an empty bar
    out << line << '\n';
  }
}

void WriteDayCsv(const DayReport& day, std::ostream& out) {
  const auto midnight = static_cast<std::int64_t>(std::floor(day.predictionDate));
  out << "time,height_m\n";
  for (std::size_t k = 0; k < day.heights.size(); ++k) {
    const DateTime at = AfterMidnight(midnight, PointSeconds(day, k));
    out << IsoDateTime(at, day.computerOffsetMinutes) << ',' << Metres(day.heights[k]) << '\n';
  }
}

}  // namespace br::brtide
