#include "inspector/rules/attribute_text.h"

namespace br::inspector {

namespace {

bool IsSeparator(char16_t c) { return c == u'#' || c == u'=' || c == u'|'; }

}  // namespace

std::optional<std::u16string> AttributeLines(std::u16string_view formatted) {
  std::size_t first = 1;
  while (first < formatted.size() && !IsSeparator(formatted[first])) ++first;
  if (first >= formatted.size()) return std::nullopt;
  std::u16string lines(formatted.substr(first + 1));
  for (char16_t& c : lines)
    if (IsSeparator(c)) c = u'\r';
  return lines;
}

}  // namespace br::inspector
