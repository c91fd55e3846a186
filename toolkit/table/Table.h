#pragma once
// The table widget: a self-drawn grid of typed columns over rows of cells, with a
// header, a current cell (or row), in-place editing through a cXEdit2, automatic
// column widths and an optional display order by one column.
//
// Columns are described in one DataTable (the k… descriptor columns below); each
// description owns the column's cell table (value column named by the kind, and
// "User data"). Rows are stored in the order they were added; with a sort column
// the rows are shown in another order, and every row that comes from the user
// (selection, editing, hit tests) is turned back into its stored row, which is
// also the row the owner is told about.
//
// Notifications are action events (id 0) given to the widget's own dispatchEvent:
// params = row (stored), double-click flag, column, code, key-state word (8 mouse,
// 4 keys). Codes: kNotifySelect (1), kNotifyRowHeader (14), kNotifyCellPressed
// (15). A handler refuses a mouse-driven selection change by answering non-zero
// with the code set to 0.

#include <functional>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/core/cXComponent.h"
#include "toolkit/data/DataTable.h"
#include "toolkit/table/logic/RowOrder.h"

namespace toolkit {

namespace records {
extern const ClassRecord Table;
}

class cXEdit2;

class Table : public cXComponent {
public:
  static constexpr int kPeerKind = 44;

  // Descriptor columns of the column descriptions.
  enum Descriptor : int {
    kColumnName = 0,
    kColumnAlias = 1,
    kColumnType = 2,
    kColumnAlign = 3,
    kColumnData = 4,
    kColumnWidth = 5,
    kColumnEditable = 6,
    kColumnMask = 7,
    kColumnVisible = 8,
  };

  // Style bits.
  static constexpr int kStyleVerticalGrid = 0x4;
  static constexpr int kStyleHorizontalGrid = 0x8;
  static constexpr int kStyleOwnerDraw = 0x10;
  static constexpr int kStyleListMode = 0x20;
  static constexpr int kStyleWholeRow = 0x200;
  static constexpr int kStyleNoHighlight = 0x2000;
  static constexpr int kStyleHidden = 0x4000;
  static constexpr int kStyleMultiSelect = 0x8000;
  static constexpr int kStyleFillLast = 0x10000;
  static constexpr int kStyleNoEditOnSelect = 0x40000;
  static constexpr int kInitialStyle = 0x40F;

  // Notification codes and key-state words.
  static constexpr int kNotifySelect = 1;
  static constexpr int kNotifyRowHeader = 14;
  static constexpr int kNotifyCellPressed = 15;
  static constexpr int kByMouse = 8;
  static constexpr int kByKeys = 4;

  // Owner-drawing event (id 2 given to dispatchEvent): params = DC, RECT*, state,
  // column, row (stored).
  static constexpr int kEventDrawCell = 2;
  // Row layout event (given to dispatchEvent; an id no window message uses) sent before
  // painting when the client width is not the one last announced: params = client
  // width. An owner that gives rows heights of their own (setRowHeight) sets them again
  // for that width.
  static constexpr int kEventLayoutRows = 0x101;
  static constexpr UINT_PTR kTimer = 0xF001;
  static constexpr int kDefaultWidth = 100;
  static constexpr int kMarkSize = 12;  // bool and state marks

  Table();
  ~Table() override;

  const ClassRecord* getClassRecord() const override;
  bool create(HWND parentHwnd) override;

  // ---- columns
  void resetColumns();
  // Answers the new column's index.
  int addColumn(const char* name, const char* alias, int kind, int align, const char* mask, bool editable);
  int getColumnCount() const { return columns_.rowCount(); }
  int getOwnerColumnCount() const { return ownerColumns_; }
  const DataTable& columns() const { return columns_; }
  std::string getColumnName(int column) const { return columns_.text(kColumnName, column); }
  std::string getColumnAlias(int column) const { return columns_.text(kColumnAlias, column); }
  int getColumnKind(int column) const;
  int getColumnWidth(int column) const;
  void setColumnWidth(int column, int width);
  void setColumnMask(int column, const char* mask);
  // Longest text an in-place edit of the column may hold; 0 (the default) leaves the
  // kind's own: 10 characters for doubles, none for the others.
  void setColumnMaxLength(int column, int length);
  int getColumnMaxLength(int column) const;
  void autoSizeColumn(int column, int rows);
  void setMinimumColumnWidth(int pixels);
  int getMinimumColumnWidth() const { return minimumWidth_; }
  const std::vector<int>& displayOrder() const { return displayOrder_; }

