// Nodal corrections: factor f and angle u of each constituent for one date.
#pragma once

#include "tides/engine/TideEngine.h"

namespace br::tides {

// Writes u and f into the process-wide constituent table from the longitudes of the moon's
// node N and perigee p (radians) of the date. O1, K1, J1, M2 and K2 are always corrected;
// every other rule runs only for constituents whose used flag is set (so call it after
// FindStation and ResetConstituents). Constituents without a rule keep u = 0, f = 1.
void ApplyNodalCorrections(double N, double p);

// Every row's u and f for N and p, as ApplyNodalCorrections gives them to a used row (no
// rule reads a row that is corrected only when used, so a row's values do not depend on
// which others are used). The engine's table is not touched.
ConstituentTable NodalCorrectionsOfEveryRow(double N, double p);

}  // namespace br::tides
