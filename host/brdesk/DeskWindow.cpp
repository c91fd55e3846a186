#include "host/brdesk/DeskWindow.h"

#include "host/brtide/default_station_folder.h"
#include "host/brtide/png_file.h"

#include <oleauto.h>

#include <cstdio>
#include <vector>

namespace br::brdesk {

namespace {

constexpr const wchar_t* kClassName = L"BrDeskWindow";
constexpr int kShowCommand = 100;
constexpr int kMargin = 8;
constexpr int kBarHeight = 24;
constexpr int kListWidth = 260;
constexpr double kStepHours = 0.25;

using AtlAxWinInitFn = BOOL(WINAPI*)();
using AtlAxGetControlFn = HRESULT(WINAPI*)(HWND, IUnknown**);

AtlAxGetControlFn gGetControl = nullptr;

bool StartAtl(std::string& error) {
  HMODULE atl = LoadLibraryW(L"atl.dll");
  if (!atl) atl = LoadLibraryW(L"atl100.dll");
  auto init = atl ? reinterpret_cast<AtlAxWinInitFn>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxWinInit")))
                  : nullptr;
  gGetControl = atl ? reinterpret_cast<AtlAxGetControlFn>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxGetControl")))
                    : nullptr;
  if (!init || !gGetControl || !init()) {
    error = "the ATL control host (atl.dll) is not available";
    return false;
  }
  return true;
}

std::string Narrow(const wchar_t* text) {
  const int n = WideCharToMultiByte(CP_ACP, 0, text, -1, nullptr, 0, nullptr, nullptr);
  std::string out(n > 0 ? n - 1 : 0, '\0');
  if (n > 1) WideCharToMultiByte(CP_ACP, 0, text, -1, &out[0], n, nullptr, nullptr);
  return out;
}

std::string Ansi(BSTR text) {
  if (!text) return std::string();
  const int n = WideCharToMultiByte(CP_ACP, 0, text, -1, nullptr, 0, nullptr, nullptr);
  std::string out(n > 0 ? n - 1 : 0, '\0');
  if (n > 1) WideCharToMultiByte(CP_ACP, 0, text, -1, &out[0], n, nullptr, nullptr);
  return out;
}

std::string WindowText(HWND window) {
  char buffer[256] = {};
  GetWindowTextA(window, buffer, sizeof buffer);
  return buffer;
}

// The computer's standard time and a zone description as "UTC+01:00".
std::string OffsetText(int minutesEast) {
  char text[16];
  const int size = minutesEast < 0 ? -minutesEast : minutesEast;
  std::snprintf(text, sizeof text, "UTC%c%02d:%02d", minutesEast < 0 ? '-' : '+', size / 60, size % 60);
  return text;
}

int ComputerOffsetMinutes() {
  TIME_ZONE_INFORMATION zone{};
  if (GetTimeZoneInformation(&zone) == TIME_ZONE_ID_INVALID) return 0;
  return -static_cast<int>(zone.Bias + zone.StandardBias);
}

// The classes brdesk creates; none can be made until BR_Info.dll is registered.
bool LibraryRegistered(std::string& error) {
  for (const wchar_t* name : {L"BR_Info.TidesDatabase", L"BR_Info.TidesPortList", L"BR_Info.TidesWindow"}) {
    CLSID clsid{};
    if (FAILED(CLSIDFromProgID(name, &clsid))) {
      error = "BR_Info.dll is not registered (regsvr32 BR_Info.dll): no class is known by the name " + Narrow(name);
      return false;
    }
  }
  return true;
}

// One array of ports from the arrays of several GetPorts answers (VT_EMPTY for none).
HRESULT JoinPorts(VARIANT* parts, int count, VARIANT* joined) {
  VariantInit(joined);
  std::vector<IUnknown*> ports;
  for (int i = 0; i < count; ++i) {
    if (V_VT(&parts[i]) != (VT_ARRAY | VT_UNKNOWN) || !V_ARRAY(&parts[i])) continue;
    SAFEARRAY* array = V_ARRAY(&parts[i]);
    LONG lower = 0, upper = -1;
    SafeArrayGetLBound(array, 1, &lower);
    SafeArrayGetUBound(array, 1, &upper);
    for (LONG k = lower; k <= upper; ++k) {
      IUnknown* port = nullptr;  // with a reference of its own
      if (SUCCEEDED(SafeArrayGetElement(array, &k, &port)) && port) ports.push_back(port);
    }
  }
  if (ports.empty()) return S_OK;
  SAFEARRAY* array = SafeArrayCreateVector(VT_UNKNOWN, 0, static_cast<ULONG>(ports.size()));
  HRESULT hr = array ? S_OK : E_OUTOFMEMORY;
  for (LONG k = 0; SUCCEEDED(hr) && k < static_cast<LONG>(ports.size()); ++k) hr = SafeArrayPutElement(array, &k, ports[k]);
  for (IUnknown* port : ports) port->Release();  // the array holds its own references
  if (FAILED(hr)) {
    if (array) SafeArrayDestroy(array);
    return hr;
  }
  V_VT(joined) = VT_ARRAY | VT_UNKNOWN;
  V_ARRAY(joined) = array;
  return S_OK;
}

template <class I>
HRESULT ControlOf(HWND host, const IID& iid, I** out) {
  IUnknown* control = nullptr;
  *out = nullptr;
  if (FAILED(gGetControl(host, &control)) || !control) return E_FAIL;
  const HRESULT hr = control->QueryInterface(iid, reinterpret_cast<void**>(out));
  control->Release();
  return hr;
}

}  // namespace

DeskWindow::DeskWindow(const DeskOptions& options)
    : options_(options),
      listSink_(DIID__ITidesPortListEvents,
                [this](DISPID id, const DISPPARAMS& params) {
                  if (id == 1 && params.cArgs == 1 && params.rgvarg[0].vt == VT_DISPATCH) {
                    ShowPort(params.rgvarg[0].pdispVal);
                  }
                }),
      graphSink_(DIID__ITidesWindowEvents, [this](DISPID id, const DISPPARAMS& params) {
        if (id != 1 || params.cArgs != 2) return;
        // Arguments arrive last first: (Time, WaveValue).
        SYSTEMTIME time{};
        if (params.rgvarg[1].vt != VT_R8 || !VariantTimeToSystemTime(params.rgvarg[1].dblVal, &time)) return;
        char text[200];
        std::snprintf(text, sizeof text, "%s  %04u-%02u-%02u %02u:%02u %s  %.2f m", portName_.c_str(), time.wYear,
                      time.wMonth, time.wDay, time.wHour, time.wMinute, OffsetText(ComputerOffsetMinutes()).c_str(),
                      params.rgvarg[0].vt == VT_R8 ? params.rgvarg[0].dblVal : 0.0);
        SetStatus(text);
      }) {}

DeskWindow::~DeskWindow() {
  listSink_.Disconnect();
  graphSink_.Disconnect();
  if (window_) DestroyWindow(window_);
  if (port_) port_->Release();
  if (graph_) graph_->Release();
  if (list_) list_->Release();
  if (database_) database_->Release();
  if (font_) DeleteObject(font_);
}

bool DeskWindow::Create(std::string& error) {
  if (!LibraryRegistered(error) || !StartAtl(error)) return false;
  WNDCLASSW wc{};
  wc.lpfnWndProc = Procedure;
  wc.hInstance = GetModuleHandleW(nullptr);
  wc.hCursor = LoadCursor(nullptr, IDC_ARROW);
  wc.hbrBackground = reinterpret_cast<HBRUSH>(COLOR_BTNFACE + 1);
  wc.lpszClassName = kClassName;
  RegisterClassW(&wc);
  window_ = CreateWindowExW(0, kClassName, L"BR_Info tide desk", WS_OVERLAPPEDWINDOW | WS_CLIPCHILDREN, 40, 40, 920,
                            560, nullptr, nullptr, GetModuleHandleW(nullptr), this);
  if (!window_) {
    error = "cannot make the desk window";
    return false;
  }
  font_ = static_cast<HFONT>(GetStockObject(DEFAULT_GUI_FONT));
  auto child = [&](const char* cls, const char* text, DWORD style, int id = 0) {
    HWND w = CreateWindowExA(std::string(cls) == "EDIT" ? WS_EX_CLIENTEDGE : 0, cls, text,
                             WS_CHILD | WS_VISIBLE | style, 0, 0, 10, 10, window_,
                             reinterpret_cast<HMENU>(static_cast<INT_PTR>(id)), GetModuleHandleW(nullptr), nullptr);
    SendMessageA(w, WM_SETFONT, reinterpret_cast<WPARAM>(font_), FALSE);
    return w;
  };
  char box[128];
  std::snprintf(box, sizeof box, "%g %g %g %g", options_.box[0], options_.box[1], options_.box[2], options_.box[3]);
  SYSTEMTIME today{};
  GetLocalTime(&today);
  if (options_.year == 0) {
    options_.year = today.wYear;
    options_.month = today.wMonth;
    options_.day = today.wDay;
  }
  char date[32];
  std::snprintf(date, sizeof date, "%04d-%02d-%02d", options_.year, options_.month, options_.day);
  boxLabel_ = child("STATIC", "Box (S W N E):", SS_LEFT | SS_CENTERIMAGE);
  boxEdit_ = child("EDIT", box, ES_AUTOHSCROLL | WS_TABSTOP);
  dateLabel_ = child("STATIC", "Date:", SS_LEFT | SS_CENTERIMAGE);
  dateEdit_ = child("EDIT", date, ES_AUTOHSCROLL | WS_TABSTOP);
  showButton_ = child("BUTTON", "Show", BS_DEFPUSHBUTTON | WS_TABSTOP, kShowCommand);
  listHost_ = child("AtlAxWin", "BR_Info.TidesPortList", WS_CLIPCHILDREN);
  // The dialog keys' tabbing goes into the host window to the list's own window (a tab stop).
  SetWindowLongPtrW(listHost_, GWL_EXSTYLE, GetWindowLongPtrW(listHost_, GWL_EXSTYLE) | WS_EX_CONTROLPARENT);
  graphHost_ = child("AtlAxWin", "BR_Info.TidesWindow", WS_CLIPCHILDREN);
  statusLine_ = child("STATIC", "Pick a station; move the pointer over the graph to read the tide.",
                      SS_LEFT | SS_CENTERIMAGE | SS_SUNKEN);
  if (FAILED(ControlOf(listHost_, IID_ITidesPortList, &list_)) || FAILED(ControlOf(graphHost_, IID_ITidesWindow, &graph_))) {
    error = "BR_Info.TidesPortList or BR_Info.TidesWindow cannot be made";
    return false;
  }
  listSink_.Connect(list_);
  graphSink_.Connect(graph_);
  LayOut();
  return true;
}

bool DeskWindow::LoadPorts(std::string& error) {
  double box[4];
  if (!ParseBox(WindowText(boxEdit_), box)) {
    error = "the box wants SOUTH WEST NORTH EAST in degrees";
    SetStatus(error);
    return false;
  }
  if (!database_) {
    CLSID clsid{};
    if (FAILED(CLSIDFromProgID(L"BR_Info.TidesDatabase", &clsid)) ||
        FAILED(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_ITidesDatabase,
                                reinterpret_cast<void**>(&database_)))) {
      error = "BR_Info.TidesDatabase cannot be made";
      return false;
    }
    std::wstring folder(options_.folder.begin(), options_.folder.end());
    if (folder.empty()) folder = br::brtide::DefaultStationFolder();
    if (folder.empty()) {
      error = "no --folder given and no data\\world folder beside brdesk or above it";
      return false;
    }
    BSTR name = SysAllocString(folder.c_str());
    const HRESULT hr = database_->Initialize(name);
    SysFreeString(name);
    if (FAILED(hr)) {
      error = "\"" + Narrow(folder.c_str()) + "\" is not a tide station folder (td_num.ntx, td_crd.ntx and td_pnt.dat, readable)";
      return false;
    }
  }
  // A box across the 180th meridian is asked for as its two halves (the library would
  // swap a west edge east of the east edge).
  VARIANT parts[2];
  VariantInit(&parts[0]);
  VariantInit(&parts[1]);
  const bool across = CrossesDateLine(box);
  HRESULT hr = database_->GetPorts(box[0], box[1], box[2], across ? 181.0 : box[3], &parts[0]);
  if (SUCCEEDED(hr) && across) hr = database_->GetPorts(box[0], -181.0, box[2], box[3], &parts[1]);
  VARIANT ports;
  if (SUCCEEDED(hr)) hr = JoinPorts(parts, 2, &ports);
  VariantClear(&parts[0]);
  VariantClear(&parts[1]);
  if (FAILED(hr)) {
    error = "GetPorts failed";
    return false;
  }
  list_->SetPortList(ports);
  VariantClear(&ports);
  return true;
}

