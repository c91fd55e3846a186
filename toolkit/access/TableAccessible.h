#pragma once
// The table as an accessibility client reads it: a list with one list item per
// shown row, in the order the rows are shown (child n is the n-th shown row).
// A row is named by its visible cells' texts joined by tabs (or by the name its
// owner gives it, the cells then being its value), and its state says
// whether it is selected and whether it has the focus. Clients may also select
// a row (accSelect), which the owner hears of as if the user had picked it.
//
// The statics are the table's announcements (NotifyWinEvent), so that clients
// that listen hear of focus and selection changes without asking.

#include "toolkit/access/ComponentAccessible.h"

namespace toolkit {

class Table;

class TableAccessible : public ComponentAccessible {
public:
  explicit TableAccessible(Table& table);

  // The child id of a stored row; 0 when the row is not shown.
  static LONG childIdOf(const Table& table, int storedRow);
  // The current row changed: the selection, and the focus when the table has it.
  static void announceCurrentRow(const Table& table);
  // The table got the focus, which rests on its current row.
  static void announceFocus(const Table& table);
  // Rows were removed or shown in another order.
  static void announceReorder(const Table& table);

protected:
  LONG childCount() const override;
  std::string nameOf(LONG child) const override;
  bool valueOf(LONG child, std::string& value) const override;
  std::wstring wideNameOf(LONG child) const override;
  bool wideValueOf(LONG child, std::wstring& value) const override;
  LONG roleOf(LONG child) const override;
  LONG stateOf(LONG child) const override;
  RECT screenRectOf(LONG child) const override;
  LONG childAt(POINT client) const override;
  LONG focusedChild() const override;
  HRESULT selectionOf(VARIANT& selection) const override;
  HRESULT select(LONG flags, LONG child) override;
  LONG neighbour(LONG child, LONG direction) const override;

private:
  Table& table() const;
  int rowOf(LONG child) const;  // stored row of a child id
  std::string cellsOf(int row) const;  // the visible cells joined by tabs
  std::wstring wideCellsOf(int row) const;  // likewise, wide text cells as stored
};

}  // namespace toolkit
