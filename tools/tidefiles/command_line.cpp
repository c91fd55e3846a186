#include "tools/tidefiles/command_line.h"

#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <sstream>

#include "tools/tidefiles/day_report.h"
#include "tools/tidefiles/Diagnostics.h"
#include "tools/tidefiles/folder_builder.h"
#include "tools/tidefiles/folder_dump.h"
#include "tools/tidefiles/folder_image.h"
#include "tools/tidefiles/station_json.h"
#include "tides/engine/station_folder_check.h"

namespace br::tidefiles {
namespace {

constexpr int kOk = 0;
constexpr int kProblems = 1;
constexpr int kUsage = 2;

// Station JSON larger than this is refused rather than read.
constexpr std::size_t kMaxJsonBytes = 512u * 1024u * 1024u;

const char kUsageText[] =
    "usage: tidefiles build [--verbose] STATIONS.json FOLDER\n"
    "       tidefiles dump FOLDER\n"
    "       tidefiles check FOLDER\n"
    "       tidefiles predict FOLDER (--station N | --at LAT LON) --date YYYY-MM-DD\n"
    "                         [--step HOURS] [--utc-offset HOURS] [--json]\n"
    "       tidefiles --help\n";

const char kHelpText[] =
    "Makes, reads and checks tide station folders (td_num.ntx, td_crd.ntx, td_pnt.dat).\n"
    "\n"
    "  build STATIONS.json FOLDER  write the three files from a JSON array of stations\n"
    "                              (\"-\" reads the JSON from standard input); --verbose\n"
    "                              also lists names changed for the code page or cut\n"
    "  dump FOLDER                 print the folder's stations as that JSON\n"
    "  check FOLDER                validate the folder: one line per problem, or \"ok: N stations\"\n"
    "  predict FOLDER ...          one station's day: heights in metres, highest and lowest\n"
    "                              points, sun events in the station's zone time\n"
    "      --station N             the station with number N (td_num.ntx order, from 0), or\n"
    "      --at LAT LON            the station at that position (degrees, whole minutes)\n"
    "      --date YYYY-MM-DD       the day\n"
    "      --step HOURS            hours between samples (default 1)\n"
    "      --utc-offset HOURS      the computer's standard time minus UT (default 0): the day\n"
    "                              starts at that local standard midnight\n"
    "      --json                  print JSON instead of a table\n"
    "\n"
    "Station JSON: [{\"name\": \"Newlyn\", \"latitude\": 50.103, \"longitude\": -5.543,\n"
    "  \"zone\": 0, \"mean_level\": 3.265, \"constituents\": [{\"name\": \"M2\",\n"
    "  \"amplitude\": 1.712, \"phase\": 133.7}, {\"number\": 36, ...}]}, ...]\n"
    "zone: whole hours, universal time = zone time + zone (UTC+1 is -1); mean_level and\n"
    "amplitude in metres; phase: Greenwich phase lag in degrees (referred to UT).\n"
    "Exit status: 0 ok, 1 problems found, 2 bad command line.\n";

std::string Count(std::size_t n, const char* noun) {
  return std::to_string(n) + " " + noun + (n == 1 ? "" : "s");
}

int Usage(std::ostream& err, const std::string& message) {
  err << "tidefiles: " << message << '\n' << kUsageText;
  return kUsage;
}

bool ParseNumber(const std::string& text, double& value) {
  if (text.empty() || text.size() > 64) return false;
  errno = 0;
  char* end = nullptr;
  value = std::strtod(text.c_str(), &end);
  return errno == 0 && end == text.c_str() + text.size() && std::isfinite(value);
}

bool ParseDate(const std::string& text, br::tides::CalendarDate& date) {
  int year = 0, month = 0, day = 0;
  char tail = 0;
  if (text.size() != 10 || text[4] != '-' || text[7] != '-') return false;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (i != 4 && i != 7 && (text[i] < '0' || text[i] > '9')) return false;
  }
  if (std::sscanf(text.c_str(), "%4d-%2d-%2d%c", &year, &month, &day, &tail) != 3) return false;
  static const int kDays[12] = {31, 29, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  if (year < 1 || month < 1 || month > 12 || day < 1 || day > kDays[month - 1]) return false;
  const bool leap = (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
  if (month == 2 && day == 29 && !leap) return false;
  date.year = static_cast<std::int16_t>(year);
  date.month = static_cast<std::uint8_t>(month);
  date.day = static_cast<std::uint8_t>(day);
  return true;
}

bool ReadText(const std::string& path, std::istream& in, std::string& text, std::string& error) {
  std::istream* source = &in;
  std::ifstream file;
  if (path != "-") {
    file.open(path, std::ios::binary);
    if (!file) {
      error = path + ": cannot open";
      return false;
    }
    source = &file;
  }
  char buffer[65536];
  while (*source) {
    source->read(buffer, sizeof buffer);
    text.append(buffer, static_cast<std::size_t>(source->gcount()));
    if (text.size() > kMaxJsonBytes) {
      error = path + ": larger than " + std::to_string(kMaxJsonBytes) + " bytes";
      return false;
    }
  }
  if (source->bad()) {
    error = path + ": cannot read";
    return false;
  }
  return true;
}

int Build(const std::vector<std::string>& args, std::istream& in, std::ostream& out, std::ostream& err) {
  bool verbose = false;
  std::vector<std::string> paths;
  for (const std::string& a : args) {
    if (a == "--verbose" || a == "-v") {
      verbose = true;
    } else if (a.size() > 1 && a[0] == '-') {
      return Usage(err, "build: unknown option " + a);
    } else {
      paths.push_back(a);
    }
  }
  if (paths.size() != 2) return Usage(err, "build needs STATIONS.json and FOLDER");
  std::string text, error;
  if (!ReadText(paths[0], in, text, error)) {
    err << "tidefiles: build: " << error << '\n';
    return kProblems;
  }
  Diagnostics diagnostics;
  const std::vector<StationEntry> stations = ReadStationsJson(text, diagnostics);
  std::optional<FolderImage> image;
  if (!diagnostics.HasErrors()) image = BuildFolderImage(stations, diagnostics);
  diagnostics.Print(err, verbose);
  if (!image) {
    err << "tidefiles: build: nothing written (" << Count(diagnostics.Count(Severity::Error), "error") << ")\n";
    return kProblems;
  }
  if (!WriteFolderImage(paths[1], *image, error)) {
    err << "tidefiles: build: " << error << '\n';
    return kProblems;
  }
  const std::size_t written = image->stationIndex.size() / 10;
  out << "wrote " << Count(written, "station") << " to " << paths[1];
  if (written != stations.size()) out << " (" << stations.size() - written << " dropped)";
  out << ", " << Count(diagnostics.Count(Severity::Warning), "warning") << '\n';
  return kOk;
}

int Dump(const std::vector<std::string>& args, std::ostream& out, std::ostream& err) {
  if (args.size() != 1 || (args[0].size() > 1 && args[0][0] == '-')) return Usage(err, "dump needs FOLDER");
  FolderImage image;
  std::string error;
  if (!ReadFolderImage(args[0], image, error)) {
    err << "tidefiles: dump: " << error << '\n';
    return kProblems;
  }
  Diagnostics diagnostics;
  out << WriteStationsJson(DumpFolderImage(image, diagnostics));
  diagnostics.Print(err, true);
  return diagnostics.HasErrors() ? kProblems : kOk;
}

int Check(const std::vector<std::string>& args, std::ostream& out, std::ostream& err) {
  if (args.size() != 1 || (args[0].size() > 1 && args[0][0] == '-')) return Usage(err, "check needs FOLDER");
  FolderImage image;
  std::string error;
  if (!ReadFolderImage(args[0], image, error)) {
    out << error << '\n';
    return kProblems;
  }
  const std::vector<std::string> problems = br::tides::CheckStationFolder(image);
  for (const std::string& p : problems) out << p << '\n';
  if (!problems.empty()) {
    err << "tidefiles: check: " << Count(problems.size(), "problem") << " in " << args[0] << '\n';
    return kProblems;
  }
  out << "ok: " << Count(image.stationIndex.size() / 10, "station") << '\n';
  return kOk;
}

int Predict(const std::vector<std::string>& args, std::ostream& out, std::ostream& err) {
  PredictOptions options;
  bool haveFolder = false, haveDate = false;
  for (std::size_t i = 0; i < args.size(); ++i) {
    const std::string& a = args[i];
    const auto value = [&](std::size_t n) { return i + n < args.size() ? &args[i + n] : nullptr; };
    if (a == "--json") {
      options.json = true;
    } else if (a == "--station") {
      double n = 0;
      if (!value(1) || !ParseNumber(*value(1), n) || n != std::floor(n) || n < 0 || n > 32767)
        return Usage(err, "predict: --station needs a station number from 0 to 32767");
      options.station = static_cast<std::int32_t>(n);
      ++i;
    } else if (a == "--at") {
      double lat = 0, lon = 0;
      if (!value(2) || !ParseNumber(*value(1), lat) || !ParseNumber(*value(2), lon) || std::fabs(lat) > 90 ||
          lon < -180 || lon > 360)
        return Usage(err, "predict: --at needs LAT (-90..90) and LON (-180..180) in degrees");
      options.latitude = lat;
      options.longitude = lon > 180 ? lon - 360 : lon;
      i += 2;
    } else if (a == "--date") {
      if (!value(1) || !ParseDate(*value(1), options.date))
        return Usage(err, "predict: --date needs a calendar date YYYY-MM-DD (year 0001..9999)");
      haveDate = true;
      ++i;
    } else if (a == "--step") {
      if (!value(1) || !ParseNumber(*value(1), options.step) || options.step <= 0)
        return Usage(err, "predict: --step needs a number of hours above 0");
      ++i;
    } else if (a == "--utc-offset") {
      if (!value(1) || !ParseNumber(*value(1), options.utcOffset) || std::fabs(options.utcOffset) > 14)
        return Usage(err, "predict: --utc-offset needs hours from -14 to 14 (UTC-5 is -5)");
      ++i;
    } else if (a.size() > 1 && a[0] == '-') {
      return Usage(err, "predict: unknown option " + a);
    } else if (!haveFolder) {
      options.folder = a;
      haveFolder = true;
    } else {
      return Usage(err, "predict: more than one FOLDER");
    }
  }
  if (!haveFolder) return Usage(err, "predict needs FOLDER");
  if (options.station.has_value() == options.latitude.has_value())
    return Usage(err, "predict needs either --station N or --at LAT LON");
  if (!haveDate) return Usage(err, "predict needs --date YYYY-MM-DD");
  return PrintPredictedDay(options, out, err);
}

}  // namespace

int RunTidefiles(const std::vector<std::string>& args, std::istream& in, std::ostream& out, std::ostream& err) {
  if (args.empty()) return Usage(err, "no command given");
  const std::string& command = args[0];
  const std::vector<std::string> rest(args.begin() + 1, args.end());
  if (command == "--help" || command == "-h" || command == "help") {
    out << kUsageText << '\n' << kHelpText;
    return kOk;
  }
  if (command == "build") return Build(rest, in, out, err);
  if (command == "dump") return Dump(rest, out, err);
  if (command == "check") return Check(rest, out, err);
  if (command == "predict") return Predict(rest, out, err);
  return Usage(err, "unknown command " + command);
}

}  // namespace br::tidefiles
