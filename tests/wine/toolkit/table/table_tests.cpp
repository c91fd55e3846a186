// The table widget: refusal, search, in-place editing, drawing, style bits. Clicks, keys
// and row data through the shown order are the port list suite's (TidesPortList).
#include <doctest/doctest.h>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/core/Palette.h"
#include "toolkit/table/Table.h"
#include "toolkit/widgets/cXEdit2.h"

using toolkit::Table;

namespace {

// A table of names shown by name, row data = insertion index, in a panel that records what
// bubbles up and refuses selection changes while `refuse` is set.
struct Mounted : wtest::MountedPanel {
  Table table;
  bool refuse = false;

  explicit Mounted(bool editable = false) {
    add(&table, "table");
    table.setBounds(0, 0, 300, 200, true, true);
    table.addColumn("name", "Name", 1, 0, nullptr, editable);
    const char* names[] = {"Le Havre", "Anvers", "Brest", "Zeebrugge"};
    for (int i = 0; i < 4; ++i) table.appendRowText(0, names[i], i);
    table.orderByColumn(0);
    seen.clear();
  }
  int dispatchEvent(toolkit::ToolkitEvent& event) override {
    const int answer = RecordingPanel::dispatchEvent(event);
    if (refuse && event.id == toolkit::kEventAction && event.params[3] == Table::kNotifySelect) {
      event.params[3] = 0;
      return 1;
    }
    return answer;
  }
  void click(int displayRow, WPARAM keys = 0) {
    const int h = table.getRowHeight();
    wtest::press(table.getHandle(), WM_LBUTTONDOWN, 20, h * (displayRow + 1) + h / 2, MK_LBUTTON | keys);
  }
  // Whether a key-down of `key` bubbled up to the panel.
  bool reached(int key) const {
    for (const wtest::Seen& s : seen)
      if (s.id == toolkit::kEventKeyDown && s.params[0] == key) return true;
    return false;
  }
  // Key-driven selection notifications the panel heard.
  int selections() const {
    int n = 0;
    for (const wtest::Seen& s : seen)
      n += s.id == toolkit::kEventAction && s.params[3] == Table::kNotifySelect && s.params[4] == Table::kByKeys;
    return n;
  }
  // Ends the edit in progress with `key`, sent to the editor as the user would.
  void press(int key) { wtest::key(table.editor()->getHandle(), key); }
};

}  // namespace

TEST_CASE("an owner can refuse a mouse selection change") {
  Mounted m;
  const int before = m.table.getCurrentRow();
  m.refuse = true;
  m.click(1);  // Brest, stored row 2
  CHECK(m.table.getCurrentRow() == before);
  m.refuse = false;
  m.click(1);
  CHECK(m.table.getCurrentRow() == 2);
}

TEST_CASE("in-place editing commits with Enter and cancels with Esc; bool cells toggle") {
  Mounted m(true);
  m.click(1);  // Brest
  REQUIRE(m.table.isEditing());
  toolkit::cXEdit2* editor = m.table.editor();
  REQUIRE(editor != nullptr);
  CHECK(editor->getText() == "Brest");
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

  m.table.addColumn("on", "On", 4, 0, nullptr, true);
  m.table.addColumn("ro", "Read-only", 1, 0, nullptr, false);
  CHECK(m.table.beginEdit(0, 1));
  CHECK(m.table.getCellLong(1, 0) == 1);
  CHECK_FALSE(m.table.isEditing());
  CHECK_FALSE(m.table.beginEdit(0, 2));
  CHECK_FALSE(m.table.beginEdit(5, 0));
}

TEST_CASE("findRow matches the cell text from the start row, whole or anywhere, with or without case") {
  Mounted m;
  CHECK(m.table.findRow(0, 0, "brest", false, false) == 2);
  CHECK(m.table.findRow(0, 0, "brest", false, true) == -1);
  CHECK(m.table.findRow(0, 0, "havre", false, false) == -1);
  CHECK(m.table.findRow(0, 0, "havre", true, false) == 0);
  CHECK(m.table.findRow(0, 1, "havre", true, false) == -1);  // Le Havre is before the start row
}

TEST_CASE("drawing: highlight of the current row, grid lines of palette colour 17") {
  Mounted m;
  m.table.selectRow(2, false);  // Brest: shown second
  wtest::Canvas canvas(300, 200, RGB(1, 2, 3));
  m.table.paint(canvas.dc());
  const int h = m.table.getRowHeight();
  const RECT shown = m.table.getCellRect(0, 2);
  CHECK(canvas.countIn(GetSysColor(COLOR_HIGHLIGHT), shown) > 0);
  CHECK(canvas.countIn(GetSysColor(COLOR_HIGHLIGHT), m.table.getCellRect(0, 1)) == 0);
  CHECK(canvas.at(50, h * 3 - 1) == toolkit::Palette::colour(17));  // bottom grid line of a row
  CHECK(canvas.countIn(RGB(1, 2, 3), RECT{0, 0, 300, 200}) == 0);  // the whole client area is drawn
}

