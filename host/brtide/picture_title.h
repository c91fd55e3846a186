// The title over brtide's picture of a day: the graph's curve runs on the port's clock and
// its sun bands on the station's, so the reader is told which is which. Portable.
#pragma once

#include <string>
#include <vector>

#include "host/brtide/day_report.h"

namespace br::brtide {

// Pixels the title takes above the graph.
inline constexpr int kPictureTitleHeight = 40;

// Two lines: station, date and unit; the clock of the curve and that of the sun bands.
std::vector<std::string> PictureTitle(const DayReport& day);

}  // namespace br::brtide
