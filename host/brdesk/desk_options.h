// brdesk's command line: station folder, box, date, row to select, screenshot file. Values
// are read by brtide's rules (decimal degrees or with a hemisphere letter, years 100 to
// 9999, a west edge east of the east edge for a box across the 180th meridian). Portable.
#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace br::brdesk {

struct DeskOptions {
  std::string folder;                        // station folder ("" = the world set beside the program)
  double box[4] = {47.5, -6.0, 49.5, -3.0};  // south, west, north, east (degrees)
  int year = 0, month = 0, day = 0;          // 0: today
  int select = 0;                            // row to select
  std::string screenshot;                    // "" = interactive
  bool help = false;                         // --help: print the usage and stop
};

// Parses the arguments after the program name. False with a one-line message on error.
bool ParseDeskOptions(const std::vector<std::string>& arguments, DeskOptions& options, std::string& error);
// "YYYY-MM-DD" with a real calendar day, years 100 to 9999.
bool ParseDate(const std::string& text, int& year, int& month, int& day);
// Four values separated by blanks or commas: south west north east. The latitudes in
// either order; a west edge east of the east edge is the box across the 180th meridian.
bool ParseBox(const std::string& text, double box[4]);
bool CrossesDateLine(const double box[4]);

// brdesk --help.
void WriteDeskUsage(std::ostream& out);

}  // namespace br::brdesk
