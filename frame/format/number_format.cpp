#include "frame/format/number_format.h"

#include <cstdio>
#include <vector>

namespace br {

namespace {
// Enough places for the exact expansion of any double; more only adds zeros.
constexpr int MAX_DECIMALS = 1100;
constexpr int DEFAULT_DECIMALS = 6;  // printf's precision when none is given
}  // namespace

std::string FormatNumber(double value, int decimals) {
  if (value == NO_VALUE) {
    return NO_VALUE_TEXT;
  }
  // "%.*f" reads a negative count as no precision at all, that is six places; said here
  // rather than left to each C runtime.
  if (decimals < 0) {
    decimals = DEFAULT_DECIMALS;
  } else if (decimals > MAX_DECIMALS) {
    decimals = MAX_DECIMALS;
  }
  char small[64];
  const int length = std::snprintf(small, sizeof small, "%.*f", decimals, value);
  if (length < 0) {
    return std::string();
  }
  if (static_cast<std::size_t>(length) < sizeof small) {
    return std::string(small, static_cast<std::size_t>(length));
  }
  std::vector<char> large(static_cast<std::size_t>(length) + 1);
  std::snprintf(large.data(), large.size(), "%.*f", decimals, value);
  return std::string(large.data(), static_cast<std::size_t>(length));
}

}  // namespace br
