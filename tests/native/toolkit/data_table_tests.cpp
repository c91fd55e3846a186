#include <doctest/doctest.h>

#include <cstdint>
#include <memory>

#include "toolkit/data/DataTable.h"

using toolkit::ColumnType;
using toolkit::DataTable;

namespace {
DataTable childList() {
  DataTable t;
  t.addColumn(ColumnType::Integer, "Component");
  t.addColumn(ColumnType::Text, "Position");
  t.addColumn(ColumnType::Text, "Name");
  return t;
}
}  // namespace

TEST_CASE("columns keep their order, names and storage types") {
  DataTable t = childList();
  CHECK(t.addColumn(ColumnType::Double, "Weight") == 3);
  CHECK(t.addColumn(ColumnType::Table, "Cells") == 4);
  CHECK(t.columnCount() == 5);
  CHECK((t.columnIndex("Position") == 1 && t.columnIndex("position") == -1 && t.columnIndex("Missing") == -1));
  CHECK((t.columnType(0) == ColumnType::Integer && t.columnType(3) == ColumnType::Double));
  CHECK((t.columnType(4) == ColumnType::Table && static_cast<int>(t.columnType(4)) == 4));
  CHECK((t.columnName(2) == "Name" && t.columnName(9).empty() && t.columnType(-1) == ColumnType::Text));
  // An unknown storage type is kept as text rather than refused.
  CHECK(t.addColumn(static_cast<ColumnType>(7), "Odd") == 5);
  CHECK(t.columnType(5) == ColumnType::Text);
}

TEST_CASE("rows: append, insert before the cursor, delete at the cursor") {
  DataTable t = childList();
  CHECK((t.rowCount() == 0 && t.cursor() == -1));
  CHECK(t.appendRowInteger(11) == 0);
  CHECK((t.appendRowInteger(22) == 1 && t.cursor() == 1));
  CHECK(t.appendRowInteger(33) == 2);

  REQUIRE(t.moveTo(1));
  CHECK(t.insertRow() == 1);
  CHECK(t.cursor() == 1);
  t.setCursorInteger(0, 15);
  CHECK(t.rowCount() == 4);
  const std::int64_t column[] = {11, 15, 22, 33};
  for (int row = 0; row < 4; ++row) CHECK(t.integer(0, row) == column[row]);

  // Deleting moves the next row under the cursor; at the end the cursor backs up.
  REQUIRE(t.moveTo(1));
  CHECK(t.deleteRow());
  CHECK((t.cursor() == 1 && t.cursorInteger(0) == 22));
  REQUIRE(t.moveTo(2));
  CHECK(t.deleteRow());
  CHECK((t.cursor() == 1 && t.rowCount() == 2));

  // With the cursor on no row an insert appends.
  CHECK_FALSE(t.moveTo(7));
  CHECK(t.cursor() == -1);
  CHECK(t.insertRow() == 2);
  CHECK_FALSE((t.deleteRowAt(5) || t.deleteRowAt(-1)));
}

TEST_CASE("new cells are empty and cells keep their type") {
  DataTable t = childList();
  t.addColumn(ColumnType::Double, "Weight");
  t.appendRow();
  CHECK((t.integer(0, 0) == 0 && t.text(1, 0).empty() && t.number(3, 0) == 0.0));
  CHECK((t.setText(2, 0, "OK") && t.setDouble(3, 0, 2.5)));
  CHECK((t.text(2, 0) == "OK" && t.number(3, 0) == 2.5));

  // Wrong type or outside the table: nothing changes, nothing is read.
  CHECK_FALSE(t.setText(0, 0, "x"));
  CHECK_FALSE(t.setInteger(1, 0, 5));
  CHECK_FALSE(t.setDouble(2, 0, 1.0));
  CHECK_FALSE(t.setText(2, 1, "x"));
  CHECK_FALSE(t.setText(9, 0, "x"));
  CHECK((t.text(0, 0).empty() && t.integer(2, 0) == 0 && t.text(2, 0) == "OK" && t.table(0, 0) == nullptr));

  // A column added later gives the existing rows empty cells.
  int late = t.addColumn(ColumnType::Integer, "Late");
  CHECK(t.integer(late, 0) == 0);
  CHECK((t.setInteger(late, 0, -4) && t.integer(late, 0) == -4));
}

