// The stations of a box as brtide lists them.
#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "host/brtide/requests.h"
#include "host/brtide/station_positions.h"

namespace br::brtide {

struct PortRow {
  long number = -1;  // station number, -1 when it could not be told
  std::string name;  // UTF-8
  Position position;
};

struct PortsReport {
  std::string folder;  // as opened (full path)
  long stationCount = 0;
  Box box;
  std::vector<PortRow> rows;
};

// Folder and its station count, the box, one line per station (number, name, latitude,
// longitude) and the count in the box.
void WritePortsText(const PortsReport& report, std::ostream& out);

}  // namespace br::brtide
