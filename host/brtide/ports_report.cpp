#include "host/brtide/ports_report.h"

#include <algorithm>

#include "host/brtide/position_text.h"

namespace br::brtide {

namespace {
constexpr std::size_t kMinNameWidth = 20;
constexpr std::size_t kMaxNameWidth = 40;  // the station files' name field
}  // namespace

void WritePortsText(const PortsReport& report, std::ostream& out) {
  out << "Folder  " << report.folder << " (" << report.stationCount << " stations)\n";
  // The library takes the corners in either order; show the box it searched.
  const Box& b = report.box;
  out << "Box     " << PositionText({std::min(b.latMin, b.latMax), std::min(b.lonMin, b.lonMax)}) << "  to  "
      << PositionText({std::max(b.latMin, b.latMax), std::max(b.lonMin, b.lonMax)}) << '\n';

  std::size_t nameWidth = kMinNameWidth;
  for (const PortRow& row : report.rows) nameWidth = std::max(nameWidth, Utf8Width(row.name));
  nameWidth = std::min(nameWidth, kMaxNameWidth);

  out << '\n' << PadLeft("No.", 6) << "  " << PadRight("Name", nameWidth) << "  " << PadRight("Latitude", 15)
      << "Longitude\n";
  for (const PortRow& row : report.rows) {
    const std::string number = row.number >= 0 ? std::to_string(row.number) : "?";
    out << PadLeft(number, 6) << "  " << PadRight(row.name, nameWidth) << "  "
        << PadRight(LatitudeText(row.position.latitude), 15) << LongitudeText(row.position.longitude) << '\n';
  }
  out << '\n' << report.rows.size() << (report.rows.size() == 1 ? " station" : " stations") << " in the box\n";
}

}  // namespace br::brtide
