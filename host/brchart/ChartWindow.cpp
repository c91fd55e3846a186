#include "host/brchart/ChartWindow.h"

#include <windowsx.h>

#include "host/brchart/chart_position.h"

namespace br::brchart {

namespace {

const wchar_t kClassName[] = L"BrChartWindow";

using AtlAxWinInitFn = BOOL(WINAPI*)();
using AtlAxGetControlFn = HRESULT(WINAPI*)(HWND, IUnknown**);
AtlAxGetControlFn gGetControl = nullptr;

bool StartAtl() {
  if (gGetControl) return true;
  HMODULE atl = LoadLibraryW(L"atl.dll");
  if (!atl) atl = LoadLibraryW(L"atl100.dll");
  auto init = atl ? reinterpret_cast<AtlAxWinInitFn>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxWinInit")))
                  : nullptr;
  auto get = atl ? reinterpret_cast<AtlAxGetControlFn>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxGetControl")))
                 : nullptr;
  if (!init || !get || !init()) return false;
  gGetControl = get;
  return true;
}

template <typename I>
HRESULT ControlOf(HWND host, const IID& iid, I** out) {
  IUnknown* control = nullptr;
  *out = nullptr;
  if (!gGetControl || FAILED(gGetControl(host, &control)) || !control) return E_FAIL;
  const HRESULT hr = control->QueryInterface(iid, reinterpret_cast<void**>(out));
  control->Release();
  return hr;
}

std::wstring FromUtf8(const std::string& text) {
  const int n = MultiByteToWideChar(CP_UTF8, 0, text.c_str(), -1, nullptr, 0);
  std::wstring out(n > 0 ? n - 1 : 0, L'\0');
  if (n > 1) MultiByteToWideChar(CP_UTF8, 0, text.c_str(), -1, &out[0], n);
  return out;
}

}  // namespace

ChartWindow::ChartWindow(ChartSession& session) : session_(session) {}

bool ChartWindow::PositionOfPixel(long x, long y, chartscene::GeoPosition& at) const {
  const auto* projection = session_.Display().projection;
  return projection && PixelToPosition(*projection, x + 0.0, y + 0.0, at);
}

ChartWindow::~ChartWindow() {
  if (contours_) contours_->Release();
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
  RECT outer{0, 0, session_.Picture().Width() + kPanelWidth, session_.Picture().Height() + kStatusHeight};
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
  std::string why;
  if (!MakeDepthPanel(why)) note_ = why;
  if (session_.Host().IsOpen() && !legend_.Open(session_.Host(), ChartDataSetId(session_.Scene()), why))
    note_ += (note_.empty() ? "" : "; ") + why;
  LayOut();
  ShowStatusAt(nullptr);
  return true;
}

bool ChartWindow::MakeDepthPanel(std::string& error) {
  const HINSTANCE instance = GetModuleHandleW(nullptr);
  panelTitle_ = CreateWindowExW(0, L"STATIC", L"Depth shades", WS_CHILD | WS_VISIBLE | SS_CENTER | SS_CENTERIMAGE,
                                0, 0, 0, 0, window_, nullptr, instance, nullptr);
  if (panelTitle_ && font_) SendMessageW(panelTitle_, WM_SETFONT, reinterpret_cast<WPARAM>(font_), FALSE);
  if (!StartAtl()) {
    error = "no depth panel: the ATL control host (atl.dll) is not available";
    return false;
  }
  contoursHost_ = CreateWindowExW(0, L"AtlAxWin", L"BR_Info.XContoursView", WS_CHILD | WS_VISIBLE | WS_CLIPCHILDREN,
                                  0, 0, 0, 0, window_, nullptr, instance, nullptr);
  if (!contoursHost_ || FAILED(ControlOf(contoursHost_, IID_IXContoursView, &contours_))) {
    error = "no depth panel: BR_Info.XContoursView cannot be made";
    return false;
  }
  // The scene's own presentation parameters, colour map and palette, through the host.
  const ChartDisplay& display = session_.Display();
  SceneClient& host = session_.Host();
  IUnknown* params = display.presParams ? host.PresParams(display.presParams->name) : nullptr;
  IUnknown* colours = display.colorMap ? host.ColorMap(display.colorMap->name) : nullptr;
  const long palette = display.palette ? host.Palette(display.palette->name) : 0;
  const double safety = ContoursOf(display.presParams).safety;
  const HRESULT set = contours_->SetContoursData(params, colours, safety);
  if (palette) contours_->put_Palette(palette);
  if (params) params->Release();
  if (colours) colours->Release();
  if (set != S_OK) {
    error = "the depth panel has no presentation parameters or colour map";
    return false;
  }
  return true;
}

SIZE ChartWindow::ContentSize() const {
  return SIZE{session_.Picture().Width() + kPanelWidth, session_.Picture().Height() + kStatusHeight};
}

void ChartWindow::LayOut() {
  // Everything keeps its place whatever the window's size: the chart is drawn 1:1.
  const SIZE content = ContentSize();
  const long chartWidth = session_.Picture().Width(), chartHeight = session_.Picture().Height();
  if (panelTitle_) MoveWindow(panelTitle_, chartWidth, 0, kPanelWidth, kPanelTitleHeight, TRUE);
  if (contoursHost_)
    MoveWindow(contoursHost_, chartWidth, kPanelTitleHeight, kPanelWidth, chartHeight - kPanelTitleHeight, TRUE);
  if (statusLine_) MoveWindow(statusLine_, 0, chartHeight, content.cx, kStatusHeight, TRUE);
}

void ChartWindow::DrawInto(HDC dc) {
  const SIZE content = ContentSize();
  const RECT all{0, 0, content.cx, content.cy};
  FillRect(dc, &all, GetSysColorBrush(COLOR_BTNFACE));
  session_.Picture().Draw(dc);
  // Children that are drawn by hand: not every system's static controls answer WM_PRINT.
  const HGDIOBJ oldFont = font_ ? SelectObject(dc, font_) : nullptr;
  SetBkMode(dc, TRANSPARENT);
  SetTextColor(dc, GetSysColor(COLOR_BTNTEXT));
  for (HWND label : {panelTitle_, statusLine_}) {
    if (!label) continue;
    RECT r{};
    GetWindowRect(label, &r);
    MapWindowPoints(HWND_DESKTOP, window_, reinterpret_cast<POINT*>(&r), 2);
    if (label == statusLine_) DrawEdge(dc, &r, BDR_SUNKENOUTER, BF_RECT | BF_ADJUST);
    InflateRect(&r, -3, 0);
    wchar_t text[512] = {};
    GetWindowTextW(label, text, 512);
    DrawTextW(dc, text, -1, &r, DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | (label == panelTitle_ ? DT_CENTER : DT_LEFT));
  }
  if (oldFont) SelectObject(dc, oldFont);
  if (contoursHost_ && contours_) {
    RECT r{};
    GetWindowRect(contoursHost_, &r);
    MapWindowPoints(HWND_DESKTOP, window_, reinterpret_cast<POINT*>(&r), 2);
    IViewObject* view = nullptr;
    if (SUCCEEDED(contours_->QueryInterface(IID_IViewObject, reinterpret_cast<void**>(&view)))) {
      const RECTL bounds{r.left, r.top, r.right, r.bottom};
      view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, dc, &bounds, nullptr, nullptr, 0);
      view->Release();
    }
  }
}

