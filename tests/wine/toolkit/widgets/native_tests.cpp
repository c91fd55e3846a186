// TabContainer: the native tab strip, its pages and its notifications as toolkit events.
#include <doctest/doctest.h>

#include <windows.h>
#include <commctrl.h>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/core/Panel.h"
#include "toolkit/layout/GridLayout.h"
#include "toolkit/widgets/TabContainer.h"

using namespace toolkit;
using namespace wtest;

namespace {

LRESULT notifyFrom(HWND to, HWND from, UINT code) {
  NMHDR header{};
  header.hwndFrom = from;
  header.idFrom = static_cast<UINT_PTR>(GetDlgCtrlID(from));
  header.code = code;
  return SendMessageA(to, WM_NOTIFY, header.idFrom, reinterpret_cast<LPARAM>(&header));
}

}  // namespace

TEST_CASE("tab container: selectPage rules and the strip's own selection change") {
  MountedPanel panel;
  TabContainer tabs;
  Panel pages[3];
  panel.add(&tabs);
  tabs.setBounds(0, 0, 300, 200, true, true);
  const char* names[] = {"A", "B", "C"};
  for (int i = 0; i < 3; ++i) tabs.add(&pages[i], names[i]);
  tabs.doLayout();
  CHECK_FALSE(IsWindowVisible(pages[1].getHandle()));

  CHECK_FALSE(tabs.selectPage(0, true));   // already selected
  CHECK_FALSE(tabs.selectPage(3, true));   // no such child
  CHECK_FALSE(tabs.selectPage(-2, true));  // only -1 stands for none
  CHECK(tabs.selectPage(2, true));
  CHECK(SendMessageA(tabs.tabStrip(), TCM_GETCURSEL, 0, 0) == 2);
  CHECK(IsWindowVisible(pages[2].getHandle()));
  CHECK_FALSE(IsWindowVisible(pages[0].getHandle()));

  // The strip's own TCN_SELCHANGE (one notification) selects and is passed on to the owners.
  panel.seen.clear();
  SendMessageA(tabs.tabStrip(), TCM_SETCURSEL, 1, 0);
  notifyFrom(tabs.peer()->hwnd(), tabs.tabStrip(), TCN_SELCHANGE);
  CHECK(tabs.getSelectedPage() == 1);
  CHECK(IsWindowVisible(pages[1].getHandle()));
  CHECK(panel.count(kEventNotify) == 1);

  CHECK(tabs.removeComponent(&pages[0], false));  // the tabs follow the children
  CHECK(tabs.getTabCount() == 2);
  CHECK(tabs.getTabText(0) == "B");
  tabs.setLayout(std::make_unique<GridLayout>(1, 1, 0, 0, nullptr, 0));
  CHECK_FALSE(tabs.selectPage(0, true));  // not a tab layout
}
