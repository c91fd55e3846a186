#include "host/brtide/png_file.h"

#include <objidl.h>
#include <gdiplus.h>

namespace br::brtide {

namespace {

// GDI+'s built-in PNG encoder.
const CLSID kPngEncoder = {0x557CF406, 0x1A04, 0x11D3, {0x9A, 0x73, 0x00, 0x00, 0xF8, 0x1E, 0xF3, 0x2E}};

class GdiplusSession {
public:
  GdiplusSession() {
    Gdiplus::GdiplusStartupInput input;
    started_ = Gdiplus::GdiplusStartup(&token_, &input, nullptr) == Gdiplus::Ok;
  }
  ~GdiplusSession() {
    if (started_) Gdiplus::GdiplusShutdown(token_);
  }
  GdiplusSession(const GdiplusSession&) = delete;
  GdiplusSession& operator=(const GdiplusSession&) = delete;
  bool Started() const { return started_; }

private:
  ULONG_PTR token_ = 0;
  bool started_ = false;
};

}  // namespace

bool WritePngFile(const std::wstring& path, const void* bits, int width, int height, std::string& error) {
  GdiplusSession gdiplus;
  if (!gdiplus.Started()) {
    error = "GDI+ cannot start";
    return false;
  }
  Gdiplus::GpBitmap* bitmap = nullptr;
  if (Gdiplus::DllExports::GdipCreateBitmapFromScan0(width, height, width * 4, PixelFormat32bppRGB,
                                                     static_cast<BYTE*>(const_cast<void*>(bits)),
                                                     &bitmap) != Gdiplus::Ok) {
    error = "GDI+ cannot make a bitmap of the picture";
    return false;
  }
  const Gdiplus::Status saved = Gdiplus::DllExports::GdipSaveImageToFile(bitmap, path.c_str(), &kPngEncoder, nullptr);
  Gdiplus::DllExports::GdipDisposeImage(bitmap);
  if (saved != Gdiplus::Ok) {
    error = "cannot write the picture file";
    return false;
  }
  return true;
}

}  // namespace br::brtide
