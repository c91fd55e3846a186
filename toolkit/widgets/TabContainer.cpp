#include "toolkit/widgets/TabContainer.h"

#include <windows.h>
#include <commctrl.h>

#include "toolkit/base/class_records.h"
#include "toolkit/core/ContainerItems.h"
#include "toolkit/core/toolkit_error.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/layout/LayoutEngine.h"
#include "toolkit/layout/TabLayout.h"

namespace toolkit {

namespace {
TabLayout* tabLayoutOf(Layout* layout) {
  return layout && isKindOf(layout, &records::TabLayout) ? static_cast<TabLayout*>(layout) : nullptr;
}
}  // namespace

TabContainer::TabContainer() { Container::setLayout(std::make_unique<TabLayout>()); }

const ClassRecord* TabContainer::getClassRecord() const { return &records::TabContainer; }

void TabContainer::setLayout(std::unique_ptr<Layout> layout) {
  Container::setLayout(layout ? std::move(layout) : std::make_unique<TabLayout>());
}

HWND TabContainer::tabStrip() const { return strip_ && IsWindow(strip_) ? strip_ : nullptr; }

int TabContainer::getTabCount() const {
  HWND strip = tabStrip();
  return strip ? static_cast<int>(SendMessageA(strip, TCM_GETITEMCOUNT, 0, 0)) : 0;
}

std::string TabContainer::getTabText(int index) const {
  HWND strip = tabStrip();
  if (!strip) return std::string();
  char buffer[256] = {};
  TCITEMA item{};
  item.mask = TCIF_TEXT;
  item.pszText = buffer;
  item.cchTextMax = static_cast<int>(sizeof(buffer));
  if (!SendMessageA(strip, TCM_GETITEMA, static_cast<WPARAM>(index), reinterpret_cast<LPARAM>(&item)))
    return std::string();
  return buffer;
}

bool TabContainer::create(HWND parentHwnd) {
  if (!parentHwnd || !IsWindow(parentHwnd)) throwBadParentWindow();
  if (isValid()) return true;
  if (!createWindow(0, nullptr, nullptr, kOwnStyle, 0, 0, 15, 15, parentHwnd, 0)) return false;
  ToolkitWindows::initCommonControls();
  HWND own = peer_->hwnd();
  strip_ = CreateWindowExA(0, WC_TABCONTROLA, "", kStripStyle, 0, 0, 10, 10, own, nullptr,
                           ToolkitWindows::moduleInstance(), nullptr);
  HFONT font = getFont();
  SendMessageA(own, WM_SETFONT, reinterpret_cast<WPARAM>(font), FALSE);
  if (font) lendFont(font);
  for (int i = 0; i < getChildCount(); ++i) {
    insertTab(i, getChildName(i));
    cXComponent* child = getChild(i);
    if (child && !child->isValid()) child->create(own);
  }
  if (TabLayout* tabs = tabLayoutOf(getLayout()); tabs && strip_)
    SendMessageA(strip_, TCM_SETCURSEL, static_cast<WPARAM>(tabs->selectedIndex), 0);
  return true;
}

void TabContainer::insertTab(int index, const std::string& text) {
  HWND strip = tabStrip();
  if (!strip) return;
  TCITEMA item{};
  item.mask = TCIF_TEXT;
  item.pszText = const_cast<char*>(text.c_str());
  SendMessageA(strip, TCM_INSERTITEMA, static_cast<WPARAM>(index), reinterpret_cast<LPARAM>(&item));
  // The pages lie over the strip, never under it.
  SetWindowPos(strip, HWND_BOTTOM, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
}

int TabContainer::insertNamed(const char* position, cXComponent* component, const char* name) {
  const int before = getChildCount();
  const int row = Container::insertNamed(position, component, name);
  if (getChildCount() > before && getTabCount() < getChildCount()) insertTab(row, name ? name : "");
  return row;
}

int TabContainer::insertAtNamed(int index, const char* position, cXComponent* component, const char* name) {
  const int before = getChildCount();
  const int row = Container::insertAtNamed(index, position, component, name);
  // The append path goes through insertNamed, which has made the tab already.
  if (getChildCount() > before && getTabCount() < getChildCount()) insertTab(row, name ? name : "");
  if (TabLayout* tabs = tabLayoutOf(getLayout()); tabs && getChildCount() > before && row <= tabs->selectedIndex) {
    ++tabs->selectedIndex;  // the selected page moved one place on
    if (HWND strip = tabStrip()) SendMessageA(strip, TCM_SETCURSEL, static_cast<WPARAM>(tabs->selectedIndex), 0);
  }
  return row;
}

bool TabContainer::removeTabAfter(int row, bool removed) {
  if (!removed) return false;
  if (HWND strip = tabStrip()) SendMessageA(strip, TCM_DELETEITEM, static_cast<WPARAM>(row), 0);
  TabLayout* tabs = tabLayoutOf(getLayout());
  if (!tabs) return true;
  // The selection stays on the same page, or on the last one when its page went.
  if (tabs->selectedIndex >= 0 && (row < tabs->selectedIndex || tabs->selectedIndex >= getChildCount())) {
    --tabs->selectedIndex;
    if (tabs->selectedIndex < 0 && getChildCount() > 0) tabs->selectedIndex = 0;
  }
  if (HWND strip = tabStrip()) SendMessageA(strip, TCM_SETCURSEL, static_cast<WPARAM>(tabs->selectedIndex), 0);
  doLayout();
  return true;
}

bool TabContainer::removeComponent(cXComponent* component, bool destroy) {
  const int row = indexOf(component);
  return removeTabAfter(row, row >= 0 && Container::removeComponent(component, destroy));
}

bool TabContainer::removeNamed(const char* name, bool destroy) {
  const int row = indexOf(findChild(name));
  return removeTabAfter(row, row >= 0 && Container::removeNamed(name, destroy));
}

bool TabContainer::removeAt(int index, bool destroy) {
  return removeTabAfter(index, Container::removeAt(index, destroy));
}

bool TabContainer::selectPage(int index, bool relayout) {
  TabLayout* tabs = tabLayoutOf(getLayout());
  if (!tabs || index == tabs->selectedIndex) return false;
  if (index < -1 || index >= getChildCount()) return false;
  tabs->selectedIndex = index;
  if (HWND strip = tabStrip()) {
    if (SendMessageA(strip, TCM_GETCURSEL, 0, 0) != index)
      SendMessageA(strip, TCM_SETCURSEL, static_cast<WPARAM>(index), 0);
  }
  if (relayout) doLayout();
  return true;
}

int TabContainer::getSelectedPage() const {
  TabLayout* tabs = tabLayoutOf(getLayout());
  return tabs ? tabs->selectedIndex : -1;
}

RECT TabContainer::displayArea() const {
  RECT area = getClientRect();
  if (HWND strip = tabStrip()) SendMessageA(strip, TCM_ADJUSTRECT, FALSE, reinterpret_cast<LPARAM>(&area));
  area.left += insets_.left;
  area.top += insets_.top;
  area.right -= insets_.right;
  area.bottom -= insets_.bottom;
  return area;
}

void TabContainer::layoutStep(HDWP& batch) {
  const RECT client = getClientRect();
  if (client.right <= client.left || client.bottom <= client.top) return;
  if (HWND strip = tabStrip()) {
    MoveWindow(strip, 0, 0, client.right - client.left, client.bottom - client.top, TRUE);
    SetWindowPos(strip, HWND_BOTTOM, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
  }
  if (Layout* layout = getLayout()) {
    ContainerItems items(*this, batch);
    LayoutEngine(items, *layout).layOut(ContainerItems::toRect(displayArea()));
  }
  for (int i = 0; i < getChildCount(); ++i) {
    cXComponent* child = getChild(i);
    if (child && isKindOf(child, &records::Container) && child->isValid() && (child->getStyle() & WS_VISIBLE))
      static_cast<Container*>(child)->layoutStep(batch);
  }
}

SIZE TabContainer::getPreferredSize() {
  SIZE size = Container::getPreferredSize();
  HWND strip = tabStrip();
  if (!strip) return size;
  // Room for the tabs and the strip's frame around the pages.
  RECT frame{0, 0, size.cx, size.cy};
  SendMessageA(strip, TCM_ADJUSTRECT, TRUE, reinterpret_cast<LPARAM>(&frame));
  return SIZE{frame.right - frame.left, frame.bottom - frame.top};
}

void TabContainer::lendFont(HFONT font) {
  Container::lendFont(font);
  if (HWND strip = tabStrip()) SendMessageA(strip, WM_SETFONT, reinterpret_cast<WPARAM>(font), TRUE);
}

int TabContainer::onResized(ToolkitEvent& event) {
  if (event.source == this && isValid() && event.hwnd == peer_->hwnd()) doLayout();
  return 0;
}

int TabContainer::onNotify(ToolkitEvent& event) {
  if (event.source != this || event.params[0] != 1 || !event.params[3]) return 0;
  const auto* header = reinterpret_cast<const NMHDR*>(event.params[3]);
  if (!strip_ || header->hwndFrom != strip_) return 0;
  switch (header->code) {
    case TCN_SELCHANGE:
      selectPage(static_cast<int>(SendMessageA(strip_, TCM_GETCURSEL, 0, 0)), true);
      return 0;  // owners may want to follow the tab change
    case TCN_KEYDOWN:
      if (reinterpret_cast<const NMTCKEYDOWN*>(header)->wVKey == VK_TAB) {
        transferFocus();
        return 1;
      }
      return 0;
    default:
      return 0;
  }
}

}  // namespace toolkit
