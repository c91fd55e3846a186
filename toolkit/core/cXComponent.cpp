#include "toolkit/core/cXComponent.h"

#include <cstring>

#include "toolkit/base/class_records.h"
#include "toolkit/core/Container.h"
#include "toolkit/core/Palette.h"
#include "toolkit/core/toolkit_error.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/dialogs/ModalDialog.h"
#include "toolkit/widgets/Tooltip.h"

namespace toolkit {

namespace {

// The system colour indices a component may override, in slot order.
constexpr int kColorIndices[] = {COLOR_WINDOW,     COLOR_WINDOWTEXT, COLOR_HIGHLIGHT,
                                 COLOR_HIGHLIGHTTEXT, COLOR_BTNFACE, COLOR_BTNSHADOW,
                                 COLOR_GRAYTEXT,   COLOR_BTNTEXT,    COLOR_BTNHIGHLIGHT};
static_assert(sizeof(kColorIndices) / sizeof(kColorIndices[0]) == 9, "nine colour overrides");

constexpr RECT kEmptyRect{0, 0, 0, 0};

}  // namespace

cXComponent::cXComponent() : cXComponent(kPeerKind) {}

cXComponent::cXComponent(int peerKind) : peer_(std::make_unique<ComponentPeer>(*this, peerKind)) {
  for (COLORREF& c : colours_) c = CLR_INVALID;
}

const ClassRecord* cXComponent::getClassRecord() const { return &records::cXComponent; }

cXComponent::~cXComponent() {
  detachFromParent();
  if (peer_) {
    peer_->silence();
    HWND hwnd = peer_->hwnd();
    if (hwnd && IsWindow(hwnd)) DestroyWindow(hwnd);
  }
  peer_.reset();
  if (ownFont_) DeleteObject(ownFont_);
  ownFont_ = nullptr;
  borrowedFont_ = nullptr;  // lent by someone else: never ours to delete
  if (tooltip_ && IsWindow(tooltip_)) DestroyWindow(tooltip_);
  tooltip_ = nullptr;
}

void cXComponent::detachFromParent() {
  if (parent_ && isKindOf(parent_, &records::Container))
    static_cast<Container*>(parent_)->forgetChild(this);
  parent_ = nullptr;
}

cXComponent* cXComponent::getParent() const { return parent_; }

void cXComponent::setParent(cXComponent* parent) { parent_ = parent; }

HWND cXComponent::getHandle() const { return isValid() ? peer_->hwnd() : nullptr; }

bool cXComponent::isValid() const { return peer_ && peer_->hwnd() && IsWindow(peer_->hwnd()); }

bool cXComponent::isEnabled() const { return isValid() && IsWindowEnabled(peer_->hwnd()); }

bool cXComponent::isVisible() const { return isValid() && IsWindowVisible(peer_->hwnd()); }

RECT cXComponent::getWindowRect() const {
  RECT rect = kEmptyRect;
  if (!isValid() || !::GetWindowRect(peer_->hwnd(), &rect)) return kEmptyRect;
  return rect;
}

RECT cXComponent::getClientRect() const {
  RECT rect = kEmptyRect;
  if (!isValid() || !::GetClientRect(peer_->hwnd(), &rect)) return kEmptyRect;
  return rect;
}

bool cXComponent::create(HWND parentHwnd) {
  if (!parentHwnd || !IsWindow(parentHwnd)) throwBadParentWindow();
  if (isValid()) return true;
  if (!createWindow(0, nullptr, nullptr, kDefaultStyle, 0, 0, 0, 0, parentHwnd, 0)) return false;
  HFONT font = getFont();
  SendMessageA(peer_->hwnd(), WM_SETFONT, reinterpret_cast<WPARAM>(font), FALSE);
  if (font) lendFont(font);
  return true;
}

bool cXComponent::createWindow(DWORD exStyle, const char* className, const char* title, DWORD style,
                               int x, int y, int width, int height, HWND parent, UINT_PTR id) {
  if (!peer_) return false;
  const bool ownClass = !className || !*className;
  std::string ownName;
  if (ownClass) {
    if (!ToolkitWindows::registerClass(peer_->kind())) return false;
    ownName = ToolkitWindows::className(peer_->kind());
  } else {
    ToolkitWindows::initCommonControls();
  }
  HWND hwnd = nullptr;
  {
    ToolkitWindows::Creating creating(ownClass ? this : nullptr);
    hwnd = CreateWindowExA(exStyle, ownClass ? ownName.c_str() : className, title ? title : "", style,
                           x, y, width, height, parent, reinterpret_cast<HMENU>(id),
                           ToolkitWindows::moduleInstance(), nullptr);
  }
  if (!hwnd) return false;
  if (ownClass) {
    if (!ToolkitWindows::componentOf(hwnd)) ToolkitWindows::enter(hwnd, this, nullptr);
  } else {
    ToolkitWindows::subclass(hwnd, this);
  }
  peer_->setHwnd(hwnd);
  // Every component window gets its hover popup with it.
  if (tooltip_ && IsWindow(tooltip_)) DestroyWindow(tooltip_);
  tooltip_ = Tooltip::createFor(hwnd);
  bounds_ = RECT{x, y, x + width, y + height};
  if (!text_.empty() && !(title && *title)) SetWindowTextA(hwnd, text_.c_str());
  return true;
}

void cXComponent::adoptWindow(HWND hwnd) { ToolkitWindows::subclass(hwnd, this); }

void cXComponent::destroyWindow() {
  if (isValid()) DestroyWindow(peer_->hwnd());
}

bool cXComponent::postEvent(std::unique_ptr<ToolkitEvent> event) {
  if (!event || !isValid()) return false;
  peer_->queue(std::move(event));
  POINT cursor{};
  GetCursorPos(&cursor);
  return PostMessageA(peer_->hwnd(), WM_NCHITTEST, static_cast<WPARAM>(cursor.x),
                      static_cast<LPARAM>(cursor.y)) != FALSE;
}

bool cXComponent::sendEvent(std::unique_ptr<ToolkitEvent> event) {
  if (!event || !isValid()) return false;
  peer_->queue(std::move(event));
  POINT cursor{};
  GetCursorPos(&cursor);
  SendMessageA(peer_->hwnd(), WM_NCHITTEST, static_cast<WPARAM>(cursor.x), static_cast<LPARAM>(cursor.y));
  return true;
}

void cXComponent::setEnabled(bool enabled) {
  enabled_ = enabled ? 1 : 0;
  if (isValid()) EnableWindow(peer_->hwnd(), enabled ? TRUE : FALSE);
}

void cXComponent::show(bool visible) {
  if (isValid()) ShowWindow(peer_->hwnd(), visible ? SW_SHOW : SW_HIDE);
}

void cXComponent::requestFocus() {
  if (isValid()) SetFocus(peer_->hwnd());
}

POINT cXComponent::getLocation() const {
  if (!isValid()) return POINT{-1, -1};
  RECT rect = getWindowRect();
  return POINT{rect.left, rect.top};
}

void cXComponent::setLocation(int x, int y) {
  if (!isValid()) return;
  SIZE size = getSize();
  if (size.cx == 0 || size.cy == 0) return;
  bounds_ = RECT{x, y, x + size.cx, y + size.cy};
  MoveWindow(peer_->hwnd(), x, y, size.cx, size.cy, TRUE);
}

SIZE cXComponent::getSize() const {
  if (!isValid()) return SIZE{0, 0};
  RECT rect = getWindowRect();
  return SIZE{rect.right - rect.left, rect.bottom - rect.top};
}

void cXComponent::setSize(int width, int height, bool show) {
  if (!isValid()) return;
  bounds_.right = bounds_.left + width;
  bounds_.bottom = bounds_.top + height;
  SetWindowPos(peer_->hwnd(), nullptr, 0, 0, width, height,
               SWP_NOMOVE | SWP_NOZORDER | (show ? SWP_SHOWWINDOW : SWP_NOREDRAW));
}

bool cXComponent::contains(int x, int y) const {
  RECT rect = getWindowRect();
  return PtInRect(&rect, POINT{x, y}) != FALSE;
}

void cXComponent::setBounds(int x, int y, int width, int height, bool forceMove, bool repaint) {
  if (!isValid()) return;
  const bool samePlace = bounds_.left == x && bounds_.top == y;
  bounds_ = RECT{x, y, x + width, y + height};
  UINT flags = SWP_NOZORDER;
  if (!forceMove && samePlace) flags |= SWP_NOMOVE;
  if (!repaint) flags |= SWP_NOREDRAW;
  SetWindowPos(peer_->hwnd(), nullptr, x, y, width, height, flags);
}

void cXComponent::moveTo(int x, int y, int width, int height, bool repaint) {
  if (!isValid()) return;
  bounds_ = RECT{x, y, x + width, y + height};
  MoveWindow(peer_->hwnd(), x, y, width, height, repaint ? TRUE : FALSE);
}

void cXComponent::deferBounds(HDWP& batch, int x, int y, int width, int height) {
  if (!isValid()) return;
  const bool samePlace = bounds_.left == x && bounds_.top == y;
  if (batch) {
    batch = DeferWindowPos(batch, peer_->hwnd(), nullptr, x, y, width, height,
                           SWP_NOZORDER | (samePlace ? SWP_NOMOVE : 0));
  } else {
    setBounds(x, y, width, height, false, true);
  }
  // Applied at once as well: nested containers are laid out in the same pass and
  // need their new client size now, not when the batch ends.
  moveTo(x, y, width, height, true);
  invalidate();
  bounds_ = RECT{x, y, x + width, y + height};
}

void cXComponent::setTextNumber(int number) { setText(std::to_string(number)); }

void cXComponent::setText(std::string_view text) {
  text_.assign(text.data(), text.size());
  if (isValid()) SetWindowTextA(peer_->hwnd(), text_.c_str());
}

std::string cXComponent::getText() const {
  if (!isValid()) return text_;
  const int length = GetWindowTextLengthA(peer_->hwnd());
  std::string text(static_cast<size_t>(length > 0 ? length : 0) + 1, '\0');
  const int copied = GetWindowTextA(peer_->hwnd(), text.data(), static_cast<int>(text.size()));
  text.resize(static_cast<size_t>(copied > 0 ? copied : 0));
  return text;
}

void cXComponent::setState(int state) { state_ = state; }

void cXComponent::validate() {}

void cXComponent::transferFocus() {
  // Focus order is the business of the root container.
  if (parent_) parent_->transferFocus();
}

bool cXComponent::hasHandle(HWND hwnd) const { return hwnd && getHandle() == hwnd; }

HFONT cXComponent::getFont() const { return borrowedFont_ ? borrowedFont_ : ownFont_; }

bool cXComponent::setFontIndirect(const LOGFONTA& logFont) {
  HFONT font = CreateFontIndirectA(&logFont);
  if (!font) return false;
  if (ownFont_) DeleteObject(ownFont_);
  ownFont_ = font;
  borrowedFont_ = nullptr;
  clearCachedPreferredSize();
  if (isValid()) SendMessageA(peer_->hwnd(), WM_SETFONT, reinterpret_cast<WPARAM>(font), TRUE);
  return true;
}

bool cXComponent::setFont(const char* face, int points, bool bold, bool italic) {
  LOGFONTA logFont{};
  HDC screen = GetDC(nullptr);
  const int dpi = screen ? GetDeviceCaps(screen, LOGPIXELSY) : 96;
  if (screen) ReleaseDC(nullptr, screen);
  logFont.lfHeight = -MulDiv(points, dpi, 72);
  logFont.lfWeight = bold ? FW_BOLD : FW_NORMAL;
  logFont.lfItalic = italic ? TRUE : FALSE;
  logFont.lfCharSet = DEFAULT_CHARSET;
  if (face) lstrcpynA(logFont.lfFaceName, face, LF_FACESIZE);
  return setFontIndirect(logFont);
}

void cXComponent::setFontObject(IFont*) {}

void cXComponent::lendFont(HFONT font) {
  borrowedFont_ = font;
  clearCachedPreferredSize();
  if (isValid()) SendMessageA(peer_->hwnd(), WM_SETFONT, reinterpret_cast<WPARAM>(font), TRUE);
}

void cXComponent::setInsets(int left, int top, int right, int bottom) {
  insets_ = RECT{left, top, right, bottom};
  clearCachedPreferredSize();
}

bool cXComponent::setPalette(const COLORREF* table, int count) {
  if (!Palette::replace(table, count)) return false;
  repaintAll();
  return true;
}

int cXComponent::colorSlot(int systemIndex) {
  for (int i = 0; i < kColorCount; ++i) {
    if (kColorIndices[i] == systemIndex) return i;
  }
  return -1;
}

bool cXComponent::setColor(int index, COLORREF value) {
  const int slot = colorSlot(index);
  if (slot < 0) return false;
  colours_[slot] = value;
  return true;
}

COLORREF cXComponent::colorOf(int systemIndex) const {
  const int slot = colorSlot(systemIndex);
  if (slot >= 0 && colours_[slot] != CLR_INVALID) return colours_[slot];
  return GetSysColor(systemIndex);
}

LONG cXComponent::getStyle() const {
  return isValid() ? GetWindowLongA(peer_->hwnd(), GWL_STYLE) : 0;
}

LONG cXComponent::getExStyle() const {
  return isValid() ? GetWindowLongA(peer_->hwnd(), GWL_EXSTYLE) : 0;
}

namespace {
bool modifyLong(HWND hwnd, int which, DWORD remove, DWORD add, UINT swpFlags) {
  const DWORD old = static_cast<DWORD>(GetWindowLongA(hwnd, which));
  const DWORD now = (old & ~remove) | add;
  if (now == old) return false;
  SetWindowLongA(hwnd, which, static_cast<LONG>(now));
  if (swpFlags)
    SetWindowPos(hwnd, nullptr, 0, 0, 0, 0,
                 SWP_NOSIZE | SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE | swpFlags);
  return true;
}
}  // namespace

bool cXComponent::modifyStyle(DWORD remove, DWORD add, UINT swpFlags) {
  return isValid() && modifyLong(peer_->hwnd(), GWL_STYLE, remove, add, swpFlags);
}

bool cXComponent::modifyExStyle(DWORD remove, DWORD add, UINT swpFlags) {
  return isValid() && modifyLong(peer_->hwnd(), GWL_EXSTYLE, remove, add, swpFlags);
}

void cXComponent::reservedSlot45() {}

bool cXComponent::redraw(const RECT* rect, HRGN region, UINT flags) {
  if (!isValid() || !redrawEnabled_) return false;
  return RedrawWindow(peer_->hwnd(), rect, region, flags) != FALSE;
}

void cXComponent::invalidateRect(const RECT* rect) {
  if (isValid() && redrawEnabled_) InvalidateRect(peer_->hwnd(), rect, TRUE);
}

void cXComponent::setRedraw(bool enabled) {
  redrawEnabled_ = enabled ? 1 : 0;
  if (!isValid()) return;
  SendMessageA(peer_->hwnd(), WM_SETREDRAW, enabled ? TRUE : FALSE, 0);
  if (enabled) invalidate();
}

void cXComponent::reservedSlot49() {}

void cXComponent::scrollBy(int dx, int dy) {
  if (isValid() && redrawEnabled_) ScrollWindow(peer_->hwnd(), dx, dy, nullptr, nullptr);
}

int cXComponent::scrollEx(int dx, int dy, const RECT* scroll, const RECT* clip, HRGN update,
                          RECT* updateRect, UINT flags) {
  if (!isValid() || !redrawEnabled_) return ERROR;
  return ScrollWindowEx(peer_->hwnd(), dx, dy, scroll, clip, update, updateRect, flags);
}

void cXComponent::invalidate() {
  if (isValid() && redrawEnabled_) InvalidateRect(peer_->hwnd(), nullptr, TRUE);
}

void cXComponent::captureMouse() {
  if (isValid()) SetCapture(peer_->hwnd());
}

int cXComponent::getScrollPos(int bar) const {
  return isValid() ? GetScrollPos(peer_->hwnd(), bar) : 0;
}

int cXComponent::setScrollPos(int bar, int position, bool redraw) {
  return isValid() ? SetScrollPos(peer_->hwnd(), bar, position, redraw ? TRUE : FALSE) : 0;
}

int cXComponent::setScrollInfo(int bar, const SCROLLINFO& info, bool redraw) {
  return isValid() ? SetScrollInfo(peer_->hwnd(), bar, &info, redraw ? TRUE : FALSE) : 0;
}

bool cXComponent::getScrollInfo(int bar, SCROLLINFO& info) const {
  return isValid() && GetScrollInfo(peer_->hwnd(), bar, &info) != FALSE;
}

void cXComponent::repaintAll() {
  if (isValid() && (getStyle() & WS_VISIBLE)) invalidate();
}

SIZE cXComponent::getPreferredSize() { return SIZE{10, 10}; }

SIZE cXComponent::getPreferredSizeIn(const RECT&) { return SIZE{10, 10}; }

int cXComponent::fireAction() {
  if (!parent_) return 0;
  ToolkitEvent event(this, kEventAction, getHandle());
  return parent_->dispatchEvent(event);
}

void cXComponent::setUserValue1(int value) { userValue1_ = value; }
int cXComponent::getUserValue1() const { return userValue1_; }
void cXComponent::setUserValue2(int value) { userValue2_ = value; }
int cXComponent::getUserValue2() const { return userValue2_; }
void cXComponent::setUserId(int id) { userId_ = id; }

int cXComponent::messageBox(const char* text, UINT style, const char* buttonText) {
  return ModalDialog::showMessage(*this, text, style, buttonText);
}

int cXComponent::inputBox(const char* prompt, std::string& result, UINT style) {
  return ModalDialog::showInput(*this, prompt, result, style);
}

}  // namespace toolkit
