#include "toolkit/widgets/Tooltip.h"

#include <algorithm>
#include <vector>

#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/core/cXComponent.h"

namespace toolkit {

namespace {

// Listed in creation order; the first one under the cursor is armed.
std::vector<Tooltip*>& tooltips() {
  static std::vector<Tooltip*> list;
  return list;
}

UINT_PTR g_scanTimer = 0;

bool mouseButtonDown() {
  return (GetAsyncKeyState(VK_LBUTTON) & 0x8000) || (GetAsyncKeyState(VK_RBUTTON) & 0x8000) ||
         (GetAsyncKeyState(VK_MBUTTON) & 0x8000);
}

}  // namespace

Tooltip::Tooltip(HWND owner) : owner_(owner) {}

Tooltip::~Tooltip() {
  auto& list = tooltips();
  list.erase(std::remove(list.begin(), list.end(), this), list.end());
  stopScanningWhenIdle();
}

bool Tooltip::registerClass() {
  HINSTANCE instance = ToolkitWindows::moduleInstance();
  WNDCLASSEXA info{};
  info.cbSize = sizeof(info);
  if (GetClassInfoExA(instance, kClassName, &info)) {
    if (info.lpfnWndProc == &Tooltip::windowProc) return true;
    UnregisterClassA(kClassName, instance);  // left by an earlier load of the module
  }
  WNDCLASSEXA wc{};
  wc.cbSize = sizeof(wc);
  wc.style = CS_HREDRAW | CS_VREDRAW;
  wc.lpfnWndProc = &Tooltip::windowProc;
  wc.hInstance = instance;
  wc.hCursor = LoadCursor(nullptr, IDC_CROSS);
  wc.hbrBackground = GetSysColorBrush(COLOR_INFOBK);
  wc.lpszClassName = kClassName;
  return RegisterClassExA(&wc) != 0;
}

HWND Tooltip::createFor(HWND owner) {
  if (!owner || !IsWindow(owner) || !registerClass()) return nullptr;
  auto* tip = new Tooltip(owner);
  tooltips().push_back(tip);
  HWND popup = CreateWindowExA(WS_EX_TOOLWINDOW, kClassName, "", WS_POPUP, 0, 0, 0, 0, owner, nullptr,
                               ToolkitWindows::moduleInstance(), tip);
  if (!popup) {
    // A window that got as far as WM_NCDESTROY has deleted its object already.
    auto& list = tooltips();
    if (std::find(list.begin(), list.end(), tip) != list.end()) delete tip;
    return nullptr;
  }
  startScanning();
  return popup;
}

Tooltip* Tooltip::of(HWND popup) {
  if (!popup || !IsWindow(popup)) return nullptr;
  for (Tooltip* tip : tooltips()) {
    if (tip->popup_ == popup) return tip;
  }
  return nullptr;
}

Tooltip* Tooltip::of(const cXComponent& component) { return of(component.tooltipWindow()); }

size_t Tooltip::count() { return tooltips().size(); }

void Tooltip::setText(std::string_view text) {
  text_.assign(text.data(), text.size());
  if (popup_ && IsWindowVisible(popup_)) InvalidateRect(popup_, nullptr, TRUE);
}

void Tooltip::setSize(int width, int height) {
  width_ = std::max(width, 0);
  height_ = std::max(height, 0);
}

void Tooltip::setFittedText(std::string_view text, int maxWidth) {
  setText(text);
  HDC screen = GetDC(nullptr);
  if (!screen) return;
  HGDIOBJ old = SelectObject(screen, GetStockObject(DEFAULT_GUI_FONT));
  RECT box{0, 0, std::max(maxWidth - 2 * kTextInset, 1), 0};
  DrawTextA(screen, text_.c_str(), textLength(), &box, DT_WORDBREAK | DT_CALCRECT | DT_NOPREFIX);
  SelectObject(screen, old);
  ReleaseDC(nullptr, screen);
  setSize(box.right - box.left + 2 * kTextInset + 2, box.bottom - box.top + 2 * kTextInset);
}

void Tooltip::shutdown() {
  // Copied: each popup leaves the list as it goes.
  const std::vector<Tooltip*> list = tooltips();
  for (Tooltip* tip : list) DestroyWindow(tip->popup_);
  if (g_scanTimer) KillTimer(nullptr, g_scanTimer);
  g_scanTimer = 0;
  UnregisterClassA(kClassName, ToolkitWindows::moduleInstance());
}

void Tooltip::startScanning() {
  if (!g_scanTimer) g_scanTimer = SetTimer(nullptr, 0, kScanPeriodMs, &Tooltip::scan);
}

void Tooltip::stopScanningWhenIdle() {
  if (g_scanTimer && tooltips().empty()) {
    KillTimer(nullptr, g_scanTimer);
    g_scanTimer = 0;
  }
}

bool Tooltip::cursorOverOwner() const {
  if (!owner_ || !IsWindow(owner_) || !IsWindowVisible(owner_)) return false;
  POINT cursor{};
  if (!GetCursorPos(&cursor)) return false;
  HWND parent = GetParent(owner_);
  if (!parent || !(GetWindowLongA(owner_, GWL_STYLE) & WS_CHILD)) return WindowFromPoint(cursor) == owner_;
  POINT inParent = cursor;
  ScreenToClient(parent, &inParent);
  return ChildWindowFromPointEx(parent, inParent, CWP_SKIPINVISIBLE) == owner_;
}

Tooltip* Tooltip::findOwner(HWND hwnd) {
  for (Tooltip* tip : tooltips()) {
    if (tip->owner_ == hwnd) return tip;
  }
  return nullptr;
}

Tooltip* Tooltip::underCursor() {
  POINT cursor{};
  if (!GetCursorPos(&cursor)) return nullptr;
  // The innermost component under the cursor: a container's popup must not
  // shadow those of the components inside it.
  for (HWND hwnd = WindowFromPoint(cursor); hwnd; hwnd = GetAncestor(hwnd, GA_PARENT)) {
    Tooltip* tip = findOwner(hwnd);
    if (tip && tip->cursorOverOwner()) return tip;
    if (!(GetWindowLongA(hwnd, GWL_STYLE) & WS_CHILD)) break;
  }
  return nullptr;
}

void CALLBACK Tooltip::scan(HWND, UINT, UINT_PTR, DWORD) {
  // Copied: destroying popups changes the list.
  const std::vector<Tooltip*> list = tooltips();
  for (Tooltip* tip : list) {
    if (!IsWindow(tip->owner_)) DestroyWindow(tip->popup_);  // a popup lives no longer than its owner
  }
  if (Tooltip* tip = underCursor()) tip->arm();
}

void Tooltip::arm() {
  if (timerRunning_) return;
  if (!SetTimer(popup_, kTimerId, kTimerPeriodMs, nullptr)) return;
  timerRunning_ = true;
  armedAt_ = GetTickCount();
}

void Tooltip::tick() {
  if (underCursor() == this && !mouseButtonDown()) {
    if (!shown_ && GetTickCount() - armedAt_ > kDelayMs) show();
    return;
  }
  KillTimer(popup_, kTimerId);
  timerRunning_ = false;
  hide();
}

void Tooltip::show() {
  shown_ = true;
  NMHDR header{};
  header.hwndFrom = popup_;
  header.idFrom = kNotifyId;
  header.code = kNotifyCode;
  SendMessageA(owner_, WM_NOTIFY, kNotifyId, reinterpret_cast<LPARAM>(&header));
  if (!popup_ || !IsWindow(popup_) || text_.empty() || width_ <= 0 || height_ <= 0) return;
  POINT cursor{};
  GetCursorPos(&cursor);
  const POINT at = placement(cursor, SIZE{width_, height_}, GetSystemMetrics(SM_CXSCREEN),
                             GetSystemMetrics(SM_CYSCREEN), GetSystemMetrics(SM_CYCURSOR));
  SetWindowPos(popup_, nullptr, at.x, at.y, width_, height_,
               SWP_NOZORDER | SWP_NOACTIVATE | SWP_SHOWWINDOW);
}

void Tooltip::hide() {
  if (popup_ && IsWindow(popup_)) ShowWindow(popup_, SW_HIDE);
  shown_ = false;
}

POINT Tooltip::placement(POINT cursor, SIZE popup, int screenWidth, int screenHeight, int cursorHeight) {
  POINT at{cursor.x, 0};
  if (at.x + popup.cx > screenWidth) at.x = screenWidth - popup.cx;
  if (cursor.y + cursorHeight + popup.cy <= screenHeight) at.y = cursor.y + cursorHeight;
  else at.y = cursor.y - popup.cy - 3;
  return at;
}

void Tooltip::draw(HDC dc, const RECT& client) const {
  HBRUSH back = CreateSolidBrush(GetSysColor(COLOR_INFOBK));
  FillRect(dc, &client, back);
  DeleteObject(back);
  HBRUSH frame = CreateSolidBrush(GetSysColor(COLOR_INFOTEXT));
  FrameRect(dc, &client, frame);
  DeleteObject(frame);
  RECT inner = client;
  InflateRect(&inner, -kTextInset, -kTextInset);
  HGDIOBJ oldFont = SelectObject(dc, GetStockObject(DEFAULT_GUI_FONT));
  const int oldMode = SetBkMode(dc, TRANSPARENT);
  const COLORREF oldColor = SetTextColor(dc, GetSysColor(COLOR_INFOTEXT));
  DrawTextA(dc, text_.c_str(), textLength(), &inner, DT_WORDBREAK | DT_NOPREFIX);
  SetTextColor(dc, oldColor);
  SetBkMode(dc, oldMode);
  SelectObject(dc, oldFont);
}

LRESULT CALLBACK Tooltip::windowProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_NCCREATE) {
    auto* tip = static_cast<Tooltip*>(reinterpret_cast<CREATESTRUCTA*>(lParam)->lpCreateParams);
    tip->popup_ = hwnd;
    SetWindowLongPtrA(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(tip));
  }
  auto* tip = reinterpret_cast<Tooltip*>(GetWindowLongPtrA(hwnd, GWLP_USERDATA));
  if (!tip) return DefWindowProcA(hwnd, message, wParam, lParam);
  switch (message) {
    case WM_TIMER:
      if (wParam == kTimerId) {
        tip->tick();
        return 0;
      }
      break;
    case WM_MOUSEACTIVATE:
      return MA_NOACTIVATE;
    case WM_ERASEBKGND:
      return 1;
    case WM_PAINT: {
      PAINTSTRUCT ps;
      HDC dc = BeginPaint(hwnd, &ps);
      RECT client;
      GetClientRect(hwnd, &client);
      if (dc) tip->draw(dc, client);
      EndPaint(hwnd, &ps);
      return 0;
    }
    case WM_DESTROY:
      KillTimer(hwnd, kTimerId);
      tip->timerRunning_ = false;
      break;
    case WM_NCDESTROY:
      SetWindowLongPtrA(hwnd, GWLP_USERDATA, 0);
      delete tip;
      return DefWindowProcA(hwnd, message, wParam, lParam);
    default:
      break;
  }
  return DefWindowProcA(hwnd, message, wParam, lParam);
}

}  // namespace toolkit
