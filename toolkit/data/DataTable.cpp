#include "toolkit/data/DataTable.h"

#include <algorithm>
#include <cstdint>

namespace toolkit {

// Column-major storage: only the vector of the column's own type is used.
struct DataTable::Column {
  ColumnType type;
  std::string name;
  std::vector<std::string> texts;
  std::vector<std::wstring> wideTexts;
  std::vector<std::int64_t> integers;
  std::vector<double> doubles;
  std::vector<std::unique_ptr<DataTable>> tables;

  void insertCell(int at) {
    switch (type) {
      case ColumnType::Text: texts.insert(texts.begin() + at, std::string()); break;
      case ColumnType::WideText: wideTexts.insert(wideTexts.begin() + at, std::wstring()); break;
      case ColumnType::Integer: integers.insert(integers.begin() + at, 0); break;
      case ColumnType::Double: doubles.insert(doubles.begin() + at, 0.0); break;
      case ColumnType::Table: tables.insert(tables.begin() + at, nullptr); break;
    }
  }
  void eraseCell(int at) {
    switch (type) {
      case ColumnType::Text: texts.erase(texts.begin() + at); break;
      case ColumnType::WideText: wideTexts.erase(wideTexts.begin() + at); break;
      case ColumnType::Integer: integers.erase(integers.begin() + at); break;
      case ColumnType::Double: doubles.erase(doubles.begin() + at); break;
      case ColumnType::Table: tables.erase(tables.begin() + at); break;
    }
  }
  void clearCells() {
    texts.clear();
    wideTexts.clear();
    integers.clear();
    doubles.clear();
    tables.clear();
  }
};

namespace {
const std::string kNoName;

bool knownType(ColumnType type) {
  return type == ColumnType::Text || type == ColumnType::Integer || type == ColumnType::Table ||
         type == ColumnType::Double || type == ColumnType::WideText;
}
}  // namespace

DataTable::DataTable() = default;
DataTable::~DataTable() = default;
DataTable::DataTable(DataTable&&) noexcept = default;
DataTable& DataTable::operator=(DataTable&&) noexcept = default;

int DataTable::addColumn(ColumnType type, std::string_view name) {
  if (!knownType(type)) type = ColumnType::Text;
  Column column{type, std::string(name), {}, {}, {}, {}, {}};
  for (int row = 0; row < rows_; ++row) column.insertCell(row);
  columns_.push_back(std::move(column));
  return static_cast<int>(columns_.size()) - 1;
}

int DataTable::columnCount() const { return static_cast<int>(columns_.size()); }

int DataTable::columnIndex(std::string_view name) const {
  for (size_t i = 0; i < columns_.size(); ++i) {
    if (columns_[i].name == name) return static_cast<int>(i);
  }
  return -1;
}

ColumnType DataTable::columnType(int column) const {
  if (column < 0 || column >= columnCount()) return ColumnType::Text;
  return columns_[column].type;
}

const std::string& DataTable::columnName(int column) const {
  if (column < 0 || column >= columnCount()) return kNoName;
  return columns_[column].name;
}

int DataTable::rowCount() const { return rows_; }

int DataTable::makeRow(int at) {
  for (Column& column : columns_) column.insertCell(at);
  ++rows_;
  cursor_ = at;
  return at;
}

int DataTable::appendRow() { return makeRow(rows_); }

int DataTable::appendRowText(std::string_view firstCell) {
  int row = appendRow();
  setText(0, row, firstCell);
  return row;
}

int DataTable::appendRowInteger(std::int64_t firstCell) {
  int row = appendRow();
  setInteger(0, row, firstCell);
  return row;
}

int DataTable::appendRowDouble(double firstCell) {
  int row = appendRow();
  setDouble(0, row, firstCell);
  return row;
}

int DataTable::appendRowTable(std::unique_ptr<DataTable> firstCell) {
  int row = appendRow();
  setTable(0, row, std::move(firstCell));
  return row;
}

int DataTable::insertRow() {
  if (cursor_ < 0 || cursor_ >= rows_) return appendRow();
  return makeRow(cursor_);
}

bool DataTable::deleteRow() { return deleteRowAt(cursor_); }

bool DataTable::deleteRowAt(int row) {
  if (row < 0 || row >= rows_) return false;
  // Take nested tables out first, so that a nested table's destructor never runs
  // while this table is half updated.
  std::vector<std::unique_ptr<DataTable>> released;
  for (Column& column : columns_) {
    if (column.type == ColumnType::Table) released.push_back(std::move(column.tables[row]));
    column.eraseCell(row);
  }
  --rows_;
  if (cursor_ >= rows_) cursor_ = rows_ - 1;
  return true;
}

void DataTable::clear() {
  std::vector<Column> old;
  for (Column& column : columns_) {
    Column emptied{column.type, column.name, {}, {}, {}, {}, {}};
    old.push_back(std::move(column));
    column = std::move(emptied);
  }
  rows_ = 0;
  cursor_ = -1;
}

bool DataTable::holds(int column, int row, ColumnType type) const {
  return column >= 0 && column < columnCount() && row >= 0 && row < rows_ &&
         columns_[column].type == type;
}

bool DataTable::setText(int column, int row, std::string_view value) {
  if (!holds(column, row, ColumnType::Text)) return false;
  columns_[column].texts[row].assign(value.data(), value.size());
  return true;
}

bool DataTable::setWideText(int column, int row, std::wstring_view value) {
  if (!holds(column, row, ColumnType::WideText)) return false;
  columns_[column].wideTexts[row].assign(value.data(), value.size());
  return true;
}

bool DataTable::setInteger(int column, int row, std::int64_t value) {
  if (!holds(column, row, ColumnType::Integer)) return false;
  columns_[column].integers[row] = value;
  return true;
}

bool DataTable::setDouble(int column, int row, double value) {
  if (!holds(column, row, ColumnType::Double)) return false;
  columns_[column].doubles[row] = value;
  return true;
}

bool DataTable::setTable(int column, int row, std::unique_ptr<DataTable> value) {
  if (!holds(column, row, ColumnType::Table) || value.get() == this) return false;
  std::unique_ptr<DataTable> old = std::move(columns_[column].tables[row]);
  columns_[column].tables[row] = std::move(value);
  return true;
}

bool DataTable::setPointer(int column, int row, const void* value) {
  return setInteger(column, row, static_cast<std::int64_t>(reinterpret_cast<std::intptr_t>(value)));
}

std::string DataTable::text(int column, int row) const {
  if (!holds(column, row, ColumnType::Text)) return std::string();
  return columns_[column].texts[row];
}

std::wstring DataTable::wideText(int column, int row) const {
  if (!holds(column, row, ColumnType::WideText)) return std::wstring();
  return columns_[column].wideTexts[row];
}

std::int64_t DataTable::integer(int column, int row) const {
  if (!holds(column, row, ColumnType::Integer)) return 0;
  return columns_[column].integers[row];
}

double DataTable::number(int column, int row) const {
  if (!holds(column, row, ColumnType::Double)) return 0.0;
  return columns_[column].doubles[row];
}

DataTable* DataTable::table(int column, int row) const {
  if (!holds(column, row, ColumnType::Table)) return nullptr;
  return columns_[column].tables[row].get();
}

void* DataTable::pointer(int column, int row) const {
  return reinterpret_cast<void*>(static_cast<std::intptr_t>(integer(column, row)));
}

bool DataTable::moveTo(int row) {
  if (row < 0 || row >= rows_) {
    cursor_ = -1;
    return false;
  }
  cursor_ = row;
  return true;
}

bool DataTable::moveFirst() { return moveTo(0); }

bool DataTable::moveNext() { return cursor_ >= 0 && moveTo(cursor_ + 1); }

int DataTable::findInteger(int column, std::int64_t value) {
  if (column < 0 || column >= columnCount() || columns_[column].type != ColumnType::Integer) return -1;
  const auto& cells = columns_[column].integers;
  auto it = std::find(cells.begin(), cells.end(), value);
  if (it == cells.end()) return -1;
  cursor_ = static_cast<int>(it - cells.begin());
  return cursor_;
}

int DataTable::findPointer(int column, const void* value) {
  return findInteger(column, static_cast<std::int64_t>(reinterpret_cast<std::intptr_t>(value)));
}

int DataTable::findText(int column, std::string_view value) {
  if (column < 0 || column >= columnCount() || columns_[column].type != ColumnType::Text) return -1;
  const auto& cells = columns_[column].texts;
  for (size_t i = 0; i < cells.size(); ++i) {
    if (cells[i] == value) {
      cursor_ = static_cast<int>(i);
      return cursor_;
    }
  }
  return -1;
}

}  // namespace toolkit
