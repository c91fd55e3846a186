#include "host/brchart/ChartWindow.h"

#include <windowsx.h>
#include <commctrl.h>

#include <functional>

#include <cstdint>
#include <cstring>
#include <utility>

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

ChartWindow::ChartWindow(ChartSession& session)
    : session_(session),
      inspectorSink_(DIID__IXObjectInspectorEvents, [this](DISPID id, const DISPPARAMS& params) {
        if (id == 1) OnInspectorSelection(params);
      }) {}

bool ChartWindow::PositionOfPixel(long x, long y, chartscene::GeoPosition& at) const {
  const auto* projection = session_.Display().projection;
  return projection && PixelToPosition(*projection, x + 0.0, y + 0.0, at);
}

ChartWindow::~ChartWindow() {
  inspectorSink_.Disconnect();
  if (inspector_) inspector_->Release();
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
  RECT outer{0, 0, session_.Picture().Width() + kPanelWidth + kInspectorWidth,
             session_.Picture().Height() + kStatusHeight};
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
  if (!MakeInspector(why)) note_ += (note_.empty() ? "" : "; ") + why;
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
  return SIZE{session_.Picture().Width() + kPanelWidth + kInspectorWidth, session_.Picture().Height() + kStatusHeight};
}

bool ChartWindow::MakeInspector(std::string& error) {
  if (!StartAtl()) {
    error = "no inspector: the ATL control host (atl.dll) is not available";
    return false;
  }
  inspectorHost_ = CreateWindowExW(0, L"AtlAxWin", L"BR_Info.XObjectInspector", WS_CHILD | WS_VISIBLE | WS_CLIPCHILDREN,
                                   0, 0, 0, 0, window_, nullptr, GetModuleHandleW(nullptr), nullptr);
  if (!inspectorHost_ || FAILED(ControlOf(inspectorHost_, IID_IXObjectInspector, &inspector_))) {
    error = "no inspector: BR_Info.XObjectInspector cannot be made";
    return false;
  }
  inspectorSink_.Connect(inspector_);
  return true;
}

void ChartWindow::Inspect() {
  if (!inspector_ || !session_.Host().IsOpen()) return;
  std::string names;
  for (std::size_t object : session_.Picked()) {
    if (!names.empty()) names += ",";
    names += session_.Scene().objects[object].name;
  }
  VARIANT records;
  if (names.empty() || !session_.Host().ObjectRecords(names, records)) {
    // Nothing picked: an empty tree.
    VARIANT none;
    VariantInit(&none);
    inspector_->SetInfo(none);
    return;
  }
  inspector_->SetInfo(records);
  VariantClear(&records);
}

std::size_t ChartWindow::ObjectOfGuid(const std::string& guid) const {
  const auto& scene = session_.Scene();
  for (std::size_t i = 0; i < scene.objects.size(); ++i) {
    const auto identity = chartscene::ObjectIdentity(scene, i);
    GUID id;
    static_assert(sizeof(id) == 16, "an identity is 16 bytes");
    std::memcpy(&id, identity.data(), sizeof(id));
    wchar_t text[40] = {};
    StringFromGUID2(id, text, 40);
    if (lstrcmpiW(text, FromUtf8(guid).c_str()) == 0) return i;
  }
  return SIZE_MAX;
}

void ChartWindow::OnInspectorSelection(const DISPPARAMS& params) {
  // SelectObject(guid, &owner, double click): the arguments come last first.
  if (params.cArgs < 1) return;
  const VARIANT& first = params.rgvarg[params.cArgs - 1];
  if (first.vt != VT_BSTR) return;
  const int n = WideCharToMultiByte(CP_UTF8, 0, first.bstrVal, -1, nullptr, 0, nullptr, nullptr);
  std::string guid(n > 0 ? n - 1 : 0, '\0');
  if (n > 1) WideCharToMultiByte(CP_UTF8, 0, first.bstrVal, -1, &guid[0], n, nullptr, nullptr);
  const std::size_t object = ObjectOfGuid(guid);
  if (object == SIZE_MAX) return;  // the dataset header, or an object off this chart
  session_.Picture().SetHighlighted({object});
  inspected_ = "inspected: " + LabelOf(session_.Scene(), object) + " (" + AcronymOf(session_.Scene(), object) + ")";
  const chartscene::GeoPosition at = lastAt_;
  ShowStatusAt(hasLastAt_ ? &at : nullptr);
  InvalidateRect(window_, nullptr, FALSE);
}

