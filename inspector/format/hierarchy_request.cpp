#include "inspector/format/hierarchy_request.h"

#include <cstdio>
#include <cstring>
#include <vector>

namespace br::inspector {

namespace {

constexpr std::size_t kIdTextLength = 38;

int HexDigit(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

// Reads `digits` hexadecimal digits at `at`; none when any is not a digit.
std::optional<unsigned long> ReadHex(std::string_view text, std::size_t at, std::size_t digits) {
  unsigned long value = 0;
  for (std::size_t i = 0; i < digits; ++i) {
    const int digit = HexDigit(text[at + i]);
    if (digit < 0) return std::nullopt;
    value = value * 16 + static_cast<unsigned long>(digit);
  }
  return value;
}

}  // namespace

bool IsHierarchyKind(const HierarchyId& kind) {
  return std::memcmp(kind.data(), kHierarchyKind.data(), kind.size()) >= 0;
}

std::string HierarchyIdText(const HierarchyId& id) {
  char text[kIdTextLength + 1];
  const unsigned long data1 = static_cast<unsigned long>(id[0]) | static_cast<unsigned long>(id[1]) << 8 |
                              static_cast<unsigned long>(id[2]) << 16 | static_cast<unsigned long>(id[3]) << 24;
  const unsigned data2 = id[4] | id[5] << 8;
  const unsigned data3 = id[6] | id[7] << 8;
  std::snprintf(text, sizeof text, "{%08lX-%04X-%04X-%02X%02X-%02X%02X%02X%02X%02X%02X}", data1, data2, data3, id[8],
                id[9], id[10], id[11], id[12], id[13], id[14], id[15]);
  return text;
}

std::optional<HierarchyId> ParseHierarchyIdText(std::string_view text) {
  if (text.size() != kIdTextLength || text.front() != '{' || text.back() != '}' || text[9] != '-' ||
      text[14] != '-' || text[19] != '-' || text[24] != '-') {
    return std::nullopt;
  }
  const auto data1 = ReadHex(text, 1, 8);
  const auto data2 = ReadHex(text, 10, 4);
  const auto data3 = ReadHex(text, 15, 4);
  if (!data1 || !data2 || !data3) return std::nullopt;
  HierarchyId id{};
  for (int i = 0; i < 4; ++i) id[i] = static_cast<unsigned char>(*data1 >> (8 * i));
  for (int i = 0; i < 2; ++i) id[4 + i] = static_cast<unsigned char>(*data2 >> (8 * i));
  for (int i = 0; i < 2; ++i) id[6 + i] = static_cast<unsigned char>(*data3 >> (8 * i));
  // Bytes 8 and 9 before the last hyphen, 10 to 15 after it.
  static constexpr std::size_t kByteAt[8] = {20, 22, 25, 27, 29, 31, 33, 35};
  for (std::size_t i = 0; i < 8; ++i) {
    const auto byte = ReadHex(text, kByteAt[i], 2);
    if (!byte) return std::nullopt;
    id[8 + i] = static_cast<unsigned char>(*byte);
  }
  return id;
}

std::string HierarchyRequestText(std::string_view text, const HierarchyId& object, const HierarchyId& kind) {
  const std::string objectText = HierarchyIdText(object);
  const std::string kindText = HierarchyIdText(kind);
  // Sized from the fields: the text comes from the host and may be of any length; it is
  // a field, never a format.
  std::vector<char> request(text.size() + objectText.size() + kindText.size() + 3);
  const int written = std::snprintf(request.data(), request.size(), "%.*s|%s|%s", static_cast<int>(text.size()),
                                    text.data(), objectText.c_str(), kindText.c_str());
  if (written < 0) return {};
  return std::string(request.data(), static_cast<std::size_t>(written));
}

std::optional<HierarchyRequest> ParseHierarchyRequest(std::string_view text) {
  const std::size_t first = text.find('|');
  if (first == std::string_view::npos || text.substr(0, first) != kHierarchyTitle) return std::nullopt;
  const std::string_view ids = text.substr(first + 1);
  if (ids.size() != 2 * kIdTextLength + 1 || ids[kIdTextLength] != '|') return std::nullopt;
  const auto object = ParseHierarchyIdText(ids.substr(0, kIdTextLength));
  const auto kind = ParseHierarchyIdText(ids.substr(kIdTextLength + 1));
  if (!object || !kind || !IsHierarchyKind(*kind)) return std::nullopt;
  return HierarchyRequest{*object, *kind};
}

}  // namespace br::inspector
