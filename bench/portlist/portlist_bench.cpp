// Times a hosted TidesPortList: SetPortList with every station of a folder (the whole
// world box: filling, name order and the first selection), then a jump to the last row
// by Ctrl+End and Down, as a user would. Usage: portlist_bench FOLDER
#include "BR_Info.h"
#include "bench/common/tides_database_opener.h"

#include <windows.h>

#include <chrono>
#include <cstdio>
#include <string>

namespace {

using Clock = std::chrono::steady_clock;

double Milliseconds(Clock::time_point from) {
  return std::chrono::duration<double, std::milli>(Clock::now() - from).count();
}

HWND DeepestChild(HWND window) {
  while (HWND child = GetWindow(window, GW_CHILD)) window = child;
  return window;
}

int Fail(const char* message) {
  std::fprintf(stderr, "portlist_bench: %s\n", message);
  return 1;
}

int Run(const wchar_t* folder) {
  HMODULE atl = LoadLibraryW(L"atl.dll");
  using InitFn = BOOL(WINAPI*)();
  using GetControlFn = HRESULT(WINAPI*)(HWND, IUnknown**);
  auto init = atl ? reinterpret_cast<InitFn>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxWinInit"))) : nullptr;
  auto getControl =
      atl ? reinterpret_cast<GetControlFn>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxGetControl"))) : nullptr;
  if (!init || !getControl || !init()) return Fail("atl.dll is not available");

  const char* failure = "";
  ITidesDatabase* database = br::bench::OpenTidesDatabase(folder, failure);
  if (!database) return Fail(failure);
  VARIANT ports;
  VariantInit(&ports);
  const Clock::time_point query = Clock::now();
  if (FAILED(database->GetPorts(-90, -180, 90, 180, &ports)) || ports.vt != (VT_ARRAY | VT_UNKNOWN)) {
    return Fail("GetPorts found nothing");
  }
  const double queryMs = Milliseconds(query);
  LONG upper = -1;
  SafeArrayGetUBound(ports.parray, 1, &upper);

  HWND host = CreateWindowExW(0, L"AtlAxWin", L"BR_Info.TidesPortList", WS_POPUP | WS_VISIBLE, 0, 0, 300, 600,
                              nullptr, nullptr, GetModuleHandleW(nullptr), nullptr);
  IUnknown* control = nullptr;
  ITidesPortList* list = nullptr;
  if (!host || FAILED(getControl(host, &control)) ||
      FAILED(control->QueryInterface(IID_ITidesPortList, reinterpret_cast<void**>(&list)))) {
    return Fail("BR_Info.TidesPortList cannot be hosted");
  }
  const Clock::time_point fill = Clock::now();
  list->SetPortList(ports);
  const double fillMs = Milliseconds(fill);

  HWND table = DeepestChild(host);
  SetFocus(table);
  BYTE keys[256] = {};
  GetKeyboardState(keys);
  const Clock::time_point last = Clock::now();
  keys[VK_CONTROL] = 0x80;
  SetKeyboardState(keys);
  SendMessageW(table, WM_KEYDOWN, VK_END, 1);
  keys[VK_CONTROL] = 0;
  SetKeyboardState(keys);
  SendMessageW(table, WM_KEYDOWN, VK_DOWN, 1);  // at the end already: selects it again, with notification
  IUnknown* selected = nullptr;
  list->get_Selected(&selected);
  const double lastMs = Milliseconds(last);

  std::wstring lastName;
  ITidesPort* port = nullptr;
  if (selected && SUCCEEDED(selected->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port)))) {
    BSTR text = nullptr;
    if (SUCCEEDED(port->get_PortName(&text)) && text) lastName = text;
    SysFreeString(text);
    port->Release();
  }
  std::printf("stations: %ld\nGetPorts (whole world): %.1f ms\nSetPortList (fill, order, select first): %.1f ms\n"
              "select the last row: %.1f ms (%ls)\n",
              static_cast<long>(upper + 1), queryMs, fillMs, lastMs, lastName.c_str());
  if (selected) selected->Release();
  list->Release();
  control->Release();
  DestroyWindow(host);
  VariantClear(&ports);
  database->Release();
  return 0;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  if (argc != 2) return Fail("usage: portlist_bench FOLDER");
  if (FAILED(OleInitialize(nullptr))) return Fail("OLE cannot start");
  const int status = Run(argv[1]);
  OleUninitialize();
  return status;
}
