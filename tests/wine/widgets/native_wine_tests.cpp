// ContainedWindow (tree view), Choice (combo box) and TabContainer (tab strip):
// native children, their styles, and their notifications as toolkit events.
#include <doctest/doctest.h>

#include <windows.h>
#include <commctrl.h>

#include "WidgetTestSupport.h"
#include "frame/errors/cErr.h"
#include "toolkit/base/ClassRecords.h"
#include "toolkit/core/Panel.h"
#include "toolkit/layout/GridLayout.h"
#include "toolkit/layout/TabLayout.h"
#include "toolkit/widgets/Choice.h"
#include "toolkit/widgets/ContainedWindow.h"
#include "toolkit/widgets/TabContainer.h"
#include "toolkit/widgets/cXEdit2.h"
#include "toolkit/widgets/support/MeasuringDC.h"

using namespace toolkit;
using namespace wtest;

namespace {

HTREEITEM addItem(HWND tree, const char* text, LPARAM data) {
  TVINSERTSTRUCTA insert{};
  insert.hParent = TVI_ROOT;
  insert.hInsertAfter = TVI_LAST;
  insert.item.mask = TVIF_TEXT | TVIF_PARAM;
  insert.item.pszText = const_cast<char*>(text);
  insert.item.lParam = data;
  return reinterpret_cast<HTREEITEM>(SendMessageA(tree, TVM_INSERTITEMA, 0, reinterpret_cast<LPARAM>(&insert)));
}

LRESULT notifyFrom(HWND to, HWND from, UINT code) {
  NMHDR header{};
  header.hwndFrom = from;
  header.idFrom = static_cast<UINT_PTR>(GetDlgCtrlID(from));
  header.code = code;
  return SendMessageA(to, WM_NOTIFY, header.idFrom, reinterpret_cast<LPARAM>(&header));
}

}  // namespace

TEST_CASE("tree view: native child, style, parent font, size; notifications as events; repaint colours") {
  HostWindow host;
  RecordingPanel panel;
  panel.setFont("Arial", 12, true, false);
  mount(panel, host);
  ContainedWindow tree;
  panel.add(&tree);
  tree.setBounds(5, 5, 150, 120, true, true);

  HWND native = tree.getHandle();
  REQUIRE(native);
  HWND own = tree.peer()->hwnd();
  CHECK(native != own);
  CHECK(GetParent(native) == own);
  CHECK(windowClass(native) == "SysTreeView32");
  CHECK(reinterpret_cast<HFONT>(SendMessageA(native, WM_GETFONT, 0, 0)) == panel.getFont());
  RECT r{};
  GetClientRect(own, &r);
  RECT n{};
  GetWindowRect(native, &n);
  CHECK(str(SIZE{n.right - n.left, n.bottom - n.top}) == str(SIZE{r.right, r.bottom}));
  CHECK(tree.hasHandle(native));
  CHECK(tree.hasHandle(own));

  ContainedWindow orphan;
  CHECK_THROWS_AS(orphan.create(reinterpret_cast<HWND>(static_cast<INT_PTR>(0x1234))), cErr);

  // Notifications become events.
  addItem(native, "one", 11);
  HTREEITEM two = addItem(native, "two", 22);

  SendMessageA(native, TVM_SELECTITEM, TVGN_CARET, reinterpret_cast<LPARAM>(two));
  const Seen* selected = panel.last(kEventAction);
  REQUIRE(selected);
  CHECK(selected->source == &tree);
  CHECK(selected->params[0] == 22);
  CHECK(selected->params[1] == ContainedWindow::kTreeSelected);
  CHECK(selected->params[2] == reinterpret_cast<std::intptr_t>(two));

  panel.seen.clear();
  panel.answer = 0;
  CHECK(notifyFrom(tree.peer()->hwnd(), native, NM_DBLCLK) == 0);
  const Seen* twice = panel.last(kEventAction);
  REQUIRE(twice);
  CHECK(twice->params[0] == 22);
  CHECK(twice->params[1] == ContainedWindow::kTreeDoubleClick);
  panel.answer = 1;  // the parent takes it: the notification is handled
  CHECK(notifyFrom(tree.peer()->hwnd(), native, NM_DBLCLK) == 1);

  // repaintAll puts the window colour into tree and image list.
  HIMAGELIST images = ImageList_Create(16, 16, ILC_COLOR24, 1, 0);
  TreeView_SetImageList(native, images, TVSIL_NORMAL);
  ImageList_SetBkColor(images, RGB(1, 2, 3));
  TreeView_SetBkColor(native, RGB(4, 5, 6));
  tree.repaintAll();
  CHECK(TreeView_GetBkColor(native) == GetSysColor(COLOR_WINDOW));
  CHECK(ImageList_GetBkColor(images) == GetSysColor(COLOR_WINDOW));
  TreeView_SetImageList(native, nullptr, TVSIL_NORMAL);
  ImageList_Destroy(images);
}

