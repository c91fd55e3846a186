// The table widget without user input: columns, cells, texts, widths, order, search.
#include <doctest/doctest.h>

#include "tests/wine/widgets/WidgetTestSupport.h"
#include "toolkit/base/ClassRecords.h"
#include "toolkit/table/Table.h"

using toolkit::Table;

TEST_CASE("a table without owner columns shows the default column") {
  Table table;
  CHECK(toolkit::isKindOf(&table, &toolkit::records::cXComponent));
  REQUIRE(table.getColumnCount() == 1);
  CHECK(table.getOwnerColumnCount() == 0);
  CHECK(table.getColumnName(0) == "Untitled");
  CHECK(table.getColumnKind(0) == 1);

  // Rows can go into the default column too.
  CHECK(table.appendRowText(0, "only", 5) == 0);
  CHECK(table.getCellText(0, 0) == "only");
  CHECK(table.getUserData(0, 0) == 5);
}

TEST_CASE("addColumn replaces the default column, then appends") {
  Table table;
  CHECK(table.addColumn("a", "Alpha", 0, 0, nullptr, true) == 0);
  CHECK(table.addColumn("b", nullptr, 9, 2, "%s!", false) == 1);
  CHECK(table.addColumn("c", "Lon", 7, 0, nullptr, false) == 2);
  REQUIRE(table.getColumnCount() == 3);
  CHECK(table.getOwnerColumnCount() == 3);
  CHECK(table.getColumnAlias(1).empty());
  CHECK(table.columns().text(Table::kColumnMask, 1) == "%s!");
  CHECK(table.columns().integer(Table::kColumnEditable, 0) == 1);
  CHECK(table.columns().integer(Table::kColumnWidth, 2) == 100);
  CHECK(table.displayOrder() == std::vector<int>{0, 1, 2});

  // A column added after rows gets empty cells for them.
  table.appendRowText(1, "x", 0);
  CHECK(table.addColumn("d", "Late", 2, 0, nullptr, false) == 3);
  CHECK(table.getCellText(0, 1) == "x!");
  CHECK(table.getCellText(0, 3) == "0");

  table.resetColumns();
  CHECK(table.getColumnCount() == 1);
  CHECK(table.getOwnerColumnCount() == 0);
}

TEST_CASE("cell texts by kind and mask") {
  // kind, mask, stored as a long?, value, shown text (the mask rules are the native suite's)
  struct Row { int kind; const char* mask; bool isLong; double value; const char* text; };
  const Row rows[] = {
      {6, nullptr, false, -12.5, "12\xB0" "30.000'S"},
      {3, "%.2f", false, 3.14159, "3.14"},
      {2, "%04d", true, 42, "0042"},
      {8, "HH':'mm", false, 45000.75, "18:00"},
      {8, "HH':'mm", false, 1e12, ""},  // an OLE date that cannot become a system time
      {7, nullptr, false, -4.0875, "004\xB0" "05.250'W"},
  };
  Table table;
  for (int c = 0; c < 6; ++c) table.addColumn("c", "C", rows[c].kind, 0, rows[c].mask, false);
  table.addColumn("flag", "Bool", 4, 0, nullptr, false);
  REQUIRE(table.appendRowLong(6, 1, 0) == 0);
  for (int c = 0; c < 6; ++c) {
    if (rows[c].isLong) table.setCellLong(c, 0, static_cast<long>(rows[c].value));
    else table.setCellDouble(c, 0, rows[c].value);
    CHECK(table.getCellText(0, c) == rows[c].text);
  }
  CHECK(table.getCellLong(6, 0) == 1);
  CHECK(table.getCellLong(2, 0) == 42);
  CHECK(table.getCellLong(1, 0) == 0);  // not an integer kind

  // Cells outside the table.
  CHECK(table.getCell(0, 0) != nullptr);
  CHECK(table.getCell(7, 0) == nullptr);
  CHECK(table.getCell(0, 1) == nullptr);
  CHECK(table.getCellText(4, 0).empty());
}