std::string ChartWindow::InspectedGuid() {
  if (!inspector_) return "";
  BSTR guid = nullptr;
  IUnknown* owner = nullptr;
  std::string out;
  if (inspector_->GetSelectedObject(&guid, &owner) == S_OK && guid) {
    const int n = WideCharToMultiByte(CP_UTF8, 0, guid, -1, nullptr, 0, nullptr, nullptr);
    out.assign(n > 0 ? n - 1 : 0, '\0');
    if (n > 1) WideCharToMultiByte(CP_UTF8, 0, guid, -1, &out[0], n, nullptr, nullptr);
  }
  SysFreeString(guid);
  if (owner) owner->Release();
  return out;
}

std::string ChartWindow::InspectedName() {
  const std::size_t object = ObjectOfGuid(InspectedGuid());
  return object == SIZE_MAX ? "" : session_.Scene().objects[object].name;
}

void ChartWindow::LayOut() {
  // Everything keeps its place whatever the window's size: the chart is drawn 1:1.
  const SIZE content = ContentSize();
  const long chartWidth = session_.Picture().Width(), chartHeight = session_.Picture().Height();
  if (panelTitle_) MoveWindow(panelTitle_, chartWidth, 0, kPanelWidth, kPanelTitleHeight, TRUE);
  if (contoursHost_)
    MoveWindow(contoursHost_, chartWidth, kPanelTitleHeight, kPanelWidth, chartHeight - kPanelTitleHeight, TRUE);
  if (inspectorHost_) MoveWindow(inspectorHost_, chartWidth + kPanelWidth, 0, kInspectorWidth, chartHeight, TRUE);
  if (statusLine_) MoveWindow(statusLine_, 0, chartHeight, content.cx, kStatusHeight, TRUE);
}

void ChartWindow::DrawInto(HDC dc) {
  const SIZE content = ContentSize();
  const RECT all{0, 0, content.cx, content.cy};
  FillRect(dc, &all, GetSysColorBrush(COLOR_BTNFACE));
  // The hosted controls picture themselves.
  const std::pair<HWND, IUnknown*> controls[] = {{contoursHost_, contours_}, {inspectorHost_, inspector_}};
  for (const auto& [host, control] : controls) {
    if (!host || !control) continue;
    RECT r{};
    GetWindowRect(host, &r);
    MapWindowPoints(HWND_DESKTOP, window_, reinterpret_cast<POINT*>(&r), 2);
    IViewObject* view = nullptr;
    if (SUCCEEDED(control->QueryInterface(IID_IViewObject, reinterpret_cast<void**>(&view)))) {
      const RECTL bounds{r.left, r.top, r.right, r.bottom};
      const int saved = SaveDC(dc);
      view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, dc, &bounds, nullptr, nullptr, 0);
      RestoreDC(dc, saved);
      view->Release();
    }
  }
  // Then what brchart draws itself, over anything a control left beyond its bounds.
  SelectClipRgn(dc, nullptr);
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
    FillRect(dc, &r, GetSysColorBrush(COLOR_BTNFACE));
    if (label == statusLine_) DrawEdge(dc, &r, BDR_SUNKENOUTER, BF_RECT | BF_ADJUST);
    InflateRect(&r, -3, 0);
    wchar_t text[512] = {};
    GetWindowTextW(label, text, 512);
    DrawTextW(dc, text, -1, &r, DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | (label == panelTitle_ ? DT_CENTER : DT_LEFT));
  }
  if (oldFont) SelectObject(dc, oldFont);
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
  hasLastAt_ = at != nullptr;
  if (at) lastAt_ = *at;
  status_ = at ? PositionText(*at) : "";
  const std::string legend = at ? legend_.At(at->lat, at->lon) : "";
  if (!legend.empty()) status_ += "   [" + legend + "]";
  if (!picked_.empty()) status_ += "   " + picked_;
  if (!inspected_.empty()) status_ += "   " + inspected_;
  if (!note_.empty()) status_ += "   (" + note_ + ")";
  if (statusLine_) SetWindowTextW(statusLine_, FromUtf8(status_).c_str());
}

void ChartWindow::PickAt(long x, long y) {
  session_.Pick(x, y);
  picked_ = session_.PickedText();
  inspected_.clear();
  Inspect();
  chartscene::GeoPosition at;
  const bool known = PositionOfPixel(x, y, at);
  ShowStatusAt(known ? &at : nullptr);
  InvalidateRect(window_, nullptr, FALSE);
}

