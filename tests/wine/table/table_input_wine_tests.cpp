// The table widget in a window: notifications from the mouse and the keys,
// refusal, in-place editing, drawing, the last-column fill.
#include <doctest/doctest.h>

#include "tests/wine/widgets/WidgetTestSupport.h"
#include "toolkit/core/Palette.h"
#include "toolkit/table/Table.h"
#include "toolkit/widgets/cXEdit2.h"

using toolkit::Table;
using wtest::HostWindow;
using wtest::RecordingPanel;

namespace {

struct Notification {
  int row, doubleClick, column, code, keyState;
};

// Table notifications (action events from the table) that reached the panel.
std::vector<Notification> notifications(const RecordingPanel& panel, const Table& table, int code = -1) {
  std::vector<Notification> out;
  for (const wtest::Seen& s : panel.seen) {
    if (s.id != toolkit::kEventAction || s.source != &table) continue;
    Notification n{int(s.params[0]), int(s.params[1]), int(s.params[2]), int(s.params[3]), int(s.params[4])};
    if (code < 0 || n.code == code) out.push_back(n);
  }
  return out;
}

// A station-like table of names shown by name, row data = insertion index.
struct Mounted {
  wtest::MountedPanel panel;
  Table table;

  explicit Mounted(bool editable = false) {
    panel.add(&table, "table");
    table.setBounds(0, 0, 300, 200, true, true);
    table.addColumn("name", "Name", 1, 0, nullptr, editable);
    const char* names[] = {"Le Havre", "Anvers", "Brest", "Zeebrugge"};
    for (int i = 0; i < 4; ++i) table.appendRowText(0, names[i], i);
    table.orderByColumn(0);
    panel.seen.clear();
  }

  // Client point in the middle of the shown row.
  POINT rowPoint(int displayRow) const {
    const int h = table.getRowHeight();
    return POINT{20, h * (displayRow + 1) + h / 2};
  }
};

class RefusingPanel : public RecordingPanel {
public:
  int onAction(toolkit::ToolkitEvent&) override { return 0; }
  int dispatchEvent(toolkit::ToolkitEvent& event) override {
    RecordingPanel::dispatchEvent(event);
    if (event.id == toolkit::kEventAction && event.params[3] == Table::kNotifySelect && refuse) {
      event.params[3] = 0;
      return 1;
    }
    return 0;
  }
  bool refuse = true;
};

}  // namespace

TEST_CASE("a click on a shown row reports its stored row and row data") {
  Mounted m;
  REQUIRE(m.table.isValid());
  const POINT p = m.rowPoint(1);  // Brest, stored row 2
  wtest::press(m.table.getHandle(), WM_LBUTTONDOWN, p.x, p.y, MK_LBUTTON);
  wtest::press(m.table.getHandle(), WM_LBUTTONUP, p.x, p.y, 0);

  const auto pressed = notifications(m.panel, m.table, Table::kNotifyCellPressed);
  REQUIRE(pressed.size() == 1);
  CHECK(pressed[0].row == 2);
  const auto selected = notifications(m.panel, m.table, Table::kNotifySelect);
  REQUIRE(selected.size() == 1);
  CHECK(selected[0].row == 2);
  CHECK(selected[0].column == 0);
  CHECK(selected[0].keyState == Table::kByMouse);
  CHECK(selected[0].doubleClick == 0);
  CHECK(m.table.getUserData(0, selected[0].row) == 2);
  CHECK(m.table.getCurrentRow() == 2);

  // The same row again: pressed, but no selection change.
  m.panel.seen.clear();
  wtest::press(m.table.getHandle(), WM_LBUTTONDOWN, p.x, p.y, MK_LBUTTON);
  CHECK(notifications(m.panel, m.table, Table::kNotifySelect).empty());
  CHECK(notifications(m.panel, m.table, Table::kNotifyCellPressed).size() == 1);

  // A double click notifies again, flagged.
  wtest::press(m.table.getHandle(), WM_LBUTTONDBLCLK, p.x, p.y, MK_LBUTTON);
  const auto again = notifications(m.panel, m.table, Table::kNotifySelect);
  REQUIRE(again.size() == 1);
  CHECK(again[0].doubleClick == 1);

  // Below the last row: nothing.
  m.panel.seen.clear();
  wtest::press(m.table.getHandle(), WM_LBUTTONDOWN, 20, 190, MK_LBUTTON);
  CHECK(notifications(m.panel, m.table).empty());
}

