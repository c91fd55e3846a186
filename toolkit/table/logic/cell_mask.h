#pragma once
// Column masks used as printf formats for text, long and double cells. A mask
// reaches printf only when it fits the cell's kind: at most one conversion, and
// that one of the kind's own (s for text; d i o u x X c for long; f F e E g G a A
// for double), with no '*' width or precision, no %n and no length modifier that
// would change the argument's size. Any other mask is ignored and the cell shows
// its plain value. Portable.

#include <string>
#include <string_view>

namespace toolkit::table {

enum class MaskArgument { Text, Long, Double };

// True when `mask` may be used as a printf format with one argument of the kind.
bool maskFitsArgument(std::string_view mask, MaskArgument argument);

// Cell texts. An empty or unfit mask, or one whose output cannot be made, gives
// the plain value: the text itself, the decimal number, "%g".
std::string formatTextCell(const std::string& mask, const std::string& text);
std::string formatLongCell(const std::string& mask, int value);
std::string formatDoubleCell(const std::string& mask, double value);

}  // namespace toolkit::table
