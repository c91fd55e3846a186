#include "toolkit/widgets/ContainedWindow.h"

#include "toolkit/base/class_records.h"
#include "toolkit/core/toolkit_error.h"
#include "toolkit/core/ToolkitWindows.h"

namespace toolkit {

ContainedWindow::ContainedWindow() = default;

const ClassRecord* ContainedWindow::getClassRecord() const { return &records::ContainedWindow; }

bool ContainedWindow::create(HWND parentHwnd) {
  if (!parentHwnd || !IsWindow(parentHwnd)) throwBadParentWindow();
  if (isValid()) return true;
  const SIZE size = initialSize();
  if (!createWindow(0, nullptr, nullptr, ownWindowStyle(), 0, 0, size.cx, size.cy, parentHwnd, 0))
    return false;
  ToolkitWindows::initCommonControls();
  native_ = createNative(peer_->hwnd());
  if (!native_) return false;
  fitNative();
  lendFont(parent_ ? parent_->getFont() : nullptr);
  return true;
}

HWND ContainedWindow::createNative(HWND ownWindow) {
  HWND tree = CreateWindowExA(WS_EX_CLIENTEDGE, WC_TREEVIEWA, "", kTreeStyle, 0, 0, 0, 0, ownWindow, nullptr,
                              ToolkitWindows::moduleInstance(), nullptr);
  if (tree) SendMessageA(tree, TVM_SETINDENT, 0, 0);
  return tree;
}

HWND ContainedWindow::nativeWindow() const {
  return native_ && IsWindow(native_) ? native_ : nullptr;
}

HWND ContainedWindow::getHandle() const { return isValid() ? nativeWindow() : nullptr; }

bool ContainedWindow::hasHandle(HWND hwnd) const {
  return hwnd && (hwnd == nativeWindow() || (isValid() && hwnd == peer_->hwnd()));
}

void ContainedWindow::setText(std::string_view text) {
  text_.assign(text.data(), text.size());
  if (HWND native = nativeWindow()) SetWindowTextA(native, text_.c_str());
}

std::string ContainedWindow::getText() const {
  HWND native = nativeWindow();
  if (!native) return text_;
  const int length = GetWindowTextLengthA(native);
  std::string text(static_cast<size_t>(length > 0 ? length : 0) + 1, '\0');
  const int copied = GetWindowTextA(native, text.data(), static_cast<int>(text.size()));
  text.resize(static_cast<size_t>(copied > 0 ? copied : 0));
  return text;
}

void ContainedWindow::setEnabled(bool enabled) {
  cXComponent::setEnabled(enabled);
  if (HWND native = nativeWindow()) EnableWindow(native, enabled ? TRUE : FALSE);
}

void ContainedWindow::lendFont(HFONT font) {
  cXComponent::lendFont(font);
  if (HWND native = nativeWindow()) SendMessageA(native, WM_SETFONT, reinterpret_cast<WPARAM>(font), TRUE);
}

void ContainedWindow::requestFocus() {
  if (HWND native = getHandle()) SetFocus(native);
}

void ContainedWindow::fitNative() {
  HWND native = nativeWindow();
  if (!native || !isValid()) return;
  RECT client{};
  GetClientRect(peer_->hwnd(), &client);
  MoveWindow(native, 0, 0, client.right, client.bottom, TRUE);
}

void ContainedWindow::validate() { fitNative(); }

int ContainedWindow::onResized(ToolkitEvent& event) {
  if (event.source == this && isValid() && event.hwnd == peer_->hwnd()) fitNative();
  return 0;
}

int ContainedWindow::onNotify(ToolkitEvent& event) {
  if (event.source != this || event.params[0] != 1 || !event.params[3]) return 0;
  const auto* header = reinterpret_cast<const NMHDR*>(event.params[3]);
  if (!native_ || header->hwndFrom != native_) return 0;
  return treeNotification(event, *header);
}

int ContainedWindow::treeNotification(ToolkitEvent& event, const NMHDR& header) {
  switch (header.code) {
    case TVN_SELCHANGEDA:
    case TVN_SELCHANGEDW: {
      // Both forms carry the new item's handle and data at the same places.
      const auto& change = reinterpret_cast<const NMTREEVIEWA&>(header);
      ToolkitEvent selected(this, kEventAction, native_);
      selected.params[0] = change.itemNew.lParam;
      selected.params[1] = kTreeSelected;
      selected.params[2] = reinterpret_cast<std::intptr_t>(change.itemNew.hItem);
      dispatchEvent(selected);
      return 1;
    }
    case NM_DBLCLK: {
      HTREEITEM item = TreeView_GetSelection(native_);
      if (!item) return 1;
      TVITEMA data{};
      data.mask = TVIF_PARAM | TVIF_HANDLE;
      data.hItem = item;
      SendMessageA(native_, TVM_GETITEMA, 0, reinterpret_cast<LPARAM>(&data));
      ToolkitEvent doubleClick(this, kEventAction, native_);
      doubleClick.params[0] = data.lParam;
      doubleClick.params[1] = kTreeDoubleClick;
      doubleClick.params[2] = reinterpret_cast<std::intptr_t>(item);
      if (parent_ && parent_->dispatchEvent(doubleClick) != 0) event.handled = true;
      return 1;
    }
    default:
      return 0;
  }
}

void ContainedWindow::repaintAll() {
  HWND tree = nativeWindow();
  char className[32] = {};
  if (tree) GetClassNameA(tree, className, static_cast<int>(sizeof(className)));
  if (tree && lstrcmpiA(className, WC_TREEVIEWA) == 0) {
    const COLORREF window = GetSysColor(COLOR_WINDOW);
    if (HIMAGELIST images = TreeView_GetImageList(tree, TVSIL_NORMAL)) ImageList_SetBkColor(images, window);
    TreeView_SetBkColor(tree, window);
    InvalidateRect(tree, nullptr, TRUE);
  }
  cXComponent::repaintAll();
}

}  // namespace toolkit