// Up and Down through the shown order: the port list suite, through TidesPortList.
TEST_CASE("Ctrl+End moves without notifying; keys notify with key state 4") {
  Mounted m;
  wtest::setModifiers(false, true);
  wtest::key(m.table.getHandle(), VK_END);
  wtest::setModifiers(false, false);
  CHECK(m.table.getCurrentRow() == 3);  // Zeebrugge
  CHECK(notifications(m.panel, m.table).empty());
  wtest::key(m.table.getHandle(), VK_DOWN);  // already last: stays, still notifies
  wtest::key(m.table.getHandle(), VK_UP);
  auto moves = notifications(m.panel, m.table, Table::kNotifySelect);
  REQUIRE(moves.size() == 2);
  CHECK(moves[0].row == 3);
  CHECK(moves[1].row == 0);
  CHECK(moves[1].keyState == Table::kByKeys);

  // A key that is not navigation on a read-only cell: an activation.
  m.panel.seen.clear();
  wtest::key(m.table.getHandle(), 'X');
  moves = notifications(m.panel, m.table, Table::kNotifySelect);
  REQUIRE(moves.size() == 1);
  CHECK(moves[0].doubleClick == 1);
  CHECK(moves[0].row == 0);
}

TEST_CASE("an owner can refuse a mouse selection change") {
  HostWindow host(300, 200);
  RefusingPanel panel;
  Table table;
  panel.add(&table, "table");
  wtest::mount(panel, host);
  table.setBounds(0, 0, 300, 200, true, true);
  table.addColumn("name", "Name", 1, 0, nullptr, false);
  table.appendRowText(0, "one", 0);
  table.appendRowText(0, "two", 1);
  REQUIRE(table.getCurrentRow() == 0);
  const int h = table.getRowHeight();
  wtest::press(table.getHandle(), WM_LBUTTONDOWN, 20, h * 2 + h / 2, MK_LBUTTON);
  CHECK(table.getCurrentRow() == 0);
  panel.refuse = false;
  wtest::press(table.getHandle(), WM_LBUTTONDOWN, 20, h * 2 + h / 2, MK_LBUTTON);
  CHECK(table.getCurrentRow() == 1);
}

TEST_CASE("in-place editing commits with Enter and cancels with Esc") {
  Mounted m(true);
  const POINT p = m.rowPoint(1);  // Brest
  wtest::press(m.table.getHandle(), WM_LBUTTONDOWN, p.x, p.y, MK_LBUTTON);
  REQUIRE(m.table.isEditing());
  toolkit::cXEdit2* editor = m.table.editor();
  REQUIRE(editor != nullptr);
  CHECK(editor->isVisible());
  CHECK(editor->getText() == "Brest");
  CHECK(editor->getOverwrite());
  CHECK(GetFocus() == editor->getHandle());

  editor->setText("Roscoff");
  wtest::key(editor->getHandle(), VK_ESCAPE);
  CHECK_FALSE(m.table.isEditing());
  CHECK(m.table.getCellText(2, 0) == "Brest");

  REQUIRE(m.table.beginEdit(2, 0));
  editor->setText("Roscoff");
  wtest::key(editor->getHandle(), VK_RETURN);
  CHECK_FALSE(m.table.isEditing());
  CHECK(m.table.getCellText(2, 0) == "Roscoff");
  CHECK_FALSE(editor->isVisible());

  // Down ends the edit with commit, moves and notifies.
  REQUIRE(m.table.beginEdit(2, 0));
  editor->setText("Morlaix");
  m.panel.seen.clear();
  wtest::key(editor->getHandle(), VK_DOWN);
  CHECK(m.table.getCellText(2, 0) == "Morlaix");
  const auto moves = notifications(m.panel, m.table, Table::kNotifySelect);
  REQUIRE(moves.size() == 1);
  CHECK(moves[0].row == 0);  // the next shown row: Le Havre
}

