// The lights panel standing alone in a host window, filled from scenes written here and
// from the sample harbour scene: which lights make rows, the used columns with their
// captions and widths (measured here with the list's font), the rows as an
// accessibility client reads them, and the chart abbreviation as each row's name and
// hover text.
#include <doctest/doctest.h>

#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "inspector/panels/cLightsViewPanel.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/inspector/panels/panel_test_support.h"
#include "toolkit/base/class_records.h"
#include "toolkit/widgets/Tooltip.h"

using namespace br;
using br::inspector::cLightsViewPanel;
using br::test::MountedPanel;
using br::test::Names;
using br::test::ScratchScene;

namespace {

// A lit beacon with two sectors, a light standing alone, a buoy without light, a
// lighthouse whose light is gathered with it in an aggregation, and a light of the
// host's own kind.
const char* const kScene = R"json({
  "format": "chartscene 1",
  "databases": [
    {"name": "TEST", "kind": "chart", "datasets": [{"id": "LIGHTS01", "objects": [
      {"name": "beacon", "class": "BCNLAT", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Beacon"},
       "members": ["white-sector", "red-sector"]},
      {"name": "white-sector", "class": "LIGHTS", "point": [48.3, -4.5],
       "attributes": {"LITCHR": 2, "SIGGRP": "(2)", "COLOUR": [1], "SIGPER": 6.0, "HEIGHT": 12.0, "VALNMR": 5.0,
                      "SECTR1": 50.0, "SECTR2": 70.5}},
      {"name": "red-sector", "class": "LIGHTS", "point": [48.3, -4.5],
       "attributes": {"LITCHR": 2, "SIGGRP": "(2)", "COLOUR": [3], "SIGPER": 6.0, "HEIGHT": 12.0, "VALNMR": 3.0,
                      "SECTR1": 70.5, "SECTR2": 252.0, "INFORM": "Obscured|by the pier"}},
      {"name": "lone", "class": "LIGHTS", "point": [48.3, -4.5],
       "attributes": {"LITCHR": 7, "COLOUR": [1, 3, 4], "SIGPER": 4.0}},
      {"name": "buoy", "class": "BOYLAT", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Buoy"}},
      {"name": "tower", "class": "LNDMRK", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Tower"}},
      {"name": "tower-light", "class": "LIGHTS", "point": [48.3, -4.5],
       "attributes": {"LITCHR": 1, "COLOUR": [3], "HEIGHT": 8.5}},
      {"name": "tower-group", "class": "C_AGGR", "primitive": "none", "members": ["tower", "tower-light"]}
    ]}]},
    {"name": "MINE", "kind": "user", "datasets": [{"id": "MINE01", "objects": [
      {"name": "own-light", "class": "LIGHTS", "point": [48.3, -4.5], "attributes": {"LITCHR": 2}}
    ]}]}
  ]
})json";

const std::wstring kDeg = L"\u00B0";

// ANSI text as the suites compare it; the abbreviations hold ASCII and the degree sign.
std::wstring Wide(const std::string& text) {
  std::wstring out;
  for (unsigned char c : text) out += static_cast<wchar_t>(c);
  return out;
}

// The widths the list should have, measured here with the list's font: caption or widest
// cell (" - " for an empty used one), 20 more, then the spare room shared out.
std::array<int, cLightsViewPanel::kColumnCount> ExpectedWidths(const cLightsViewPanel& panel) {
  std::array<int, cLightsViewPanel::kColumnCount> widths{};
  HDC dc = GetDC(nullptr);
  HFONT font = panel.table().getFont();
  if (font == nullptr) font = static_cast<HFONT>(GetStockObject(DEFAULT_GUI_FONT));
  HGDIOBJ old = SelectObject(dc, font);
  const auto extent = [&](const std::string& text) {
    SIZE size{};
    if (!text.empty()) GetTextExtentPoint32A(dc, text.c_str(), static_cast<int>(text.size()), &size);
    return static_cast<int>(size.cx);
  };
  for (int column = 1; column <= 12; ++column) {
    int width = extent(panel.GetColumnName(column - 1));
    for (int row = 0; row < panel.RowCount(); ++row) {
      std::string cell = panel.CellText(row, column);
      if (cell.empty() && panel.IsColumnUsed(column)) cell = " - ";
      width = std::max(width, extent(cell));
    }
    widths[column] = width == 0 ? 0 : width + 20;
  }
  SelectObject(dc, old);
  ReleaseDC(nullptr, dc);
  const RECT client = panel.table().getClientRect();
  int sum = 0;
  int sharing = 0;
  for (int column = 1; column <= 12; ++column) {
    if (!panel.IsColumnUsed(column)) continue;
    sum += widths[column];
    sharing += widths[column] != 0;
  }
  if (client.right - client.left > sum && sharing > 0) {
    const double share = static_cast<double>(client.right - client.left - sum) / sharing;
    for (int column = 1; column <= 12; ++column) {
      if (panel.IsColumnUsed(column) && widths[column] != 0) widths[column] = static_cast<int>(widths[column] + share);
    }
  }
  return widths;
}

// The list's columns as (name, caption, width).
struct ListColumn {
  std::string name;
  std::string caption;
  int width;
  bool operator==(const ListColumn& other) const {
    return name == other.name && caption == other.caption && width == other.width;
  }
};

std::vector<ListColumn> ListColumns(const cLightsViewPanel& panel) {
  std::vector<ListColumn> columns;
  const toolkit::Table& table = panel.table();
  for (int column = 0; column < table.getColumnCount(); ++column) {
    columns.push_back({table.getColumnName(column), table.getColumnAlias(column), table.getColumnWidth(column)});
  }
  return columns;
}

std::vector<ListColumn> ExpectedColumns(const cLightsViewPanel& panel) {
  const auto widths = ExpectedWidths(panel);
  std::vector<ListColumn> columns;
  for (int column = 1; column <= 12; ++column) {
    if (panel.IsColumnUsed(column)) {
      columns.push_back({cLightsViewPanel::ColumnAcronym(column), panel.GetColumnName(column - 1), widths[column]});
    }
  }
  return columns;
}

std::vector<std::wstring> Values(const cLightsViewPanel& panel) {
  test::AccessibleReader reader(const_cast<cLightsViewPanel&>(panel).table().getHandle());
  REQUIRE(reader.get() != nullptr);
  std::vector<std::wstring> values;
  for (long child = 1; child <= reader.ChildCount(); ++child) values.push_back(reader.Value(child));
  return values;
}

}  // namespace