TEST_CASE("choice: styles, extent, items before and after the window") {
  MountedPanel panel;
  Choice plain(300, 0, false), editable(0, 0, true);
  editable.setSorted(true);
  plain.addItem("zero");
  plain.addItem("one");
  CHECK(plain.select(1));
  CHECK_FALSE(plain.select(2));
  panel.add(&plain);
  panel.add(&editable);

  HWND combo = plain.getHandle();
  REQUIRE(combo);
  CHECK(windowClass(combo) == "ComboBox");
  CHECK(SendMessageA(combo, CB_GETHORIZONTALEXTENT, 0, 0) == 300);
  CHECK(plain.getItemCount() == 2);
  CHECK(plain.getSelectedIndex() == 1);
  CHECK(plain.getItem(0) == "zero");

  const DWORD style = static_cast<DWORD>(GetWindowLongA(editable.getHandle(), GWL_STYLE));
  CHECK((style & 3) == CBS_DROPDOWN);
  CHECK((style & CBS_SORT) != 0);
  editable.addItem("b");
  editable.addItem("a");
  CHECK(editable.getItem(0) == "a");  // sorted by the list

  plain.removeAllItems();
  CHECK(plain.getItemCount() == 0);
  CHECK(plain.getSelectedIndex() == -1);
}

TEST_CASE("choice events: selection changes bubble as commands, its own keys stay") {
  MountedPanel panel;
  Choice choice;
  panel.add(&choice);
  choice.setBounds(0, 0, 120, 150, true, true);
  for (const char* item : {"a", "b", "c"}) choice.addItem(item);
  choice.select(0);
  HWND combo = choice.getHandle();
  panel.seen.clear();

  key(combo, VK_DOWN);  // the combo box moves its selection and says so
  CHECK(choice.getSelectedIndex() == 1);
  CHECK(panel.count(kEventKeyDown) == 0);
  const Seen* command = panel.last(kEventCommand);
  REQUIRE(command);
  CHECK(command->source == &choice);
  CHECK(command->params[0] == CBN_SELCHANGE);

  key(combo, VK_RETURN);
  key(combo, VK_ESCAPE);
  CHECK(panel.count(kEventKeyDown) == 2);

  panel.seen.clear();
  SendMessageA(choice.peer()->hwnd(), WM_COMMAND, MAKEWPARAM(0, CBN_SETFOCUS), reinterpret_cast<LPARAM>(combo));
  CHECK(panel.count(kEventCommand) == 0);
  SendMessageA(choice.peer()->hwnd(), WM_COMMAND, MAKEWPARAM(0, CBN_CLOSEUP), reinterpret_cast<LPARAM>(combo));
  CHECK(panel.count(kEventCommand) == 1);

  // Events of other components passing through stop at the Choice.
  ToolkitEvent foreign(&panel, kEventAction, nullptr);
  CHECK(choice.dispatchEvent(foreign) == 1);
}

TEST_CASE("choice sizes") {
  const TEXTMETRICA tm = metricsOf("A").tm;
  const int scroll = GetSystemMetrics(SM_CXVSCROLL);
  Choice narrow(0, 0, false), wide(0, 100, false);
  SIZE in = narrow.getPreferredSizeIn(RECT{0, 0, 500, 500});
  CHECK(in.cx == std::min<int>(std::max<int>(10 * tm.tmAveCharWidth + 2 * scroll, 20), 250));
  CHECK(in.cy == std::min<int>(std::max<int>(4 * scroll, 100), 200));
  CHECK(wide.getPreferredSizeIn(RECT{}).cx == 250);
  for (int i = 0; i < 30; ++i) narrow.addItem("x");
  CHECK(narrow.getPreferredSizeIn(RECT{}).cy == in.cy);  // cached
  narrow.setFont("Arial", 10, false, false);  // a new font clears the cache
  CHECK(narrow.getPreferredSizeIn(RECT{}).cy == 200);

  Choice field;
  const SIZE closed = field.getPreferredSize();
  CHECK(closed.cy == 2 * tm.tmDescent + metricsOf("A", DT_SINGLELINE).measured.cy + 2 * GetSystemMetrics(SM_CYEDGE));
  CHECK(closed.cx == field.getPreferredSizeIn(RECT{}).cx);

  MeasuringDC::simulateNoScreen(true);
  Choice blind;
  CHECK(blind.getPreferredSizeIn(RECT{}).cx == 20);
  CHECK(blind.getPreferredSizeIn(RECT{}).cy == 100);
  CHECK(blind.getPreferredSize().cy == 4 * GetSystemMetrics(SM_CYEDGE) + scroll);
  MeasuringDC::simulateNoScreen(false);
  CHECK(blind.getPreferredSizeIn(RECT{}).cy == std::min<int>(std::max<int>(4 * scroll, 100), 200));
}

