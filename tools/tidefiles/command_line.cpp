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
#include "host/brtide/value_parsers.h"
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
    "  dump FOLDER                 print the folder's stations as that JSON (exit status 1\n"
    "                              when the folder is damaged)\n"
    "  check FOLDER                validate the folder: one line per problem, or \"ok: N stations\"\n"
    "  predict FOLDER ...          one station's day: heights in metres, highest and lowest\n"
    "                              points, sun events in the station's zone time as the\n"
    "                              library publishes them (\"--:--\": none that day)\n"
    "      --station N             the station with number N (td_num.ntx order, from 0), or\n"
    "      --at LAT LON            the station at that position (decimal degrees or 48.5N\n"
    "                              4.5W; whole minutes)\n"
    "      --date YYYY-MM-DD       the day (years 100 to 9999)\n"
    "      --step HOURS            hours between samples, 0.001 to 24 (default 1); the\n"
    "                              samples run to the one nearest 24:00, which falls in\n"
    "                              the next day when HOURS does not divide 24\n"
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
  // What can be read is printed; a damaged folder still fails, so that no script takes
  // the JSON of a broken folder for a good one.
  Diagnostics diagnostics;
  out << WriteStationsJson(DumpFolderImage(image, diagnostics));
  diagnostics.Print(err, true);
  const std::vector<std::string> problems = br::tides::CheckStationFolder(image);
  for (const std::string& p : problems) err << "tidefiles: dump: " << p << '\n';
  if (!problems.empty()) err << "tidefiles: dump: " << args[0] << " is damaged (" << Count(problems.size(), "problem") << ")\n";
  return diagnostics.HasErrors() || !problems.empty() ? kProblems : kOk;
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
  // Values read as brtide reads them: decimal degrees or with a hemisphere letter, years
  // 100..9999, steps of 0.001 to 24 hours.
  PredictOptions options;
  bool haveFolder = false, haveDate = false;
  for (std::size_t i = 0; i < args.size(); ++i) {
    const std::string& a = args[i];
    const auto value = [&](std::size_t n) { return i + n < args.size() ? args[i + n] : std::string(); };
    if (a == "--json") {
      options.json = true;
    } else if (a == "--station") {
      const std::optional<long> number = br::brtide::ParseStationNumber(value(1));
      if (!number) return Usage(err, "predict: bad station number \"" + value(1) + "\" (a whole number from 0)");
      options.station = static_cast<std::int32_t>(*number);
      ++i;
    } else if (a == "--at") {
      options.latitude = br::brtide::ParseLatitude(value(1));
      options.longitude = br::brtide::ParseLongitude(value(2));
      if (!options.latitude || !options.longitude)
        return Usage(err, "predict: --at needs LAT (degrees -90..90, or 48.5N) and LON (-180..180, or 4.5W)");
      i += 2;
    } else if (a == "--date") {
      const std::optional<br::tides::CalendarDate> date = br::brtide::ParseIsoDate(value(1));
      if (!date) return Usage(err, "predict: bad date \"" + value(1) + "\" (a real day as YYYY-MM-DD, years 100 to 9999)");
      options.date = *date;
      haveDate = true;
      ++i;
    } else if (a == "--step") {
      const std::optional<double> step = br::brtide::ParseStep(value(1));
      if (!step) return Usage(err, "predict: bad step \"" + value(1) + "\" (hours from 0.001 to 24)");
      options.step = *step;
      ++i;
    } else if (a == "--utc-offset") {
      const std::optional<double> offset = br::brtide::ParseNumber(value(1));
      if (!offset || std::fabs(*offset) > 14)
        return Usage(err, "predict: --utc-offset needs hours from -14 to 14 (UTC-5 is -5)");
      options.utcOffset = *offset;
      ++i;
    } else if (a.size() > 1 && a[0] == '-' && !br::brtide::ParseNumber(a)) {
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