TEST_CASE("a lit beacon: one row per sector, the used columns only, captions and widths for the list's font") {
  MountedPanel<cLightsViewPanel> m;
  ScratchScene scene(kScene);
  CHECK(toolkit::isKindOf(&m.panel, &toolkit::records::cLightsViewPanel));
  CHECK_FALSE(m.panel.HasContent());

  REQUIRE(m.panel.FillLights(scene.Object(L"beacon").Get()) == S_OK);
  CHECK(m.panel.HasContent());
  REQUIRE(m.panel.RowCount() == 2);

  // Used: every attribute some light has; not the unused status, category or periods.
  std::vector<std::string> used;
  for (int column = 1; column <= 12; ++column) {
    if (m.panel.IsColumnUsed(column)) used.push_back(cLightsViewPanel::ColumnAcronym(column));
  }
  CHECK(used == std::vector<std::string>{"LITCHR", "SIGGRP", "COLOUR", "SIGPER", "SECTOR", "HEIGHT", "VALNMR",
                                         "INFORM"});
  const std::vector<ListColumn> columns = ListColumns(m.panel);
  CHECK(columns == ExpectedColumns(m.panel));
  REQUIRE(columns.size() == 8);
  // The formatter names the attributes.
  CHECK(columns[0].caption == "Light characteristic");
  CHECK(columns[4].caption == "Sector limit one");

  // Rows read as a client reads them: named by the abbreviation, the cells as value.
  test::AccessibleReader reader(m.panel.table().getHandle());
  REQUIRE(reader.get() != nullptr);
  CHECK(reader.ChildNames() == Names{L"Fl(2)W.6s12m5M 050" + kDeg + L"-070.5" + kDeg,
                                     L"Fl(2)R.6s12m3M 070.5" + kDeg + L"-252" + kDeg});
  CHECK(Values(m.panel) == Names{L"flashing\t(2)\twhite\t6\t50 - 70.5\t12\t5\t - ",
                                 L"flashing\t(2)\tred\t6\t70.5 - 252\t12\t3\tObscured, by the pier"});
  CHECK(reader.Role(1) == ROLE_SYSTEM_LISTITEM);

  // Clearing empties the rows and the flags; the tab would hide.
  m.panel.Clear();
  CHECK_FALSE(m.panel.HasContent());
  CHECK_FALSE(m.panel.IsColumnUsed(1));
  CHECK(m.panel.table().getRowCount() == 0);
}

