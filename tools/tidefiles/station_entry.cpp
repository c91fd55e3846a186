#include "tools/tidefiles/station_entry.h"

namespace br::tidefiles {

std::string DescribeStation(std::size_t index, const std::string& utf8Name) {
  std::string s = "station " + std::to_string(index);
  if (utf8Name.empty()) return s;
  // Messages stay one line each whatever the name holds.
  std::string shown = utf8Name.substr(0, 80);
  for (char& c : shown) {
    if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) c = '?';
  }
  s += " \"" + shown + "\"";
  return s;
}

}  // namespace br::tidefiles
