#pragma once
// Latitude and longitude text: the mask-driven formatter of the coordinate edits
// and table cells, and the fixed degree-minute formats of the chart panels.
// Results are ANSI text; the degree sign is the byte 0xB0.

#include <string>

namespace br {

enum CoordKind : int {
  COORD_LATITUDE = 6,
  COORD_LONGITUDE = 7,
};

// Masks that take the rounded path of FormatCoord. The first of each kind is
// the coordinate edit's default mask.
inline constexpr const char* COORD_MASK_LAT_MINUTES = "DD\xB0MM.mmm'$";
inline constexpr const char* COORD_MASK_LAT_HUNDREDTHS = "DD\xB0MM'.mm $";
inline constexpr const char* COORD_MASK_LON_MINUTES = "DDD\xB0MM.mmm'$";
inline constexpr const char* COORD_MASK_LON_HUNDREDTHS = "DDD\xB0MM'.mm $";

// Mask letters: D degrees, M whole minutes, S whole seconds, d/m/s decimals of
// the degree/minute/second, $ hemisphere letter; a run of one letter is one
// field as wide as the run. Other characters are copied.
// A preset mask rounds once on the whole value; any other mask truncates.
// An empty or null mask, a kind other than 6 or 7, or a value that is not
// finite gives empty text.
std::string FormatCoord(const char* mask, int kind, double value);

// Fixed chart-panel formats, truncated: "12\xB0 30'.000 N", "004\xB0 05'.250 W".
std::string FormatLatitudeDM(double value);
std::string FormatLongitudeDM(double value);

// Hemisphere letter for a kind: N/S for latitudes, E/W for longitudes;
// zero counts as north or east. '\0' for any other kind.
char HemisphereLetter(int kind, double value);

}  // namespace br
