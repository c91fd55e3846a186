#include "tools/tidefiles/day_report.h"

#include <cmath>
#include <cstdio>
#include <vector>

#include <nlohmann/json.hpp>

#include "tides/engine/prediction.h"
#include "tides/engine/station_files.h"
#include "tides/engine/station_folder_check.h"
#include "tools/tidefiles/codepage.h"
#include "tools/tidefiles/folder_builder.h"
#include "tools/tidefiles/folder_image.h"
#include "tools/tidefiles/station_entry.h"
#include "host/brtide/printable_text.h"

namespace br::tidefiles {
namespace {

using Json = nlohmann::ordered_json;
namespace bt = br::tides;

// The engine's heights are ten times the published unit's, amplitudes x 0.1 of thousandths.
constexpr double kPublishedPerInternal = 0.01;

const char* const kEventNames[4] = {"twilight_begin", "sunrise", "sunset", "twilight_end"};

std::string Format(const char* format, double a) {
  char text[64];
  std::snprintf(text, sizeof text, format, a);
  return text;
}

std::string HourMinuteText(long minutes) {
  char text[32];
  std::snprintf(text, sizeof text, "%02ld:%02ld", minutes / 60, minutes % 60);
  return text;
}

std::string DayMark(int offset) {
  if (offset < 0) return " (previous day)";
  return offset > 0 ? " (next day)" : "";
}

// The time of sample k: a point past 24:00 is the next day's (24:00 itself ends the day).
std::string SampleTime(std::size_t k, double step) {
  const long minutes = std::lround(static_cast<double>(k) * step * 60.0);
  if (minutes <= 24 * 60) return HourMinuteText(minutes);
  return HourMinuteText(minutes - 24 * 60) + DayMark(1);
}

std::string DateText(const bt::CalendarDate& d) {
  char text[32];
  std::snprintf(text, sizeof text, "%04d-%02d-%02d", d.year, d.month, d.day);
  return text;
}

// First highest and first lowest sample, compared as the stored floats.
void Extremes(const std::vector<float>& samples, std::size_t& highest, std::size_t& lowest) {
  highest = lowest = 0;
  for (std::size_t k = 1; k < samples.size(); ++k) {
    if (samples[k] > samples[highest]) highest = k;
    if (samples[k] < samples[lowest]) lowest = k;
  }
}

// The day's sun as a TidesPort publishes it, with what the port cannot say: whether an
// event happens and which day it falls on.
struct SunReport {
  bt::SunDayKind kind = bt::SunDayKind::kNormal;
  bool happens[4] = {};
  std::string time[4];  // "HH:MM"
  int dayOffset[4] = {};
};

SunReport ReportSun(const bt::SunDay& sun) {
  SunReport report;
  const bt::PublishedSunTimes published = bt::PublishSunTimes(sun);
  report.kind = published.kind;
  if (report.kind != bt::SunDayKind::kNormal) return report;
  for (int e = 0; e < 4; ++e) {
    report.happens[e] = sun.outcomes[e] == bt::SunEventOutcome::kOccurs;
    if (!report.happens[e]) continue;
    report.time[e] = HourMinuteText(published.events[e].hour * 60L + published.events[e].minute);
    report.dayOffset[e] = bt::EventDayOffset(sun.zoneHours[e]);
  }
  return report;
}

std::string SunLine(const SunReport& sun) {
  if (sun.kind == bt::SunDayKind::kPolarDay) return "the sun stays above the horizon all day";
  if (sun.kind == bt::SunDayKind::kPolarNight) return "the sun stays below the horizon all day";
  static const char* const kLabels[4] = {"twilight begin ", "sunrise ", "sunset ", "twilight end "};
  std::string line;
  for (int e = 0; e < 4; ++e) {
    line += (e ? ", " : "") + std::string(kLabels[e]);
    line += sun.happens[e] ? sun.time[e] + DayMark(sun.dayOffset[e]) : "--:--";
  }
  return line;
}

Json SunJson(const SunReport& sun) {
  static const char* const kKinds[] = {"ordinary", "polar_day", "polar_night"};
  Json events = Json::object();
  events["day"] = kKinds[static_cast<int>(sun.kind)];
  for (int e = 0; e < 4; ++e) {
    events[kEventNames[e]] = sun.happens[e] ? Json{{"time", sun.time[e]}, {"day_offset", sun.dayOffset[e]}} : Json();
  }
  return events;
}

// The folder as the check sees it; false with the reason on err when it is damaged.
bool FolderIsSound(const std::string& folder, std::ostream& err) {
  FolderImage image;
  std::string error;
  if (!ReadFolderImage(folder, image, error)) {
    err << "tidefiles: predict: cannot open the station folder " << folder << " (" << error << ")\n";
    return false;
  }
  const std::vector<std::string> problems = bt::CheckStationFolder(image);
  if (problems.empty()) return true;
  err << "tidefiles: predict: " << folder << " is damaged: " << problems.front();
  if (problems.size() > 1) err << " (and " << problems.size() - 1 << " more; tidefiles check lists them)";
  err << '\n';
  return false;
}

}  // namespace

int PrintPredictedDay(const PredictOptions& options, std::ostream& out, std::ostream& err) {
  const std::int32_t count = bt::DaySampleCount(options.step);
  if (options.folder.size() > bt::kMaxFolderLength) {
    err << "tidefiles: predict: the folder path is longer than " << bt::kMaxFolderLength << " characters\n";
    return 1;
  }
  if (!FolderIsSound(options.folder, err)) return 1;
  if (bt::OpenTideFiles(options.folder.c_str()) != 0) {
    err << "tidefiles: predict: cannot open the station folder " << options.folder
        << " (missing or incomplete td_num.ntx, td_crd.ntx or td_pnt.dat; try tidefiles check)\n";
    return 1;
  }
  bt::StationIndexRecord key;
  if (options.station) {
    if (!bt::ReadStationIndexRecord(*options.station, key)) {
      const std::int32_t stations = bt::StationCount();
      err << "tidefiles: predict: no station " << *options.station << " (station numbers "
          << (stations > 0 ? "0 to " + std::to_string(stations - 1) : std::string("none: the folder is empty")) << ")\n";
      bt::CloseTideFiles();
      return 1;
    }
  } else {
    key.latitude = WholeMinutes(options.latitude.value_or(0.0));
    key.longitude = WholeMinutes(options.longitude.value_or(0.0));
  }

  std::vector<float> samples(static_cast<std::size_t>(count), 0.0f);
  bt::StationHeader header;
  bt::SunDay sun;
  const auto offsetSeconds = static_cast<std::int32_t>(std::lround(options.utcOffset * 3600.0));
  const bt::DayPrediction day = bt::PredictDay(key, header, options.date, options.step, samples.data(),
                                               samples.size(), sun, bt::FixedOffsetLocalMidnight(offsetSeconds));
  bt::CloseTideFiles();
  if (!day.stationFound) {
    err << "tidefiles: predict: no station at " << PositionText(key.latitude, key.longitude) << '\n';
    return 1;
  }
  samples.resize(static_cast<std::size_t>(day.sampleCount));
  std::size_t highest = 0, lowest = 0;
  Extremes(samples, highest, lowest);
  const std::string name = br::brtide::PrintableText(Windows1252ToUtf8(bt::StationName(header)));
  const SunReport sunReport = ReportSun(sun);

  if (options.json) {
    Json j;
    j["name"] = name;
    j["latitude"] = header.latitude / 60.0;
    j["longitude"] = header.longitude / 60.0;
    j["zone"] = header.zone;
    j["date"] = DateText(options.date);
    j["step"] = options.step;
    j["utc_offset"] = options.utcOffset;
    Json heights = Json::array();
    for (float s : samples) heights.push_back(std::round(s * kPublishedPerInternal * 1e6) / 1e6);
    j["heights"] = heights;
    if (!samples.empty()) {
      j["highest"] = {{"index", highest}, {"height", heights[highest]}};
      j["lowest"] = {{"index", lowest}, {"height", heights[lowest]}};
    }
    j["sun"] = SunJson(sunReport);
    out << j.dump(2) << '\n';
    return 0;
  }

  out << name << "  (" << Format("%.4f", header.latitude / 60.0) << ", " << Format("%.4f", header.longitude / 60.0)
      << ")  zone " << static_cast<int>(header.zone) << '\n';
  out << DateText(options.date) << " from 00:00 at UTC" << (options.utcOffset < 0 ? "" : "+")
      << Format("%g", options.utcOffset) << ", step " << Format("%g", options.step) << " h, " << samples.size()
      << " samples (metres above chart datum)\n";
  for (std::size_t k = 0; k < samples.size(); ++k) {
    out << Format("%6.0f", static_cast<double>(k)) << "  " << SampleTime(k, options.step) << "  "
        << Format("%8.3f", samples[k] * kPublishedPerInternal) << '\n';
  }
  if (!samples.empty()) {
    out << "highest: index " << highest << " (" << SampleTime(highest, options.step) << ") "
        << Format("%.3f", samples[highest] * kPublishedPerInternal) << " m\n";
    out << "lowest:  index " << lowest << " (" << SampleTime(lowest, options.step) << ") "
        << Format("%.3f", samples[lowest] * kPublishedPerInternal) << " m\n";
  }
  out << "sun (zone time): " << SunLine(sunReport) << '\n';
  return 0;
}

}  // namespace br::tidefiles