bool DeskWindow::SelectRow(int row) {
  // The list is driven as a user would: focused (its window hands the focus to its table),
  // then Down row times.
  const HWND list = FindWindowExA(listHost_, nullptr, nullptr, nullptr);
  if (!list) return false;
  SetFocus(list);
  for (int i = 0; i < row; ++i) SendMessageA(GetFocus(), WM_KEYDOWN, VK_DOWN, 1);
  IUnknown* selected = nullptr;
  if (FAILED(list_->get_Selected(&selected)) || !selected) return false;
  selected->Release();
  return true;
}

bool DeskWindow::TranslateListKey(MSG& message) {
  if (message.message != WM_KEYDOWN && message.message != WM_KEYUP) return false;
  const HWND focus = GetFocus();
  if (!list_ || !focus || !IsChild(listHost_, focus)) return false;
  IOleInPlaceActiveObject* active = nullptr;
  if (FAILED(list_->QueryInterface(IID_IOleInPlaceActiveObject, reinterpret_cast<void**>(&active)))) return false;
  const bool used = active->TranslateAccelerator(&message) == S_OK;
  active->Release();
  return used;
}

void DeskWindow::ShowPort(IDispatch* port) {
  ITidesPort* tides = nullptr;
  if (!port || FAILED(port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&tides)))) return;
  if (port_) port_->Release();
  port_ = tides;
  BSTR name = nullptr;
  portName_ = SUCCEEDED(port_->get_PortName(&name)) ? Ansi(name) : std::string();
  SysFreeString(name);
  graph_->SetPort(port_);
  Recalculate();
}

