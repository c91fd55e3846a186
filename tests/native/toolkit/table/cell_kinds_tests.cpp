#include <doctest/doctest.h>

#include "toolkit/table/logic/cell_kinds.h"

#include <string>

using namespace toolkit;
using namespace toolkit::table;

TEST_CASE("kinds outside 2..9 are text columns") {
  for (int kind : {0, 10, -3}) CHECK(normalizeKind(kind) == kCellText);
  for (int kind = 2; kind <= 9; ++kind) CHECK(normalizeKind(kind) == kind);
}

TEST_CASE("each kind's cell table has its named cell column and User data") {
  struct Expect {
    int kind;
    const char* name;
    ColumnType storage;
  };
  const Expect expected[] = {{6, "Cell data (Latitude)", ColumnType::Double}, {0, "Cell data (text)", ColumnType::Text},
                             {9, "Cell data (wide text)", ColumnType::WideText}};
  for (const Expect& e : expected) {
    CAPTURE(e.kind);
    auto cells = makeCellTable(e.kind);
    REQUIRE(cells->columnCount() == 2);
    CHECK((cells->columnName(0) == std::string(e.name) && cells->columnType(0) == e.storage));
    CHECK((cells->columnName(1) == "User data" && cells->columnType(1) == ColumnType::Integer));
  }
}
