#include "toolkit/table/logic/cell_mask.h"

#include <cstdio>
#include <cstring>

namespace toolkit::table {

namespace {

// Longest cell text a mask may produce; a wider field is a damaged mask.
constexpr int kMaxOutput = 4096;

bool conversionFits(char conversion, MaskArgument argument) {
  switch (argument) {
    case MaskArgument::Text: return conversion == 's';
    case MaskArgument::Long: return std::strchr("dioxXuc", conversion) != nullptr;
    case MaskArgument::Double: return std::strchr("fFeEgGaA", conversion) != nullptr;
  }
  return false;
}

// Length modifiers that leave the argument's size alone: h and hh for the int
// (promoted anyway), l for the double (%lf is %f).
bool modifierFits(std::string_view modifier, MaskArgument argument) {
  if (modifier.empty()) return true;
  if (argument == MaskArgument::Long) return modifier == "h" || modifier == "hh";
  if (argument == MaskArgument::Double) return modifier == "l";
  return false;
}

// Skips the digits at `i`; false when they ask for a field wider than any cell.
bool skipNumber(std::string_view mask, size_t& i) {
  long number = 0;
  while (i < mask.size() && mask[i] >= '0' && mask[i] <= '9') {
    number = number * 10 + (mask[i] - '0');
    if (number > kMaxOutput) return false;
    ++i;
  }
  return true;
}

template <class Value>
bool formatWith(const std::string& mask, Value value, std::string& out) {
  const int needed = std::snprintf(nullptr, 0, mask.c_str(), value);
  if (needed < 0 || needed > kMaxOutput) return false;
  out.assign(static_cast<size_t>(needed) + 1, '\0');
  std::snprintf(&out[0], out.size(), mask.c_str(), value);
  out.resize(static_cast<size_t>(needed));
  return true;
}

}  // namespace

bool maskFitsArgument(std::string_view mask, MaskArgument argument) {
  if (mask.find('\0') != std::string_view::npos) return false;
  int conversions = 0;
  size_t i = 0;
  while (i < mask.size()) {
    if (mask[i] != '%') {
      ++i;
      continue;
    }
    ++i;
    if (i < mask.size() && mask[i] == '%') {
      ++i;
      continue;
    }
    while (i < mask.size() && std::strchr("-+ #0", mask[i])) ++i;  // flags
    if (!skipNumber(mask, i)) return false;  // width
    if (i < mask.size() && mask[i] == '.') {
      ++i;
      if (!skipNumber(mask, i)) return false;  // precision
    }
    const size_t modifierStart = i;
    while (i < mask.size() && std::strchr("hlLqjzt", mask[i])) ++i;
    if (i >= mask.size()) return false;  // a lone '%' at the end
    const std::string_view modifier = mask.substr(modifierStart, i - modifierStart);
    if (!modifierFits(modifier, argument) || !conversionFits(mask[i], argument)) return false;
    if (++conversions > 1) return false;
    ++i;
  }
  return true;
}

std::string formatTextCell(const std::string& mask, const std::string& text) {
  std::string out;
  if (!mask.empty() && maskFitsArgument(mask, MaskArgument::Text) && formatWith(mask, text.c_str(), out)) return out;
  return text;
}

std::string formatLongCell(const std::string& mask, int value) {
  std::string out;
  if (!mask.empty() && maskFitsArgument(mask, MaskArgument::Long) && formatWith(mask, value, out)) return out;
  return std::to_string(value);
}

std::string formatDoubleCell(const std::string& mask, double value) {
  std::string out;
  if (!mask.empty() && maskFitsArgument(mask, MaskArgument::Double) && formatWith(mask, value, out)) return out;
  formatWith("%g", value, out);
  return out;
}

}  // namespace toolkit::table
