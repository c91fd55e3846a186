#include "tides/controls/graph/label_format.h"

#include <cstdio>
#include <cstring>
#include <vector>

namespace br::tides::graph {

namespace {

bool IsFlag(char c) { return c == '-' || c == '+' || c == ' ' || c == '#' || c == '0'; }
bool IsDigit(char c) { return c >= '0' && c <= '9'; }
bool IsFloatingConversion(char c) { return std::strchr("eEfFgGaA", c) != nullptr && c != '\0'; }

// Reads digits from format at i; false when they make a number above the limit.
bool ReadNumber(std::string_view format, std::size_t& i) {
  int value = 0;
  while (i < format.size() && IsDigit(format[i])) {
    value = value * 10 + (format[i] - '0');
    if (value > kLabelFormatMaxNumber) return false;
    ++i;
  }
  return true;
}

}  // namespace

bool IsValueLabelFormat(std::string_view format) {
  int conversions = 0;
  for (std::size_t i = 0; i < format.size(); ++i) {
    const char c = format[i];
    if (c == '\0') return false;  // the C library would stop reading here
    if (c != '%') continue;
    ++i;
    if (i < format.size() && format[i] == '%') continue;
    while (i < format.size() && IsFlag(format[i])) ++i;
    if (!ReadNumber(format, i)) return false;
    if (i < format.size() && format[i] == '.') {
      ++i;
      if (!ReadNumber(format, i)) return false;
    }
    if (i >= format.size() || !IsFloatingConversion(format[i])) return false;
    ++conversions;
  }
  return conversions == 1;
}

std::string FormatValueLabel(const std::string& format, double value) {
  const char* used = IsValueLabelFormat(format) ? format.c_str() : kDefaultLabelFormat;
  const int length = std::snprintf(nullptr, 0, used, value);
  if (length <= 0) return std::string();
  std::vector<char> text(static_cast<std::size_t>(length) + 1);
  std::snprintf(text.data(), text.size(), used, value);
  return std::string(text.data(), static_cast<std::size_t>(length));
}

}  // namespace br::tides::graph
