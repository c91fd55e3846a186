// Pixels and himetric units (hundredths of a millimetre, 2540 to the inch), as OLE
// extents use them. Portable: the screen's pixels per inch is an argument.
#pragma once

#include <cstdint>

namespace br::control {

constexpr std::int32_t kHimetricPerInch = 2540;

// value * numerator / denominator rounded half away from zero (MulDiv's rounding);
// 0 for a zero denominator, and saturated to the 32-bit range.
constexpr std::int32_t ScaleRounded(std::int32_t value, std::int32_t numerator, std::int32_t denominator) {
  if (denominator == 0) return 0;
  std::int64_t product = static_cast<std::int64_t>(value) * numerator;
  std::int64_t d = denominator;
  if (d < 0) {
    d = -d;
    product = -product;
  }
  const std::int64_t half = d / 2;
  const std::int64_t q = product >= 0 ? (product + half) / d : -((-product + half) / d);
  if (q > INT32_MAX) return INT32_MAX;
  if (q < INT32_MIN) return INT32_MIN;
  return static_cast<std::int32_t>(q);
}

constexpr std::int32_t HimetricFromPixels(std::int32_t pixels, std::int32_t pixelsPerInch) {
  return ScaleRounded(pixels, kHimetricPerInch, pixelsPerInch > 0 ? pixelsPerInch : 96);
}

constexpr std::int32_t PixelsFromHimetric(std::int32_t himetric, std::int32_t pixelsPerInch) {
  return ScaleRounded(himetric, pixelsPerInch > 0 ? pixelsPerInch : 96, kHimetricPerInch);
}

}  // namespace br::control