TEST_CASE("hidden rows and multiple selection need their style bits") {
  Mounted m;
  m.table.addTableStyle(Table::kStyleMultiSelect | Table::kStyleWholeRow);
  m.click(0);
  m.click(2, MK_SHIFT);
  CHECK(m.table.selectedRows() == std::set<int>{1, 2, 0});  // Anvers, Brest, Le Havre
  m.click(0, MK_CONTROL);
  CHECK(m.table.selectedRows() == std::set<int>{2, 0});

  m.table.setRowVisible(1, false);
  CHECK(m.table.isRowVisible(1));  // ignored without the style
  m.table.addTableStyle(Table::kStyleHidden);
  m.table.setRowVisible(1, false);
  CHECK_FALSE(m.table.isRowVisible(1));
}

TEST_CASE("each edit sets its own length limit: a number edit's 10 characters never cut a later text") {
  Mounted m(true);
  const int depth = m.table.addColumn("depth", "Depth", 3, 2, nullptr, true);
  m.table.setCellText(0, 1, "Anvers (Antwerpen)");
  REQUIRE(m.table.beginEdit(0, depth));
  toolkit::cXEdit2* editor = m.table.editor();
  CHECK(editor->getMaxLength() == 10);
  m.press(VK_ESCAPE);

  REQUIRE(m.table.beginEdit(1, 0));
  CHECK(editor->getMaxLength() == 0);
  CHECK(editor->getText() == "Anvers (Antwerpen)");
  m.press(VK_END);
  wtest::typeChar(editor->getHandle(), '!');
  m.press(VK_RETURN);
  CHECK(m.table.getCellText(1, 0) == "Anvers (Antwerpen)!");

  // A column's own limit replaces the kind's.
  m.table.setColumnMaxLength(0, 6);
  m.table.setColumnMaxLength(depth, 12);
  CHECK(m.table.getColumnMaxLength(0) == 6);
  REQUIRE(m.table.beginEdit(2, 0));
  CHECK(editor->getMaxLength() == 6);
  m.press(VK_ESCAPE);
  REQUIRE(m.table.beginEdit(2, depth));
  CHECK(editor->getMaxLength() == 12);
  m.press(VK_ESCAPE);
  m.table.setColumnMaxLength(depth, 0);  // back to the kind's
  REQUIRE(m.table.beginEdit(2, depth));
  CHECK(editor->getMaxLength() == 10);
  m.press(VK_ESCAPE);
}

TEST_CASE("an edit left unchanged stores nothing: numbers keep their decimals, coordinates their values") {
  Mounted m(true);
  const int depth = m.table.addColumn("depth", "Depth", 3, 2, nullptr, true);
  const int latitude = m.table.addColumn("lat", "Latitude", 6, 0, nullptr, true);
  m.table.setCellDouble(depth, 0, 3.14159);
  m.table.setCellDouble(latitude, 0, 47.1234567);
  m.table.setCellDouble(latitude, 1, 95.0);  // beyond the pole: the editor shows 90
  const struct {
    int row, column;
    double value;
  } cells[] = {{0, depth, 3.14159}, {0, latitude, 47.1234567}, {1, latitude, 95.0}};
  for (const auto& cell : cells) {
    INFO("column ", cell.column, " row ", cell.row);
    REQUIRE(m.table.beginEdit(cell.row, cell.column));
    m.press(VK_RETURN);
    CHECK_FALSE(m.table.isEditing());
    CHECK(m.table.getCellDouble(cell.column, cell.row) == cell.value);
  }
  // A changed text is stored as read.
  REQUIRE(m.table.beginEdit(0, depth));
  CHECK(m.table.editor()->getText() == "3.1416");
  wtest::typeChar(m.table.editor()->getHandle(), '4');
  m.press(VK_RETURN);
  CHECK(m.table.getCellDouble(depth, 0) == doctest::Approx(4.1416));
}

TEST_CASE("while editing only Esc stays with the table; Enter, Page Up/Down and Up/Down end the edit and go on up") {
  Mounted m(true);
  m.click(1);  // Brest (stored row 2): shown second, now being edited
  REQUIRE(m.table.isEditing());
  m.seen.clear();
  m.press(VK_ESCAPE);
  CHECK_FALSE(m.table.isEditing());
  CHECK_FALSE(m.reached(VK_ESCAPE));
  CHECK(GetFocus() == m.table.getHandle());

  // key, stored row current afterwards, key-driven notifications to the owner
  const struct {
    int key, row, notified;
  } steps[] = {{VK_RETURN, 2, 0}, {VK_PRIOR, 2, 1}, {VK_NEXT, 2, 1}, {VK_UP, 1, 1}, {VK_DOWN, 2, 1}};
  for (const auto& step : steps) {
    INFO("key ", step.key);
    REQUIRE(m.table.beginEdit(m.table.getCurrentRow(), 0));
    m.seen.clear();
    m.press(step.key);
    CHECK_FALSE(m.table.isEditing());
    CHECK(m.reached(step.key));
    CHECK(m.table.getCurrentRow() == step.row);
    CHECK(m.selections() == step.notified);
    CHECK(GetFocus() == m.table.getHandle());
  }
}
