// brpicture: shows a picture file in the XPICREPView control, or writes the control's
// drawing of it to a PNG file (--png). See picture_options.h for the command line.
#include "host/brpicture/picture_options.h"
#include "host/brtide/png_file.h"

#include "BR_Info.h"
#include "BR_Private.h"

#include <windows.h>
#include <ocidl.h>

#include <algorithm>
#include <cstdio>
#include <string>
#include <vector>

namespace br::brpicture {

namespace {

int Fail(const std::string& message, int code) {
  std::fprintf(stderr, "brpicture: %s\n", message.c_str());
  return code;
}

std::string Narrow(const std::wstring& text) {
  const int n = WideCharToMultiByte(CP_UTF8, 0, text.c_str(), -1, nullptr, 0, nullptr, nullptr);
  std::string out(n > 0 ? n - 1 : 0, '\0');
  if (n > 1) WideCharToMultiByte(CP_UTF8, 0, text.c_str(), -1, out.data(), n, nullptr, nullptr);
  return out;
}

template <class I>
struct Held {
  I* p = nullptr;
  ~Held() {
    if (p) p->Release();
  }
};

HRESULT PutValue(IXPICREPView* view, PRV_PROPERTY code, VARIANT value) { return view->put_Property(code, value); }

int WritePicture(IUnknown* view, const PictureOptions& options, long width, long height) {
  Held<IViewObject> drawing;
  if (FAILED(view->QueryInterface(IID_IViewObject, reinterpret_cast<void**>(&drawing.p))))
    return Fail("the control cannot draw", 3);
  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof info.bmiHeader;
  info.bmiHeader.biWidth = width;
  info.bmiHeader.biHeight = -height;
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  void* bits = nullptr;
  const HDC dc = CreateCompatibleDC(nullptr);
  const HBITMAP bitmap = CreateDIBSection(dc, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  if (!bitmap) {
    DeleteDC(dc);
    return Fail("no memory for the picture", 3);
  }
  const HGDIOBJ old = SelectObject(dc, bitmap);
  const RECTL box{0, 0, width, height};
  const HRESULT drawn = drawing.p->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, dc, &box, nullptr, nullptr, 0);
  GdiFlush();
  std::string error;
  const bool written = SUCCEEDED(drawn) && br::brtide::WritePngFile(options.png, bits, width, height, error);
  SelectObject(dc, old);
  DeleteObject(bitmap);
  DeleteDC(dc);
  if (FAILED(drawn)) return Fail("the control did not draw", 3);
  if (!written) return Fail(error, 3);
  std::printf("%s (%ld x %ld pixels)\n", Narrow(options.png).c_str(), width, height);
  return 0;
}

LRESULT CALLBACK FrameProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_DESTROY) {
    PostQuitMessage(0);
    return 0;
  }
  if (message == WM_SIZE) {
    // The hosted control fills the frame.
    if (const HWND child = GetWindow(window, GW_CHILD))
      MoveWindow(child, 0, 0, LOWORD(lParam), HIWORD(lParam), TRUE);
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

int ShowPicture(IUnknown* view, const PictureOptions& options, long width, long height) {
  const HMODULE atl = LoadLibraryW(L"atl.dll");
  using Attach = HRESULT(WINAPI*)(IUnknown*, HWND, IUnknown**);
  const auto attach = atl ? reinterpret_cast<Attach>(reinterpret_cast<void*>(GetProcAddress(atl, "AtlAxAttachControl")))
                          : nullptr;
  if (!attach) return Fail("atl.dll cannot host the control", 3);
  WNDCLASSW wc{};
  wc.lpfnWndProc = FrameProc;
  wc.hInstance = GetModuleHandleW(nullptr);
  wc.hCursor = LoadCursor(nullptr, IDC_ARROW);
  wc.lpszClassName = L"brpicture";
  RegisterClassW(&wc);
  RECT work{};
  SystemParametersInfoW(SPI_GETWORKAREA, 0, &work, 0);
  RECT frame{0, 0, width + GetSystemMetrics(SM_CXVSCROLL), height + GetSystemMetrics(SM_CYHSCROLL)};
  AdjustWindowRect(&frame, WS_OVERLAPPEDWINDOW, FALSE);
  const int frameWidth = std::min<long>(frame.right - frame.left, work.right - work.left);
  const int frameHeight = std::min<long>(frame.bottom - frame.top, work.bottom - work.top);
  const std::wstring title = L"brpicture - " + options.file;
  const HWND window = CreateWindowExW(0, L"brpicture", title.c_str(), WS_OVERLAPPEDWINDOW | WS_CLIPCHILDREN,
                                      CW_USEDEFAULT, CW_USEDEFAULT, frameWidth, frameHeight, nullptr, nullptr,
                                      GetModuleHandleW(nullptr), nullptr);
  if (!window) return Fail("cannot make a window", 3);
  Held<IUnknown> container;
  if (FAILED(attach(view, window, &container.p))) {
    DestroyWindow(window);
    return Fail("the control cannot be hosted", 3);
  }
  ShowWindow(window, SW_SHOWNORMAL);
  MSG msg;
  while (GetMessageW(&msg, nullptr, 0, 0) > 0) {
    TranslateMessage(&msg);
    DispatchMessageW(&msg);
  }
  return 0;
}

int Run(const PictureOptions& options) {
  CLSID clsid{};
  Held<IXPICREPView> view;
  if (FAILED(CLSIDFromProgID(L"BR_Info.XPICREPView", &clsid)) ||
      FAILED(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IXPICREPView,
                              reinterpret_cast<void**>(&view.p))))
    return Fail("BR_Info.XPICREPView cannot be made (is BR_Info.dll registered?)", 3);
  view.p->SetPalIdxShading(static_cast<ULONG>(options.palette), options.shade);
  Held<IEmbeddedControl> embedded;
  if (SUCCEEDED(view.p->QueryInterface(IID_IEmbeddedControl, reinterpret_cast<void**>(&embedded.p)))) {
    VARIANT palette;
    palette.vt = VT_I4;
    palette.lVal = options.palette;
    embedded.p->SetPalette(palette);
  }
  VARIANT name;
  name.vt = VT_BSTR;
  name.bstrVal = SysAllocString(options.file.c_str());
  const HRESULT loaded = PutValue(view.p, PRV_PICFILENAME, name);
  VariantClear(&name);
  VARIANT zoom;
  zoom.vt = VT_I4;
  zoom.lVal = options.zoom;
  if (loaded == S_OK && FAILED(PutValue(view.p, PRV_ZOOMPERCENT, zoom))) return Fail("the zoom is too large", 1);

  // The zoomed picture's size, or room for the failure text.
  long width = 400, height = 100;
  if (embedded.p && loaded == S_OK) embedded.p->GetPreferredSize(&width, &height);
  if (options.width > 0) {
    width = options.width;
    height = options.height;
  }
  if (width <= 0 || height <= 0 || width > 20000 || height > 20000) return Fail("the picture is too large to draw", 1);

  const int result = options.png.empty() ? ShowPicture(view.p, options, width, height)
                                         : WritePicture(view.p, options, width, height);
  if (loaded != S_OK) return Fail("cannot open the picture " + Narrow(options.file), result ? result : 2);
  return result;
}

}  // namespace

}  // namespace br::brpicture

int wmain(int argc, wchar_t** argv) {
  std::vector<std::wstring> args(argv + 1, argv + argc);
  br::brpicture::PictureOptions options;
  std::string error;
  if (!br::brpicture::ParsePictureOptions(args, options, error)) {
    std::fprintf(stderr, "brpicture: %s\n%s", error.c_str(), br::brpicture::kPictureUsage);
    return 1;
  }
  if (FAILED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED))) {
    std::fprintf(stderr, "brpicture: COM cannot start\n");
    return 3;
  }
  const int result = br::brpicture::Run(options);
  CoUninitialize();
  return result;
}
