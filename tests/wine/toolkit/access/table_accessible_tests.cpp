// The table read through oleacc: one list item per shown row in the order shown, named
// by its visible cells; selection and focus as states, answers and WinEvents; rows
// picked by a client reach the owner as the user's picks do.
#include <doctest/doctest.h>

#include <windows.h>
#include <objbase.h>

#include <set>
#include <string>
#include <vector>

#include "tests/wine/common/AccessibleReader.h"
#include "tests/wine/common/widget_test_support.h"
#include "toolkit/table/Table.h"

using namespace toolkit;
using br::test::AccessibleReader;
using br::test::ChildId;
using br::test::WinEventLog;
using Names = std::vector<std::wstring>;

namespace {

struct Apartment {
  Apartment() { CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED); }
  ~Apartment() { CoUninitialize(); }
};

// Stations stored as Le Havre, Anvers, Brest, Zeebrugge (row data = stored row) with their
// ranges through a mask, shown by name.
struct Stations : wtest::MountedPanel {
  Apartment apartment;
  Table table;

  Stations() {
    add(&table, "table");
    table.setBounds(0, 0, 300, 200, true, true);
    table.addColumn("name", "Name", 1, 0, nullptr, false);
    table.addColumn("range", "Range", 3, 0, "%.1f m", false);
    const char* names[] = {"Le Havre", "Anvers", "Brest", "Zeebrugge"};
    const double ranges[] = {7.1, 5.2, 6.4, 4.3};
    for (int i = 0; i < 4; ++i) {
      table.appendRowText(0, names[i], i);
      table.setCellDouble(1, i, ranges[i]);
    }
    table.orderByColumn(0);
    seen.clear();
  }
  // Owner notifications as (code, stored row).
  std::vector<std::pair<int, int>> notices() const {
    std::vector<std::pair<int, int>> found;
    for (const wtest::Seen& s : seen) {
      if (s.id == kEventAction && s.source == &table) found.emplace_back(int(s.params[3]), int(s.params[0]));
    }
    return found;
  }
};

using Logged = std::vector<std::pair<DWORD, LONG>>;  // (event, child) on OBJID_CLIENT

Logged logged(WinEventLog& log, HWND window) {
  Logged found;
  for (const WinEventLog::Event& e : log.For(window)) {
    if (e.object == OBJID_CLIENT) found.emplace_back(e.event, e.child);
  }
  return found;
}

constexpr LONG kRowBase = STATE_SYSTEM_SELECTABLE | STATE_SYSTEM_FOCUSABLE;

}  // namespace

TEST_CASE("an owner's row names stand before the cells, which become the row's value") {
  Stations s;
  AccessibleReader list(s.table.getHandle());
  REQUIRE(list.get());
  CHECK(list.Value(1) == L"<failed>");  // rows named by their cells have no value
  // Stored rows 0 (Le Havre) and 2 (Brest) get names; the others keep their cells.
  s.table.setRowNamer([](int row) { return row == 0 ? std::string("LH") : row == 2 ? std::string("BR") : ""; });
  CHECK(list.ChildNames() == Names{L"Anvers\t5.2 m", L"BR", L"LH", L"Zeebrugge\t4.3 m"});
  CHECK(list.Value(2) == L"Brest\t6.4 m");
  CHECK(list.Value(3) == L"Le Havre\t7.1 m");
  CHECK(list.Value(1) == L"<failed>");
  s.table.setRowNamer(nullptr);
  CHECK(list.ChildNames()[1] == L"Brest\t6.4 m");
}

TEST_CASE("rows are list items named by their visible cells, in the order shown") {
  Stations s;
  AccessibleReader list(s.table.getHandle());
  REQUIRE(list.get());
  CHECK(list.Role() == ROLE_SYSTEM_LIST);
  CHECK(list.Role(1) == ROLE_SYSTEM_LISTITEM);
  CHECK(list.ChildCount() == 4);
  CHECK(list.ChildNames() == Names{L"Anvers\t5.2 m", L"Brest\t6.4 m", L"Le Havre\t7.1 m", L"Zeebrugge\t4.3 m"});

  // Hidden columns and rows are not read.
  s.table.addTableStyle(Table::kStyleHidden);
  s.table.setColumnVisible(1, false);
  s.table.setRowVisible(2, false);  // Brest
  CHECK(list.ChildCount() == 3);
  CHECK(list.ChildNames() == Names{L"Anvers", L"Le Havre", L"Zeebrugge"});
  s.table.setRowVisible(2, true);

  // Rows scrolled out of the window are off screen; their place follows the rows shown.
  const int h = s.table.getRowHeight();
  s.table.setBounds(0, 0, 300, h * 3, true, true);  // the header and two rows
  CHECK((list.State(2) & STATE_SYSTEM_OFFSCREEN) == 0);
  CHECK((list.State(3) & STATE_SYSTEM_OFFSCREEN) != 0);
  LONG x = 0, y = 0, w = 0, height = 0;
  REQUIRE(list.get()->accLocation(&x, &y, &w, &height, ChildId(2)) == S_OK);
  const RECT window = s.table.getWindowRect();
  CHECK(x == window.left);
  CHECK(y == window.top + 2 * h);
  CHECK(height == h);
  VARIANT hit;
  REQUIRE(list.get()->accHitTest(x + 5, y + h / 2, &hit) == S_OK);
  CHECK(hit.lVal == 2);
  REQUIRE(list.get()->accHitTest(x + 5, window.top + 2, &hit) == S_OK);  // the header
  CHECK(hit.lVal == CHILDID_SELF);

  VARIANT next;
  CHECK(list.get()->accNavigate(NAVDIR_FIRSTCHILD, ChildId(CHILDID_SELF), &next) == S_OK);
  CHECK(next.lVal == 1);
  CHECK(list.get()->accNavigate(NAVDIR_NEXT, ChildId(4), &next) == S_FALSE);
  CHECK(next.vt == VT_EMPTY);
  BSTR name = nullptr;
  CHECK(list.get()->get_accName(ChildId(5), &name) == E_INVALIDARG);
}

