#pragma once
// Measured values as text, with the library's "no value" marker.

#include <string>

namespace br {

// The largest finite double stands for "no value" in doubles throughout.
inline constexpr double NO_VALUE = 1.7976931348623157e308;
inline constexpr const char* NO_VALUE_TEXT = "<None>";

// "<None>" for NO_VALUE, else the value with the given number of decimals
// ("%.*f"): a negative count, as printf takes it, gives six.
std::string FormatNumber(double value, int decimals);

}  // namespace br
