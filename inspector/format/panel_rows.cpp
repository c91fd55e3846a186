#include "inspector/format/panel_rows.h"

#include <algorithm>

namespace br::inspector {

namespace {
constexpr int kRowPadding = 4;
constexpr int kHeadingSpace = 10;
constexpr int kLastRowSpace = 5;
}  // namespace

int PanelRowIndent(PanelRowKind kind, bool tableLayout) {
  if (tableLayout) return kind == PanelRowKind::Heading ? 4 : 8;
  switch (kind) {
    case PanelRowKind::Heading: return 15;
    case PanelRowKind::Name: return 30;
    default: return 60;
  }
}

int PanelRowTextTop(PanelRowKind kind) {
  return kRowPadding / 2 + (kind == PanelRowKind::Heading ? kHeadingSpace : 0);
}

int PanelRowHeight(int textHeight, int lineHeight, PanelRowKind kind, bool last) {
  const int text = std::max(textHeight, std::max(lineHeight, 1));
  return text + kRowPadding + (kind == PanelRowKind::Heading ? kHeadingSpace : 0) + (last ? kLastRowSpace : 0);
}

std::vector<std::wstring_view> PanelTextLines(std::wstring_view text) {
  std::vector<std::wstring_view> lines;
  std::size_t start = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] != L'\r' && text[i] != L'\n') continue;
    lines.push_back(text.substr(start, i - start));
    if (text[i] == L'\r' && i + 1 < text.size() && text[i + 1] == L'\n') ++i;
    start = i + 1;
  }
  lines.push_back(text.substr(start));
  return lines;
}

}  // namespace br::inspector
