// Geometry of rows of their own heights: offsets, hit rows, rows that fit a page and
// the top row that brings a row into view.
#include <doctest/doctest.h>

#include <vector>

#include "toolkit/table/logic/row_heights.h"

using namespace toolkit::table;

namespace {
RowHeightOf Heights(const std::vector<int>& heights) {
  return [heights](int index) { return heights.at(static_cast<std::size_t>(index)); };
}
}  // namespace

TEST_CASE("offsets and hit rows follow each row's own height") {
  const auto h = Heights({20, 40, 10, 30});
  CHECK(rowOffset(h, 0, 0) == 0);
  CHECK(rowOffset(h, 0, 3) == 70);
  CHECK(rowOffset(h, 1, 4) == 80);
  // A row above the first shown one lies above the top.
  CHECK(rowOffset(h, 2, 0) == -60);
  CHECK(rowAtOffset(h, 4, 0, 0) == 0);
  CHECK(rowAtOffset(h, 4, 0, 19) == 0);
  CHECK(rowAtOffset(h, 4, 0, 20) == 1);
  CHECK(rowAtOffset(h, 4, 0, 69) == 2);
  CHECK(rowAtOffset(h, 4, 1, 45) == 2);
  CHECK(rowAtOffset(h, 4, 0, 100) == -1);
  CHECK(rowAtOffset(h, 4, 0, -1) == -1);
}

TEST_CASE("whole rows fitting a page, and the top row that shows a row last") {
  const auto h = Heights({20, 40, 10, 30});
  CHECK(rowsFitting(h, 4, 0, 59) == 1);
  CHECK(rowsFitting(h, 4, 0, 60) == 2);
  CHECK(rowsFitting(h, 4, 1, 1000) == 3);
  CHECK(rowsFitting(h, 4, 0, 5) == 0);
  CHECK(rowsFitting(h, 0, 0, 100) == 0);
  CHECK(firstRowEndingAt(h, 3, 40) == 2);
  CHECK(firstRowEndingAt(h, 3, 80) == 1);
  CHECK(firstRowEndingAt(h, 3, 1000) == 0);
  // A row taller than the page is shown from its top.
  CHECK(firstRowEndingAt(h, 1, 30) == 1);
}

TEST_CASE("heights below one pixel still take a pixel, so no row is lost under another") {
  const auto h = Heights({0, -5, 3});
  CHECK(rowOffset(h, 0, 3) == 5);
  CHECK(rowAtOffset(h, 3, 0, 1) == 1);
  CHECK(rowsFitting(h, 3, 0, 2) == 2);
}
