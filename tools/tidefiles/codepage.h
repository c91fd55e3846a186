// Station names are stored in the Windows-1252 code page; station JSON is UTF-8.
#pragma once

#include <string>
#include <string_view>

namespace br::tidefiles {

struct CodePageResult {
  std::string text;
  bool approximated = false;  // some character had no exact Windows-1252 form
};

// UTF-8 to Windows-1252. A character the code page lacks becomes its closest plain
// letters ("Ł" -> "L", "ș" -> "s"), else '?'; malformed UTF-8 and control characters
// become '?' too. Never fails.
CodePageResult Utf8ToWindows1252(std::string_view utf8);

// Windows-1252 to UTF-8. The five bytes the code page leaves undefined (0x81, 0x8D, 0x8F,
// 0x90, 0x9D) map to the C1 control of the same value, so they survive a round trip.
std::string Windows1252ToUtf8(std::string_view bytes);

}  // namespace br::tidefiles
