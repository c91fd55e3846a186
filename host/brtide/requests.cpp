#include "host/brtide/requests.h"

#include "host/brtide/value_parsers.h"

namespace br::brtide {

namespace {

const char kFolder[] = "--folder";
const char kBox[] = "--box";
const char kPort[] = "--port";
const char kNear[] = "--near";
const char kDate[] = "--date";
const char kStep[] = "--step";
const char kCsv[] = "--csv";

bool IsOwnDayOption(const std::string& name) {
  return name == kFolder || name == kPort || name == kNear || name == kDate || name == kStep || name == kCsv;
}

bool Reject(std::string& error, std::string message) {
  error = std::move(message);
  return false;
}

bool ReadLatitude(const std::string& text, const char* what, double& out, std::string& error) {
  const std::optional<double> value = ParseLatitude(text);
  if (!value) return Reject(error, std::string("bad ") + what + " \"" + text + "\" (degrees -90..90, or 48.5N)");
  out = *value;
  return true;
}

bool ReadLongitude(const std::string& text, const char* what, double& out, std::string& error) {
  const std::optional<double> value = ParseLongitude(text);
  if (!value) return Reject(error, std::string("bad ") + what + " \"" + text + "\" (degrees -180..180, or 4.5W)");
  out = *value;
  return true;
}

}  // namespace

std::vector<CommandSpec> BrtideCommands() {
  const OptionSpec folder{kFolder, 1, "F", "station folder (td_num.ntx, td_crd.ntx, td_pnt.dat)", true, ""};
  CommandSpec ports{"ports", "list the stations inside a latitude/longitude box", {}};
  ports.options = {
      folder,
      {kBox, 4, "LATMIN LONMIN LATMAX LONMAX", "the box in decimal degrees, north and east positive", true, ""},
  };
  CommandSpec day{"day", "one day of tide heights, extremes, sunrise, sunset and twilight at a station", {}};
  day.options = {
      folder,
      {kPort, 1, "N", "station number (as \"ports\" lists it)", false, "station"},
      {kNear, 2, "LAT LON", "the station nearest to a position", false, "station"},
      {kDate, 1, "YYYY-MM-DD", "the day", true, ""},
      {kStep, 1, "H", "hours between heights (default 1, from 0.001 to 24)", false, ""},
      {kCsv, 0, "", "heights as CSV: one row per point with its ISO local time", false, ""},
  };
  return {ports, day};
}

void AddDayOption(std::vector<CommandSpec>& commands, const OptionSpec& option) {
  for (CommandSpec& command : commands) {
    if (command.name == "day") command.options.push_back(option);
  }
}

bool BuildPortsRequest(const ParsedCommand& parsed, PortsRequest& request, std::string& error) {
  request.folder = parsed.Value(kFolder);
  if (request.folder.empty()) return Reject(error, "the station folder name is empty");
  const std::vector<std::string>& box = parsed.Values(kBox);
  if (box.size() != 4) return Reject(error, "--box needs LATMIN LONMIN LATMAX LONMAX");
  return ReadLatitude(box[0], "LATMIN", request.box.latMin, error) &&
         ReadLongitude(box[1], "LONMIN", request.box.lonMin, error) &&
         ReadLatitude(box[2], "LATMAX", request.box.latMax, error) &&
         ReadLongitude(box[3], "LONMAX", request.box.lonMax, error);
}

bool BuildDayRequest(const ParsedCommand& parsed, DayRequest& request, std::string& error) {
  request.folder = parsed.Value(kFolder);
  if (request.folder.empty()) return Reject(error, "the station folder name is empty");

  if (parsed.Has(kPort) == parsed.Has(kNear)) return Reject(error, "day needs either --port N or --near LAT LON");
  if (parsed.Has(kPort)) {
    const std::string text = parsed.Value(kPort);
    request.port = ParseStationNumber(text);
    if (!request.port) return Reject(error, "bad station number \"" + text + "\" (a whole number from 0)");
  } else {
    const std::vector<std::string>& values = parsed.Values(kNear);
    Position position;
    if (values.size() != 2 || !ReadLatitude(values[0], "LAT", position.latitude, error) ||
        !ReadLongitude(values[1], "LON", position.longitude, error)) {
      if (error.empty()) error = "--near needs LAT LON";
      return false;
    }
    request.nearTo = position;
  }

  const std::string date = parsed.Value(kDate);
  const std::optional<br::tides::CalendarDate> day = ParseIsoDate(date);
  if (!day) return Reject(error, "bad date \"" + date + "\" (a real day as YYYY-MM-DD)");
  request.date = *day;

  if (parsed.Has(kStep)) {
    const std::string text = parsed.Value(kStep);
    const std::optional<double> step = ParseStep(text);
    if (!step) return Reject(error, "bad step \"" + text + "\" (hours from 0.001 to 24)");
    request.step = *step;
  }
  request.csv = parsed.Has(kCsv);

  for (const auto& [name, values] : parsed.options) {
    if (!IsOwnDayOption(name)) request.extras[name] = values;
  }
  return true;
}

}  // namespace br::brtide
