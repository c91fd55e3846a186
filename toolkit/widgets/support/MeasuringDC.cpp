#include "toolkit/widgets/support/MeasuringDC.h"

namespace toolkit {

namespace {
bool g_noScreen = false;
}

void MeasuringDC::simulateNoScreen(bool on) { g_noScreen = on; }

MeasuringDC::MeasuringDC(HFONT font) {
  if (g_noScreen) return;
  dc_ = GetDC(nullptr);
  if (!dc_) return;
  oldFont_ = SelectObject(dc_, font ? static_cast<HGDIOBJ>(font) : GetStockObject(DEFAULT_GUI_FONT));
  if (!GetTextMetricsA(dc_, &metrics_)) metrics_ = TEXTMETRICA{};
}

MeasuringDC::~MeasuringDC() {
  if (!dc_) return;
  if (oldFont_) SelectObject(dc_, oldFont_);
  ReleaseDC(nullptr, dc_);
}

SIZE MeasuringDC::measure(const std::string& text, UINT flags) const {
  if (!dc_) return SIZE{0, 0};
  RECT box{0, 0, 0, 0};
  DrawTextA(dc_, text.c_str(), static_cast<int>(text.size()), &box, DT_CALCRECT | DT_NOPREFIX | flags);
  return SIZE{box.right - box.left, box.bottom - box.top};
}

}  // namespace toolkit