bool DeskWindow::ReadDate(double& date) const {
  int y = 0, m = 0, d = 0;
  if (!ParseDate(WindowText(dateEdit_), y, m, d)) return false;
  SYSTEMTIME time{};
  time.wYear = static_cast<WORD>(y);
  time.wMonth = static_cast<WORD>(m);
  time.wDay = static_cast<WORD>(d);
  return SystemTimeToVariantTime(&time, &date) != 0;
}

void DeskWindow::Recalculate() {
  double date = 0.0;
  if (!ReadDate(date)) {
    SetStatus("the date wants a real day as YYYY-MM-DD");
    return;
  }
  if (!port_) return;
  graph_->Calculate(kStepHours, date);
  // The graph draws its curve on this computer's standard time and its sun bands on the
  // station's: the status line says so.
  long zone = 0;
  const std::string station = SUCCEEDED(port_->get_TimeZone(&zone)) ? OffsetText(static_cast<int>(-zone * 60)) : "?";
  SetStatus(portName_ + "  " + WindowText(dateEdit_) + "  heights in metres; curve: this computer's standard time " +
            OffsetText(ComputerOffsetMinutes()) + ", sun bands: station time " + station);
}

void DeskWindow::SetStatus(const std::string& text) {
  status_ = text;
  if (statusLine_) SetWindowTextA(statusLine_, text.c_str());
}