TEST_CASE("which lights: the light itself with its sectors, collections, and nothing for other objects") {
  MountedPanel<cLightsViewPanel> m;
  ScratchScene scene(kScene);

  // A sector selected: itself first, then the other sector of its beacon.
  REQUIRE(m.panel.FillLights(scene.Object(L"red-sector").Get()) == S_OK);
  REQUIRE(m.panel.RowCount() == 2);
  CHECK(m.panel.CellText(0, 3) == "red");
  CHECK(m.panel.CellText(1, 3) == "white");
  m.panel.Clear();

  // A light alone: one row, only its own columns.
  REQUIRE(m.panel.FillLights(scene.Object(L"lone").Get()) == S_OK);
  CHECK(m.panel.RowCount() == 1);
  CHECK(m.Rows() == Names{L"Iso.WRG.4s"});
  CHECK(Values(m.panel) == Names{L"isophased\twhite, red, green\t4"});
  CHECK(ListColumns(m.panel) == ExpectedColumns(m.panel));
  m.panel.Clear();

  // A lighthouse reaches its light through the aggregation that gathers them.
  REQUIRE(m.panel.FillLights(scene.Object(L"tower").Get()) == S_OK);
  CHECK(m.Rows() == Names{L"F.R8.5m"});
  m.panel.Clear();

  // No light: no row, the tab stays hidden; a light of another kind is not a chart light.
  CHECK(m.panel.FillLights(scene.Object(L"buoy").Get()) == S_FALSE);
  CHECK_FALSE(m.panel.HasContent());
  CHECK(m.panel.FillLights(scene.Object(L"own-light").Get()) == S_FALSE);
  CHECK_FALSE(m.panel.HasContent());
  CHECK(m.panel.FillLights(nullptr) == E_INVALIDARG);
  CHECK(m.panel.table().getRowCount() == 0);
}

TEST_CASE("column names: index i names column i + 1, the defaults without the formatter, nothing outside") {
  MountedPanel<cLightsViewPanel> m;
  ScratchScene scene(kScene);
  test::SceneProbe probe;
  CHECK(m.panel.GetColumnName(0) == "Light characteristic");
  CHECK(m.panel.GetColumnName(11) == "Information");
  CHECK(m.panel.GetColumnName(-1).empty());
  CHECK(m.panel.GetColumnName(12).empty());

  probe.SetFault("IObjectFormatter.GetAttributeName", E_FAIL);
  const char* const defaults[] = {"Characteristic", "Signal Group", "Colour", "Signal Period",
                                  "Sector",         "Height",       "Range",  "Category",
                                  "Status",         "PERSTA",       "PEREND", "Inform"};
  for (int index = 0; index < 12; ++index) {
    INFO(index);
    CHECK(m.panel.GetColumnName(index) == defaults[index]);
  }
  // The list takes the default captions too, and measures them.
  REQUIRE(m.panel.FillLights(scene.Object(L"lone").Get()) == S_OK);
  CHECK(ListColumns(m.panel) == ExpectedColumns(m.panel));
  CHECK(ListColumns(m.panel).front().caption == "Characteristic");
  probe.ClearFaults();
}

TEST_CASE("widths follow the list: a narrow list shares nothing, a wider one shares its spare room") {
  MountedPanel<cLightsViewPanel> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillLights(scene.Object(L"beacon").Get()) == S_OK);

  m.panel.setBounds(0, 0, 120, 200, true, true);
  m.panel.doLayout();
  const std::vector<ListColumn> narrow = ListColumns(m.panel);
  CHECK(narrow == ExpectedColumns(m.panel));
  int sum = 0;
  for (const ListColumn& column : narrow) sum += column.width;
  CHECK(sum > 120);  // no spare room: caption or cell plus the margin only

  m.panel.setBounds(0, 0, 900, 200, true, true);
  m.panel.doLayout();
  const std::vector<ListColumn> wide = ListColumns(m.panel);
  CHECK(wide == ExpectedColumns(m.panel));
  REQUIRE(wide.size() == narrow.size());
  for (std::size_t i = 0; i < wide.size(); ++i) CHECK(wide[i].width > narrow[i].width);
  // The whole client width is used, less what truncating each share loses.
  int total = 0;
  for (const ListColumn& column : wide) total += column.width;
  const RECT client = m.panel.table().getClientRect();
  CHECK(total <= client.right - client.left);
  CHECK(total > client.right - client.left - static_cast<int>(wide.size()));

  // A light without any of the columns' attributes: a row that shows nothing, no column
  // with a width to share with, and no failure.
  const char* const bare = R"({"format": "chartscene 1", "databases": [{"name": "T", "kind": "chart",
    "datasets": [{"id": "BARE01", "objects": [{"name": "bare", "class": "LIGHTS", "point": [48.3, -4.5]}]}]}]})";
  ScratchScene empty(bare);
  m.panel.Clear();
  CHECK(m.panel.FillLights(empty.Object(L"bare").Get()) == S_OK);
  CHECK(m.panel.HasContent());
  CHECK(m.panel.table().getRowCount() == 0);
  for (int column = 1; column <= 12; ++column) CHECK_FALSE(m.panel.IsColumnUsed(column));
}

