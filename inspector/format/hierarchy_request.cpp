#include "inspector/format/hierarchy_request.h"

#include <cstdio>
#include <cstring>
#include <vector>

namespace br::inspector {

namespace {

constexpr std::size_t kIdTextLength = 38;

}  // namespace

bool IsHierarchyKind(const HierarchyId& kind) {
  return std::memcmp(kind.data(), kHierarchyKindId.data(), kind.size()) >= 0;
}

std::string HierarchyIdText(const HierarchyId& id) {
  const std::u16string text = IdText(id);
  return std::string(text.begin(), text.end());  // hexadecimal digits, braces and hyphens only
}

std::optional<HierarchyId> ParseHierarchyIdText(std::string_view text) {
  // Bytes above 0x7F stay above 'f' and are refused with the rest.
  std::u16string wide;
  for (char c : text) wide += static_cast<char16_t>(static_cast<unsigned char>(c));
  return ParseIdText(wide);
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
