// One calculated day of a port as the tide graph draws it. Portable.
#pragma once

#include "tides/controls/graph/background_bands.h"

#include <vector>

namespace br::tides::graph {

struct TideDay {
  std::vector<double> points;  // heights as the port reports them, one per step
  double maxValue = 0.0;       // the port's highest and lowest height (automatic scale)
  double minValue = 0.0;
  SunEvents sun;
};

// Feet in one metre, for height labels in feet.
inline constexpr double kFeetPerMetre = 3.280839895013123;

}  // namespace br::tides::graph
