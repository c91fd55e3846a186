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
