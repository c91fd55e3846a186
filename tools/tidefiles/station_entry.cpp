#include "tools/tidefiles/station_entry.h"

namespace br::tidefiles {

std::string DescribeStation(std::size_t index, const std::string& utf8Name) {
  std::string s = "station " + std::to_string(index);
  if (!utf8Name.empty()) s += " \"" + utf8Name + "\"";
  return s;
}

}  // namespace br::tidefiles
