// Texts from data (station names) made safe to print: a name is data, and a control
// character in one would otherwise reach the terminal and drive it.
#pragma once

#include <string>

namespace br::brtide {

// UTF-8 text with every control character (C0, DEL and the C1 range U+0080..U+009F)
// replaced by '?'. Other characters, malformed bytes included, pass unchanged.
std::string PrintableText(const std::string& utf8);

// A JSON string literal of UTF-8 text, quotes included; control characters escaped.
std::string JsonString(const std::string& utf8);

}  // namespace br::brtide
