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

// The most days one "days" table covers.
inline constexpr long kMaxTableDays = 366;

// The commands and their own options. Extra outputs of the day command append their
// options to the "day" table before parsing (see AddDayOption).
std::vector<CommandSpec> BrtideCommands();
void AddDayOption(std::vector<CommandSpec>& commands, const OptionSpec& option);

// A latitude/longitude box in degrees. The longitudes are the west and the east edge: a
// west edge east of the east edge is the box across the 180th meridian.
struct Box {
  double latMin = 0.0;
  double lonMin = 0.0;  // west edge
  double latMax = 0.0;
  double lonMax = 0.0;  // east edge
};
bool CrossesDateLine(const Box& box);

// The station asked for: by number, or the one nearest to a position.
struct StationChoice {
  std::optional<long> port;
  std::optional<Position> nearTo;
};

struct PortsRequest {
  std::string folder;  // empty: the world set found beside the program
  Box box;
};

struct DayRequest {
  std::string folder;  // empty: the world set found beside the program
  StationChoice station;
  br::tides::CalendarDate date;
  double step = 1.0;  // hours
  bool csv = false;
  bool json = false;
  bool stationTime = false;  // heights and tides in the station's zone time
  // Options of the "day" table that are not the command's own (extra outputs).
  std::map<std::string, std::vector<std::string>> extras;
};

struct DaysRequest {
  std::string folder;
  StationChoice station;
  br::tides::CalendarDate from;
  long days = 1;  // from "from" on, at most kMaxTableDays
  bool csv = false;
  bool json = false;
  bool stationTime = false;
};

// Each gives false and a one-line message when a value is wrong.
bool BuildPortsRequest(const ParsedCommand& parsed, PortsRequest& request, std::string& error);
bool BuildDayRequest(const ParsedCommand& parsed, DayRequest& request, std::string& error);
bool BuildDaysRequest(const ParsedCommand& parsed, DaysRequest& request, std::string& error);

}  // namespace br::brtide
