#include "toolkit/table/Table.h"

#include <oleauto.h>

#include <algorithm>

#include "frame/format/coord_format.h"
#include "toolkit/access/TableAccessible.h"
#include "toolkit/base/class_records.h"
#include "toolkit/table/logic/cell_kinds.h"
#include "toolkit/table/logic/cell_mask.h"
#include "toolkit/widgets/cXEdit2.h"
#include "toolkit/widgets/support/MeasuringDC.h"

namespace toolkit {

namespace records {
constexpr ClassRecord Table{"Table", &cXComponent};
}

using namespace table;

namespace {

constexpr int kValue = 0;     // cell table: the value column

std::wstring wideFromAnsi(const char* text) {
  if (text == nullptr || *text == '\0') return std::wstring();
  const int length = MultiByteToWideChar(CP_ACP, 0, text, -1, nullptr, 0);
  if (length <= 1) return std::wstring();
  std::wstring wide(static_cast<std::size_t>(length), L'\0');
  MultiByteToWideChar(CP_ACP, 0, text, -1, wide.data(), length);
  wide.resize(static_cast<std::size_t>(length - 1));
  return wide;
}

std::string ansiFromWide(std::wstring_view text) {
  if (text.empty() || text.size() > 0x7FFFFFF) return std::string();
  const int units = static_cast<int>(text.size());
  const int size = WideCharToMultiByte(CP_ACP, 0, text.data(), units, nullptr, 0, nullptr, nullptr);
  if (size <= 0) return std::string();
  std::string ansi(static_cast<std::size_t>(size), '\0');
  WideCharToMultiByte(CP_ACP, 0, text.data(), units, ansi.data(), size, nullptr, nullptr);
  return ansi;
}
constexpr int kUserData = 1;  // cell table: "User data"

std::string dateText(const std::string& mask, double date) {
  SYSTEMTIME time{};
  if (!VariantTimeToSystemTime(date, &time)) return std::string();
  char buffer[256];
  const int length = GetTimeFormatA(LOCALE_SYSTEM_DEFAULT, 0, &time, mask.empty() ? nullptr : mask.c_str(),
                                    buffer, static_cast<int>(sizeof buffer));
  return length > 0 ? std::string(buffer) : std::string();
}

}  // namespace

Table::Table() : cXComponent(kPeerKind) {
  columns_.addColumn(ColumnType::Text, "Column name");
  columns_.addColumn(ColumnType::Text, "Column alias");
  columns_.addColumn(ColumnType::Integer, "Column type");
  columns_.addColumn(ColumnType::Integer, "Column align");
  columns_.addColumn(ColumnType::Table, "Column data");
  columns_.addColumn(ColumnType::Integer, "Column width");
  columns_.addColumn(ColumnType::Integer, "Column editable");
  columns_.addColumn(ColumnType::Text, "Column mask");
  columns_.addColumn(ColumnType::Integer, "Column visible");
  resetColumns();
}

Table::~Table() {
  // The editor's window is a child of ours: it goes first.
  editor_.reset();
}

const ClassRecord* Table::getClassRecord() const { return &records::Table; }

bool Table::create(HWND parentHwnd) {
  if (!IsWindow(parentHwnd)) return cXComponent::create(parentHwnd);  // raises the toolkit's error
  if (!createWindow(0, nullptr, "", kDefaultStyle | WS_VSCROLL | WS_HSCROLL, 0, 0, 0, 0, parentHwnd, 0)) return false;
  updateScrollBars();
  return true;
}

// ---- columns

void Table::resetColumns() {
  if (editing_) endEdit(false);
  columns_.clear();
  displayOrder_.clear();
  hiddenColumns_.clear();
  editLimits_.clear();
  ownerColumns_ = 0;
  const int row = columns_.appendRowText("Untitled");
  columns_.setText(kColumnAlias, row, "List box implementation");
  columns_.setInteger(kColumnType, row, kCellText);
  columns_.setInteger(kColumnAlign, row, 1);
  columns_.setTable(kColumnData, row, makeCellTable(kCellText));
  columns_.setInteger(kColumnWidth, row, kDefaultWidth);
  columns_.setInteger(kColumnEditable, row, 0);
  columns_.setInteger(kColumnVisible, row, 1);
  displayOrder_.push_back(0);
  growRows(row);
  currentRow_ = 0;
  currentColumn_ = 0;
  invalidate();
}

int Table::addColumn(const char* name, const char* alias, int kind, int align, const char* mask, bool editable) {
  if (editing_) endEdit(true);
  if (ownerColumns_ == 0) {
    columns_.clear();
    displayOrder_.clear();
    hiddenColumns_.clear();
    editLimits_.clear();
    sortColumn_ = -1;
    order_.clear();
  }
  const int normal = normalizeKind(kind);
  const int row = columns_.appendRowText(name ? name : "");
  columns_.setText(kColumnAlias, row, alias ? alias : "");
  columns_.setInteger(kColumnType, row, normal);
  columns_.setInteger(kColumnAlign, row, align);
  columns_.setInteger(kColumnWidth, row, kDefaultWidth);
  columns_.setInteger(kColumnEditable, row, editable ? 1 : 0);
  columns_.setText(kColumnMask, row, mask ? mask : "");
  columns_.setTable(kColumnData, row, makeCellTable(normal));
  columns_.setInteger(kColumnVisible, row, 1);
  ++ownerColumns_;
  displayOrder_.push_back(row);
  growRows(row);
  fillLastColumn();
  updateScrollBars();
  invalidate();
  return row;
}

// A new column gets the rows the table already has.
void Table::growRows(int column) {
  DataTable* cells = cellsOf(column);
  while (cells && cells->rowCount() < rowCount_) cells->appendRow();
}

DataTable* Table::cellsOf(int column) const {
  if (column < 0 || column >= columns_.rowCount()) return nullptr;
  return columns_.table(kColumnData, column);
}

int Table::getColumnKind(int column) const {
  return column < 0 || column >= columns_.rowCount() ? 0 : static_cast<int>(columns_.integer(kColumnType, column));
}

int Table::getColumnWidth(int column) const {
  return column < 0 || column >= columns_.rowCount() ? 0 : static_cast<int>(columns_.integer(kColumnWidth, column));
}

void Table::setColumnWidth(int column, int width) {
  if (!columns_.setInteger(kColumnWidth, column, std::max(width, 0))) return;
  updateScrollBars();
  invalidate();
}

void Table::setColumnMask(int column, const char* mask) {
  if (columns_.setText(kColumnMask, column, mask ? mask : "")) invalidate();
}

void Table::setColumnMaxLength(int column, int length) {
  if (column < 0 || column >= columns_.rowCount() || length < 0) return;
  if (editLimits_.size() <= static_cast<size_t>(column)) editLimits_.resize(static_cast<size_t>(column) + 1, 0);
  editLimits_[static_cast<size_t>(column)] = length;
}

int Table::getColumnMaxLength(int column) const {
  return column >= 0 && static_cast<size_t>(column) < editLimits_.size() ? editLimits_[static_cast<size_t>(column)] : 0;
}

void Table::setMinimumColumnWidth(int pixels) { minimumWidth_ = pixels <= 0 ? 50 : pixels; }

void Table::autoSizeColumn(int column, int rows) {
  if (column < 0 || column >= columns_.rowCount()) return;
  MeasuringDC dc(getFont());
  auto extent = [&](const std::string& text) {
    if (!dc.valid() || text.empty()) return 0;
    SIZE size{};
    GetTextExtentPoint32A(dc.dc(), text.c_str(), static_cast<int>(text.size()), &size);
    return static_cast<int>(size.cx);
  };
  int width = 10;
  width = std::max(width, extent(getColumnAlias(column)) + 10);
  const int kind = getColumnKind(column);
  const int last = rows < 0 ? rowCount_ : std::min(rows, rowCount_);
  for (int row = 0; row < last; ++row) {
    const int cellWidth = (kind == kCellBool || kind == kCellState) ? kMarkSize : extent(getCellText(row, column));
    width = std::max(width, cellWidth + 10);
  }
  columns_.setInteger(kColumnWidth, column, width);
  updateScrollBars();
  invalidate();
}

// ---- rows

int Table::appendRowText(int column, const char* text, int userData) {
  if (!cellsOf(column)) return -1;
  for (int c = 0; c < columns_.rowCount(); ++c) cellsOf(c)->appendRow();
  const int row = rowCount_++;
  if (!rowHeights_.empty()) rowHeights_.push_back(0);
  setCellText(column, row, text);
  setUserData(column, row, userData);
  // Filling thousands of rows must not set the scroll bars thousands of times.
  scrollBarsStale_ = true;
  invalidate();
  return row;
}

int Table::appendRowLong(int column, int value, int userData) {
  const int row = appendRowText(column, nullptr, userData);
  if (row >= 0) setCellLong(column, row, value);
  return row;
}

int Table::appendRowDouble(int column, double value, int userData) {
  const int row = appendRowText(column, nullptr, userData);
  if (row >= 0) setCellDouble(column, row, value);
  return row;
}

bool Table::setCellText(int column, int row, const char* text) {
  DataTable* cells = cellsOf(column);
  if (cells && getColumnKind(column) == kCellWideText) return setCellWideText(column, row, wideFromAnsi(text));
  return cells && cells->setText(kValue, row, text ? text : "");
}

bool Table::setCellWideText(int column, int row, std::wstring_view text) {
  DataTable* cells = cellsOf(column);
  if (!cells) return false;
  if (getColumnKind(column) == kCellWideText) return cells->setWideText(kValue, row, text);
  return cells->setText(kValue, row, ansiFromWide(text));
}

bool Table::setCellLong(int column, int row, int value) {
  DataTable* cells = cellsOf(column);
  return cells && cells->setInteger(kValue, row, value);
}

bool Table::setCellDouble(int column, int row, double value) {
  DataTable* cells = cellsOf(column);
  return cells && cells->setDouble(kValue, row, value);
}

bool Table::setUserData(int column, int row, int value) {
  DataTable* cells = cellsOf(column);
  return cells && cells->setInteger(kUserData, row, value);
}

int Table::getUserData(int column, int row) const {
  DataTable* cells = cellsOf(column);
  return cells ? static_cast<int>(cells->integer(kUserData, row)) : 0;
}

void Table::removeAllRows() {
  if (editing_) endEdit(false);
  for (int c = 0; c < columns_.rowCount(); ++c) cellsOf(c)->clear();
  rowCount_ = 0;
  rowHeights_.clear();
  order_.clear();
  hiddenRows_.clear();
  selection_.clear();
  anchorRow_ = -1;
  currentRow_ = (style_ & kStyleListMode) ? -1 : 0;
  currentColumn_ = (style_ & kStyleListMode) ? -1 : currentColumn_;
  topRow_ = 0;
  updateScrollBars();
  invalidate();
  TableAccessible::announceReorder(*this);
}

// ---- cells

DataTable* Table::getCell(int column, int row) const {
  const int columnCount = std::max(columns_.rowCount(), 1);
  if (column < 0 || column >= columnCount || row < 0 || row >= rowCount_) return nullptr;
  return cellsOf(column);
}

int Table::getCellLong(int column, int row) const {
  const int kind = getColumnKind(column);
  if (kind != kCellLong && kind != kCellBool && kind != kCellState) return 0;
  DataTable* cells = getCell(column, row);
  return cells ? static_cast<int>(cells->integer(kValue, row)) : 0;
}

double Table::getCellDouble(int column, int row) const {
  DataTable* cells = getCell(column, row);
  return cells ? cells->number(kValue, row) : 0.0;
}

std::string Table::getCellText(int row, int column) const {
  DataTable* cells = getCell(column, row);
  if (!cells) return std::string();
  const std::string mask = columns_.text(kColumnMask, column);
  switch (getColumnKind(column)) {
    case kCellLong:
      return formatLongCell(mask, static_cast<int>(cells->integer(kValue, row)));
    case kCellBool:
    case kCellState:
      return std::to_string(cells->integer(kValue, row));
    case kCellDouble:
      return formatDoubleCell(mask, cells->number(kValue, row));
    case kCellLatitude:
      return br::FormatCoord(mask.empty() ? br::COORD_MASK_LAT_MINUTES : mask.c_str(), br::COORD_LATITUDE,
                         cells->number(kValue, row));
    case kCellLongitude:
      return FormatCoord(mask.empty() ? br::COORD_MASK_LON_MINUTES : mask.c_str(), br::COORD_LONGITUDE,
                         cells->number(kValue, row));
    case kCellDateTime:
      return dateText(mask, cells->number(kValue, row));
    case kCellWideText:
      return ansiFromWide(cells->wideText(kValue, row));
    default:
      return formatTextCell(mask, cells->text(kValue, row));
  }
}

std::wstring Table::getCellWideText(int row, int column) const {
  if (getColumnKind(column) != kCellWideText) return wideFromAnsi(getCellText(row, column).c_str());
  DataTable* cells = getCell(column, row);
  return cells ? cells->wideText(kValue, row) : std::wstring();
}

int Table::findRow(int column, int firstRow, const char* text, bool anywhere, bool caseSensitive) const {
  if (!cellsOf(column)) return -1;
  const std::string wanted = text ? text : "";
  for (int row = std::max(firstRow, 0); row < rowCount_; ++row) {
    if (textMatches(getCellText(row, column), wanted, anywhere, caseSensitive)) return row;
  }
  return -1;
}

// ---- selection

bool Table::isCurrentCell(int column, int row) const {
  if (style_ & kStyleMultiSelect) {
    if (selection_.count(row)) return (style_ & kStyleWholeRow) || column == currentColumn_;
    return false;
  }
  if (style_ & kStyleWholeRow) return row == currentRow_;
  return row == currentRow_ && column == currentColumn_;
}

bool Table::isRowSelected(int row) const {
  if (style_ & kStyleMultiSelect) return selection_.count(row) != 0;
  return row == currentRow_;
}

bool Table::selectRow(int row, bool notifyOwner) {
  if (row < 0 || row >= rowCount_) return false;
  const int column = currentColumn_ >= 0 ? currentColumn_ : 0;
  return moveCurrent(row, column, false, kByKeys, notifyOwner);
}

// ---- display

void Table::setTableStyle(int style) {
  style_ = style;
  fillLastColumn();
  invalidate();
}

void Table::orderByColumn(int column) {
  sortColumn_ = cellsOf(column) ? column : -1;
  if (sortColumn_ < 0) {
    order_.clear();
  } else {
    switch (cellStorage(getColumnKind(column))) {
      case ColumnType::Text: {
        std::vector<std::string> keys;
        keys.reserve(rowCount_);
        for (int row = 0; row < rowCount_; ++row) keys.push_back(getCellText(row, column));
        order_.orderByText(keys);
        break;
      }
      default: {
        std::vector<double> keys;
        keys.reserve(rowCount_);
        DataTable* cells = cellsOf(column);
        for (int row = 0; row < rowCount_; ++row) {
          keys.push_back(cellStorage(getColumnKind(column)) == ColumnType::Integer
                             ? static_cast<double>(cells->integer(kValue, row))
                             : cells->number(kValue, row));
        }
        order_.orderByNumber(keys);
        break;
      }
    }
  }
  invalidate();
  TableAccessible::announceReorder(*this);
}

void Table::setDisplayWidth(int width) {
  displayWidth_ = std::max(width, 0);
  updateScrollBars();
}

bool Table::isColumnVisible(int column) const {
  if (!(style_ & kStyleHidden)) return true;
  return hiddenColumns_.count(column) == 0;
}

bool Table::isRowVisible(int row) const {
  if (!(style_ & kStyleHidden)) return true;
  return hiddenRows_.count(row) == 0;
}

void Table::setColumnVisible(int column, bool visible) {
  if (!(style_ & kStyleHidden) || !cellsOf(column)) return;
  if (visible) hiddenColumns_.erase(column);
  else hiddenColumns_.insert(column);
  columns_.setInteger(kColumnVisible, column, visible ? 1 : 0);
  updateScrollBars();
  invalidate();
}

void Table::setRowVisible(int row, bool visible) {
  if (!(style_ & kStyleHidden) || row < 0 || row >= rowCount_) return;
  if (visible) hiddenRows_.erase(row);
  else hiddenRows_.insert(row);
  updateScrollBars();
  invalidate();
}

void Table::setBoolColors(int pair, int background, int foreground) {
  if (pair < 0 || pair > 3) return;
  boolBack_[pair] = background;
  boolFore_[pair] = foreground;
  invalidate();
}

int Table::getRowHeight() const {
  if (rowHeight_ > 0) return rowHeight_;
  MeasuringDC dc(getFont());
  const int textHeight = dc.valid() ? static_cast<int>(dc.metrics().tmHeight) : 13;
  rowHeight_ = textHeight + 6;
  return rowHeight_;
}

void Table::setRowHeight(int row, int height) {
  if (row < 0 || row >= rowCount_) return;
  height = std::max(height, 0);
  if (rowHeights_.empty() && height == 0) return;
  rowHeights_.resize(static_cast<std::size_t>(rowCount_), 0);
  rowHeights_[static_cast<std::size_t>(row)] = height;
  scrollBarsStale_ = true;
  invalidate();
}

int Table::getRowHeightOf(int row) const {
  if (row >= 0 && static_cast<std::size_t>(row) < rowHeights_.size() && rowHeights_[row] > 0) return rowHeights_[row];
  return getRowHeight();
}

int Table::displayRowCount() const {
  return (style_ & kStyleHidden) ? rowCount_ - static_cast<int>(hiddenRows_.size()) : rowCount_;
}

int Table::nthShownRow(int index) const {
  if (index < 0) return -1;
  if (!(style_ & kStyleHidden) || hiddenRows_.empty()) {
    return index < rowCount_ ? order_.toStored(index) : -1;
  }
  int shown = 0;
  for (int display = 0; display < rowCount_; ++display) {
    const int stored = order_.toStored(display);
    if (hiddenRows_.count(stored)) continue;
    if (shown++ == index) return stored;
  }
  return -1;
}

int Table::shownIndexOf(int storedRow) const {
  if (storedRow < 0 || storedRow >= rowCount_ || !isRowVisible(storedRow)) return -1;
  const int display = order_.toDisplay(storedRow);
  if (!(style_ & kStyleHidden) || hiddenRows_.empty()) return display;
  int shown = 0;
  for (int d = 0; d < display; ++d) {
    if (!hiddenRows_.count(order_.toStored(d))) ++shown;
  }
  return shown;
}

}  // namespace toolkit
