// brdesk's command line: station folder, box, date, row to select, screenshot file.
// Portable.
#pragma once

#include <string>
#include <vector>

namespace br::brdesk {

struct DeskOptions {
  std::string folder;                                 // station folder ("" = the library's default search)
  double box[4] = {47.5, -6.0, 49.5, -3.0};           // south, west, north, east (degrees)
  int year = 0, month = 0, day = 0;                   // 0: today
  int select = 0;                                     // row to select
  std::string screenshot;                             // "" = interactive
};

// Parses the arguments after the program name. False with a one-line message on error.
bool ParseDeskOptions(const std::vector<std::string>& arguments, DeskOptions& options, std::string& error);
// "YYYY-MM-DD" with a real calendar day.
bool ParseDate(const std::string& text, int& year, int& month, int& day);
// Four numbers separated by blanks or commas: south west north east.
bool ParseBox(const std::string& text, double box[4]);

}  // namespace br::brdesk