TEST_CASE("the selected and focused row: states, answers and announcements") {
  Stations s;
  HWND t = s.table.getHandle();
  AccessibleReader list(t);
  REQUIRE(list.get());
  WinEventLog log(EVENT_OBJECT_REORDER, EVENT_OBJECT_SELECTIONWITHIN);

  s.table.selectRow(2, false);  // Brest, shown second, without the focus
  CHECK(list.State(2) == (kRowBase | STATE_SYSTEM_SELECTED));
  CHECK(list.State(1) == kRowBase);
  CHECK(list.Selection() == std::vector<long>{2});
  CHECK(list.Focus() == -1);
  CHECK(logged(log, t) == Logged{{EVENT_OBJECT_SELECTION, 2}});

  SetFocus(t);
  CHECK(list.State(2) == (kRowBase | STATE_SYSTEM_SELECTED | STATE_SYSTEM_FOCUSED));
  CHECK(list.State() == (STATE_SYSTEM_FOCUSABLE | STATE_SYSTEM_FOCUSED));
  CHECK(list.Focus() == 2);
  const Logged focused = logged(log, t);
  REQUIRE_FALSE(focused.empty());
  CHECK(focused.back() == std::make_pair(DWORD(EVENT_OBJECT_FOCUS), LONG(2)));  // after the window's own

  log.Clear();
  wtest::key(t, VK_DOWN);  // Le Havre
  CHECK(logged(log, t) == Logged{{EVENT_OBJECT_FOCUS, 3}, {EVENT_OBJECT_SELECTION, 3}});
  CHECK(list.Selection() == std::vector<long>{3});
  wtest::key(t, VK_DOWN);  // Zeebrugge, the last
  log.Clear();
  wtest::key(t, VK_DOWN);  // stays: nothing announced
  CHECK(logged(log, t).empty());

  // Rows gone: the list says its children changed.
  s.table.removeAllRows();
  CHECK(logged(log, t) == Logged{{EVENT_OBJECT_REORDER, CHILDID_SELF}});
  CHECK(list.ChildCount() == 0);
  CHECK(list.Selection().empty());
}

TEST_CASE("a client picks a row as the user would; refused forms change nothing") {
  Stations s;
  AccessibleReader list(s.table.getHandle());
  REQUIRE(list.get());
  s.table.selectRow(1, false);  // Anvers, shown first

  CHECK(list.get()->accSelect(SELFLAG_ADDSELECTION, ChildId(3)) == E_INVALIDARG);
  CHECK(list.get()->accSelect(SELFLAG_TAKESELECTION, ChildId(5)) == E_INVALIDARG);
  CHECK(list.get()->accSelect(SELFLAG_TAKESELECTION, ChildId(CHILDID_SELF)) == E_INVALIDARG);
  CHECK(s.table.getCurrentRow() == 1);
  CHECK(s.notices().empty());

  CHECK(list.get()->accSelect(SELFLAG_TAKEFOCUS | SELFLAG_TAKESELECTION, ChildId(4)) == S_OK);
  CHECK(s.table.getCurrentRow() == 3);  // Zeebrugge
  CHECK(GetFocus() == s.table.getHandle());
  CHECK(s.notices() == std::vector<std::pair<int, int>>{{Table::kNotifySelect, 3}});
  CHECK(list.State(4) == (kRowBase | STATE_SYSTEM_SELECTED | STATE_SYSTEM_FOCUSED));
}

TEST_CASE("several selected rows are handed out through an enumerator") {
  Stations s;
  s.table.addTableStyle(Table::kStyleMultiSelect | Table::kStyleWholeRow);
  AccessibleReader list(s.table.getHandle());
  REQUIRE(list.get());
  const int h = s.table.getRowHeight();
  auto click = [&](int shown, WPARAM keys) {
    wtest::press(s.table.getHandle(), WM_LBUTTONDOWN, 20, h * (shown + 1) + h / 2, MK_LBUTTON | keys);
  };
  click(0, 0);
  click(2, MK_SHIFT);  // Anvers to Le Havre
  CHECK(list.Selection() == std::vector<long>{1, 2, 3});
  CHECK((list.State(4) & STATE_SYSTEM_SELECTED) == 0);
  CHECK((list.State(1) & STATE_SYSTEM_MULTISELECTABLE) != 0);
  // Picking one row out of several is not offered.
  CHECK(list.get()->accSelect(SELFLAG_TAKESELECTION, ChildId(4)) == E_INVALIDARG);
  CHECK(list.Selection() == std::vector<long>{1, 2, 3});
}
