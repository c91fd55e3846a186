#pragma once
// Row geometry of a table whose rows may each have a height of their own. Rows are
// counted by their index among the rows shown; `heightOf` answers a shown row's height
// in pixels (a height below 1 counts as 1, so every row takes room).
// Portable: the widget and the tests share these.

#include <functional>

namespace toolkit::table {

using RowHeightOf = std::function<int(int index)>;

// Pixels from the top of row `from` to the top of row `to`; negative when `to` is above.
int rowOffset(const RowHeightOf& heightOf, int from, int to);
// The row (of `count`) under a point `offset` pixels below the top of row `first`; -1
// above it or below the last row.
int rowAtOffset(const RowHeightOf& heightOf, int count, int first, int offset);
// How many rows from `first` on fit whole in `space` pixels.
int rowsFitting(const RowHeightOf& heightOf, int count, int first, int space);
// The first row to show so that row `index` is the last one shown whole in `space`
// pixels: `index` itself when it alone is taller than the space.
int firstRowEndingAt(const RowHeightOf& heightOf, int index, int space);

}  // namespace toolkit::table
