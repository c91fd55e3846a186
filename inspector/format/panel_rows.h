#pragma once
// Row layout of the inspector's text panels: where a row's text starts and how high the
// row is for the height of its wrapped text. Portable: the panels and the tests share it.

#include <string_view>
#include <vector>

namespace br::inspector {

enum class PanelRowKind { Heading, Name, Value, Attribute };

// Left indent of the stacked text panel's rows: 15 for a heading, 30 for a name, 60 for
// a value (the attribute table's rows: 4 for a heading, 8 for a name or value).
int PanelRowIndent(PanelRowKind kind, bool tableLayout);
// Space above a row's text: 2 pixels, and the 10 a heading has above it.
int PanelRowTextTop(PanelRowKind kind);
// A row as high as its wrapped text plus 4 pixels, plus 10 for a heading, plus 5 for the
// panel's last row. A text of no height counts as one line of `lineHeight`.
int PanelRowHeight(int textHeight, int lineHeight, PanelRowKind kind, bool last);
// The lines of a cell: the formatter's line breaks are "\r", "\n" or "\r\n". An empty
// text is one empty line.
std::vector<std::wstring_view> PanelTextLines(std::wstring_view text);

}  // namespace br::inspector
