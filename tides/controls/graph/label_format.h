// The printf format of the tide graph's value labels. Hosts set it (TW_FORMATTEXT), so it
// is checked before it is ever used: exactly one floating conversion of the one double
// the label has, besides literal text and "%%".
#pragma once

#include <string>
#include <string_view>

namespace br::tides::graph {

// The format a graph starts with, and the one an empty text selects.
inline constexpr const char* kDefaultLabelFormat = "%.2f";

// Largest field width or precision a label format may ask for.
inline constexpr int kLabelFormatMaxNumber = 999;

// True for a format with exactly one conversion of the kind e E f F g G a A, optionally
// with flags (- + space # 0), a field width and a precision (digits, no '*', at most
// kLabelFormatMaxNumber), and otherwise only literal characters and "%%". Everything
// else ("%s", "%n", "%d", "%lf", two conversions, a lone '%', an embedded zero byte)
// is refused.
bool IsValueLabelFormat(std::string_view format);

// The value written with format, which must pass IsValueLabelFormat (else the value is
// written with the default format).
std::string FormatValueLabel(const std::string& format, double value);

}  // namespace br::tides::graph
