#include "tools/tidefiles/station_entry.h"

#include "tides/engine/station_folder_check.h"

#include <cstdio>

namespace br::tidefiles {

std::string DescribeStation(std::size_t index, const std::string& utf8Name) {
  std::string s = "station " + std::to_string(index);
  if (utf8Name.empty()) return s;
  s += " \"" + MessageText(utf8Name) + "\"";
  return s;
}


std::string PositionText(int latitudeMinutes, int longitudeMinutes) {
  return br::tides::WholeMinutePositionText(latitudeMinutes, longitudeMinutes);
}

std::string MessageText(const std::string& text) {
  std::string shown = text.substr(0, 80);
  for (char& c : shown) {
    if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) c = '?';
  }
  return shown;
}

}  // namespace br::tidefiles
