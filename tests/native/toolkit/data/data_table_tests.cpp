// The generic data table under the container's child list and the table widget; row handling and
// find are the Wine container and table suites'.
#include <doctest/doctest.h>

#include <cstdint>
#include <memory>

#include "toolkit/data/DataTable.h"

using toolkit::ColumnType;
using toolkit::DataTable;

TEST_CASE("cells keep their type; the integer column holds 64-bit values and pointers") {
  DataTable t;
  t.addColumn(ColumnType::Integer, "Component");
  t.addColumn(ColumnType::Text, "Name");
  t.appendRowInteger(INT64_MIN);
  CHECK(t.integer(0, 0) == INT64_MIN);
  // Wrong type or outside the table: nothing changes, nothing is read.
  CHECK_FALSE(t.setText(0, 0, "x"));
  CHECK_FALSE(t.setInteger(1, 0, 5));
  CHECK_FALSE(t.setText(1, 1, "x"));
  CHECK((t.text(0, 0).empty() && t.integer(1, 0) == 0 && t.table(0, 0) == nullptr));
  if (sizeof(void*) == 8) {
    // A pointer above 4 GiB survives the round trip.
    void* high = reinterpret_cast<void*>(static_cast<std::uintptr_t>(0x00007FF612345678ULL));
    CHECK((t.setPointer(0, 0, high) && t.pointer(0, 0) == high));
  }
}

TEST_CASE("nested tables are owned by their cell") {
  DataTable columns;
  columns.addColumn(ColumnType::Text, "Column name");
  columns.addColumn(ColumnType::Table, "Column data");
  columns.appendRowText("Depth");
  auto cells = std::make_unique<DataTable>();
  cells->addColumn(ColumnType::Double, "Cell data (double)");
  cells->appendRowDouble(12.5);
  CHECK(columns.setTable(1, 0, std::move(cells)));
  REQUIRE(columns.table(1, 0) != nullptr);
  CHECK(columns.table(1, 0)->number(0, 0) == 12.5);

  // Replacing, deleting and clearing free nested tables (LeakSanitizer checks).
  CHECK(columns.setTable(1, 0, std::make_unique<DataTable>()));
  columns.appendRowText("Name");
  columns.setTable(1, 1, std::make_unique<DataTable>());
  CHECK(columns.deleteRowAt(0));
  CHECK((columns.rowCount() == 1 && columns.cursorText(0) == "Name"));
  columns.clear();
  CHECK((columns.rowCount() == 0 && columns.cursor() == -1 && columns.columnCount() == 2));
}

TEST_CASE("wide text cells keep UTF-16 texts whole through row inserts and deletes") {
  DataTable t;
  t.addColumn(ColumnType::Integer, "Type");
  const int wide = t.addColumn(ColumnType::WideText, "Text");
  CHECK(t.columnType(wide) == ColumnType::WideText);
  const std::wstring arabic = L"\x0645\x064A\x0646\x0627\x0621";  // four letters and a hamza
  const std::wstring thai = L"\x0E17\x0E48\x0E32\x0E40\x0E23\x0E37\x0E2D";
  t.appendRowInteger(1);
  CHECK(t.setWideText(wide, 0, arabic));
  t.appendRowInteger(2);
  CHECK(t.setWideText(wide, 1, thai));
  // A row put in before the others moves them down with their texts.
  t.moveTo(0);
  t.insertRow();
  CHECK((t.wideText(wide, 0).empty() && t.wideText(wide, 1) == arabic && t.wideText(wide, 2) == thai));
  CHECK(t.deleteRowAt(1));
  CHECK(t.wideText(wide, 1) == thai);
  CHECK(t.integer(0, 1) == 2);
  // The narrow accessors read and write nothing in a wide column, nor the wide ones in others.
  CHECK_FALSE(t.setText(wide, 0, "x"));
  CHECK(t.text(wide, 1).empty());
  CHECK_FALSE(t.setWideText(0, 0, L"x"));
  CHECK(t.wideText(0, 1).empty());
  CHECK_FALSE(t.setWideText(wide, 2, L"past the end"));
  // A column added later gets empty cells for the rows there are.
  const int later = t.addColumn(ColumnType::WideText, "Later");
  CHECK((t.wideText(later, 0).empty() && t.wideText(later, 1).empty() && t.setWideText(later, 1, L"x")));
  t.clear();
  CHECK((t.rowCount() == 0 && t.columnCount() == 3));
}