TEST_CASE("a choice in a grid keeps the height of its list") {
  HostWindow host;
  RecordingPanel panel;
  panel.setLayout(std::make_unique<GridLayout>(1, 2, 0, 0, nullptr, 68));
  mount(panel, host);
  Choice choice;
  Panel other;
  panel.add(&choice);
  panel.add(&other);
  panel.doLayout();
  RECT r{};
  GetWindowRect(choice.peer()->hwnd(), &r);
  CHECK(r.bottom - r.top == choice.getPreferredSizeIn(RECT{}).cy);
}

TEST_CASE("tab container: tabs follow the children") {
  MountedPanel panel;
  TabContainer tabs;
  Panel first, second, third, fourth;
  tabs.add(&first, "First");  // before the window: its tab comes with the window
  panel.add(&tabs);
  HWND strip = tabs.tabStrip();
  REQUIRE(strip);
  CHECK(windowClass(strip) == "SysTabControl32");
  RECT initial{};
  GetWindowRect(tabs.peer()->hwnd(), &initial);
  CHECK(initial.right - initial.left == 15);
  CHECK(isKindOf(tabs.getLayout(), &records::TabLayout));

  auto texts = [&] {
    std::string all;
    for (int i = 0; i < tabs.getTabCount(); ++i) all += tabs.getTabText(i) + ";";
    return all;
  };
  tabs.add(&second, "Second");
  tabs.insertAt(1, &third, "Third");
  tabs.insertAt(9, &fourth, "Fourth");  // no such row: appended
  CHECK(texts() == "First;Third;Second;Fourth;");
  CHECK(tabs.removeComponent(&third, false));
  CHECK(texts() == "First;Second;Fourth;");
  CHECK(tabs.removeNamed("First", false));
  CHECK(tabs.removeAt(1, false));
  CHECK_FALSE(tabs.removeAt(5, false));
  CHECK(texts() == "Second;");
}

TEST_CASE("tab container: selectPage rules and the strip's own selection change") {
  MountedPanel panel;
  TabContainer tabs;
  Panel pages[3];
  panel.add(&tabs);
  tabs.setBounds(0, 0, 300, 200, true, true);
  const char* names[] = {"A", "B", "C"};
  for (int i = 0; i < 3; ++i) tabs.add(&pages[i], names[i]);
  tabs.doLayout();
  CHECK(IsWindowVisible(pages[0].getHandle()));
  CHECK_FALSE(IsWindowVisible(pages[1].getHandle()));

  CHECK_FALSE(tabs.selectPage(0, true));   // already selected
  CHECK_FALSE(tabs.selectPage(3, true));   // no such child
  CHECK_FALSE(tabs.selectPage(-2, true));  // only -1 stands for none
  CHECK(tabs.selectPage(2, true));
  CHECK(tabs.getSelectedPage() == 2);
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

  CHECK(tabs.selectPage(-1, true));
  CHECK(tabs.getSelectedPage() == -1);

  tabs.setLayout(std::make_unique<GridLayout>(1, 1, 0, 0, nullptr, 0));
  CHECK_FALSE(tabs.selectPage(0, true));  // not a tab layout
  tabs.setLayout(nullptr);
  CHECK(isKindOf(tabs.getLayout(), &records::TabLayout));
}

TEST_CASE("tab container: Tab on the strip moves the focus on") {
  MountedPanel panel;
  TabContainer tabs;
  Panel page;
  cXEdit2 inside, after;
  panel.add(&tabs);
  tabs.setBounds(0, 0, 200, 150, true, true);
  tabs.add(&page, "Page");
  page.add(&inside);
  panel.add(&after);
  tabs.doLayout();
  SetFocus(tabs.tabStrip());
  REQUIRE(GetFocus() == tabs.tabStrip());

  NMTCKEYDOWN down{};
  down.hdr.hwndFrom = tabs.tabStrip();
  down.hdr.code = TCN_KEYDOWN;
  down.wVKey = VK_RIGHT;
  SendMessageA(tabs.peer()->hwnd(), WM_NOTIFY, 0, reinterpret_cast<LPARAM>(&down));
  CHECK(GetFocus() == tabs.tabStrip());  // other keys are the strip's
  down.wVKey = VK_TAB;
  SendMessageA(tabs.peer()->hwnd(), WM_NOTIFY, 0, reinterpret_cast<LPARAM>(&down));
  CHECK(GetFocus() == inside.getHandle());
}
