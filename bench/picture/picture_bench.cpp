// Times XPICREPView on a 4000 x 3000 PNG drawn through IViewObject::Draw into an 800 x 600
// 32-bit DIB section: GDI+'s own decode of the file, the view's load, the load with the
// first paint, a repaint after each zoom change, and a repaint at the same zoom. Each case runs COUNT times (default 5); the median and the
// fastest run are printed. A new case is one more row of kCases.
#include "BR_Info.h"

#include <windows.h>
#include <objidl.h>
#include <ocidl.h>
#include <gdiplus.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cwchar>
#include <functional>
#include <string>
#include <vector>

namespace {

using Clock = std::chrono::steady_clock;
namespace gp = Gdiplus::DllExports;

constexpr int kPictureWidth = 4000;
constexpr int kPictureHeight = 3000;
constexpr int kViewWidth = 800;
constexpr int kViewHeight = 600;

int Fail(const char* message) {
  std::fprintf(stderr, "picture_bench: %s\n", message);
  return 1;
}

// A picture with detail everywhere (gradients and a checker), so decoding costs what a
// real photograph costs, with some transparency.
bool WritePicture(const std::wstring& path) {
  std::vector<std::uint32_t> pixels(static_cast<size_t>(kPictureWidth) * kPictureHeight);
  for (int y = 0; y < kPictureHeight; ++y)
    for (int x = 0; x < kPictureWidth; ++x) {
      const std::uint32_t alpha = (x / 200 + y / 200) % 7 == 0 ? 0x80 : 0xFF;
      const std::uint32_t red = x * 255 / kPictureWidth, green = y * 255 / kPictureHeight;
      const std::uint32_t blue = ((x ^ y) & 0x3F) * 4;
      pixels[static_cast<size_t>(y) * kPictureWidth + x] = alpha << 24 | red << 16 | green << 8 | blue;
    }
  UINT count = 0, bytes = 0;
  gp::GdipGetImageEncodersSize(&count, &bytes);
  std::vector<unsigned char> table(bytes);
  auto* codecs = reinterpret_cast<Gdiplus::ImageCodecInfo*>(table.data());
  if (!bytes || gp::GdipGetImageEncoders(count, bytes, codecs) != Gdiplus::Ok) return false;
  Gdiplus::GpBitmap* bitmap = nullptr;
  if (gp::GdipCreateBitmapFromScan0(kPictureWidth, kPictureHeight, kPictureWidth * 4, PixelFormat32bppARGB,
                                    reinterpret_cast<BYTE*>(pixels.data()), &bitmap) != Gdiplus::Ok)
    return false;
  bool saved = false;
  for (UINT i = 0; i < count; ++i)
    if (lstrcmpiW(codecs[i].MimeType, L"image/png") == 0)
      saved = gp::GdipSaveImageToFile(bitmap, path.c_str(), &codecs[i].Clsid, nullptr) == Gdiplus::Ok;
  gp::GdipDisposeImage(bitmap);
  return saved;
}

class Surface {
public:
  Surface() {
    BITMAPINFO info{};
    info.bmiHeader.biSize = sizeof info.bmiHeader;
    info.bmiHeader.biWidth = kViewWidth;
    info.bmiHeader.biHeight = -kViewHeight;
    info.bmiHeader.biPlanes = 1;
    info.bmiHeader.biBitCount = 32;
    dc_ = CreateCompatibleDC(nullptr);
    bitmap_ = CreateDIBSection(dc_, &info, DIB_RGB_COLORS, reinterpret_cast<void**>(&bits_), nullptr, 0);
    old_ = SelectObject(dc_, bitmap_);
  }
  ~Surface() {
    SelectObject(dc_, old_);
    DeleteObject(bitmap_);
    DeleteDC(dc_);
  }
  HDC Dc() const { return dc_; }
  std::uint32_t At(int x, int y) const { return bits_[y * kViewWidth + x] & 0xFFFFFF; }

private:
  HDC dc_ = nullptr;
  HBITMAP bitmap_ = nullptr;
  HGDIOBJ old_ = nullptr;
  std::uint32_t* bits_ = nullptr;
};

struct Bench {
  IXPICREPView* view = nullptr;
  IViewObject* drawing = nullptr;
  Surface surface;
  std::wstring path;
  long zoom = 100;
  int step = 0;

  HRESULT Draw() {
    const RECTL box{0, 0, kViewWidth, kViewHeight};
    return drawing->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, surface.Dc(), &box, nullptr, nullptr, 0);
  }
  HRESULT Put(PRV_PROPERTY code, VARIANT value) { return view->put_Property(code, value); }
  HRESULT Load() {
    VARIANT name;
    name.vt = VT_BSTR;
    name.bstrVal = SysAllocString(path.c_str());
    const HRESULT hr = Put(PRV_PICFILENAME, name);
    VariantClear(&name);
    return hr;
  }
  HRESULT Zoom(long percent) {
    VARIANT value;
    value.vt = VT_I4;
    value.lVal = percent;
    zoom = percent;
    return Put(PRV_ZOOMPERCENT, value);
  }
  HRESULT Remove() {
    VARIANT empty;
    VariantInit(&empty);
    return Put(PRV_PICFILENAME, empty);
  }
};

