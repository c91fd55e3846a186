#include "host/brtide/days_report.h"

#include <cmath>
#include <cstdio>

#include "host/brtide/clock_text.h"
#include "host/brtide/day_report.h"
#include "host/brtide/position_text.h"
#include "host/brtide/printable_text.h"

namespace br::brtide {

namespace {

// One table day as a day report without heights, so the day's writers serve it.
DayReport AsDay(const DaysReport& table, const TableDay& day) {
  DayReport report;
  report.station = table.station;
  report.name = table.name;
  report.position = table.position;
  report.askedNear = table.askedNear;
  report.zone = table.zone;
  report.predictionDate = day.date;
  report.clockOffsetMinutes = table.clockOffsetMinutes;
  report.stationTime = table.stationTime;
  report.sun = day.sun;
  report.tides = day.tides;
  return report;
}

const char* Weekday(double date) {
  static const char* const kNames[7] = {"Sat", "Sun", "Mon", "Tue", "Wed", "Thu", "Fri"};  // day 0 was a Saturday
  const long long day = static_cast<long long>(std::floor(date));
  return kNames[((day % 7) + 7) % 7];
}

std::string SunSummary(const SunDay& sun) {
  switch (sun.kind) {
    case SunDayKind::PolarDay: return "the sun stays up";
    case SunDayKind::PolarNight: return "the sun stays down";
    case SunDayKind::Ordinary: break;
  }
  const auto at = [](const SunEvent& e) {
    return e.happens ? DayClock((static_cast<long long>(e.dayOffset) * 1440 + e.minuteOfDay) * 60, false) : "--:--";
  };
  return "sunrise " + at(sun.events[kSunrise]) + "  sunset " + at(sun.events[kSunset]);
}

}  // namespace

void WriteDaysText(const DaysReport& table, std::ostream& out) {
  out << "Station   " << table.station << "  " << PrintableText(table.name) << '\n';
  out << "Position  " << PositionText(table.position) << '\n';
  if (table.askedNear) {
    char distance[32];
    std::snprintf(distance, sizeof distance, "%.1f km", DistanceKm(*table.askedNear, table.position));
    out << "Nearest   to " << PositionText(*table.askedNear) << ", " << distance << " away\n";
  }
  out << "Zone      " << table.zone << " (station time UTC" << ZoneOffsetText(table.zone) << ")\n";
  out << "Tides     high and low water in metres, times in "
      << (table.stationTime ? "station time UTC" : "this computer's standard time UTC")
      << OffsetText(table.clockOffsetMinutes) << '\n';
  out << "Sun       station time UTC" << ZoneOffsetText(table.zone) << '\n';
  for (const TableDay& day : table.days) {
    out << '\n'
        << IsoDate(SplitDayCount(day.date).date) << "  " << Weekday(day.date) << "   "
        << SunSummary(ReadSunDay(day.sun, table.position.longitude, table.zone)) << '\n';
    for (const TideTurn& turn : day.tides) {
      char height[32];
      std::snprintf(height, sizeof height, "%6.2f", turn.height);
      out << "  " << PadRight(turn.high ? "high" : "low", 6) << ClockText(std::llround(turn.minutes) * 60, false) << "  "
          << height << '\n';
    }
  }
}

void WriteDaysCsv(const DaysReport& table, std::ostream& out) {
  out << "time,height_m,event\n";
  for (const TableDay& day : table.days) WriteDayCsvRows(AsDay(table, day), out);
}

void WriteDaysJson(const DaysReport& table, std::ostream& out) {
  out << "{\n  " << StationJson(table.station, table.name, table.position, table.zone, table.askedNear) << ",\n";
  out << "  \"days\": [";
  for (std::size_t i = 0; i < table.days.size(); ++i) {
    const TableDay& day = table.days[i];
    out << (i ? ",\n" : "\n") << "    {\"date\": \"" << IsoDate(SplitDayCount(day.date).date) << "\",\n     "
        << DayEventsJson(AsDay(table, day), "     ") << "}";
  }
  out << (table.days.empty() ? "" : "\n  ") << "]\n}\n";
}

}  // namespace br::brtide