  // ---- rows (stored order)
  int getRowCount() const { return rowCount_; }
  int appendRowText(int column, const char* text, int userData);
  int appendRowLong(int column, int value, int userData);
  int appendRowDouble(int column, double value, int userData);
  bool setCellText(int column, int row, const char* text);
  // A text cell in any script: stored as it is in a wide text column (kind 9), through
  // the ANSI code page in a text column.
  bool setCellWideText(int column, int row, std::wstring_view text);
  bool setCellLong(int column, int row, int value);
  bool setCellDouble(int column, int row, double value);
  bool setUserData(int column, int row, int value);
  int getUserData(int column, int row) const;
  void removeAllRows();

  // ---- cells
  // The cells table of a column and the value column's index; null outside the table.
  DataTable* getCell(int column, int row) const;
  int getCellLong(int column, int row) const;
  double getCellDouble(int column, int row) const;
  std::string getCellText(int row, int column) const;  // wide texts in the ANSI code page
  // The cell's text in UTF-16: a wide text cell as stored, others widened from getCellText.
  std::wstring getCellWideText(int row, int column) const;

  // ---- current cell and selection (stored rows; -1 for none)
  int getCurrentRow() const { return currentRow_; }
  int getCurrentColumn() const { return currentColumn_; }
  bool isCurrentCell(int column, int row) const;
  bool isRowSelected(int row) const;
  const std::set<int>& selectedRows() const { return selection_; }
  // Makes the row current (scrolled into view); with `notify`, the owner is told
  // (code 1, key-driven). Answers false for a row out of range.
  bool selectRow(int row, bool notify);

  // ---- display
  int getTableStyle() const { return style_; }
  void setTableStyle(int style);
  void addTableStyle(int bits) { setTableStyle(style_ | bits); }
  // Orders the shown rows by a column (-1: stored order).
  void orderByColumn(int column);
  int getSortColumn() const { return sortColumn_; }
  int displayRowOf(int storedRow) const { return order_.toDisplay(storedRow); }
  int storedRowOf(int displayRow) const { return order_.toStored(displayRow); }
  // The rows shown, in the order shown, hidden ones left out.
  int displayRowCount() const;
  int nthShownRow(int index) const;       // stored row of the index-th shown row, or -1
  int shownIndexOf(int storedRow) const;  // -1 when the row is not shown
  // Width of the scrolled content (0: the sum of the column widths).
  void setDisplayWidth(int width);
  int getDisplayWidth() const { return displayWidth_; }
  bool isColumnVisible(int column) const;
  bool isRowVisible(int row) const;
  void setColumnVisible(int column, bool visible);
  void setRowVisible(int row, bool visible);
  void setBoolColors(int pair, int background, int foreground);
  int getRowHeight() const;  // of the header and of rows without a height of their own
  // A height of the row's own (stored row); 0 gives it back the table's height.
  void setRowHeight(int row, int height);
  int getRowHeightOf(int row) const;
  int getTopRow() const { return topRow_; }
  // Cell rectangle in client coordinates (column -1: the whole row); empty when not shown.
  RECT getCellRect(int column, int row) const;
  // Stored row and column under a client point; row -1 on the header, column -1
  // left of the columns. Answers false below the rows or right of the columns.
  bool hitTest(int x, int y, int& row, int& column) const;
  // First row from `firstRow` (stored) whose cell text holds `text`; -1 if none.
  int findRow(int column, int firstRow, const char* text, bool anywhere, bool caseSensitive) const;
  // Owners whose rows have a name of their own (a light's chart abbreviation) give the
  // namer; accessibility clients then read that name, and the visible cells as the
  // row's value. A namer answering an empty text leaves the row named by its cells.
  void setRowNamer(std::function<std::string(int storedRow)> namer) { rowNamer_ = std::move(namer); }
  std::string rowName(int storedRow) const { return rowNamer_ ? rowNamer_(storedRow) : std::string(); }