// One case: prepare (untimed), then the timed step; false when a step failed.
struct Case {
  const char* name;
  std::function<bool(Bench&)> prepare;
  std::function<bool(Bench&)> timed;
};

const long kZooms[] = {50, 75, 125, 150, 200, 20, 100};
constexpr int kZoomCount = sizeof kZooms / sizeof kZooms[0];

const Case kCases[] = {
    // What GDI+ itself takes to decode the file: the floor under the view's load.
    {"GDI+ decode alone (no view)", [](Bench& b) { return SUCCEEDED(b.Remove()); },
     [](Bench& b) {
       Gdiplus::GpBitmap* image = nullptr;
       if (gp::GdipCreateBitmapFromFile(b.path.c_str(), &image) != Gdiplus::Ok) return false;
       gp::GdipDisposeImage(image);
       return true;
     }},
    {"load only, 4000 x 3000 PNG", [](Bench& b) { return SUCCEEDED(b.Remove()) && SUCCEEDED(b.Zoom(100)); },
     [](Bench& b) { return b.Load() == S_OK; }},
    {"load and first paint, 4000 x 3000 PNG at 100%", [](Bench& b) { return SUCCEEDED(b.Remove()) && SUCCEEDED(b.Zoom(100)); },
     [](Bench& b) { return b.Load() == S_OK && b.Draw() == S_OK; }},
    {"repaint after a zoom change", [](Bench& b) { return b.Load() == S_OK; },
     [](Bench& b) { return b.Zoom(kZooms[b.step++ % kZoomCount]) == S_OK && b.Draw() == S_OK; }},
    {"repaint at the same zoom", [](Bench&) { return true; }, [](Bench& b) { return b.Draw() == S_OK; }},
    // Palette 0 shaded: every pixel goes through the colour matrix.
    {"repaint at the same zoom, shaded", [](Bench& b) { return b.view->SetPalIdxShading(0, 10.0) == S_OK; },
     [](Bench& b) { return b.Draw() == S_OK; }},
};

int Run(int count, const std::wstring& path) {
  CLSID clsid{};
  Bench bench;
  bench.path = path;
  if (FAILED(CLSIDFromProgID(L"BR_Info.XPICREPView", &clsid)) ||
      FAILED(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IXPICREPView,
                              reinterpret_cast<void**>(&bench.view))))
    return Fail("BR_Info.XPICREPView cannot be made (is BR_Info.dll registered?)");
  if (FAILED(bench.view->QueryInterface(IID_IViewObject, reinterpret_cast<void**>(&bench.drawing))))
    return Fail("no IViewObject");

  int result = 0;
  for (const Case& c : kCases) {
    std::vector<double> runs;
    for (int i = 0; i < count && result == 0; ++i) {
      if (!c.prepare(bench)) result = Fail(c.name);
      const Clock::time_point start = Clock::now();
      if (!c.timed(bench)) result = Fail(c.name);
      runs.push_back(std::chrono::duration<double, std::milli>(Clock::now() - start).count());
    }
    if (result != 0) break;
    std::sort(runs.begin(), runs.end());
    std::printf("%-48s median %8.2f ms, fastest %8.2f ms (%d runs)\n", c.name, runs[runs.size() / 2], runs.front(),
                count);
  }
  // The picture covers the view at every zoom of the list: without it the view shows its
  // background there, and nothing was timed.
  const std::uint32_t drawn = bench.surface.At(400, 300);
  if (result == 0 && (FAILED(bench.Remove()) || FAILED(bench.Draw()) || bench.surface.At(400, 300) == drawn))
    result = Fail("the picture was not drawn");
  bench.drawing->Release();
  bench.view->Release();
  return result;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  const int count = argc > 1 ? static_cast<int>(std::wcstol(argv[1], nullptr, 10)) : 5;
  if (count < 1) return Fail("COUNT must be positive");
  if (FAILED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED))) return Fail("COM cannot start");
  ULONG_PTR token = 0;
  Gdiplus::GdiplusStartupInput input;
  if (Gdiplus::GdiplusStartup(&token, &input, nullptr) != Gdiplus::Ok) return Fail("GDI+ cannot start");
  wchar_t temp[MAX_PATH] = {};
  GetTempPathW(MAX_PATH, temp);
  const std::wstring path = std::wstring(temp) + L"picture_bench_" + std::to_wstring(GetCurrentProcessId()) + L".png";
  int result = WritePicture(path) ? Run(count, path) : Fail("the PNG cannot be written");
  DeleteFileW(path.c_str());
  Gdiplus::GdiplusShutdown(token);
  CoUninitialize();
  return result;
}
