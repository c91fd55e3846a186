// Nodal corrections: factor f and angle u of each constituent for one date.
#pragma once

namespace br::tides {

// Writes u and f into the process-wide constituent table from the longitudes of the moon's
// node N and perigee p (radians) of the date. O1, K1, J1, M2 and K2 are always corrected;
// every other rule runs only for constituents whose used flag is set (so call it after
// FindStation and ResetConstituents). Constituents without a rule keep u = 0, f = 1.
void ApplyNodalCorrections(double N, double p);

}  // namespace br::tides
