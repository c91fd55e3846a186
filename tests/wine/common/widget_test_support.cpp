#include "tests/wine/common/widget_test_support.h"

#include <cstdio>

namespace wtest {

namespace {
const char* hostClass() {
  static bool registered = false;
  if (!registered) {
    WNDCLASSA wc{};
    wc.lpfnWndProc = DefWindowProcA;
    wc.hInstance = GetModuleHandleA(nullptr);
    wc.lpszClassName = "WidgetTestHost";
    wc.hbrBackground = reinterpret_cast<HBRUSH>(COLOR_BTNFACE + 1);
    RegisterClassA(&wc);
    registered = true;
  }
  return "WidgetTestHost";
}
}  // namespace

HostWindow::HostWindow(int width, int height) {
  hwnd_ = CreateWindowExA(0, hostClass(), "host", WS_POPUP | WS_VISIBLE | WS_CLIPCHILDREN, 100, 100, width,
                          height, nullptr, nullptr, GetModuleHandleA(nullptr), nullptr);
  SetForegroundWindow(hwnd_);
  SetActiveWindow(hwnd_);
}

HostWindow::~HostWindow() {
  if (hwnd_ && IsWindow(hwnd_)) DestroyWindow(hwnd_);
}

void pump(int ms) {
  const DWORD start = GetTickCount();
  do {
    MSG msg;
    while (PeekMessageA(&msg, nullptr, 0, 0, PM_REMOVE)) {
      TranslateMessage(&msg);
      DispatchMessageA(&msg);
    }
    if (ms > 0) Sleep(1);
  } while (static_cast<int>(GetTickCount() - start) < ms);
}

Seen recordOf(const toolkit::ToolkitEvent& event) {
  Seen s{event.id, event.source, event.hwnd, {}, event.keyState};
  for (int i = 0; i < 7; ++i) s.params[i] = event.params[i];
  return s;
}

int RecordingPanel::dispatchEvent(toolkit::ToolkitEvent& event) {
  seen.push_back(recordOf(event));
  if (event.source == this) return Container::dispatchEvent(event);
  return answer;
}

int RecordingPanel::count(int id) const {
  int n = 0;
  for (const Seen& s : seen) n += s.id == id;
  return n;
}

const Seen* lastOf(const std::vector<Seen>& seen, int id) {
  for (auto it = seen.rbegin(); it != seen.rend(); ++it) {
    if (it->id == id) return &*it;
  }
  return nullptr;
}

void mount(RecordingPanel& panel, HostWindow& host) {
  panel.create(host.hwnd());
  RECT client{};
  GetClientRect(host.hwnd(), &client);
  panel.setBounds(0, 0, client.right, client.bottom, true, true);
}

void key(HWND hwnd, int virtualKey) { SendMessageA(hwnd, WM_KEYDOWN, static_cast<WPARAM>(virtualKey), 1); }

void typeChar(HWND hwnd, char ch) {
  SendMessageA(hwnd, WM_CHAR, static_cast<WPARAM>(static_cast<unsigned char>(ch)), 1);
}

void press(HWND hwnd, UINT message, int x, int y, WPARAM keys) {
  SendMessageA(hwnd, message, keys, MAKELPARAM(x, y));
}

Canvas::Canvas(int width, int height, COLORREF fill) : width_(width), height_(height) {
  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof(info.bmiHeader);
  info.bmiHeader.biWidth = width;
  info.bmiHeader.biHeight = -height;
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  info.bmiHeader.biCompression = BI_RGB;
  HDC screen = GetDC(nullptr);
  dc_ = CreateCompatibleDC(screen);
  void* bits = nullptr;
  bitmap_ = CreateDIBSection(screen, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  ReleaseDC(nullptr, screen);
  bits_ = static_cast<std::uint32_t*>(bits);
  old_ = SelectObject(dc_, bitmap_);
  RECT all{0, 0, width, height};
  HBRUSH brush = CreateSolidBrush(fill);
  FillRect(dc_, &all, brush);
  DeleteObject(brush);
  GdiFlush();
}

Canvas::~Canvas() {
  SelectObject(dc_, old_);
  DeleteObject(bitmap_);
  DeleteDC(dc_);
}

COLORREF Canvas::raw(int x, int y) const {
  if (!bits_ || x < 0 || y < 0 || x >= width_ || y >= height_) return CLR_INVALID;
  const std::uint32_t p = bits_[y * width_ + x];
  return RGB((p >> 16) & 0xFF, (p >> 8) & 0xFF, p & 0xFF);
}

COLORREF Canvas::at(int x, int y) const {
  GdiFlush();
  return raw(x, y);
}

int Canvas::countIn(COLORREF colour, const RECT& area) const {
  GdiFlush();
  int n = 0;
  for (int y = area.top; y < area.bottom; ++y)
    for (int x = area.left; x < area.right; ++x) n += raw(x, y) == colour;
  return n;
}

std::string windowClass(HWND hwnd) {
  char name[128] = {};
  GetClassNameA(hwnd, name, static_cast<int>(sizeof(name)));
  return name;
}

RECT xywh(int x, int y, int w, int h) { return RECT{x, y, x + w, y + h}; }

std::string str(const RECT& r) {
  char buffer[96];
  std::snprintf(buffer, sizeof(buffer), "(%ld,%ld %ldx%ld)", static_cast<long>(r.left), static_cast<long>(r.top),
                static_cast<long>(r.right - r.left), static_cast<long>(r.bottom - r.top));
  return buffer;
}

std::string str(SIZE s) { return std::to_string(s.cx) + "x" + std::to_string(s.cy); }

std::string str(POINT p) { return "(" + std::to_string(p.x) + "," + std::to_string(p.y) + ")"; }

bool cursorMoves() {
  SetCursorPos(7, 9);
  POINT at{};
  GetCursorPos(&at);
  return at.x == 7 && at.y == 9;
}

}  // namespace wtest
