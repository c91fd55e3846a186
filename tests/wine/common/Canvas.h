// A 32-bit DIB section in a memory DC: what the tests draw controls into and read pixels
// from (windows have no pixels under Wine's null display driver).
#pragma once

#include <windows.h>
#include <ocidl.h>

#include <cstdint>

namespace br::test {

class Canvas {
public:
  // A canvas of width x height filled with background (0x00BBGGRR).
  Canvas(int width, int height, COLORREF background = RGB(0x12, 0x34, 0x56));
  ~Canvas();

  HDC Dc() const { return dc_; }
  int Width() const { return width_; }
  int Height() const { return height_; }
  // The pixel as 0x00BBGGRR; 0xFFFFFFFF outside the canvas.
  COLORREF At(int x, int y) const;
  // Pixels of the colour inside [left, right) x [top, bottom).
  int Count(COLORREF colour, int left, int top, int right, int bottom) const;
  bool SamePixels(const Canvas& other) const;

private:
  int width_;
  int height_;
  HDC dc_ = nullptr;
  HBITMAP bitmap_ = nullptr;
  HGDIOBJ old_ = nullptr;
  std::uint32_t* bits_ = nullptr;
};

// Draws control (any interface of it) over the whole canvas through IViewObject::Draw.
HRESULT DrawControl(IUnknown* control, const Canvas& canvas);

// Colour i of the ramp palette: each of the 20 slots told apart on a canvas.
inline COLORREF RampColour(int i) { return RGB(10 * i, 3, 5); }
// Hands the ramp palette to control through IEmbeddedControl::SetPalette.
HRESULT SetRampPalette(IUnknown* control);

}  // namespace br::test
