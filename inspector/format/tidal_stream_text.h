#pragma once
// A tidal stream attribute (code 159) laid out as a small text table: the stream's
// direction and rate for each hour from six hours before to six hours after high or low
// water at a reference station. No Windows API: tested natively.
//
// The value is a comma-separated field list: A, B (free texts, printed as received), C
// (the reference: "HW" or "LW"), then 13 pairs of direction and rate for the hours -6 to
// +6. Missing fields read as empty; fields beyond the 29th are ignored. Every line ends
// in a carriage return; texts from the data are copied, never used as a format.
// Texts are 8-bit in the ANSI code page (the degree sign is 0xB0 there).

#include <string>
#include <string_view>
#include <vector>

namespace br::inspector {

// The localised words of the table (section "ObjInspector", ids 59 to 64).
struct TidalStreamCaptions {
  std::string highWater = "HighWater";
  std::string lowWater = "LowWater";
  std::string time = "Time";
  std::string direction = "Direction";
  std::string velocity = "Velocity";
  std::string knots = "kn";
};

inline constexpr int kTidalStreamHours = 13;   // -6 .. +6
inline constexpr int kTidalStreamFields = 29;  // A, B, C and 13 pairs

// The value split at every comma (an empty value gives one empty field).
std::vector<std::string> SplitTidalStreamFields(std::string_view value);

// The 15 lines: "A, B C(reference)", the caption line, then one line per hour.
std::string TidalStreamText(std::string_view value, const TidalStreamCaptions& captions);

// The hour label of one line: " -  6" for -6, six blanks for 0, " + 6" for +6.
std::string TidalStreamHourLabel(int hour);

}  // namespace br::inspector
