#pragma once
// The request the hierarchy panel's buttons send to the inspector: three fields joined by
// '|', the node object's text, its identity and its kind, both identities in registry
// form. The inspector acts on a request only when the text is the chart supplementary
// information title, both identities parse strictly and the kind is, byte by byte, not
// below the hierarchy kind. No Windows API: tested natively.

#include <optional>
#include <string>
#include <string_view>

#include "inspector/rules/guid_text.h"

namespace br::inspector {

// 16 bytes in the platform's GUID layout.
using HierarchyId = IdBytes;

// All zero but "CSI" in bytes 8 to 10.
inline constexpr HierarchyId kHierarchyKindId = {0, 0, 0, 0, 0, 0, 0, 0, 'C', 'S', 'I', 0, 0, 0, 0, 0};
inline constexpr std::string_view kHierarchyTitle = "CHART SUPPLEMENTARY INFORMATION";

// Whether a kind, compared byte by byte, is not below the hierarchy kind.
bool IsHierarchyKind(const HierarchyId& kind);

// IdText and ParseIdText over 8-bit text: the registry form, upper-case digits; exactly
// that form read back, digits in either case, nothing else.
std::string HierarchyIdText(const HierarchyId& id);
std::optional<HierarchyId> ParseHierarchyIdText(std::string_view text);

// The request text of a node: "%s|%s|%s" of its text and the two identities.
std::string HierarchyRequestText(std::string_view text, const HierarchyId& object, const HierarchyId& kind);

struct HierarchyRequest {
  HierarchyId object{};
  HierarchyId kind{};
};

// The identities of a request the inspector acts on; none for any other text.
std::optional<HierarchyRequest> ParseHierarchyRequest(std::string_view text);

}  // namespace br::inspector