bool ChartWindow::SelectNamed(const std::string& name) {
  if (!session_.Select(name)) return false;
  picked_ = "selected: " + session_.PickedText().substr(session_.PickedText().find(": ") + 2);
  inspected_.clear();
  Inspect();
  // SetInfo leaves the dataset header chosen; a selection by name means the object itself.
  ChooseFirstInspected();
  const auto& shape = session_.Scene().objects[session_.Picked().front()].geometry;
  ShowStatusAt(shape.empty() ? nullptr : &shape.front());
  InvalidateRect(window_, nullptr, FALSE);
  return true;
}

namespace {
struct ChildSearch {
  const wchar_t* className;
  HWND found;
};

// A named function, not a lambda: the callback must be stdcall on 32-bit Windows.
BOOL CALLBACK MatchChildClass(HWND child, LPARAM data) {
  auto* search = reinterpret_cast<ChildSearch*>(data);
  wchar_t name[64] = {};
  GetClassNameW(child, name, 64);
  if (lstrcmpiW(name, search->className) != 0) return TRUE;
  search->found = child;
  return FALSE;
}
}  // namespace

HWND ChartWindow::InspectorChild(const wchar_t* className) const {
  if (!inspectorHost_) return nullptr;
  ChildSearch search{className, nullptr};
  EnumChildWindows(inspectorHost_, MatchChildClass, reinterpret_cast<LPARAM>(&search));
  return search.found;
}

void ChartWindow::ChooseFirstInspected() {
  HWND tree = InspectorChild(WC_TREEVIEWW);
  if (!tree) return;
  // Record 1 is the first object handed over (0 is the dataset header).
  HTREEITEM found = nullptr;
  std::function<void(HTREEITEM)> walk = [&](HTREEITEM item) {
    for (; item && !found; item = TreeView_GetNextSibling(tree, item)) {
      TVITEMW data{};
      data.mask = TVIF_PARAM | TVIF_HANDLE;
      data.hItem = item;
      if (SendMessageW(tree, TVM_GETITEMW, 0, reinterpret_cast<LPARAM>(&data)) && data.lParam == 1) found = item;
      else walk(TreeView_GetChild(tree, item));
    }
  };
  walk(TreeView_GetRoot(tree));
  if (found) TreeView_SelectItem(tree, found);
}

std::vector<std::string> ChartWindow::InspectorTreeLines() {
  std::vector<std::string> lines;
  HWND tree = InspectorChild(WC_TREEVIEWW);
  if (!tree) return lines;
  const HTREEITEM selected = TreeView_GetSelection(tree);
  std::function<void(HTREEITEM, int)> walk = [&](HTREEITEM item, int depth) {
    for (; item && lines.size() < 1000; item = TreeView_GetNextSibling(tree, item)) {
      wchar_t text[512] = {};
      TVITEMW data{};
      data.mask = TVIF_TEXT | TVIF_HANDLE;
      data.hItem = item;
      data.pszText = text;
      data.cchTextMax = 512;
      if (!SendMessageW(tree, TVM_GETITEMW, 0, reinterpret_cast<LPARAM>(&data))) continue;
      const int n = WideCharToMultiByte(CP_UTF8, 0, text, -1, nullptr, 0, nullptr, nullptr);
      std::string label(n > 0 ? n - 1 : 0, '\0');
      if (n > 1) WideCharToMultiByte(CP_UTF8, 0, text, -1, &label[0], n, nullptr, nullptr);
      lines.push_back(std::string(static_cast<std::size_t>(depth) * 2, ' ') + (item == selected ? "* " : "") + label);
      walk(TreeView_GetChild(tree, item), depth + 1);
    }
  };
  walk(TreeView_GetRoot(tree), 0);
  return lines;
}

bool ChartWindow::ShowInspectorTab(const std::string& title) {
  HWND strip = InspectorChild(WC_TABCONTROLW);
  if (!strip) return false;
  const std::wstring wanted = FromUtf8(title);
  const int count = TabCtrl_GetItemCount(strip);
  for (int i = 0; i < count; ++i) {
    wchar_t text[128] = {};
    TCITEMW item{};
    item.mask = TCIF_TEXT;
    item.pszText = text;
    item.cchTextMax = 128;
    if (!SendMessageW(strip, TCM_GETITEMW, static_cast<WPARAM>(i), reinterpret_cast<LPARAM>(&item)) || lstrcmpiW(text, wanted.c_str()) != 0) continue;
    // As a click on the tab does: the strip's owner hears of the change.
    TabCtrl_SetCurSel(strip, i);
    NMHDR note{strip, static_cast<UINT_PTR>(GetDlgCtrlID(strip)), static_cast<UINT>(TCN_SELCHANGE)};
    SendMessageW(GetParent(strip), WM_NOTIFY, note.idFrom, reinterpret_cast<LPARAM>(&note));
    return true;
  }
  return false;
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
