// Stations (published units) to the three station files.
//
// Positions are rounded to whole minutes, amplitudes to thousandths of a metre (unsigned
// 16-bit: larger values are clipped with a warning), phases to tenths of a degree in
// 0..3599. Every station's first record is its mean level (constituent 0; a negative level
// is stored as its size with phase 180 degrees). Names go to Windows-1252, cut to 40 bytes.
// A station whose position rounds to that of an earlier one is dropped with a warning.
// "td_num.ntx" keeps the input order; "td_crd.ntx" is sorted by the unsigned StationKey.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "tools/tidefiles/Diagnostics.h"
#include "tools/tidefiles/folder_image.h"
#include "tools/tidefiles/station_entry.h"

namespace br::tidefiles {

// Whole minutes of a coordinate in degrees.
std::int16_t WholeMinutes(double degrees);
// Amplitude field (thousandths of a metre) and whether it had to be clipped.
std::uint16_t AmplitudeField(double metres, bool& clipped);
// Phase field: tenths of a degree, normalised to 0..3599.
std::uint16_t PhaseField(double degrees);

// Nothing when the stations cannot be stored at all (errors in diagnostics).
std::optional<FolderImage> BuildFolderImage(const std::vector<StationEntry>& stations, Diagnostics& diagnostics);

}  // namespace br::tidefiles
