// The station JSON: an array of stations, each
//   {"name": "Newlyn", "latitude": 50.103, "longitude": -5.543, "zone": 0,
//    "mean_level": 3.265, "tag": 0,
//    "constituents": [{"name": "M2", "amplitude": 1.712, "phase": 133.7},
//                     {"number": 36, "amplitude": 0.572, "phase": 177.8}]}
// latitude/longitude in decimal degrees (north/east positive), zone in whole hours with
// universal time = zone time + zone (UTC+1 is -1), mean_level in metres above chart datum
// (optional, may be negative), tag an optional 0..65535 carried in the index records,
// amplitudes in metres and phases as Greenwich phase lags in degrees (referred to UT).
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "tools/tidefiles/Diagnostics.h"
#include "tools/tidefiles/station_entry.h"

namespace br::tidefiles {

// Reads and checks the JSON. Malformed stations are errors; constituents with no table row
// or that cannot be stored are dropped with a warning. Two constituents of one station that
// map to the same row are combined when they are different constituents of equal Doodson
// numbers (their sum is the same wave), and the later one is dropped when it repeats one.
std::vector<StationEntry> ReadStationsJson(std::string_view text, Diagnostics& diagnostics);

// The JSON text of stations (as dump prints it): one station per block, one constituent per
// line; rows with a usual name by name, the others by number.
std::string WriteStationsJson(const std::vector<StationEntry>& stations);

}  // namespace br::tidefiles