void DeskWindow::LayOut() {
  RECT client{};
  GetClientRect(window_, &client);
  const int width = client.right, height = client.bottom;
  int x = kMargin;
  MoveWindow(boxLabel_, x, kMargin, 90, kBarHeight, TRUE);
  x += 92;
  MoveWindow(boxEdit_, x, kMargin, 200, kBarHeight, TRUE);
  x += 210;
  MoveWindow(dateLabel_, x, kMargin, 40, kBarHeight, TRUE);
  x += 42;
  MoveWindow(dateEdit_, x, kMargin, 100, kBarHeight, TRUE);
  x += 110;
  MoveWindow(showButton_, x, kMargin, 70, kBarHeight, TRUE);
  const int top = kMargin * 2 + kBarHeight;
  const int bottom = height - kMargin * 2 - kBarHeight;
  MoveWindow(listHost_, kMargin, top, kListWidth, bottom - top, TRUE);
  MoveWindow(graphHost_, kMargin * 2 + kListWidth, top, width - kListWidth - kMargin * 3, bottom - top, TRUE);
  MoveWindow(statusLine_, kMargin, bottom + kMargin, width - kMargin * 2, kBarHeight, TRUE);
}

LRESULT CALLBACK DeskWindow::Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_NCCREATE) {
    auto* create = reinterpret_cast<CREATESTRUCTW*>(lParam);
    SetWindowLongPtrW(window, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(create->lpCreateParams));
  }
  auto* desk = reinterpret_cast<DeskWindow*>(GetWindowLongPtrW(window, GWLP_USERDATA));
  if (desk && desk->window_ == window) return desk->Handle(message, wParam, lParam);
  return DefWindowProcW(window, message, wParam, lParam);
}

