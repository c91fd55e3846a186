#include "host/brtide/requests.h"

#include <cmath>

#include "host/brtide/clock_text.h"
#include "host/brtide/value_parsers.h"

namespace br::brtide {

namespace {

const char kFolder[] = "--folder";
const char kBox[] = "--box";
const char kPort[] = "--port";
const char kNear[] = "--near";
const char kDate[] = "--date";
const char kFrom[] = "--from";
const char kTo[] = "--to";
const char kStep[] = "--step";
const char kCsv[] = "--csv";
const char kJson[] = "--json";
const char kStationTime[] = "--station-time";

bool IsOwnDayOption(const std::string& name) {
  for (const char* own : {kFolder, kPort, kNear, kDate, kStep, kCsv, kJson, kStationTime})
    if (name == own) return true;
  return false;
}

bool Reject(std::string& error, std::string message) {
  error = std::move(message);
  return false;
}

bool ReadLatitude(const std::string& text, const char* what, double& out, std::string& error) {
  const std::optional<double> value = ParseLatitude(text);
  if (!value) return Reject(error, std::string("bad ") + what + " \"" + text + "\" (degrees -90 to 90, or 48.5N)");
  out = *value;
  return true;
}

bool ReadLongitude(const std::string& text, const char* what, double& out, std::string& error) {
  const std::optional<double> value = ParseLongitude(text);
  if (!value) return Reject(error, std::string("bad ") + what + " \"" + text + "\" (degrees -180 to 180, or 4.5W)");
  out = *value;
  return true;
}

bool ReadDate(const ParsedCommand& parsed, const char* option, br::tides::CalendarDate& out, std::string& error) {
  const std::string text = parsed.Value(option);
  const std::optional<br::tides::CalendarDate> day = ParseIsoDate(text);
  if (!day) return Reject(error, "bad date \"" + text + "\" (a real day as YYYY-MM-DD, years 100 to 9999)");
  out = *day;
  return true;
}

bool ReadStation(const ParsedCommand& parsed, const std::string& command, StationChoice& choice, std::string& error) {
  if (parsed.Has(kPort) == parsed.Has(kNear)) return Reject(error, command + " needs either --port N or --near LAT LON");
  if (parsed.Has(kPort)) {
    const std::string text = parsed.Value(kPort);
    choice.port = ParseStationNumber(text);
    if (!choice.port) return Reject(error, "bad station number \"" + text + "\" (a whole number from 0)");
    return true;
  }
  const std::vector<std::string>& values = parsed.Values(kNear);
  Position position;
  if (values.size() != 2) return Reject(error, "--near needs LAT LON");
  if (!ReadLatitude(values[0], "LAT", position.latitude, error) || !ReadLongitude(values[1], "LON", position.longitude, error))
    return false;
  choice.nearTo = position;
  return true;
}

OptionSpec FolderOption() {
  return {kFolder, 1, "F",
          "station folder (td_num.ntx, td_crd.ntx, td_pnt.dat); default: the world set, data\\world beside "
          "brtide or in a folder above it",
          false, ""};
}

}  // namespace

bool CrossesDateLine(const Box& box) { return box.lonMin > box.lonMax; }

std::vector<CommandSpec> BrtideCommands() {
  const OptionSpec folder = FolderOption();
  const OptionSpec port{kPort, 1, "N", "station number (as \"ports\" lists it)", false, "station"};
  const OptionSpec near{kNear, 2, "LAT LON", "the station nearest to a position", false, "station"};
  const OptionSpec stationTime{kStationTime, 0, "",
                               "heights and high and low waters in the station's zone time (the sun's clock) "
                               "instead of this computer's standard time",
                               false, ""};
  CommandSpec ports{"ports", "list the stations inside a latitude/longitude box", {}};
  ports.options = {
      folder,
      {kBox, 4, "SOUTH WEST NORTH EAST",
       "the box in degrees, north and east positive; a WEST edge east of the EAST edge is the box across the "
       "180th meridian (50 170 56 -170)",
       true, ""},
  };
  CommandSpec day{"day", "one day at a station: sun, high and low waters, and the tide heights", {}};
  day.options = {
      folder,
      port,
      near,
      {kDate, 1, "YYYY-MM-DD", "the day", true, ""},
      {kStep, 1, "H",
       "hours between heights, 0.001 to 24 (default 1); they run from 00:00 to the one nearest 24:00, which "
       "falls before 24:00 or in the next day when H does not divide 24",
       false, ""},
      {kCsv, 0, "", "CSV: time,height_m,event rows (points, high and low waters, sun)", false, ""},
      {kJson, 0, "", "the day as JSON", false, ""},
      stationTime,
  };
  CommandSpec days{"days", "a tide table: sun and high and low waters day by day", {}};
  days.options = {
      folder,
      port,
      near,
      {kFrom, 1, "YYYY-MM-DD", "the first day", true, ""},
      {kTo, 1, "YYYY-MM-DD", "the last day (at most 366 days from the first)", true, ""},
      {kCsv, 0, "", "CSV: time,height_m,event rows", false, ""},
      {kJson, 0, "", "the table as JSON", false, ""},
      stationTime,
  };
  return {ports, day, days};
}

void AddDayOption(std::vector<CommandSpec>& commands, const OptionSpec& option) {
  for (CommandSpec& command : commands) {
    if (command.name == "day") command.options.push_back(option);
  }
}

bool BuildPortsRequest(const ParsedCommand& parsed, PortsRequest& request, std::string& error) {
  request.folder = parsed.Value(kFolder);
  if (parsed.Has(kFolder) && request.folder.empty()) return Reject(error, "the station folder name is empty");
  const std::vector<std::string>& box = parsed.Values(kBox);
  if (box.size() != 4) return Reject(error, "--box needs SOUTH WEST NORTH EAST");
  if (!ReadLatitude(box[0], "SOUTH", request.box.latMin, error) || !ReadLongitude(box[1], "WEST", request.box.lonMin, error) ||
      !ReadLatitude(box[2], "NORTH", request.box.latMax, error) || !ReadLongitude(box[3], "EAST", request.box.lonMax, error))
    return false;
  // The library takes the latitudes in either order.
  if (request.box.latMin > request.box.latMax) std::swap(request.box.latMin, request.box.latMax);
  return true;
}

bool BuildDayRequest(const ParsedCommand& parsed, DayRequest& request, std::string& error) {
  request.folder = parsed.Value(kFolder);
  if (parsed.Has(kFolder) && request.folder.empty()) return Reject(error, "the station folder name is empty");
  if (!ReadStation(parsed, "day", request.station, error) || !ReadDate(parsed, kDate, request.date, error)) return false;

  if (parsed.Has(kStep)) {
    const std::string text = parsed.Value(kStep);
    const std::optional<double> step = ParseStep(text);
    if (!step) return Reject(error, "bad step \"" + text + "\" (hours from 0.001 to 24)");
    request.step = *step;
  }
  request.csv = parsed.Has(kCsv);
  request.json = parsed.Has(kJson);
  if (request.csv && request.json) return Reject(error, "--csv and --json exclude each other");
  request.stationTime = parsed.Has(kStationTime);
  // Station time is read from the port's curve every minute: its points are whole minutes.
  if (request.stationTime && std::fabs(request.step * 60.0 - std::round(request.step * 60.0)) > 1e-9)
    return Reject(error, "--station-time needs a step of whole minutes (0.25 is 15 minutes)");

  for (const auto& [name, values] : parsed.options) {
    if (!IsOwnDayOption(name)) request.extras[name] = values;
  }
  return true;
}

bool BuildDaysRequest(const ParsedCommand& parsed, DaysRequest& request, std::string& error) {
  request.folder = parsed.Value(kFolder);
  if (parsed.Has(kFolder) && request.folder.empty()) return Reject(error, "the station folder name is empty");
  br::tides::CalendarDate to;
  if (!ReadStation(parsed, "days", request.station, error) || !ReadDate(parsed, kFrom, request.from, error) ||
      !ReadDate(parsed, kTo, to, error))
    return false;
  const double span = DayCountOfDate(to) - DayCountOfDate(request.from);
  if (span < 0) return Reject(error, "--to " + IsoDate(to) + " is before --from " + IsoDate(request.from));
  if (span >= kMaxTableDays)
    return Reject(error, "--from to --to spans " + std::to_string(static_cast<long>(span) + 1) + " days; at most " +
                             std::to_string(kMaxTableDays));
  request.days = static_cast<long>(span) + 1;
  request.csv = parsed.Has(kCsv);
  request.json = parsed.Has(kJson);
  if (request.csv && request.json) return Reject(error, "--csv and --json exclude each other");
  request.stationTime = parsed.Has(kStationTime);
  return true;
}

}  // namespace br::brtide
