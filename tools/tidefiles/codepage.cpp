#include "tools/tidefiles/codepage.h"

#include <iconv.h>
#include <locale.h>

#include <array>
#include <cstdint>
#include <optional>

namespace br::tidefiles {
namespace {

// Code points of bytes 0x80..0x9F; 0 where the code page leaves the byte undefined.
constexpr std::array<char32_t, 32> kHighControls = {
    0x20AC, 0,      0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021,
    0x02C6, 0x2030, 0x0160, 0x2039, 0x0152, 0,      0x017D, 0,
    0,      0x2018, 0x2019, 0x201C, 0x201D, 0x2022, 0x2013, 0x2014,
    0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0,      0x017E, 0x0178};

constexpr char32_t kInvalid = 0xFFFFFFFF;

char32_t CodePointOfByte(std::uint8_t b) {
  if (b < 0x80 || b >= 0xA0) return b;
  const char32_t cp = kHighControls[b - 0x80];
  return cp != 0 ? cp : b;
}

// Exact byte for cp, or -1.
int ByteOfCodePoint(char32_t cp) {
  if (cp < 0x80 || (cp >= 0xA0 && cp <= 0xFF)) return static_cast<int>(cp);
  for (int i = 0; i < 32; ++i) {
    const char32_t mapped = kHighControls[i];
    if (mapped == cp || (mapped == 0 && cp == static_cast<char32_t>(0x80 + i))) return 0x80 + i;
  }
  return -1;
}

// Decodes one UTF-8 sequence at s[i]; advances i. Strict: overlong forms, surrogates and
// values above U+10FFFF give kInvalid (one byte consumed).
char32_t DecodeUtf8(std::string_view s, std::size_t& i) {
  const auto byte = [&](std::size_t k) { return static_cast<std::uint8_t>(s[k]); };
  const std::uint8_t b0 = byte(i);
  if (b0 < 0x80) {
    ++i;
    return b0;
  }
  int extra = 0;
  char32_t cp = 0;
  char32_t minimum = 0;
  if ((b0 & 0xE0) == 0xC0) {
    extra = 1, cp = b0 & 0x1F, minimum = 0x80;
  } else if ((b0 & 0xF0) == 0xE0) {
    extra = 2, cp = b0 & 0x0F, minimum = 0x800;
  } else if ((b0 & 0xF8) == 0xF0) {
    extra = 3, cp = b0 & 0x07, minimum = 0x10000;
  } else {
    ++i;
    return kInvalid;
  }
  if (i + static_cast<std::size_t>(extra) >= s.size()) {
    ++i;
    return kInvalid;
  }
  for (int k = 1; k <= extra; ++k) {
    const std::uint8_t b = byte(i + k);
    if ((b & 0xC0) != 0x80) {
      ++i;
      return kInvalid;
    }
    cp = (cp << 6) | (b & 0x3F);
  }
  if (cp < minimum || cp > 0x10FFFF || (cp >= 0xD800 && cp <= 0xDFFF)) {
    ++i;
    return kInvalid;
  }
  i += static_cast<std::size_t>(extra) + 1;
  return cp;
}

void AppendUtf8(std::string& out, char32_t cp) {
  if (cp < 0x80) {
    out += static_cast<char>(cp);
  } else if (cp < 0x800) {
    out += static_cast<char>(0xC0 | (cp >> 6));
    out += static_cast<char>(0x80 | (cp & 0x3F));
  } else if (cp < 0x10000) {
    out += static_cast<char>(0xE0 | (cp >> 12));
    out += static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (cp & 0x3F));
  } else {
    out += static_cast<char>(0xF0 | (cp >> 18));
    out += static_cast<char>(0x80 | ((cp >> 12) & 0x3F));
    out += static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (cp & 0x3F));
  }
}

// The C library's transliteration of one character into the code page ("" when none).
// Its tables belong to the character-type locale, and the plain "C" locale has next to
// none, so conversions run under a UTF-8 locale of this thread only.
class Transliterator {
 public:
  Transliterator() : cd_(iconv_open("WINDOWS-1252//TRANSLIT", "UTF-8")) {
    for (const char* name : {"C.UTF-8", "C.utf8", "en_US.UTF-8"}) {
      locale_ = newlocale(LC_CTYPE_MASK, name, static_cast<locale_t>(0));
      if (locale_ != static_cast<locale_t>(0)) break;
    }
  }
  ~Transliterator() {
    if (cd_ != reinterpret_cast<iconv_t>(-1)) iconv_close(cd_);
    if (locale_ != static_cast<locale_t>(0)) freelocale(locale_);
  }
  Transliterator(const Transliterator&) = delete;
  Transliterator& operator=(const Transliterator&) = delete;

  std::string Convert(char32_t cp) {
    if (cd_ == reinterpret_cast<iconv_t>(-1)) return {};
    std::string in;
    AppendUtf8(in, cp);
    char outBuf[16];
    char* inPtr = in.data();
    std::size_t inLeft = in.size();
    char* outPtr = outBuf;
    std::size_t outLeft = sizeof outBuf;
    const locale_t previous = locale_ != static_cast<locale_t>(0) ? uselocale(locale_) : static_cast<locale_t>(0);
    iconv(cd_, nullptr, nullptr, nullptr, nullptr);
    const std::size_t r = iconv(cd_, &inPtr, &inLeft, &outPtr, &outLeft);
    if (previous != static_cast<locale_t>(0)) uselocale(previous);
    if (r == static_cast<std::size_t>(-1) || inLeft != 0) return {};
    std::string out(outBuf, static_cast<std::size_t>(outPtr - outBuf));
    // glibc writes '?' itself when it knows no transliteration; so do we.
    for (char c : out) {
      const auto b = static_cast<std::uint8_t>(c);
      if (b < 0x20 || b == 0x7F) return {};
    }
    return out;
  }

 private:
  iconv_t cd_;
  locale_t locale_ = static_cast<locale_t>(0);
};

}  // namespace

CodePageResult Utf8ToWindows1252(std::string_view utf8) {
  CodePageResult result;
  std::optional<Transliterator> translit;  // opened only when a name needs it
  std::size_t i = 0;
  while (i < utf8.size()) {
    const char32_t cp = DecodeUtf8(utf8, i);
    if (cp == kInvalid || cp < 0x20 || cp == 0x7F) {
      result.text += '?';
      result.approximated = true;
      continue;
    }
    const int exact = ByteOfCodePoint(cp);
    if (exact >= 0) {
      result.text += static_cast<char>(exact);
      continue;
    }
    result.approximated = true;
    if (!translit) translit.emplace();
    const std::string plain = translit->Convert(cp);
    result.text += plain.empty() ? std::string("?") : plain;
  }
  return result;
}

std::string Windows1252ToUtf8(std::string_view bytes) {
  std::string out;
  out.reserve(bytes.size());
  for (char c : bytes) AppendUtf8(out, CodePointOfByte(static_cast<std::uint8_t>(c)));
  return out;
}

}  // namespace br::tidefiles
