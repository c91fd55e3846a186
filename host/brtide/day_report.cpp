#include "host/brtide/day_report.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

#include "host/brtide/clock_text.h"
#include "host/brtide/position_text.h"
#include "host/brtide/printable_text.h"

namespace br::brtide {

namespace {

constexpr int kBarWidth = 40;
constexpr long long kSecondsPerDay = 86400;

const char* const kSunLabels[4] = {"twilight begins", "sunrise", "sunset", "twilight ends"};
const char* const kSunKeys[4] = {"twilight_begins", "sunrise", "sunset", "twilight_ends"};

std::string Metres(double value, int decimals = 3) {
  char text[32];
  std::snprintf(text, sizeof text, "%.*f", decimals, value);
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

// High and low waters to the minute, as tide tables give them.
long long TurnSeconds(const TideTurn& turn) { return std::llround(turn.minutes) * 60; }

std::string ClockName(const DayReport& day) {
  return (day.stationTime ? "station time UTC" : "this computer's standard time UTC") + OffsetText(day.clockOffsetMinutes);
}

// A sun event of the day in the station's time, seconds after the date's midnight.
long long SunSeconds(const SunEvent& event) {
  return (static_cast<long long>(event.dayOffset) * 1440 + event.minuteOfDay) * 60;
}

std::string SunText(const SunEvent& event) {
  return event.happens ? DayClock(SunSeconds(event), false) : "--:--  (the sun stays above -12\xC2\xB0)";
}

// One row of the CSV and the JSON: an instant with its offset, a height or none.
struct Row {
  bool timed = false;
  long long utcSeconds = 0;  // after the date's UT midnight, for ordering
  std::string time;          // ISO 8601, empty when the event does not happen
  std::optional<double> height;
  std::string event;
};

Row TimedRow(const DayReport& day, long long secondsAfterMidnight, int offsetMinutes) {
  Row row;
  row.timed = true;
  row.utcSeconds = secondsAfterMidnight - offsetMinutes * 60LL;
  const auto midnight = static_cast<std::int64_t>(std::floor(day.predictionDate));
  row.time = IsoDateTime(AfterMidnight(midnight, secondsAfterMidnight), offsetMinutes);
  return row;
}

std::vector<Row> EventRows(const DayReport& day, const SunDay& sun) {
  std::vector<Row> rows;
  for (const TideTurn& turn : day.tides) {
    Row row = TimedRow(day, TurnSeconds(turn), day.clockOffsetMinutes);
    row.height = turn.height;
    row.event = turn.high ? "high water" : "low water";
    rows.push_back(row);
  }
  const int stationOffset = static_cast<int>(-day.zone * 60);
  for (int e = 0; e < 4; ++e) {
    Row row;
    if (sun.events[e].happens) row = TimedRow(day, SunSeconds(sun.events[e]), stationOffset);
    row.event = kSunLabels[e];
    rows.push_back(row);
  }
  return rows;
}

const char* SunDayName(SunDayKind kind) {
  switch (kind) {
    case SunDayKind::PolarDay: return "polar_day";
    case SunDayKind::PolarNight: return "polar_night";
    default: return "ordinary";
  }
}

}  // namespace

long long PointSeconds(const DayReport& day, std::size_t k) {
  return std::llround(static_cast<double>(k) * day.step * 3600.0);
}

std::size_t HighestPoint(const DayReport& day) {
  std::size_t best = 0;
  for (std::size_t k = 1; k < day.heights.size(); ++k)
    if (static_cast<float>(day.heights[k]) > static_cast<float>(day.heights[best])) best = k;
  return best;
}

std::size_t LowestPoint(const DayReport& day) {
  std::size_t best = 0;
  for (std::size_t k = 1; k < day.heights.size(); ++k)
    if (static_cast<float>(day.heights[k]) < static_cast<float>(day.heights[best])) best = k;
  return best;
}

std::string DayClock(long long secondsAfterMidnight, bool withSeconds) {
  if (secondsAfterMidnight < 0) return ClockText(secondsAfterMidnight + kSecondsPerDay, withSeconds) + " (previous day)";
  if (secondsAfterMidnight > kSecondsPerDay)
    return ClockText(secondsAfterMidnight - kSecondsPerDay, withSeconds) + " (next day)";
  return ClockText(secondsAfterMidnight, withSeconds);
}

void WriteDayText(const DayReport& day, std::ostream& out) {
  const std::string zoneOffset = ZoneOffsetText(day.zone);
  const DateTime date = SplitDayCount(day.predictionDate);

  out << "Station   " << day.station << "  " << PrintableText(day.name) << '\n';
  out << "Position  " << PositionText(day.position) << '\n';
  if (day.askedNear) {
    char distance[32];
    std::snprintf(distance, sizeof distance, "%.1f km", DistanceKm(*day.askedNear, day.position));
    out << "Nearest   to " << PositionText(*day.askedNear) << ", " << distance << " away\n";
  }
  out << "Zone      " << day.zone << " (station time UTC" << zoneOffset << ")\n";
  out << "Date      " << IsoDate(date.date) << '\n';

  out << "Sun       station time UTC" << zoneOffset << '\n';
  const SunDay sun = ReadSunDay(day.sun, day.position.longitude, day.zone);
  switch (sun.kind) {
    case SunDayKind::PolarDay:
      out << "  the sun stays above the horizon all day\n";
      break;
    case SunDayKind::PolarNight:
      out << "  the sun stays below the horizon all day\n";
      break;
    case SunDayKind::Ordinary:
      for (int e = 0; e < 4; ++e) out << "  " << PadRight(kSunLabels[e], 17) << SunText(sun.events[e]) << '\n';
      break;
  }

  out << "Tides     high and low water, times in " << ClockName(day) << '\n';
  if (day.tides.empty()) out << "  none: the water turns on no minute of the day\n";
  for (const TideTurn& turn : day.tides) {
    out << "  " << PadRight(turn.high ? "high" : "low", 6) << ClockText(TurnSeconds(turn), false) << "  "
        << PadLeft(Metres(turn.height, 2), 6) << " m\n";
  }

  const bool withSeconds = NeedsSeconds(day);
  const std::size_t maxAt = HighestPoint(day), minAt = LowestPoint(day);
  const double maxValue = day.heights.empty() ? 0.0 : day.heights[maxAt];
  const double minValue = day.heights.empty() ? 0.0 : day.heights[minAt];
  std::vector<std::string> clocks;
  std::size_t clockWidth = 0;
  for (std::size_t k = 0; k < day.heights.size(); ++k) {
    clocks.push_back(DayClock(PointSeconds(day, k), withSeconds));
    clockWidth = std::max(clockWidth, clocks.back().size());
  }
  out << "Heights   metres, every " << StepText(day.step) << ", times in " << ClockName(day) << '\n';
  const double range = maxValue - minValue;
  for (std::size_t k = 0; k < day.heights.size(); ++k) {
    const double h = day.heights[k];
    const int bar = range > 0 ? static_cast<int>(std::lround((h - minValue) / range * kBarWidth)) : 0;
    std::string line = "  " + PadRight(clocks[k], clockWidth) + "  " + PadLeft(Metres(h), 8) + "  " +
                       std::string(static_cast<std::size_t>(bar < 0 ? 0 : bar), '#');
    if (k == maxAt) line += "  highest";
    if (k == minAt) line += "  lowest";
    line.erase(line.find_last_not_of(' ') + 1);  // no trailing blanks under an empty bar
    out << line << '\n';
  }
}

void WriteDayCsvRows(const DayReport& day, std::ostream& out) {
  std::vector<Row> rows;
  for (std::size_t k = 0; k < day.heights.size(); ++k) {
    Row row = TimedRow(day, PointSeconds(day, k), day.clockOffsetMinutes);
    row.height = day.heights[k];
    rows.push_back(row);
  }
  const std::vector<Row> events = EventRows(day, ReadSunDay(day.sun, day.position.longitude, day.zone));
  rows.insert(rows.end(), events.begin(), events.end());
  // Time order; a point before an event at the same instant; events without a time last.
  std::stable_sort(rows.begin(), rows.end(), [](const Row& a, const Row& b) {
    if (a.timed != b.timed) return a.timed;
    return a.timed && a.utcSeconds < b.utcSeconds;
  });
  for (const Row& row : rows) out << row.time << ',' << (row.height ? Metres(*row.height) : "") << ',' << row.event << '\n';
}

void WriteDayCsv(const DayReport& day, std::ostream& out) {
  out << "time,height_m,event\n";
  WriteDayCsvRows(day, out);
}

std::string DayEventsJson(const DayReport& day, const std::string& indent) {
  const SunDay sun = ReadSunDay(day.sun, day.position.longitude, day.zone);
  const std::vector<Row> events = EventRows(day, sun);
  std::string json = "\"sun\": {\"day\": \"" + std::string(SunDayName(sun.kind)) + "\"";
  for (int e = 0; e < 4; ++e) {
    const Row& row = events[day.tides.size() + static_cast<std::size_t>(e)];
    json += ", \"" + std::string(kSunKeys[e]) + "\": " + (row.timed ? "\"" + row.time + "\"" : "null");
  }
  json += "},\n" + indent + "\"tides\": [";
  for (std::size_t i = 0; i < day.tides.size(); ++i) {
    json += (i ? ",\n  " : "\n  ") + indent + "{\"time\": \"" + events[i].time + "\", \"height_m\": " +
            Metres(day.tides[i].height) + ", \"type\": \"" + (day.tides[i].high ? "high" : "low") + "\"}";
  }
  return json + (day.tides.empty() ? "" : "\n" + indent) + "]";
}

void WriteDayJson(const DayReport& day, std::ostream& out) {
  out << "{\n  " << StationJson(day.station, day.name, day.position, day.zone, day.askedNear) << ",\n";
  out << "  \"date\": \"" << IsoDate(SplitDayCount(day.predictionDate).date) << "\",\n";
  out << "  " << DayEventsJson(day, "  ") << ",\n";
  char step[32];
  std::snprintf(step, sizeof step, "%g", day.step);
  out << "  \"step_hours\": " << step << ",\n  \"heights\": [";
  for (std::size_t k = 0; k < day.heights.size(); ++k) {
    const Row row = TimedRow(day, PointSeconds(day, k), day.clockOffsetMinutes);
    out << (k ? ",\n    " : "\n    ") << "{\"time\": \"" << row.time << "\", \"height_m\": " << Metres(day.heights[k]) << "}";
  }
  out << (day.heights.empty() ? "" : "\n  ") << "]\n}\n";
}

std::string StationJson(long station, const std::string& name, const Position& position, long zone,
                        const std::optional<Position>& askedNear) {
  char text[160];
  std::snprintf(text, sizeof text, "\"latitude\": %.6f, \"longitude\": %.6f, \"zone\": %ld", position.latitude,
                position.longitude, zone);
  std::string json = "\"station\": " + std::to_string(station) + ", \"name\": " + JsonString(name) + ", " + text;
  if (askedNear) {
    std::snprintf(text, sizeof text, "{\"latitude\": %.6f, \"longitude\": %.6f, \"distance_km\": %.1f}",
                  askedNear->latitude, askedNear->longitude, DistanceKm(*askedNear, position));
    json += ",\n  \"nearest_to\": " + std::string(text);
  }
  return json;
}

}  // namespace br::brtide
