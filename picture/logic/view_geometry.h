// The picture view's arithmetic: the zoomed extent and its line steps, the scroll bar of
// one axis, where a scroll request lands, and the brightness of a display palette.
// Portable, so it is tested natively.
#pragma once

#include <array>
#include <cstdint>

namespace br::picture {

// The zoomed image size in pixels and one line step per axis (a hundredth of the extent,
// rounded down: a 90-pixel-wide extent has no horizontal line step).
struct ZoomExtent {
  long width = 0;
  long height = 0;
  long lineX = 0;
  long lineY = 0;
};

// The extent of an image of width x height at zoom percent: width x zoom / 100 in integers.
// False for a zoom of 0 or less, or when an axis would not fit a signed 32-bit number.
bool ExtentAt(std::uint32_t width, std::uint32_t height, long zoom, ZoomExtent& extent);

// One axis's scroll bar over a client size and an extent.
struct AxisBar {
  bool enabled = false;  // false: the whole extent fits, position 0, both arrows disabled
  long max = 0;          // range 0..max (extent - 1)
  long page = 0;         // the client size
};
AxisBar BarFor(long client, long extent);

// The scroll requests the view answers; others leave the position alone.
enum class ScrollRequest { LineUp, LineDown, PageUp, PageDown, Thumb, Other };

// Where a request moves the position: by the line step, by the page, or to thumb; clamped to
// 0..max - page + 1, so the last pixel row of the extent can be scrolled into view.
long ScrollTo(ScrollRequest request, long position, long line, const AxisBar& bar, long thumb);

// The largest position of a bar (0 when disabled).
long LastPosition(const AxisBar& bar);

constexpr int kPaletteCount = 5;

// A shading of -100..100 for a palette 0..4; false for anything else (NaN included).
bool ShadingAccepted(unsigned long palette, double shading);

// The palette number taken from a 32-bit value read as signed: below 0 is 0, above 4 is 4.
int ClampPalette(std::uint32_t value);

// The colour factor of a shading: (100 - shading) x 0.01, so -100 doubles, 100 is black.
float BrightnessOf(double shading);

// The 5 x 5 colour matrix that multiplies red, green and blue by factor and keeps alpha.
using ColourMatrix = std::array<std::array<float, 5>, 5>;
ColourMatrix MatrixFor(float factor);

// The part of the source image, in whole image pixels, that covers the destination rectangle
// [left, right) x [top, bottom) of the zoomed picture, widened by one pixel for filtering and
// cut to the image. Empty (right <= left) when nothing of the image is there.
struct SourceRect {
  long left = 0;
  long top = 0;
  long right = 0;
  long bottom = 0;
};
SourceRect SourceFor(long left, long top, long right, long bottom, std::uint32_t width, std::uint32_t height,
                     long zoom);

}  // namespace br::picture
