#include "toolkit/widgets/support/TextExtent.h"

#include "toolkit/widgets/support/MeasuringDC.h"

namespace toolkit {

SIZE TextExtent::fromMetrics(const MeasuringDC& dc, const std::string& text, const RECT& insets) {
  const TEXTMETRICA& tm = dc.metrics();
  const SIZE measured = dc.measure(text);
  SIZE size{2 * tm.tmAveCharWidth + measured.cx, 3 * tm.tmDescent + measured.cy};
  if (text.find('\r') != std::string::npos) size.cy += 2 * tm.tmDescent;
  size.cy += 2;
  size.cx += insets.left + insets.right;
  size.cy += insets.top + insets.bottom;
  return size;
}

bool TextExtent::measure(HFONT font, const std::string& text, const RECT& insets, SIZE& out) {
  MeasuringDC dc(font);
  if (!dc.valid()) return false;
  out = fromMetrics(dc, text, insets);
  return true;
}

}  // namespace toolkit