TEST_CASE("bool cells toggle instead of editing; read-only kinds do not edit") {
  Table table;
  HostWindow host;
  table.create(host.hwnd());
  table.addColumn("on", "On", 4, 0, nullptr, true);
  table.addColumn("when", "When", 8, 0, nullptr, true);
  table.addColumn("ro", "Read-only", 1, 0, nullptr, false);
  table.appendRowLong(0, 0, 0);
  CHECK(table.beginEdit(0, 0));
  CHECK(table.getCellLong(0, 0) == 1);
  CHECK_FALSE(table.isEditing());
  CHECK(table.beginEdit(0, 0));
  CHECK(table.getCellLong(0, 0) == 0);
  CHECK_FALSE(table.beginEdit(0, 1));
  CHECK_FALSE(table.beginEdit(0, 2));
  CHECK_FALSE(table.beginEdit(5, 0));
}

TEST_CASE("drawing: highlight of the current row, grid lines of palette colour 17") {
  Mounted m;
  m.table.selectRow(2, false);  // Brest: shown second
  wtest::Canvas canvas(300, 200, RGB(1, 2, 3));
  m.table.paint(canvas.dc());
  const int h = m.table.getRowHeight();
  const RECT shown = m.table.getCellRect(0, 2);
  CHECK(shown.top == h * 2);
  CHECK(canvas.countIn(GetSysColor(COLOR_HIGHLIGHT), shown) > 0);
  const RECT other = m.table.getCellRect(0, 1);
  CHECK(canvas.countIn(GetSysColor(COLOR_HIGHLIGHT), other) == 0);
  CHECK(canvas.at(50, h * 3 - 1) == toolkit::Palette::colour(17));  // bottom grid line of a row
  CHECK(canvas.count(RGB(1, 2, 3)) == 0);                          // the whole client area is drawn

  // With no-highlight the current cell is drawn like the others.
  m.table.addTableStyle(Table::kStyleNoHighlight);
  wtest::Canvas plain(300, 200, RGB(1, 2, 3));
  m.table.paint(plain.dc());
  CHECK(plain.countIn(GetSysColor(COLOR_HIGHLIGHT), shown) == 0);
}

TEST_CASE("owner drawing hands each cell to the owner first") {
  Mounted m;
  m.table.addTableStyle(Table::kStyleOwnerDraw);
  m.panel.answer = 1;  // every cell taken by the owner
  wtest::Canvas canvas(300, 200, RGB(1, 2, 3));
  m.table.paint(canvas.dc());
  int cells = 0;
  for (const wtest::Seen& s : m.panel.seen) cells += s.id == Table::kEventDrawCell && s.source == &m.table;
  CHECK(cells == 4);
  const RECT first = m.table.getCellRect(0, 1);
  CHECK(canvas.countIn(GetSysColor(COLOR_WINDOW), RECT{first.left + 2, first.top + 2, first.right - 2, first.bottom - 3}) == 0);
}

TEST_CASE("the last column fills the width when the style asks") {
  Mounted m;
  m.table.addColumn("b", "B", 1, 0, nullptr, false);
  CHECK(m.table.getColumnWidth(1) == 100);
  m.table.addTableStyle(Table::kStyleFillLast);
  const int client = m.table.getClientRect().right;
  CHECK(m.table.getColumnWidth(1) == client - 100 - 2);
  // Columns already wider than the window: nothing changes.
  m.table.setColumnWidth(0, client);
  m.table.setColumnWidth(1, 40);
  m.table.setBounds(0, 0, 290, 200, true, true);
  CHECK(m.table.getColumnWidth(1) == 40);
}

TEST_CASE("multiple selection with Ctrl and Shift clicks") {
  Mounted m;
  m.table.addTableStyle(Table::kStyleMultiSelect | Table::kStyleWholeRow);
  const POINT a = m.rowPoint(0), c = m.rowPoint(2);
  wtest::press(m.table.getHandle(), WM_LBUTTONDOWN, a.x, a.y, MK_LBUTTON);
  wtest::press(m.table.getHandle(), WM_LBUTTONDOWN, c.x, c.y, MK_LBUTTON | MK_SHIFT);
  CHECK(m.table.selectedRows() == std::set<int>{1, 2, 0});  // Anvers, Brest, Le Havre
  wtest::press(m.table.getHandle(), WM_LBUTTONDOWN, a.x, a.y, MK_LBUTTON | MK_CONTROL);
  CHECK(m.table.selectedRows() == std::set<int>{2, 0});
  CHECK(m.table.isRowSelected(0));
  CHECK_FALSE(m.table.isRowSelected(1));
}
