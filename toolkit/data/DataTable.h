#pragma once
// The toolkit's one in-memory table: rows under named, typed columns, with a
// cursor on the current row. A container keeps its children in one, and the table
// widget keeps its column descriptions and cells in them.
//
// Cells are read and written by (column, row) or at the cursor row. Access of the
// wrong type, or outside the table, changes nothing: setters answer false and
// getters answer the type's empty value.

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace toolkit {

// Storage types; the values are those the table's users store as column types.
enum class ColumnType : int {
  Text = 0,
  Integer = 3,  // 64 bits wide: also holds pointers and flags
  Table = 4,    // an owned nested table
  Double = 9,
  WideText = 10,  // UTF-16 text, for texts in any script
};

class DataTable {
public:
  DataTable();
  ~DataTable();
  DataTable(DataTable&&) noexcept;
  DataTable& operator=(DataTable&&) noexcept;
  DataTable(const DataTable&) = delete;
  DataTable& operator=(const DataTable&) = delete;

  // Columns. A column added to a table that already has rows gets empty cells.
  int addColumn(ColumnType type, std::string_view name);
  int columnCount() const;
  int columnIndex(std::string_view name) const;  // -1 when there is none
  ColumnType columnType(int column) const;       // Text for a bad index
  const std::string& columnName(int column) const;

  // Rows. Each operation that makes a row puts the cursor on it and answers its index.
  int rowCount() const;
  int appendRow();
  int appendRowText(std::string_view firstCell);
  int appendRowInteger(std::int64_t firstCell);
  int appendRowDouble(double firstCell);
  int appendRowTable(std::unique_ptr<DataTable> firstCell);
  int insertRow();         // before the cursor row; appends when the cursor is on no row
  bool deleteRow();        // the cursor row; the cursor then rests on the row that moved up
  bool deleteRowAt(int row);
  void clear();            // every row; the columns stay

  // Cells by position.
  bool setText(int column, int row, std::string_view value);
  bool setInteger(int column, int row, std::int64_t value);
  bool setDouble(int column, int row, double value);
  bool setTable(int column, int row, std::unique_ptr<DataTable> value);
  bool setPointer(int column, int row, const void* value);
  bool setWideText(int column, int row, std::wstring_view value);
  std::string text(int column, int row) const;
  std::wstring wideText(int column, int row) const;
  std::int64_t integer(int column, int row) const;
  double number(int column, int row) const;
  DataTable* table(int column, int row) const;  // still owned by this table
  void* pointer(int column, int row) const;

  // Cells at the cursor row.
  bool setCursorText(int column, std::string_view value) { return setText(column, cursor_, value); }
  bool setCursorInteger(int column, std::int64_t value) { return setInteger(column, cursor_, value); }
  bool setCursorDouble(int column, double value) { return setDouble(column, cursor_, value); }
  bool setCursorTable(int column, std::unique_ptr<DataTable> value) {
    return setTable(column, cursor_, std::move(value));
  }
  bool setCursorPointer(int column, const void* value) { return setPointer(column, cursor_, value); }
  std::string cursorText(int column) const { return text(column, cursor_); }
  std::int64_t cursorInteger(int column) const { return integer(column, cursor_); }
  double cursorNumber(int column) const { return number(column, cursor_); }
  DataTable* cursorTable(int column) const { return table(column, cursor_); }
  void* cursorPointer(int column) const { return pointer(column, cursor_); }

  // Cursor. Each move answers whether the cursor now rests on a row.
  bool moveTo(int row);
  bool moveFirst();
  bool moveNext();
  int cursor() const { return cursor_; }  // -1 when on no row

  // First row whose cell equals the value; the cursor moves there. -1 (cursor
  // unchanged) when none matches. Text comparison is exact.
  int findInteger(int column, std::int64_t value);
  int findPointer(int column, const void* value);
  int findText(int column, std::string_view value);

private:
  struct Column;
  bool holds(int column, int row, ColumnType type) const;
  int makeRow(int at);

  std::vector<Column> columns_;
  int rows_ = 0;
  int cursor_ = -1;
};

}  // namespace toolkit
