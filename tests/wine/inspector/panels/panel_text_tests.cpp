// Texts in any script in the inspector's text panels: national names read by clients
// exactly as the scene holds them and drawn as the text engine draws them (never as the
// '?' of the ANSI code page), and rows as high as their wrapped text.
#include <doctest/doctest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "inspector/panels/cAttrViewPanel_Tbl.h"
#include "inspector/panels/cP_SHPanel.h"
#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/inspector/panels/panel_test_support.h"
#include "toolkit/text/TextEngine.h"

using br::inspector::cAttrViewPanel_Tbl;
using br::inspector::cP_SHPanel;
using br::test::MountedPanel;
using br::test::ScratchScene;

namespace {

// "Mina" in Arabic, "Tha Ruea" in Thai, "harbour information" in Chinese.
const std::wstring kArabic = L"\x0645\x064A\x0646\x0627\x0621 \x0627\x0644\x0635\x064A\x062F";
const std::wstring kThai = L"\x0E17\x0E48\x0E32\x0E40\x0E23\x0E37\x0E2D";
const std::wstring kChinese = L"\x6E2F\x53E3\x8D44\x6599";

const char* const kScene = R"({
  "format": "chartscene 1",
  "databases": [
    {"name": "TEST", "kind": "chart", "datasets": [{"id": "TESTDS01", "objects": [
      {"name": "arabic", "class": "BOYLAT", "point": [29.9, 32.5],
       "attributes": {"OBJNAM": "Port", "NOBJNM": "\u0645\u064A\u0646\u0627\u0621 \u0627\u0644\u0635\u064A\u062F"}},
      {"name": "thai", "class": "BOYLAT", "point": [13.6, 100.5],
       "attributes": {"NOBJNM": "\u0E17\u0E48\u0E32\u0E40\u0E23\u0E37\u0E2D",
                      "NINFOM": "\u6E2F\u53E3\u8D44\u6599"}},
      {"name": "lines", "class": "BOYLAT", "point": [48.3, -4.5],
       "attributes": {"OBJNAM": "Buoy", "INFORM": "Pass west|keep clear", "SORIND": "one line"}},
      {"name": "long", "class": "BOYLAT", "point": [48.3, -4.5],
       "attributes": {"INFORM": "Keep well clear of the wreck to the west of the fairway at all states of the tide", "OBJNAM": "Wreck"}}
    ]}]}
  ]
})";

int IndexOf(const std::vector<std::wstring>& rows, const std::wstring& row) {
  const auto it = std::find(rows.begin(), rows.end(), row);
  return it == rows.end() ? -1 : static_cast<int>(it - rows.begin());
}

// What the code page makes of a text: Arabic, Thai and Chinese letters become '?'.
std::wstring ThroughAnsi(const std::wstring& text) {
  char narrow[256] = {};
  WideCharToMultiByte(CP_ACP, 0, text.c_str(), -1, narrow, sizeof narrow, nullptr, nullptr);
  wchar_t wide[256] = {};
  MultiByteToWideChar(CP_ACP, 0, narrow, -1, wide, 256);
  return wide;
}

// The text drawn by a text engine of its own in the panel's font, from `left`, `top`
// in a cell `area` (wrapped at the window's edge), onto the panel's background: what
// the row must look like.
struct Reference {
  wtest::Canvas canvas{500, 380, GetSysColor(COLOR_WINDOW)};
  Reference(HFONT font, const std::wstring& text, const RECT& area, int left, int top, LONG clientRight) {
    toolkit::TextEngine engine;
    REQUIRE(engine.setBaseFont(font));
    engine.selectFontSlot(0);
    const HDC dc = canvas.dc();
    const HGDIOBJ old = SelectObject(dc, font);
    TEXTMETRICW metrics{};
    GetTextMetricsW(dc, &metrics);
    SetBkMode(dc, TRANSPARENT);
    SetTextColor(dc, GetSysColor(COLOR_WINDOWTEXT));
    const RECT box{left, area.top, std::min(area.right, clientRight) - 4, area.bottom};
    int y = top;
    engine.drawParagraph(dc, text, y, box, 0, static_cast<int>(text.size()), metrics.tmHeight);
    SelectObject(dc, old);
  }
};

int InkIn(const wtest::Canvas& canvas, const RECT& area) {
  const COLORREF paper = GetSysColor(COLOR_WINDOW);
  int ink = 0;
  for (LONG y = area.top; y < area.bottom; ++y)
    for (LONG x = area.left; x < area.right; ++x) ink += canvas.at(x, y) != paper;
  return ink;
}