TEST_CASE("the sample harbour's lights and their chart abbreviations") {
  MountedPanel<cLightsViewPanel> m;
  ScratchScene harbour(ScratchScene::SampleHarbour{});
  test::SceneProbe probe;
  const long objects = probe.Counter("live.Object");
  const long enumerators = probe.Counter("live.ObjectEnum");
  const long attributes = probe.Counter("live.Attribute");
  struct Case {
    const wchar_t* object;
    Names names;
  } cases[] = {
      {L"fillettes-beacon", {L"Fl.R.4s8m5M"}},
      {L"minou-lighthouse",
       {L"DirIso(2)W.6s30m19M 050" + kDeg + L"-070.5" + kDeg, L"Iso(2)R.6s30m11M 070.5" + kDeg + L"-252" + kDeg}},
      {L"portzic-lighthouse",
       {L"Oc(2)W.12s56m19M 219" + kDeg + L"-259" + kDeg, L"Oc(2)R.12s56m15M 259" + kDeg + L"-338" + kDeg,
        L"DirIso.WRG.4s32m13.5M"}},
      {L"coq-light", {L"Q(6)+LFl.W.15s10m5M"}},
  };
  for (const Case& c : cases) {
    INFO(test::Printable(c.object));
    m.panel.Clear();
    REQUIRE(m.panel.FillLights(harbour.Object(c.object).Get()) == S_OK);
    CHECK(m.Rows() == c.names);
    CHECK(ListColumns(m.panel) == ExpectedColumns(m.panel));
    for (int row = 0; row < m.panel.RowCount(); ++row) CHECK(Wide(m.panel.Abbreviation(row)) == c.names[row]);
  }
  // Objects without lights leave the tab hidden.
  m.panel.Clear();
  CHECK(m.panel.FillLights(harbour.Object(L"kerviniou-buoy").Get()) == S_FALSE);
  CHECK(m.panel.FillLights(harbour.Object(L"goulet-stream").Get()) == S_FALSE);
  CHECK_FALSE(m.panel.HasContent());
  // Everything the panel took from the host was given back.
  CHECK(probe.Counter("live.Object") == objects);
  CHECK(probe.Counter("live.ObjectEnum") == enumerators);
  CHECK(probe.Counter("live.Attribute") == attributes);
}

TEST_CASE("hovering a light's row shows its abbreviation") {
  MountedPanel<cLightsViewPanel> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillLights(scene.Object(L"beacon").Get()) == S_OK);
  HWND list = m.panel.table().getHandle();
  toolkit::Tooltip* tip = toolkit::Tooltip::of(m.panel.table());
  REQUIRE(tip != nullptr);

  const auto hoverRow = [&](int row) {
    const RECT cell = m.panel.table().getCellRect(-1, row);
    POINT at{(cell.left + cell.right) / 2, (cell.top + cell.bottom) / 2};
    ClientToScreen(list, &at);
    SetCursorPos(at.x, at.y);
    NMHDR header{};
    header.hwndFrom = tip->window();
    header.idFrom = toolkit::Tooltip::kNotifyId;
    header.code = toolkit::Tooltip::kNotifyCode;
    SendMessageA(list, WM_NOTIFY, toolkit::Tooltip::kNotifyId, reinterpret_cast<LPARAM>(&header));
    return tip->text();
  };
  POINT probe{};
  SetCursorPos(300, 300);
  GetCursorPos(&probe);
  if (probe.x != 300 || probe.y != 300) {
    MESSAGE("the cursor cannot be moved here; hover texts not checked");
    return;
  }
  CHECK(hoverRow(0) == m.panel.Abbreviation(0));
  CHECK(hoverRow(1) == "Fl(2)R.6s12m3M 070.5\xB0-252\xB0");
}
