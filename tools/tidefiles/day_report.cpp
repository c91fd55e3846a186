#include "tools/tidefiles/day_report.h"

#include <cmath>
#include <cstdio>
#include <vector>

#include <nlohmann/json.hpp>

#include "tides/engine/prediction.h"
#include "tides/engine/station_files.h"
#include "tools/tidefiles/codepage.h"
#include "tools/tidefiles/folder_builder.h"

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

std::string ClockTime(double hours) {
  const long minutes = std::lround(hours * 60.0);
  char text[32];
  std::snprintf(text, sizeof text, "%02ld:%02ld", minutes / 60, minutes % 60);
  return text;
}

std::string EventText(const bt::HourMinute& t) {
  if (t.hour == -1) return "none";
  char text[32];
  if (t.hour >= 0 && t.hour <= 24 && t.minute >= 0 && t.minute < 60) {
    std::snprintf(text, sizeof text, "%02d:%02d", t.hour, t.minute);
  } else {
    std::snprintf(text, sizeof text, "(%d, %d)", t.hour, t.minute);
  }
  return text;
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

}  // namespace

int PrintPredictedDay(const PredictOptions& options, std::ostream& out, std::ostream& err) {
  const std::int32_t count = bt::DaySampleCount(options.step);
  if (!std::isfinite(options.step) || options.step <= 0.0 || count < 1 || count > kMaxDaySamples) {
    err << "tidefiles: predict: step must be a number of hours above 0 giving at most " << kMaxDaySamples
        << " samples\n";
    return 1;
  }
  if (options.folder.size() > bt::kMaxFolderLength) {
    err << "tidefiles: predict: the folder path is longer than " << bt::kMaxFolderLength << " characters\n";
    return 1;
  }
  if (bt::OpenTideFiles(options.folder.c_str()) != 0) {
    err << "tidefiles: predict: cannot open the station folder " << options.folder
        << " (missing or incomplete td_num.ntx, td_crd.ntx or td_pnt.dat; try tidefiles check)\n";
    return 1;
  }
  bt::StationIndexRecord key;
  if (options.station) {
    if (!bt::ReadStationIndexRecord(*options.station, key)) {
      err << "tidefiles: predict: no station number " << *options.station << " (the folder has "
          << bt::StationCount() << " stations, numbered from 0)\n";
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
    err << "tidefiles: predict: no station at latitude " << key.latitude << "', longitude " << key.longitude
        << "' (or its block cannot be read whole)\n";
    return 1;
  }
  samples.resize(static_cast<std::size_t>(day.sampleCount));
  std::size_t highest = 0, lowest = 0;
  Extremes(samples, highest, lowest);
  const std::string name = Windows1252ToUtf8(bt::StationName(header));

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
    Json events = Json::object();
    for (int e = 0; e < 4; ++e) {
      events[kEventNames[e]] = {{"hour", sun.times.events[e].hour}, {"minute", sun.times.events[e].minute}};
    }
    j["sun"] = events;
    out << j.dump(2) << '\n';
    return 0;
  }

  out << name << "  (" << Format("%.4f", header.latitude / 60.0) << ", " << Format("%.4f", header.longitude / 60.0)
      << ")  zone " << static_cast<int>(header.zone) << '\n';
  out << DateText(options.date) << " from 00:00 at UTC" << (options.utcOffset < 0 ? "" : "+")
      << Format("%g", options.utcOffset) << ", step " << Format("%g", options.step) << " h, " << samples.size()
      << " samples (metres above chart datum)\n";
  for (std::size_t k = 0; k < samples.size(); ++k) {
    out << Format("%6.0f", static_cast<double>(k)) << "  " << ClockTime(static_cast<double>(k) * options.step) << "  "
        << Format("%8.3f", samples[k] * kPublishedPerInternal) << '\n';
  }
  if (!samples.empty()) {
    out << "highest: index " << highest << " (" << ClockTime(static_cast<double>(highest) * options.step) << ") "
        << Format("%.3f", samples[highest] * kPublishedPerInternal) << " m\n";
    out << "lowest:  index " << lowest << " (" << ClockTime(static_cast<double>(lowest) * options.step) << ") "
        << Format("%.3f", samples[lowest] * kPublishedPerInternal) << " m\n";
  }
  out << "sun (zone time): twilight begin " << EventText(sun.times.events[0]) << ", sunrise "
      << EventText(sun.times.events[1]) << ", sunset " << EventText(sun.times.events[2]) << ", twilight end "
      << EventText(sun.times.events[3]) << '\n';
  return 0;
}

}  // namespace br::tidefiles
