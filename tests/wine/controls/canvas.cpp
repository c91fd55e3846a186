#include "tests/wine/controls/canvas.h"

#include <cstring>

namespace br::test {

Canvas::Canvas(int width, int height, COLORREF background) : width_(width), height_(height) {
  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof(info.bmiHeader);
  info.bmiHeader.biWidth = width;
  info.bmiHeader.biHeight = -height;  // top-down rows
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  info.bmiHeader.biCompression = BI_RGB;
  dc_ = CreateCompatibleDC(nullptr);
  void* bits = nullptr;
  bitmap_ = CreateDIBSection(dc_, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  bits_ = static_cast<std::uint32_t*>(bits);
  old_ = SelectObject(dc_, bitmap_);
  const RECT all{0, 0, width, height};
  HBRUSH brush = CreateSolidBrush(background);
  FillRect(dc_, &all, brush);
  DeleteObject(brush);
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

HRESULT DrawControl(IUnknown* control, const Canvas& canvas, const RECT* bounds) {
  IViewObject* view = nullptr;
  HRESULT hr = control->QueryInterface(IID_IViewObject, reinterpret_cast<void**>(&view));
  if (FAILED(hr)) return hr;
  const RECTL box = bounds ? RECTL{bounds->left, bounds->top, bounds->right, bounds->bottom}
                           : RECTL{0, 0, canvas.Width(), canvas.Height()};
  hr = view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, canvas.Dc(), &box, nullptr, nullptr, 0);
  view->Release();
  return hr;
}

}  // namespace br::test
