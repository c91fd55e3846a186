#include "host/brchart/ChartWindow.h"

#include <windowsx.h>

namespace br::brchart {

namespace {

const wchar_t kClassName[] = L"BrChartWindow";

std::wstring FromUtf8(const std::string& text) {
  const int n = MultiByteToWideChar(CP_UTF8, 0, text.c_str(), -1, nullptr, 0);
  std::wstring out(n > 0 ? n - 1 : 0, L'\0');
  if (n > 1) MultiByteToWideChar(CP_UTF8, 0, text.c_str(), -1, &out[0], n);
  return out;
}

}  // namespace

ChartWindow::ChartWindow(ChartSession& session) : session_(session) {}

ChartWindow::~ChartWindow() {
  if (window_ && IsWindow(window_)) DestroyWindow(window_);
  if (font_) DeleteObject(font_);
}

bool ChartWindow::Create(std::string& error) {
  WNDCLASSEXW wc{};
  wc.cbSize = sizeof(wc);
  wc.style = CS_HREDRAW | CS_VREDRAW;
  wc.lpfnWndProc = &ChartWindow::Procedure;
  wc.hInstance = GetModuleHandleW(nullptr);
  wc.hCursor = LoadCursor(nullptr, IDC_CROSS);
  wc.hbrBackground = reinterpret_cast<HBRUSH>(COLOR_BTNFACE + 1);
  wc.lpszClassName = kClassName;
  WNDCLASSEXW known{};
  known.cbSize = sizeof(known);
  if (!GetClassInfoExW(wc.hInstance, kClassName, &known) && !RegisterClassExW(&wc)) {
    error = "the chart window class cannot be registered";
    return false;
  }
  const DWORD style = WS_OVERLAPPEDWINDOW;
  RECT outer{0, 0, session_.Picture().Width(), session_.Picture().Height() + kStatusHeight};
  AdjustWindowRect(&outer, style, FALSE);
  window_ = CreateWindowExW(0, kClassName, L"brchart", style, CW_USEDEFAULT, CW_USEDEFAULT, outer.right - outer.left,
                            outer.bottom - outer.top, nullptr, nullptr, wc.hInstance, this);
  if (!window_) {
    error = "the chart window cannot be made";
    return false;
  }
  NONCLIENTMETRICSW metrics{};
  metrics.cbSize = sizeof(metrics);
  if (SystemParametersInfoW(SPI_GETNONCLIENTMETRICS, sizeof(metrics), &metrics, 0))
    font_ = CreateFontIndirectW(&metrics.lfStatusFont);
  statusLine_ = CreateWindowExW(0, L"STATIC", L"", WS_CHILD | WS_VISIBLE | SS_LEFTNOWORDWRAP | SS_SUNKEN, 0, 0, 0, 0,
                                window_, nullptr, wc.hInstance, nullptr);
  if (statusLine_ && font_) SendMessageW(statusLine_, WM_SETFONT, reinterpret_cast<WPARAM>(font_), FALSE);
  LayOut();
  ShowStatus(session_.PositionAt(session_.Picture().Width() / 2, session_.Picture().Height() / 2));
  return true;
}

void ChartWindow::LayOut() {
  if (!statusLine_) return;
  RECT client{};
  GetClientRect(window_, &client);
  MoveWindow(statusLine_, 0, client.bottom - kStatusHeight, client.right, kStatusHeight, TRUE);
}

void ChartWindow::SetNote(const std::string& note) {
  note_ = note;
  ShowStatus(session_.PositionAt(session_.Picture().Width() / 2, session_.Picture().Height() / 2));
}

void ChartWindow::ShowStatus(const std::string& position) {
  status_ = position;
  if (!picked_.empty()) status_ += "   " + picked_;
  if (!note_.empty()) status_ += "   (" + note_ + ")";
  if (statusLine_) SetWindowTextW(statusLine_, FromUtf8(status_).c_str());
}

void ChartWindow::PickAt(long x, long y) {
  session_.Pick(x, y);
  picked_ = session_.PickedText();
  ShowStatus(session_.PositionAt(x, y));
  InvalidateRect(window_, nullptr, FALSE);
}

void ChartWindow::Paint() {
  PAINTSTRUCT paint;
  HDC dc = BeginPaint(window_, &paint);
  const long w = session_.Picture().Width(), h = session_.Picture().Height();
  // Through a bitmap, so the chart never flickers while it is drawn.
  HDC memory = CreateCompatibleDC(dc);
  HBITMAP bitmap = CreateCompatibleBitmap(dc, w, h);
  if (memory && bitmap) {
    HGDIOBJ old = SelectObject(memory, bitmap);
    session_.Picture().Draw(memory);
    BitBlt(dc, 0, 0, w, h, memory, 0, 0, SRCCOPY);
    SelectObject(memory, old);
  }
  if (bitmap) DeleteObject(bitmap);
  if (memory) DeleteDC(memory);
  EndPaint(window_, &paint);
}

LRESULT CALLBACK ChartWindow::Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_NCCREATE) {
    auto* self = static_cast<ChartWindow*>(reinterpret_cast<CREATESTRUCTW*>(lParam)->lpCreateParams);
    self->window_ = window;
    SetWindowLongPtrW(window, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(self));
  }
  auto* self = reinterpret_cast<ChartWindow*>(GetWindowLongPtrW(window, GWLP_USERDATA));
  if (!self) return DefWindowProcW(window, message, wParam, lParam);
  return self->Handle(message, wParam, lParam);
}

LRESULT ChartWindow::Handle(UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_PAINT:
      Paint();
      return 0;
    case WM_ERASEBKGND:
      return 1;  // the chart covers its part; the status line paints itself
    case WM_SIZE:
      LayOut();
      return 0;
    case WM_MOUSEMOVE: {
      const long x = GET_X_LPARAM(lParam), y = GET_Y_LPARAM(lParam);
      if (y < session_.Picture().Height()) ShowStatus(session_.PositionAt(x, y));
      return 0;
    }
    case WM_LBUTTONDOWN: {
      const long x = GET_X_LPARAM(lParam), y = GET_Y_LPARAM(lParam);
      if (y < session_.Picture().Height()) PickAt(x, y);
      return 0;
    }
    case WM_DESTROY:
      SetWindowLongPtrW(window_, GWLP_USERDATA, 0);
      window_ = nullptr;
      PostQuitMessage(0);
      return 0;
    default:
      return DefWindowProcW(window_, message, wParam, lParam);
  }
}

}  // namespace br::brchart
