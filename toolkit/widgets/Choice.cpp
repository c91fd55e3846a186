#include "toolkit/widgets/Choice.h"

#include <algorithm>

#include "toolkit/base/class_records.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/widgets/support/MeasuringDC.h"

namespace toolkit {

namespace {
constexpr int kItemColumn = 0;
}

Choice::Choice(int horizontalExtent, int widthInCharacters, bool editable)
    : horizontalExtent_(horizontalExtent), widthInCharacters_(widthInCharacters), editable_(editable) {
  items_.addColumn(ColumnType::Text, "items");
}

const ClassRecord* Choice::getClassRecord() const { return &records::Choice; }

DWORD Choice::comboStyle() const {
  DWORD style = kComboStyle;
  if (editable_) style = (style & ~static_cast<DWORD>(CBS_DROPDOWNLIST)) | CBS_DROPDOWN;
  if (sorted_) style |= CBS_SORT;
  return style;
}

HWND Choice::createNative(HWND ownWindow) {
  HWND combo = CreateWindowExA(0, "COMBOBOX", "", comboStyle(), 0, 0, 0, 0, ownWindow, nullptr,
                               ToolkitWindows::moduleInstance(), nullptr);
  if (!combo) return nullptr;
  if (horizontalExtent_ != 0) SendMessageA(combo, CB_SETHORIZONTALEXTENT, static_cast<WPARAM>(horizontalExtent_), 0);
  for (int i = 0; i < items_.rowCount(); ++i) {
    const std::string text = items_.text(kItemColumn, i);
    SendMessageA(combo, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(text.c_str()));
  }
  if (selected_ >= 0) SendMessageA(combo, CB_SETCURSEL, static_cast<WPARAM>(selected_), 0);
  // The combo box's own messages become this component's events.
  adoptWindow(combo);
  return combo;
}

int Choice::addItem(const char* text) {
  const std::string item = text ? text : "";
  const int row = items_.appendRowText(item);
  if (HWND combo = nativeWindow()) {
    const LRESULT at = SendMessageA(combo, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(item.c_str()));
    return at < 0 ? -1 : static_cast<int>(at);
  }
  return row;
}

void Choice::removeAllItems() {
  items_.clear();
  selected_ = -1;
  if (HWND combo = nativeWindow()) SendMessageA(combo, CB_RESETCONTENT, 0, 0);
}

int Choice::getItemCount() const {
  if (HWND combo = nativeWindow()) return static_cast<int>(SendMessageA(combo, CB_GETCOUNT, 0, 0));
  return items_.rowCount();
}

std::string Choice::getItem(int index) const {
  HWND combo = nativeWindow();
  if (!combo) return items_.text(kItemColumn, index);
  const LRESULT length = SendMessageA(combo, CB_GETLBTEXTLEN, static_cast<WPARAM>(index), 0);
  if (length < 0) return std::string();
  std::string text(static_cast<size_t>(length) + 1, '\0');
  const LRESULT copied = SendMessageA(combo, CB_GETLBTEXT, static_cast<WPARAM>(index), reinterpret_cast<LPARAM>(text.data()));
  text.resize(copied > 0 ? static_cast<size_t>(copied) : 0);
  return text;
}

int Choice::getSelectedIndex() const {
  if (HWND combo = nativeWindow()) return static_cast<int>(SendMessageA(combo, CB_GETCURSEL, 0, 0));
  return selected_;
}

bool Choice::select(int index) {
  if (index < -1 || index >= getItemCount()) return false;
  selected_ = index;
  if (HWND combo = nativeWindow()) SendMessageA(combo, CB_SETCURSEL, static_cast<WPARAM>(index), 0);
  return true;
}

int Choice::dispatchEvent(ToolkitEvent& event) {
  if (event.source != this) return 1;
  if (event.id == kEventKeyDown) {
    const int key = event.param(0);
    if (key != VK_TAB && key != VK_RETURN && key != VK_ESCAPE) return 1;  // the combo box's own keys
    return ContainedWindow::dispatchEvent(event);
  }
  if (event.id == kEventCommand && event.hwnd == native_ && native_) {
    // The edit field of an editable list talking to the combo box: the combo
    // box needs it, the owner does not.
    return 1;
  }
  if (event.id == kEventCommand && event.params[2] == reinterpret_cast<std::intptr_t>(native_)) {
    HWND combo = nativeWindow();
    switch (event.param(0)) {
      case CBN_SETFOCUS:
        if (combo) SendMessageA(combo, CB_SETEDITSEL, 0, MAKELPARAM(0, -1));
        return 1;
      case CBN_KILLFOCUS:
        if (combo) SendMessageA(combo, CB_SETEDITSEL, 0, MAKELPARAM(-1, 0));
        return 1;
      case CBN_EDITCHANGE:
        if (editable_) return 1;
        break;
      case CBN_SELCHANGE:
        if (combo) selected_ = static_cast<int>(SendMessageA(combo, CB_GETCURSEL, 0, 0));
        break;
      default:
        break;
    }
  }
  return ContainedWindow::dispatchEvent(event);
}

SIZE Choice::getPreferredSizeIn(const RECT&) {
  if (cachedPreferredSize_.cx != 0 || cachedPreferredSize_.cy != 0) return cachedPreferredSize_;
  MeasuringDC dc(getFont());
  if (!dc.valid()) return kFallbackSize;
  const TEXTMETRICA& tm = dc.metrics();
  const int scrollWidth = GetSystemMetrics(SM_CXVSCROLL);
  const int characters = widthInCharacters_ != 0 ? widthInCharacters_ : 10;
  const int width = std::clamp<int>(characters * tm.tmAveCharWidth + 2 * scrollWidth, 20, 250);
  const int height = std::clamp<int>(getItemCount() * tm.tmHeight + 4 * scrollWidth, 100, 200);
  cachedPreferredSize_ = SIZE{width, height};
  return cachedPreferredSize_;
}

SIZE Choice::getPreferredSize() {
  const SIZE inside = getPreferredSizeIn(RECT{0, 0, 0, 0});
  const int edge = GetSystemMetrics(SM_CYEDGE);
  MeasuringDC dc(getFont());
  if (!dc.valid()) return SIZE{inside.cx, 4 * edge + GetSystemMetrics(SM_CXVSCROLL)};
  int height = 2 * dc.metrics().tmDescent + dc.measure("A", DT_SINGLELINE).cy + 2 * edge;
  if (getStyle() & 0x10) height += 3 * edge;
  return SIZE{inside.cx, height};
}

}  // namespace toolkit
