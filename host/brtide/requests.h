// What the user asked brtide for, checked: the command tables and the requests built from a
// parsed command line.
#pragma once

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "host/brtide/ArgumentParser.h"
#include "host/brtide/station_positions.h"
#include "tides/engine/calendar.h"

namespace br::brtide {

// Exit statuses.
inline constexpr int kExitOk = 0;
inline constexpr int kExitFailure = 1;  // the folder, the station or the day cannot be had
inline constexpr int kExitUsage = 2;    // the command line is wrong

// The commands and their own options. Extra outputs of the day command append their
// options to the "day" table before parsing (see AddDayOption).
std::vector<CommandSpec> BrtideCommands();
void AddDayOption(std::vector<CommandSpec>& commands, const OptionSpec& option);

// A latitude/longitude box in degrees, corners in the order given.
struct Box {
  double latMin = 0.0;
  double lonMin = 0.0;
  double latMax = 0.0;
  double lonMax = 0.0;
};

struct PortsRequest {
  std::string folder;
  Box box;
};

struct DayRequest {
  std::string folder;
  std::optional<long> port;     // a station number, or
  std::optional<Position> nearTo;  // the station nearest to a position
  br::tides::CalendarDate date;
  double step = 1.0;  // hours
  bool csv = false;
  // Options of the "day" table that are not the command's own (extra outputs).
  std::map<std::string, std::vector<std::string>> extras;
};

// Each gives false and a one-line message when a value is wrong.
bool BuildPortsRequest(const ParsedCommand& parsed, PortsRequest& request, std::string& error);
bool BuildDayRequest(const ParsedCommand& parsed, DayRequest& request, std::string& error);

}  // namespace br::brtide
