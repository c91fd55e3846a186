#pragma once
// Cell kinds of the table widget's columns and the names of their cell columns.
// Portable: the widget and the tests share these.

#include <string>

#include "toolkit/data/DataTable.h"

namespace toolkit::table {

enum CellKind : int {
  kCellText = 1,
  kCellLong = 2,
  kCellDouble = 3,
  kCellBool = 4,
  kCellState = 5,
  kCellLatitude = 6,
  kCellLongitude = 7,
  kCellDateTime = 8,
  kCellWideText = 9,  // UTF-16 text: texts in any script, whatever the ANSI code page
};

// Kinds 2..9 are kept; anything else is a text column.
int normalizeKind(int kind);
// "Cell data (text)", "Cell data (long)", ...; kind 7 is spelled "Cell data (Longitud)".
const char* cellColumnName(int kind);
// Storage of the cell values of a kind.
ColumnType cellStorage(int kind);
// A fresh data table for a column: the kind's cell column and "User data".
std::unique_ptr<DataTable> makeCellTable(int kind);

}  // namespace toolkit::table
