#include "toolkit/table/logic/cell_kinds.h"

namespace toolkit::table {

int normalizeKind(int kind) { return kind >= kCellLong && kind <= kCellWideText ? kind : kCellText; }

const char* cellColumnName(int kind) {
  switch (normalizeKind(kind)) {
    case kCellLong: return "Cell data (long)";
    case kCellDouble: return "Cell data (double)";
    case kCellBool: return "Cell data (bool)";
    case kCellState: return "Cell data (state)";
    case kCellLatitude: return "Cell data (Latitude)";
    case kCellLongitude: return "Cell data (Longitud)";
    case kCellDateTime: return "Cell data (datetime)";
    case kCellWideText: return "Cell data (wide text)";
    default: return "Cell data (text)";
  }
}

ColumnType cellStorage(int kind) {
  switch (normalizeKind(kind)) {
    case kCellLong:
    case kCellBool:
    case kCellState: return ColumnType::Integer;
    case kCellDouble:
    case kCellLatitude:
    case kCellLongitude:
    case kCellDateTime: return ColumnType::Double;
    case kCellWideText: return ColumnType::WideText;
    default: return ColumnType::Text;
  }
}

std::unique_ptr<DataTable> makeCellTable(int kind) {
  auto cells = std::make_unique<DataTable>();
  cells->addColumn(cellStorage(kind), cellColumnName(kind));
  cells->addColumn(ColumnType::Integer, "User data");
  return cells;
}

}  // namespace toolkit::table
