#include "host/brdesk/desk_options.h"

#include <cmath>
#include <cstdlib>
#include <sstream>

namespace br::brdesk {

namespace {

bool ParseNumber(const std::string& text, double& value) {
  if (text.empty()) return false;
  char* end = nullptr;
  value = std::strtod(text.c_str(), &end);
  return end && *end == '\0' && std::isfinite(value);
}

bool ParseCount(const std::string& text, int& value) {
  if (text.empty() || text.size() > 9) return false;
  for (char c : text) {
    if (c < '0' || c > '9') return false;
  }
  value = std::atoi(text.c_str());
  return true;
}

}  // namespace

bool ParseDate(const std::string& text, int& year, int& month, int& day) {
  if (text.size() != 10 || text[4] != '-' || text[7] != '-') return false;
  int y = 0, m = 0, d = 0;
  if (!ParseCount(text.substr(0, 4), y) || !ParseCount(text.substr(5, 2), m) || !ParseCount(text.substr(8, 2), d)) {
    return false;
  }
  static const int kDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  if (y < 1601 || m < 1 || m > 12 || d < 1) return false;
  const bool leap = (y % 4 == 0 && y % 100 != 0) || y % 400 == 0;
  if (d > kDays[m - 1] + (m == 2 && leap ? 1 : 0)) return false;
  year = y;
  month = m;
  day = d;
  return true;
}

bool ParseBox(const std::string& text, double box[4]) {
  std::string spaced = text;
  for (char& c : spaced) {
    if (c == ',' || c == ';') c = ' ';
  }
  std::istringstream in(spaced);
  std::string word;
  double values[4];
  int count = 0;
  while (in >> word) {
    if (count == 4 || !ParseNumber(word, values[count])) return false;
    ++count;
  }
  if (count != 4) return false;
  if (values[0] < -90 || values[2] > 90 || values[0] > values[2]) return false;
  for (int i = 0; i < 4; ++i) box[i] = values[i];
  return true;
}

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
    if (name == "--folder") {
      if (!value(options.folder)) return false;
    } else if (name == "--box") {
      // Four values, given as one argument or as four.
      if (i + 4 < arguments.size() + 0 && ParseBox(arguments[i + 1] + " " + arguments[i + 2] + " " +
                                                       arguments[i + 3] + " " + arguments[i + 4], options.box)) {
        i += 4;
      } else if (!value(text) || !ParseBox(text, options.box)) {
        error = "--box wants south west north east in degrees";
        return false;
      }
    } else if (name == "--date") {
      if (!value(text) || !ParseDate(text, options.year, options.month, options.day)) {
        error = "--date wants YYYY-MM-DD";
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
      error = "unknown option " + name;
      return false;
    }
  }
  return true;
}

}  // namespace br::brdesk