TEST_CASE("the integer column holds full 64-bit values and pointers") {
  DataTable t = childList();
  const std::int64_t big = 0x7FEDCBA987654321LL;
  t.appendRowInteger(big);
  CHECK(t.integer(0, 0) == big);
  t.appendRowInteger(INT64_MIN);
  CHECK(t.integer(0, 1) == INT64_MIN);

  int object = 0;
  t.appendRow();
  CHECK((t.setPointer(0, 2, &object) && t.pointer(0, 2) == &object));
  if (sizeof(void*) == 8) {
    // A pointer above 4 GiB survives the round trip.
    void* high = reinterpret_cast<void*>(static_cast<std::uintptr_t>(0x00007FF612345678ULL));
    CHECK((t.setPointer(0, 2, high) && t.pointer(0, 2) == high));
  }
  CHECK(t.pointer(1, 2) == nullptr);
}

TEST_CASE("nested tables are owned by their cell") {
  DataTable columns;
  columns.addColumn(ColumnType::Text, "Column name");
  columns.addColumn(ColumnType::Table, "Column data");
  columns.appendRowText("Depth");
  auto cells = std::make_unique<DataTable>();
  cells->addColumn(ColumnType::Double, "Cell data (double)");
  cells->appendRowDouble(12.5);
  DataTable* raw = cells.get();
  CHECK(columns.setTable(1, 0, std::move(cells)));
  REQUIRE(columns.table(1, 0) == raw);
  CHECK(columns.table(1, 0)->number(0, 0) == 12.5);

  // Replacing, deleting and clearing free nested tables (LeakSanitizer checks).
  auto other = std::make_unique<DataTable>();
  other->addColumn(ColumnType::Text, "x");
  CHECK(columns.setTable(1, 0, std::move(other)));
  CHECK(columns.table(1, 0) != raw);
  columns.appendRowText("Name");
  columns.setTable(1, 1, std::make_unique<DataTable>());
  CHECK(columns.deleteRowAt(0));
  CHECK((columns.rowCount() == 1 && columns.cursorText(0) == "Name"));
  columns.clear();
  CHECK((columns.rowCount() == 0 && columns.cursor() == -1 && columns.columnCount() == 2));

  // A table first column takes a table as the first cell.
  DataTable outer;
  outer.addColumn(ColumnType::Table, "t");
  CHECK(outer.appendRowTable(std::make_unique<DataTable>()) == 0);
  CHECK(outer.table(0, 0) != nullptr);
}

TEST_CASE("find moves the cursor to the first match; walking with the cursor") {
  DataTable t = childList();
  int a = 0, b = 0, c = 0;
  const char* names[] = {"EDIT", "OK", "OK"};
  int* objects[] = {&a, &b, &c};
  for (int i = 0; i < 3; ++i) {
    int row = t.appendRow();
    t.setPointer(0, row, objects[i]);
    t.setText(2, row, names[i]);
  }
  t.moveTo(0);
  CHECK((t.findText(2, "OK") == 1 && t.cursor() == 1));
  CHECK((t.findPointer(0, &c) == 2 && t.cursor() == 2));
  CHECK((t.findText(2, "ok") == -1 && t.cursor() == 2));  // exact comparison; no match leaves the cursor
  CHECK(t.findText(0, "OK") == -1);                        // wrong column type
  CHECK((t.findInteger(1, 0) == -1 && t.findText(-3, "OK") == -1));

  int visited = 0;
  for (bool more = t.moveFirst(); more; more = t.moveNext()) {
    CHECK(t.cursorPointer(0) == objects[visited]);
    ++visited;
  }
  CHECK((visited == 3 && t.cursor() == -1));
  CHECK_FALSE(t.moveNext());
  DataTable empty = childList();
  CHECK_FALSE((empty.moveFirst() || empty.deleteRow()));
}