int DifferencesIn(const wtest::Canvas& a, const wtest::Canvas& b, const RECT& area) {
  int differences = 0;
  for (LONG y = area.top; y < area.bottom; ++y)
    for (LONG x = area.left; x < area.right; ++x) differences += a.at(x, y) != b.at(x, y);
  return differences;
}

// Height of a cell's text wrapped from `indent` in a cell `width` wide, line by line as
// the formatter broke it, measured by an engine of the test's own.
int WrappedHeight(HFONT font, const std::wstring& text, int width, int indent, int* lines = nullptr) {
  toolkit::TextEngine engine;
  REQUIRE(engine.setBaseFont(font));
  engine.selectFontSlot(0);
  engine.setMeasureOnly(true);
  const HDC dc = CreateCompatibleDC(nullptr);
  const HGDIOBJ old = SelectObject(dc, font);
  TEXTMETRICW metrics{};
  GetTextMetricsW(dc, &metrics);
  const RECT box{indent, 0, width - 4, 0};
  int y = 0;
  int count = 0;
  std::size_t start = 0;
  for (std::size_t i = 0; i <= text.size(); ++i) {
    if (i < text.size() && text[i] != L'\r') continue;
    engine.drawParagraph(dc, text, y, box, static_cast<int>(start), static_cast<int>(i - start), metrics.tmHeight);
    count += engine.lastLineCount();
    start = i + 1;
  }
  SelectObject(dc, old);
  DeleteDC(dc);
  if (lines) *lines = count;
  return y;
}

int Height(const RECT& r) { return static_cast<int>(r.bottom - r.top); }

}  // namespace

TEST_CASE("national names in Arabic, Thai and Chinese reach clients and the screen as they are") {
  MountedPanel<cP_SHPanel> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillObject(scene.Object(L"arabic").Get(), false, false) == S_OK);
  REQUIRE(m.panel.FillObject(scene.Object(L"thai").Get(), false, false) == S_OK);
  const std::vector<std::wstring> rows = m.Rows();
  CAPTURE(rows);
  wtest::Canvas canvas(500, 380, RGB(1, 2, 3));
  m.panel.table().paint(canvas.dc());
  for (const std::wstring& text : {kArabic, kThai, kChinese}) {
    CAPTURE(text);
    // The value row a client reads is the scene's UTF-16 text, unit for unit.
    const int row = IndexOf(rows, text);
    REQUIRE(row >= 0);
    CHECK(m.panel.RowType(row) == cP_SHPanel::kRowValue);
    REQUIRE(ThroughAnsi(text) != text);
    // Drawn as the engine draws the text, with ink, and not as the code page's '?'.
    const RECT cell = m.panel.table().getCellRect(1, row);
    const Reference drawn(m.panel.RowFont(), text, cell, cell.left + 60, cell.top + 2, m.panel.table().getClientRect().right);
    const Reference lost(m.panel.RowFont(), ThroughAnsi(text), cell, cell.left + 60, cell.top + 2, m.panel.table().getClientRect().right);
    CHECK(InkIn(canvas, cell) > 0);
    CHECK(DifferencesIn(canvas, drawn.canvas, cell) == 0);
    CHECK(DifferencesIn(canvas, lost.canvas, cell) > 0);
  }
}

TEST_CASE("attribute table: national names side by side with their attribute names, unchanged") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillObject(scene.Object(L"thai").Get(), false, false) == S_OK);
  const std::vector<std::wstring> rows = m.Rows();
  CAPTURE(rows);
  REQUIRE(rows.size() == 2);
  for (const std::wstring& text : {kThai, kChinese}) {
    const auto ends = std::count_if(rows.begin(), rows.end(), [&](const std::wstring& row) {
      return row.size() > text.size() && row.compare(row.size() - text.size(), text.size(), text) == 0 &&
             row[row.size() - text.size() - 1] == L'\t';
    });
    CHECK(ends == 1);
  }
  wtest::Canvas canvas(500, 380, RGB(1, 2, 3));
  m.panel.table().paint(canvas.dc());
  for (int row = 0; row < 2; ++row) {
    const std::wstring value = m.panel.table().getCellWideText(row, cAttrViewPanel_Tbl::kTextColumn);
    const RECT cell = m.panel.table().getCellRect(cAttrViewPanel_Tbl::kTextColumn, row);
    const Reference drawn(m.panel.RowFont(), value, cell, cell.left + 8, cell.top + 2, m.panel.table().getClientRect().right);
    CHECK(InkIn(canvas, cell) > 0);
    CHECK(DifferencesIn(canvas, drawn.canvas, cell) == 0);
  }
}