std::vector<std::uint32_t> ChartWindow::Pixels(int& width, int& height) {
  std::vector<std::uint32_t> pixels;
  const SIZE content = ContentSize();
  width = content.cx;
  height = content.cy;
  if (width <= 0 || height <= 0) return pixels;
  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof(info.bmiHeader);
  info.bmiHeader.biWidth = width;
  info.bmiHeader.biHeight = -height;  // top-down
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  info.bmiHeader.biCompression = BI_RGB;
  void* bits = nullptr;
  HDC screen = GetDC(nullptr);
  HDC memory = CreateCompatibleDC(screen);
  ReleaseDC(nullptr, screen);
  HBITMAP bitmap = CreateDIBSection(memory, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  if (memory && bitmap && bits) {
    HGDIOBJ old = SelectObject(memory, bitmap);
    DrawInto(memory);
    GdiFlush();
    const auto* from = static_cast<const std::uint32_t*>(bits);
    pixels.assign(from, from + static_cast<std::size_t>(width) * static_cast<std::size_t>(height));
    SelectObject(memory, old);
  }
  if (bitmap) DeleteObject(bitmap);
  if (memory) DeleteDC(memory);
  return pixels;
}

void ChartWindow::SetNote(const std::string& note) {
  note_ = note;
  ShowStatusAt(nullptr);
}

void ChartWindow::ShowStatusAt(const chartscene::GeoPosition* at) {
  status_ = at ? PositionText(*at) : "";
  const std::string legend = at ? legend_.At(at->lat, at->lon) : "";
  if (!legend.empty()) status_ += "   [" + legend + "]";
  if (!picked_.empty()) status_ += "   " + picked_;
  if (!note_.empty()) status_ += "   (" + note_ + ")";
  if (statusLine_) SetWindowTextW(statusLine_, FromUtf8(status_).c_str());
}

void ChartWindow::PickAt(long x, long y) {
  session_.Pick(x, y);
  picked_ = session_.PickedText();
  chartscene::GeoPosition at;
  const bool known = PositionOfPixel(x, y, at);
  ShowStatusAt(known ? &at : nullptr);
  InvalidateRect(window_, nullptr, FALSE);
}

bool ChartWindow::SelectNamed(const std::string& name) {
  if (!session_.Select(name)) return false;
  picked_ = "selected: " + session_.PickedText().substr(session_.PickedText().find(": ") + 2);
  const auto& shape = session_.Scene().objects[session_.Picked().front()].geometry;
  ShowStatusAt(shape.empty() ? nullptr : &shape.front());
  InvalidateRect(window_, nullptr, FALSE);
  return true;
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
  if (message == WM_GETMINMAXINFO) {
    // A chart larger than the screen keeps its size (it comes before WM_NCCREATE, so
    // it is answered here for every window of the class).
    auto* limits = reinterpret_cast<MINMAXINFO*>(lParam);
    limits->ptMaxTrackSize.x = limits->ptMaxSize.x = 16000;
    limits->ptMaxTrackSize.y = limits->ptMaxSize.y = 16000;
    return 0;
  }
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
      chartscene::GeoPosition at;
      if (y < session_.Picture().Height() && PositionOfPixel(x, y, at)) ShowStatusAt(&at);
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
