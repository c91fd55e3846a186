// Positions in the library's degree-minute format, and column padding, for UTF-8 output.
#pragma once

#include <cstddef>
#include <string>

#include "host/brtide/station_positions.h"

namespace br::brtide {

// The library's degree-minute text ("48° 23'.000 N", "004° 30'.000 W") in UTF-8: the
// library writes the degree sign as the ANSI byte 0xB0.
std::string LatitudeText(double degrees);
std::string LongitudeText(double degrees);
std::string PositionText(const Position& position);  // latitude, two blanks, longitude

// Characters (code points) of UTF-8 text, for lining up columns.
std::size_t Utf8Width(const std::string& text);
// text followed by blanks up to width characters (never cut).
std::string PadRight(const std::string& text, std::size_t width);
// Blanks up to width characters, then text.
std::string PadLeft(const std::string& text, std::size_t width);

}  // namespace br::brtide
