// Reads what the tide graph draws from a port through ITidesPort.
#pragma once

#include "tides/controls/graph/tide_day.h"

#include "BR_Info.h"

namespace br::tides {

// False when there is no port, or its point count cannot be read, is below 1 or above
// kMaxDayPoints. Heights
// that cannot be read are not-a-number (the curve shows them at mid-height); a sun event
// the port does not give, or whose date the platform cannot split, is absent.
bool ReadTideDay(ITidesPort* port, graph::TideDay& day);

}  // namespace br::tides