TEST_CASE("automatic column widths") {
  Table table;
  table.addColumn("e", "", 1, 0, nullptr, false);
  table.addColumn("t", "Name", 1, 0, nullptr, false);
  table.appendRowText(0, "", 0);
  table.appendRowText(0, "", 0);
  table.setCellText(1, 1, "A much longer station name");
  table.autoSizeColumn(0, -1);
  CHECK(table.getColumnWidth(0) == 10);

  table.autoSizeColumn(1, 1);  // the first row only: the header decides
  const int headerOnly = table.getColumnWidth(1);
  CHECK(headerOnly > 10);
  table.autoSizeColumn(1, -1);
  CHECK(table.getColumnWidth(1) > headerOnly);

  const int before = table.getColumnWidth(1);
  table.autoSizeColumn(2, -1);   // no such column: nothing happens
  table.autoSizeColumn(-1, -1);
  CHECK(table.getColumnWidth(1) == before);

  table.setMinimumColumnWidth(0);
  CHECK(table.getMinimumColumnWidth() == 50);
  table.setMinimumColumnWidth(30);
  CHECK(table.getMinimumColumnWidth() == 30);
}

TEST_CASE("findRow compares the shown text from the start row (matching rules: native suite)") {
  Table table;
  table.addColumn("name", "Name", 1, 0, nullptr, false);
  table.addColumn("value", "Value", 3, 0, "%.1f m", false);
  const char* names[] = {"Brest", "Le Conquet", "brest harbour"};
  for (int i = 0; i < 3; ++i) {
    table.appendRowText(0, names[i], i);
    table.setCellDouble(1, i, i + 0.25);
  }
  CHECK(table.findRow(0, 0, "brest", false, false) == 0);
  CHECK(table.findRow(0, 1, "brest", true, false) == 2);
  CHECK(table.findRow(1, 0, "2.2 m", false, true) == 2);
  CHECK(table.findRow(5, 0, "x", true, true) == -1);
}

TEST_CASE("row order by a column maps display rows to stored rows") {
  Table table;
  table.addColumn("name", "Name", 1, 0, nullptr, false);
  const char* names[] = {"Le Havre", "Anvers", "Brest", "anse"};
  for (int i = 0; i < 4; ++i) table.appendRowText(0, names[i], 10 + i);
  table.orderByColumn(0);
  CHECK(table.getSortColumn() == 0);
  CHECK(table.storedRowOf(0) == 3);  // anse (comparison rules: native row-order suite)
  CHECK(table.displayRowOf(0) == 3);  // Le Havre
  // Row data stays with its stored row.
  CHECK(table.getUserData(0, table.storedRowOf(0)) == 13);

  table.orderByColumn(7);
  CHECK(table.getSortColumn() == -1);
  CHECK(table.storedRowOf(0) == 0);

  // A new first column drops the order.
  table.orderByColumn(0);
  Table other;
  other.appendRowText(0, "b", 0);
  other.appendRowText(0, "a", 1);
  other.orderByColumn(0);
  other.addColumn("x", "X", 1, 0, nullptr, false);
  CHECK(other.getSortColumn() == -1);
}

TEST_CASE("hidden rows and columns and multiple selection need their style bits") {
  Table table;
  table.addColumn("a", "A", 1, 0, nullptr, false);
  table.addColumn("b", "B", 1, 0, nullptr, false);
  for (int i = 0; i < 3; ++i) table.appendRowText(0, "r", i);
  table.setRowVisible(1, false);
  table.setColumnVisible(1, false);
  CHECK(table.isRowVisible(1));  // ignored without 0x4000
  CHECK(table.isColumnVisible(1));

  table.addTableStyle(Table::kStyleHidden);
  table.setRowVisible(1, false);
  table.setColumnVisible(1, false);
  CHECK_FALSE(table.isRowVisible(1));
  CHECK_FALSE(table.isColumnVisible(1));
  CHECK(table.columns().integer(Table::kColumnVisible, 1) == 0);
  CHECK(table.isRowVisible(2));

  CHECK(table.isRowSelected(0));  // the current row
  CHECK(table.isCurrentCell(0, 0));
  CHECK_FALSE(table.isCurrentCell(1, 0));
  table.addTableStyle(Table::kStyleWholeRow);
  CHECK(table.isCurrentCell(1, 0));
  table.addTableStyle(Table::kStyleMultiSelect);
  CHECK_FALSE(table.isRowSelected(0));  // the selection set is empty
}
