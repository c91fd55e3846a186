#include "host/brdesk/desk_options.h"

#include <sstream>
#include <utility>

#include "host/brtide/value_parsers.h"

namespace br::brdesk {

namespace {

bool ParseCount(const std::string& text, int& value) {
  if (text.empty() || text.size() > 9) return false;
  for (char c : text) {
    if (c < '0' || c > '9') return false;
  }
  value = std::stoi(text);
  return true;
}

}  // namespace

bool ParseDate(const std::string& text, int& year, int& month, int& day) {
  const auto date = br::brtide::ParseIsoDate(text);
  if (!date) return false;
  year = date->year;
  month = date->month;
  day = date->day;
  return true;
}

bool ParseBox(const std::string& text, double box[4]) {
  std::string spaced = text;
  for (char& c : spaced) {
    if (c == ',' || c == ';') c = ' ';
  }
  std::istringstream in(spaced);
  std::string word;
  std::vector<std::string> words;
  while (in >> word) words.push_back(word);
  if (words.size() != 4) return false;
  const auto south = br::brtide::ParseLatitude(words[0]), west = br::brtide::ParseLongitude(words[1]);
  const auto north = br::brtide::ParseLatitude(words[2]), east = br::brtide::ParseLongitude(words[3]);
  if (!south || !west || !north || !east) return false;
  box[0] = std::min(*south, *north);
  box[1] = *west;
  box[2] = std::max(*south, *north);
  box[3] = *east;
  return true;
}

bool CrossesDateLine(const double box[4]) { return box[1] > box[3]; }

bool ParseDeskOptions(const std::vector<std::string>& arguments, DeskOptions& options, std::string& error) {
  for (size_t i = 0; i < arguments.size(); ++i) {
    const std::string& name = arguments[i];
    auto value = [&](std::string& out) {
      if (i + 1 >= arguments.size()) {
        error = name + " wants a value";
        return false;
      }
      out = arguments[++i];
      return true;
    };
    std::string text;
    if (name == "--help" || name == "-h") {
      options.help = true;
    } else if (name == "--folder") {
      if (!value(options.folder) || options.folder.empty()) {
        error = "--folder wants a station folder";
        return false;
      }
    } else if (name == "--box") {
      // Four values, given as one argument or as four.
      if (i + 4 < arguments.size() + 0 && ParseBox(arguments[i + 1] + " " + arguments[i + 2] + " " +
                                                       arguments[i + 3] + " " + arguments[i + 4], options.box)) {
        i += 4;
      } else if (!value(text) || !ParseBox(text, options.box)) {
        error = "--box wants SOUTH WEST NORTH EAST in degrees (-90 to 90, -180 to 180, or 48.5N 4.5W)";
        return false;
      }
    } else if (name == "--date") {
      if (!value(text) || !ParseDate(text, options.year, options.month, options.day)) {
        error = "--date wants a real day as YYYY-MM-DD, years 100 to 9999";
        return false;
      }
    } else if (name == "--select") {
      if (!value(text) || !ParseCount(text, options.select)) {
        error = "--select wants a row number from 0";
        return false;
      }
    } else if (name == "--screenshot") {
      if (!value(options.screenshot) || options.screenshot.empty()) {
        error = "--screenshot wants a file name";
        return false;
      }
    } else {
      error = "unknown option " + name + " (try --help)";
      return false;
    }
  }
  return true;
}

void WriteDeskUsage(std::ostream& out) {
  out << "usage: brdesk [--folder F] [--box SOUTH WEST NORTH EAST] [--date YYYY-MM-DD] [--select N]\n"
         "              [--screenshot FILE]\n"
         "\n"
         "The tide desk: the stations of a box in a TidesPortList, the picked one's day in a\n"
         "TidesWindow, the pointer's reading and the graph's clocks in the status line.\n"
         "\n"
         "  --folder F          station folder; default: the world set, data\\world beside brdesk\n"
         "                      or in a folder above it\n"
         "  --box S W N E       the box in degrees, north and east positive (default 47.5 -6 49.5 -3,\n"
         "                      western Brittany); a WEST edge east of the EAST edge is the box\n"
         "                      across the 180th meridian\n"
         "  --date YYYY-MM-DD   the day (default today)\n"
         "  --select N          pick row N of the list (from 0, in name order) as a user would\n"
         "  --screenshot FILE   lay out, pick the row, write the whole window to a PNG file, print\n"
         "                      the status line and exit (no window stays open)\n"
         "  --help              this text\n"
         "\n"
         "Exit status: 0 done, 1 the library, the folder or the row cannot be had, 2 a wrong\n"
         "command line.\n";
}

}  // namespace br::brdesk
