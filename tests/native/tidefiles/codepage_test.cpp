// UTF-8 names to the Windows-1252 code page and back.
#include <doctest/doctest.h>

#include <string>

#include "tools/tidefiles/codepage.h"

using br::tidefiles::Utf8ToWindows1252;
using br::tidefiles::Windows1252ToUtf8;

TEST_CASE("characters of the code page convert exactly") {
  const auto r = Utf8ToWindows1252("\xC3\x85lesund \xE2\x82\xAC \xC5\x92 \xE2\x80\x9Cq\xE2\x80\x9D");  // Ålesund € Œ “q”
  CHECK(r.text == "\xC5lesund \x80 \x8C \x93q\x94");
  CHECK_FALSE(r.approximated);
  CHECK(Utf8ToWindows1252("Newlyn").text == "Newlyn");
}

TEST_CASE("characters the code page lacks become their closest plain letter, else '?'") {
  const auto r = Utf8ToWindows1252("\xC5\x81\xC3\xB3\x64\xC5\xBA");  // Łódź
  CHECK(r.text == "L\xF3" "dz");
  CHECK(r.approximated);
  CHECK(Utf8ToWindows1252("\xE4\xB8\xAD").text == "?");      // 中
  CHECK(Utf8ToWindows1252("\xF0\x9F\x8C\x8A").text == "?");  // 🌊
}

TEST_CASE("malformed UTF-8 and control characters become '?'") {
  CHECK(Utf8ToWindows1252("a\xFF" "b").text == "a?b");
  CHECK(Utf8ToWindows1252("a\xC3").text == "a?");                 // cut sequence
  CHECK(Utf8ToWindows1252("\xC0\x80").text == "??");              // overlong NUL
  CHECK(Utf8ToWindows1252("\xED\xA0\x80").text == "???");         // surrogate
  CHECK(Utf8ToWindows1252(std::string("a\0b", 3)).text == "a?b");  // no early terminator
  CHECK(Utf8ToWindows1252("a\tb\x7F").text == "a?b?");
}

TEST_CASE("every printable byte survives a round trip through UTF-8") {
  for (int b = 0x20; b < 0x100; ++b) {
    if (b == 0x7F) continue;
    const std::string byte(1, static_cast<char>(b));
    const auto back = Utf8ToWindows1252(Windows1252ToUtf8(byte));
    CHECK_MESSAGE(back.text == byte, b);
    CHECK_FALSE(back.approximated);
  }
  CHECK(Windows1252ToUtf8("\x80\x9F") == "\xE2\x82\xAC\xC5\xB8");  // € Ÿ
  CHECK(Windows1252ToUtf8("\x81") == "\xC2\x81");                 // undefined byte kept
}