  // ---- editing
  bool beginEdit(int row, int column);
  // With commit, the cell takes the editor's value only when its text was changed.
  void endEdit(bool commit);
  bool isEditing() const { return editing_; }
  cXEdit2* editor() const { return editor_.get(); }

  // ---- drawing and events
  void paint(HDC dc) override;
  void drawCell(HDC dc, RECT rect, int column, int row);
  int dispatchEvent(ToolkitEvent& event) override;
  int onMouseDown(ToolkitEvent& event, int x, int y) override;
  int onMouseDrag(ToolkitEvent& event, int x, int y) override;
  int onMouseUp(ToolkitEvent& event, int x, int y) override;
  int onKeyDown(ToolkitEvent& event, int key) override;
  int onFocusGained(ToolkitEvent& event) override;
  int onFocusLost(ToolkitEvent& event) override;
  int onScroll(ToolkitEvent& event) override;
  int onResized(ToolkitEvent& event) override;
  int onEraseBackground(ToolkitEvent& event) override;
  int onSetCursor(ToolkitEvent& event) override;
  void lendFont(HFONT font) override;
  bool setFontIndirect(const LOGFONTA& font) override;

private:
  DataTable* cellsOf(int column) const;
  int columnLeft(int column) const;  // content x of the column's left edge
  int visibleRowCount() const;       // whole rows that fit below the header
  void fillLastColumn();
  void updateScrollBars();
  void scrollIntoView(int row);
  void drawHeader(HDC dc, const RECT& client);
  void drawMark(HDC dc, const RECT& rect, int kind, int value, bool selected);
  // Sends a notification; answers whether a handler refused it.
  bool notify(int row, bool doubleClick, int column, int code, int keyState);
  // Moves the current cell; answers false when a handler refused.
  bool moveCurrent(int row, int column, bool doubleClick, int keyState, bool notifyOwner);
  void redrawRow(int row);
  bool navigate(int key, bool shift, bool control);
  void storeEditedValue();
  void growRows(int column);
  void selectRange(int from, int to);
  bool ownRowHeights() const { return !rowHeights_.empty(); }
  int shownRowHeight(int index) const { return getRowHeightOf(nthShownRow(index)); }

  DataTable columns_;
  int ownerColumns_ = 0;
  std::vector<int> displayOrder_;
  int rowCount_ = 0;
  int currentRow_ = -1;
  int currentColumn_ = -1;
  int style_ = kInitialStyle;
  int sortColumn_ = -1;
  table::RowOrder order_;
  std::set<int> hiddenRows_;
  std::set<int> hiddenColumns_;
  std::set<int> selection_;
  int anchorRow_ = -1;
  int boolBack_[4] = {1, 1, 2, 2};
  int boolFore_[4] = {4, 4, 3, 3};
  int minimumWidth_ = 50;
  int displayWidth_ = 0;
  int topRow_ = 0;       // index of the first shown row at the top
  int leftPixel_ = 0;    // horizontal scroll
  int resizing_ = -1;    // column being resized
  int resizeStartX_ = 0;
  int resizeStartWidth_ = 0;
  int pressedHeader_ = -1;
  mutable int rowHeight_ = 0;     // cached; 0 = measure again
  std::vector<int> rowHeights_;   // per stored row, 0 = rowHeight_; empty while no row has its own
  int laidOutWidth_ = -1;         // client width of the last kEventLayoutRows
  bool scrollBarsStale_ = false;  // rows were added since the scroll bars were set
  std::vector<int> editLimits_;  // per column, 0 = the kind's; shorter than the columns = 0
  std::unique_ptr<cXEdit2> editor_;
  bool editing_ = false;
  int editRow_ = -1;
  int editColumn_ = -1;
  std::string editStartText_;  // the editor's text when the edit began
  std::function<std::string(int)> rowNamer_;
};

}  // namespace toolkit
