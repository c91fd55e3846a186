#include "host/brtide/ports_report.h"

#include <algorithm>

#include "host/brtide/position_text.h"
#include "host/brtide/printable_text.h"

namespace br::brtide {

namespace {
constexpr std::size_t kMinNameWidth = 20;
constexpr std::size_t kMaxNameWidth = 40;  // the station files' name field

std::string Count(std::size_t n, const char* noun) { return std::to_string(n) + " " + noun + (n == 1 ? "" : "s"); }
}  // namespace

void WritePortsText(const PortsReport& report, std::ostream& out) {
  out << "Folder  " << report.folder << " (" << Count(static_cast<std::size_t>(report.stationCount), "station") << ")\n";
  // South-west to north-east corner, as searched.
  const Box& b = report.box;
  out << "Box     " << PositionText({b.latMin, b.lonMin}) << "  to  " << PositionText({b.latMax, b.lonMax})
      << (CrossesDateLine(b) ? "  (across the 180th meridian)" : "") << '\n';

  std::size_t nameWidth = kMinNameWidth;
  for (const PortRow& row : report.rows) nameWidth = std::max(nameWidth, Utf8Width(row.name));
  nameWidth = std::min(nameWidth, kMaxNameWidth);

  out << '\n' << PadLeft("No.", 6) << "  " << PadRight("Name", nameWidth) << "  " << PadRight("Latitude", 15)
      << "Longitude\n";
  for (const PortRow& row : report.rows) {
    const std::string number = row.number >= 0 ? std::to_string(row.number) : "?";
    out << PadLeft(number, 6) << "  " << PadRight(PrintableText(row.name), nameWidth) << "  "
        << PadRight(LatitudeText(row.position.latitude), 15) << LongitudeText(row.position.longitude) << '\n';
  }
  out << '\n' << Count(report.rows.size(), "station") << " in the box\n";
}

}  // namespace br::brtide