LRESULT DeskWindow::Handle(UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_SIZE:
      if (listHost_) LayOut();
      return 0;
    case WM_COMMAND:
      if (LOWORD(wParam) == kShowCommand) {
        std::string error;
        if (!LoadPorts(error)) SetStatus(error);
        Recalculate();
      }
      return 0;
    case WM_DESTROY:
      PostQuitMessage(0);
      return 0;
    default:
      return DefWindowProcW(window_, message, wParam, lParam);
  }
}

// The window's own background, then each child where it stands: the hosted controls
// through their view objects, the plain controls through WM_PRINT.
void DeskWindow::DrawInto(HDC dc) {
  RECT client{};
  GetClientRect(window_, &client);
  FillRect(dc, &client, GetSysColorBrush(COLOR_BTNFACE));
  for (HWND child = GetWindow(window_, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    if (!IsWindowVisible(child)) continue;
    RECT r{};
    GetWindowRect(child, &r);
    MapWindowPoints(HWND_DESKTOP, window_, reinterpret_cast<POINT*>(&r), 2);
    if (child == listHost_ || child == graphHost_) {
      IViewObject* view = nullptr;
      if (SUCCEEDED(ControlOf(child, IID_IViewObject, &view))) {
        const RECTL bounds{r.left, r.top, r.right, r.bottom};
        view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, dc, &bounds, nullptr, nullptr, 0);
        view->Release();
      }
      continue;
    }
    char cls[32] = {};
    GetClassNameA(child, cls, sizeof cls);
    if (lstrcmpiA(cls, "Button") == 0 || lstrcmpiA(cls, "Static") == 0) {
      // Drawn here: not every system's buttons and labels answer WM_PRINT.
      RECT box = r;
      if (lstrcmpiA(cls, "Button") == 0) DrawFrameControl(dc, &box, DFC_BUTTON, DFCS_BUTTONPUSH);
      else if (GetWindowLongW(child, GWL_STYLE) & SS_SUNKEN) DrawEdge(dc, &box, BDR_SUNKENOUTER, BF_RECT | BF_ADJUST);
      const std::string text = WindowText(child);
      HGDIOBJ oldFont = SelectObject(dc, font_);
      SetBkMode(dc, TRANSPARENT);
      SetTextColor(dc, GetSysColor(COLOR_BTNTEXT));
      InflateRect(&box, -3, 0);
      DrawTextA(dc, text.c_str(), -1, &box,
                DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | (lstrcmpiA(cls, "Button") == 0 ? DT_CENTER : DT_LEFT));
      SelectObject(dc, oldFont);
      continue;
    }
    const int saved = SaveDC(dc);
    SetViewportOrgEx(dc, r.left, r.top, nullptr);
    IntersectClipRect(dc, 0, 0, r.right - r.left, r.bottom - r.top);
    SendMessageW(child, WM_PRINT, reinterpret_cast<WPARAM>(dc),
                 PRF_CLIENT | PRF_NONCLIENT | PRF_ERASEBKGND | PRF_CHILDREN);
    RestoreDC(dc, saved);
  }
}

bool DeskWindow::SaveScreenshot(const std::wstring& path, std::string& error) {
  RECT client{};
  GetClientRect(window_, &client);
  const int width = client.right, height = client.bottom;
  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof info.bmiHeader;
  info.bmiHeader.biWidth = width;
  info.bmiHeader.biHeight = -height;
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  info.bmiHeader.biCompression = BI_RGB;
  void* bits = nullptr;
  HDC screen = GetDC(nullptr);
  HDC dc = CreateCompatibleDC(screen);
  ReleaseDC(nullptr, screen);
  HBITMAP bitmap = CreateDIBSection(dc, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  if (!dc || !bitmap) {
    error = "cannot make the picture";
    if (dc) DeleteDC(dc);
    return false;
  }
  HGDIOBJ old = SelectObject(dc, bitmap);
  DrawInto(dc);
  GdiFlush();
  const bool written = br::brtide::WritePngFile(path, bits, width, height, error);
  SelectObject(dc, old);
  DeleteObject(bitmap);
  DeleteDC(dc);
  return written;
}

}  // namespace br::brdesk
