#include "host/chartscene/model/cp1252_text.h"

#include "host/chartscene/model/utf8_sequence.h"

#include <cstdint>
#include <vector>

namespace br::chartscene {

namespace {

// Unicode of the 1252 bytes 0x80 to 0x9F (0 where the byte is unassigned).
const std::uint16_t kHighControls[32] = {
    0x20AC, 0,      0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
    0x2039, 0x0152, 0,      0x017D, 0,      0,      0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
    0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0,      0x017E, 0x0178};

// Code points of valid UTF-8; false for anything else.
bool DecodeUtf8(const std::string& text, std::vector<std::uint32_t>& codes) {
  for (std::size_t i = 0; i < text.size();) {
    std::uint32_t code = 0;
    const std::size_t length = Utf8SequenceAt(text.data() + i, text.size() - i, code);
    if (length == 0) return false;
    codes.push_back(code);
    i += length;
  }
  return true;
}

char ByteOf(std::uint32_t code) {
  if (code < 0x100) return static_cast<char>(code);
  for (int i = 0; i < 32; ++i) {
    if (kHighControls[i] == code) return static_cast<char>(0x80 + i);
  }
  return '?';
}

void AppendUtf8(std::string& out, std::uint32_t code) {
  if (code < 0x80) {
    out += static_cast<char>(code);
  } else if (code < 0x800) {
    out += static_cast<char>(0xC0 | (code >> 6));
    out += static_cast<char>(0x80 | (code & 0x3F));
  } else {
    out += static_cast<char>(0xE0 | (code >> 12));
    out += static_cast<char>(0x80 | ((code >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (code & 0x3F));
  }
}

}  // namespace

std::string Cp1252FromMixed(const std::string& text) {
  std::vector<std::uint32_t> codes;
  if (!DecodeUtf8(text, codes)) return text;  // not UTF-8: already single bytes
  std::string out;
  out.reserve(codes.size());
  for (std::uint32_t code : codes) out += ByteOf(code);
  return out;
}

std::string Utf8FromCp1252(const std::string& text) {
  std::string out;
  for (char c : text) {
    const unsigned char byte = static_cast<unsigned char>(c);
    std::uint32_t code = byte;
    if (byte >= 0x80 && byte <= 0x9F && kHighControls[byte - 0x80] != 0) code = kHighControls[byte - 0x80];
    AppendUtf8(out, code);
  }
  return out;
}

}  // namespace br::chartscene
