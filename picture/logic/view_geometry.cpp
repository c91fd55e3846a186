#include "picture/logic/view_geometry.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>

namespace br::picture {

namespace {

constexpr std::int64_t kLongMax = std::numeric_limits<std::int32_t>::max();

}  // namespace

bool ExtentAt(std::uint32_t width, std::uint32_t height, long zoom, ZoomExtent& extent) {
  if (zoom <= 0) return false;
  const std::int64_t w = static_cast<std::int64_t>(width) * zoom / 100;
  const std::int64_t h = static_cast<std::int64_t>(height) * zoom / 100;
  if (w > kLongMax || h > kLongMax) return false;
  extent.width = static_cast<long>(w);
  extent.height = static_cast<long>(h);
  extent.lineX = extent.width / 100;
  extent.lineY = extent.height / 100;
  return true;
}

AxisBar BarFor(long client, long extent) {
  AxisBar bar;
  if (client >= extent) return bar;
  bar.enabled = true;
  bar.max = extent - 1;
  bar.page = client < 0 ? 0 : client;
  return bar;
}

long LastPosition(const AxisBar& bar) {
  if (!bar.enabled) return 0;
  return std::max(0L, bar.max - bar.page + 1);
}

long ScrollTo(ScrollRequest request, long position, long line, const AxisBar& bar, long thumb) {
  std::int64_t next = position;
  switch (request) {
    case ScrollRequest::LineUp: next -= line; break;
    case ScrollRequest::LineDown: next += line; break;
    case ScrollRequest::PageUp: next -= bar.page; break;
    case ScrollRequest::PageDown: next += bar.page; break;
    case ScrollRequest::Thumb: next = thumb; break;
    case ScrollRequest::Other: return position;
  }
  return static_cast<long>(std::clamp<std::int64_t>(next, 0, LastPosition(bar)));
}

bool ShadingAccepted(unsigned long palette, double shading) {
  // Written so that NaN fails both comparisons.
  return palette < kPaletteCount && shading >= -100.0 && shading <= 100.0;
}

int ClampPalette(std::uint32_t value) {
  const auto number = static_cast<std::int32_t>(value);
  return std::clamp<std::int32_t>(number, 0, kPaletteCount - 1);
}

float BrightnessOf(double shading) { return static_cast<float>((100.0 - shading) * 0.01); }

ColourMatrix MatrixFor(float factor) {
  ColourMatrix m{};
  m[0][0] = m[1][1] = m[2][2] = factor;
  m[3][3] = m[4][4] = 1.0f;
  return m;
}

SourceRect SourceFor(long left, long top, long right, long bottom, std::uint32_t width, std::uint32_t height,
                     long zoom) {
  SourceRect source;
  if (zoom <= 0 || right <= left || bottom <= top) return source;
  // Destination pixel d covers source pixels d x 100 / zoom; one pixel more on each side
  // keeps the filtered edges the same as when the whole image is drawn.
  const auto down = [zoom](long d) { return static_cast<std::int64_t>(std::floor(d * 100.0 / zoom)) - 1; };
  const auto up = [zoom](long d) { return static_cast<std::int64_t>(std::ceil(d * 100.0 / zoom)) + 1; };
  source.left = static_cast<long>(std::clamp<std::int64_t>(down(left), 0, width));
  source.top = static_cast<long>(std::clamp<std::int64_t>(down(top), 0, height));
  source.right = static_cast<long>(std::clamp<std::int64_t>(up(right), 0, width));
  source.bottom = static_cast<long>(std::clamp<std::int64_t>(up(bottom), 0, height));
  if (source.right <= source.left || source.bottom <= source.top) source = SourceRect{};
  return source;
}

}  // namespace br::picture
