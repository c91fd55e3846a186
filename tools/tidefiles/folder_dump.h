// The three station files back to stations in published units, in station-number order.
#pragma once

#include <vector>

#include "tools/tidefiles/Diagnostics.h"
#include "tools/tidefiles/folder_image.h"
#include "tools/tidefiles/station_entry.h"

namespace br::tidefiles {

// Each station's block is found as the engine finds it: through the "td_crd.ntx" record
// with the station's key. Stations whose block cannot be read whole are left out with an
// error; records with a number outside 0..68 are left out with an error. A first record of
// constituent 0 with phase 0 or 180 degrees becomes the mean level.
std::vector<StationEntry> DumpFolderImage(const FolderImage& image, Diagnostics& diagnostics);

}  // namespace br::tidefiles
