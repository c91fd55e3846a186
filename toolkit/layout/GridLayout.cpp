#include "toolkit/layout/GridLayout.h"

#include <cstdlib>

#include "toolkit/base/class_records.h"

namespace toolkit {

GridLayout::GridLayout(std::int32_t r, std::int32_t c, std::int32_t h, std::int32_t v,
                       const char* percentages, std::int32_t m) {
  rows = r;
  columns = c;
  hgap = h;
  vgap = v;
  mode = m;
  if (percentages) parsePercentages(percentages);
}

const ClassRecord* GridLayout::getClassRecord() const { return &records::GridLayout; }

namespace {
bool isSeparator(char c) { return c == ' ' || c == ',' || c == ';'; }

// Leading decimal digits of a token (an optional sign first); 0 without digits.
// Saturates instead of overflowing on absurdly long numbers.
std::int32_t tokenValue(std::string_view token) {
  size_t i = 0;
  bool negative = false;
  if (i < token.size() && (token[i] == '-' || token[i] == '+')) negative = token[i++] == '-';
  long long value = 0;
  for (; i < token.size() && token[i] >= '0' && token[i] <= '9'; ++i) {
    value = value * 10 + (token[i] - '0');
    if (value > 0x7fffffff) value = 0x7fffffff;
  }
  return static_cast<std::int32_t>(negative ? -value : value);
}
}  // namespace

void GridLayout::parsePercentages(std::string_view text) {
  for (std::int32_t& percent : columnPercent) percent = 0;
  int column = 0;
  size_t pos = 0;
  while (pos < text.size() && column < kMaxColumnPercents) {
    while (pos < text.size() && isSeparator(text[pos])) ++pos;
    if (pos >= text.size()) break;
    size_t end = pos;
    while (end < text.size() && !isSeparator(text[end])) ++end;
    columnPercent[column++] = tokenValue(text.substr(pos, end - pos));
    pos = end;
  }
}

}  // namespace toolkit
