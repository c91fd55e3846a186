// Times XContoursView's paint: a four-shade scheme with its three labels drawn through
// IViewObject::Draw into a 300 x 600 32-bit DIB section, repeated. Usage: contours_bench [COUNT]
#include "BR_Info.h"
#include "GeoData.h"
#include "bench/common/contours_setup.h"

#include <windows.h>
#include <ocidl.h>

#include <chrono>
#include <cstdio>
#include <cwchar>

namespace {

using namespace br::bench;

using Clock = std::chrono::steady_clock;

int Fail(const char* message) {
  std::fprintf(stderr, "contours_bench: %s\n", message);
  return 1;
}

int Run(int count) {
  CLSID clsid{};
  IXContoursView* view = nullptr;
  if (FAILED(CLSIDFromProgID(L"BR_Info.XContoursView", &clsid)) ||
      FAILED(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IXContoursView,
                              reinterpret_cast<void**>(&view)))) {
    return Fail("BR_Info.XContoursView cannot be made (is BR_Info.dll registered?)");
  }
  IViewObject* drawing = nullptr;
  if (FAILED(view->QueryInterface(IID_IViewObject, reinterpret_cast<void**>(&drawing))))
    return Fail("no IViewObject");

  const HPALETTE palette = BenchPalette();
  BenchParams params;
  BenchColours colours;
  const Clock::time_point read = Clock::now();
  view->SetContoursData(&params, &colours, 10.0);
  const double readMs = std::chrono::duration<double, std::milli>(Clock::now() - read).count();
  view->put_Palette(static_cast<long>(reinterpret_cast<LONG_PTR>(palette)));

  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof info.bmiHeader;
  info.bmiHeader.biWidth = 300;
  info.bmiHeader.biHeight = -600;
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  void* bits = nullptr;
  const HDC dc = CreateCompatibleDC(nullptr);
  const HBITMAP bitmap = CreateDIBSection(dc, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  const HGDIOBJ old = SelectObject(dc, bitmap);
  const RECTL box{0, 0, 300, 600};

  const Clock::time_point start = Clock::now();
  for (int i = 0; i < count; ++i)
    drawing->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, dc, &box, nullptr, nullptr, 0);
  const double totalMs = std::chrono::duration<double, std::milli>(Clock::now() - start).count();
  // Colour 21 is palette index 0: the top band must be in it, or nothing was timed.
  if (static_cast<const DWORD*>(bits)[0] != 0x0000C8FAu) return Fail("the paint did not draw the bands");
  std::printf("SetContoursData: %.3f ms\n", readMs);
  std::printf("paint 300 x 600, four shades, three labels: %.3f ms per paint (%d paints)\n", totalMs / count, count);

  SelectObject(dc, old);
  DeleteObject(bitmap);
  DeleteDC(dc);
  drawing->Release();
  view->Release();
  DeleteObject(palette);
  return 0;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  const int count = argc > 1 ? static_cast<int>(std::wcstol(argv[1], nullptr, 10)) : 1000;
  if (count < 1) return Fail("COUNT must be positive");
  if (FAILED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED))) return Fail("COM cannot start");
  const int result = Run(count);
  CoUninitialize();
  return result;
}
