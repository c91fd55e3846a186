#pragma once
// The host's attribute text as FormatAttributes hands it on: the formatter writes a
// heading, then name/value fields parted by '#', '=' or '|'. The heading and its
// separator go; every further separator becomes a carriage return.

#include <optional>
#include <string>
#include <string_view>

namespace br::inspector {

// None when no separator follows the first character (the text is no attribute list).
std::optional<std::u16string> AttributeLines(std::u16string_view formatted);

}  // namespace br::inspector
