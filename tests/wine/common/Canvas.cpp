#include "tests/wine/common/Canvas.h"

#include <cstring>

#include "BR_Private.h"
#include "frame/com/ComRef.h"

namespace br::test {

Canvas::Canvas(int width, int height, COLORREF background) : width_(width), height_(height) {
  BITMAPINFO info{{sizeof(BITMAPINFOHEADER), width, -height, 1, 32, BI_RGB, 0, 0, 0, 0, 0}, {}};  // top-down rows
  dc_ = CreateCompatibleDC(nullptr);
  void* bits = nullptr;
  bitmap_ = CreateDIBSection(dc_, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  bits_ = static_cast<std::uint32_t*>(bits);
  old_ = SelectObject(dc_, bitmap_);
  SetDCBrushColor(dc_, background);
  const RECT all{0, 0, width, height};
  FillRect(dc_, &all, static_cast<HBRUSH>(GetStockObject(DC_BRUSH)));
}

Canvas::~Canvas() {
  SelectObject(dc_, old_);
  DeleteObject(bitmap_);
  DeleteDC(dc_);
}

COLORREF Canvas::At(int x, int y) const {
  if (!bits_ || x < 0 || y < 0 || x >= width_ || y >= height_) return 0xFFFFFFFF;
  GdiFlush();
  const std::uint32_t pixel = bits_[static_cast<std::size_t>(y) * width_ + x];  // 0x00RRGGBB
  return RGB((pixel >> 16) & 0xFF, (pixel >> 8) & 0xFF, pixel & 0xFF);
}

int Canvas::Count(COLORREF colour, int left, int top, int right, int bottom) const {
  int n = 0;
  for (int y = top; y < bottom; ++y)
    for (int x = left; x < right; ++x)
      if (At(x, y) == colour) ++n;
  return n;
}

bool Canvas::SamePixels(const Canvas& other) const {
  if (width_ != other.width_ || height_ != other.height_ || !bits_ || !other.bits_) return false;
  GdiFlush();
  return std::memcmp(bits_, other.bits_, static_cast<std::size_t>(width_) * height_ * sizeof(std::uint32_t)) == 0;
}

HRESULT DrawControl(IUnknown* control, const Canvas& canvas) {
  br::com::ComRef<IViewObject> view;
  const HRESULT hr = control->QueryInterface(IID_IViewObject, view.OutVoid());
  if (FAILED(hr)) return hr;
  const RECTL box{0, 0, canvas.Width(), canvas.Height()};
  return view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, canvas.Dc(), &box, nullptr, nullptr, 0);
}

HRESULT SetRampPalette(IUnknown* control) {
  br::com::ComRef<IEmbeddedControl> embedded;
  HRESULT hr = control->QueryInterface(IID_IEmbeddedControl, embedded.OutVoid());
  if (FAILED(hr)) return hr;
  VARIANT palette;
  palette.vt = VT_ARRAY | VT_I4;
  palette.parray = SafeArrayCreateVector(VT_I4, 0, 20);
  for (LONG i = 0; i < 20; ++i) {
    LONG value = RampColour(i);
    SafeArrayPutElement(palette.parray, &i, &value);
  }
  hr = embedded->SetPalette(palette);
  VariantClear(&palette);
  return hr;
}

}  // namespace br::test