TEST_CASE("stacked rows: as high as their wrapped text, 4 more, 10 more for a heading, 5 more for the last") {
  MountedPanel<cP_SHPanel> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillObject(scene.Object(L"lines").Get(), true, false) == S_OK);
  REQUIRE(m.panel.FillObject(scene.Object(L"long").Get(), true, false) == S_OK);
  m.panel.setBounds(0, 0, 260, 380, true, true);
  m.panel.doLayout();
  wtest::Canvas canvas(500, 380, RGB(1, 2, 3));
  m.panel.table().paint(canvas.dc());
  const toolkit::Table& table = m.panel.table();
  // Texts wrap at the window's edge.
  const int width = std::min(table.getColumnWidth(1), static_cast<int>(table.getClientRect().right));
  const int rows = table.getRowCount();
  REQUIRE(rows >= 8);
  bool wrapped = false;
  for (int row = 0; row < rows; ++row) {
    const int type = m.panel.RowType(row);
    const int indent = type == cP_SHPanel::kRowHeading ? 15 : type == cP_SHPanel::kRowName ? 30 : 60;
    const std::wstring text = table.getCellWideText(row, 1);
    int lines = 0;
    const int expected = WrappedHeight(m.panel.RowFont(), text, width, indent, &lines) + 4 +
                         (type == cP_SHPanel::kRowHeading ? 10 : 0) + (row == rows - 1 ? 5 : 0);
    CAPTURE(row);
    CAPTURE(text);
    CHECK(Height(table.getCellRect(-1, row)) == expected);
    wrapped = wrapped || lines > 1;
  }
  // The long information does not fit one line of this panel.
  CHECK(wrapped);
  // The rows follow the panel's width: wider, the long text takes fewer lines.
  int longRow = -1;
  for (int row = 0; row < rows; ++row) {
    if (table.getCellWideText(row, 1).rfind(L"Keep well clear", 0) == 0) longRow = row;
  }
  REQUIRE(longRow >= 0);
  const int narrow = Height(table.getCellRect(-1, longRow));
  m.panel.setBounds(0, 0, 500, 380, true, true);
  m.panel.doLayout();
  m.panel.table().paint(canvas.dc());
  CHECK(Height(table.getCellRect(-1, longRow)) < narrow);
}

TEST_CASE("attribute table: a value of two lines shows both, its row taller than a row of one") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillObject(scene.Object(L"lines").Get(), false, false) == S_OK);
  const std::vector<std::wstring> rows = m.Rows();
  CAPTURE(rows);
  const toolkit::Table& table = m.panel.table();
  int twoLines = -1;
  int oneLine = -1;
  for (int row = 0; row < table.getRowCount(); ++row) {
    const std::wstring value = table.getCellWideText(row, cAttrViewPanel_Tbl::kTextColumn);
    if (value == L"Pass west\rkeep clear") twoLines = row;
    if (value == L"Buoy") oneLine = row;
  }
  REQUIRE(twoLines >= 0);
  REQUIRE(oneLine >= 0);
  wtest::Canvas canvas(500, 380, RGB(1, 2, 3));
  m.panel.table().paint(canvas.dc());
  const int last = table.getRowCount() - 1;
  const auto expected = [&](int row) {
    int height = 0;
    for (int column : {cAttrViewPanel_Tbl::kNameColumn, cAttrViewPanel_Tbl::kTextColumn}) {
      height = std::max(height, WrappedHeight(m.panel.RowFont(), table.getCellWideText(row, column),
                                              std::min<int>(table.getCellRect(column, -1).right,
                                                            table.getClientRect().right) -
                                                  table.getCellRect(column, -1).left,
                                              8));
    }
    return height + 4 + (row == last ? 5 : 0);
  };
  CHECK(Height(table.getCellRect(-1, twoLines)) == expected(twoLines));
  CHECK(Height(table.getCellRect(-1, oneLine)) == expected(oneLine));
  CHECK(Height(table.getCellRect(-1, twoLines)) - (twoLines == last ? 5 : 0) >
        Height(table.getCellRect(-1, oneLine)) - (oneLine == last ? 5 : 0));
  // Both lines are drawn, one under the other: ink in the lower half of the row too.
  RECT lower = table.getCellRect(cAttrViewPanel_Tbl::kTextColumn, twoLines);
  lower.top = (lower.top + lower.bottom) / 2;
  CHECK(InkIn(canvas, lower) > 0);
}
