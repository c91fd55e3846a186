// The table widget: refusal, search, in-place editing, drawing, style bits. Clicks, keys
// and row data through the shown order are the port list suite's (TidesPortList).
#include <doctest/doctest.h>

#include "tests/wine/common/AccessibleReader.h"
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

namespace {

// A table of a wide text column that records the layout events it hears and gives
// each row a height of its own from them.
struct WideMounted : wtest::MountedPanel {
  Table table;
  std::vector<int> widths;  // client widths of the layout events, in order
  std::vector<int> heights;

  WideMounted() {
    add(&table, "table");
    table.setBounds(0, 0, 300, 200, true, true);
    table.addColumn("text", "Text", 9, 0, nullptr, false);
  }
  int dispatchEvent(toolkit::ToolkitEvent& event) override {
    if (event.source == &table && event.id == Table::kEventLayoutRows) {
      widths.push_back(static_cast<int>(event.params[0]));
      for (int row = 0; row < table.getRowCount() && row < static_cast<int>(heights.size()); ++row)
        table.setRowHeight(row, heights[row]);
      return 1;
    }
    return RecordingPanel::dispatchEvent(event);
  }
};

}  // namespace

TEST_CASE("wide text cells keep texts in any script for clients; text cells go through the code page") {
  WideMounted m;
  const std::wstring greek = L"\x039B\x03B9\x03BC\x03AC\x03BD\x03B9";  // a harbour in Greek
  const std::wstring arabic = L"\x0645\x064A\x0646\x0627\x0621";
  REQUIRE(m.table.appendRowText(0, nullptr, 0) == 0);
  CHECK(m.table.setCellWideText(0, 0, greek));
  REQUIRE(m.table.appendRowText(0, "Brest", 1) == 1);
  CHECK(m.table.getCellWideText(0, 0) == greek);
  CHECK(m.table.getCellWideText(1, 0) == L"Brest");
  CHECK(m.table.getCellText(1, 0) == "Brest");
  CHECK(m.table.setCellWideText(0, 1, arabic));
  // Clients read the rows as stored.
  CoInitialize(nullptr);
  br::test::AccessibleReader reader(m.table.getHandle());
  REQUIRE(reader.get() != nullptr);
  CHECK(reader.ChildNames() == std::vector<std::wstring>{greek, arabic});
  // A row its owner names gives its cells as its value, as stored too.
  m.table.setRowNamer([](int row) { return row == 0 ? std::string("Harbour") : std::string(); });
  CHECK(reader.Name(1) == L"Harbour");
  CHECK(reader.Value(1) == greek);
  CHECK(reader.Name(2) == arabic);
  m.table.setRowNamer(nullptr);
  // A narrow text column takes a wide text through the ANSI code page: letters it lacks are lost.
  m.table.addColumn("narrow", "Narrow", 1, 0, nullptr, false);
  CHECK(m.table.setCellWideText(1, 0, L"Brest"));
  CHECK(m.table.getCellWideText(0, 1) == L"Brest");
  CHECK(m.table.setCellWideText(1, 1, arabic));
  CHECK(m.table.getCellWideText(1, 1) != arabic);
}

TEST_CASE("rows of their own heights: cell rectangles, hit tests, scrolling and the layout event") {
  WideMounted m;
  for (int row = 0; row < 6; ++row) m.table.appendRowText(0, "row", row);
  const int h = m.table.getRowHeight();
  m.heights = {h, 4 * h, h, 3 * h, h, 2 * h};
  wtest::Canvas canvas(300, 200, RGB(1, 2, 3));
  m.table.paint(canvas.dc());
  // The first paint announces the client width (again once the rows have brought the
  // scroll bar); the owner's heights hold from then on.
  REQUIRE(!m.widths.empty());
  CHECK(m.widths.back() == m.table.getClientRect().right);
  const std::size_t announced = m.widths.size();
  CHECK(m.table.getCellRect(0, 0).top == h);
  CHECK(m.table.getCellRect(0, 1).top == 2 * h);
  CHECK(m.table.getCellRect(0, 1).bottom == 6 * h);
  CHECK(m.table.getCellRect(0, 2).top == 6 * h);
  CHECK(m.table.getCellRect(-1, 3).bottom == 10 * h);
  int row = -1, column = -1;
  CHECK((m.table.hitTest(10, 4 * h, row, column) && row == 1 && column == 0));
  CHECK((m.table.hitTest(10, 6 * h + 1, row, column) && row == 2));
  CHECK((m.table.hitTest(10, 8 * h, row, column) && row == 3));
  // A second paint at the same width announces nothing.
  m.table.paint(canvas.dc());
  CHECK(m.widths.size() == announced);
  // Selecting the last row scrolls until it is the last one shown whole.
  const int space = static_cast<int>(m.table.getClientRect().bottom) - h;
  REQUIRE(space < 12 * h);  // not every row fits
  REQUIRE(m.table.selectRow(5, false));
  const RECT last = m.table.getCellRect(-1, 5);
  CHECK(last.bottom <= m.table.getClientRect().bottom);
  CHECK(m.table.getTopRow() > 0);
  // A row above the top row lies above the header.
  CHECK(m.table.getCellRect(-1, 0).top < h);
  // Height 0 gives the row back the table's height.
  m.table.setRowHeight(1, 0);
  CHECK(m.table.getRowHeightOf(1) == h);
  m.table.removeAllRows();
  m.table.appendRowText(0, "again", 0);
  CHECK(m.table.getRowHeightOf(0) == h);
}
