#include "toolkit/widgets/Label.h"

#include "toolkit/base/class_records.h"
#include "toolkit/widgets/support/MeasuringDC.h"
#include "toolkit/widgets/support/TextExtent.h"

namespace toolkit {

Label::Label(const char* text, int alignment) : alignment_(alignment) {
  if (text) text_ = text;
  userValue1_ = 7;
  userValue2_ = 0;
}

const ClassRecord* Label::getClassRecord() const { return &records::Label; }

void Label::setText(std::string_view text) {
  if (text == std::string_view(text_)) return;
  cXComponent::setText(text);
  invalidate();
}

void Label::setAlignment(int alignment) {
  if (alignment == alignment_) return;
  alignment_ = alignment;
  invalidate();
}

void Label::setEnabled(bool enabled) {
  const bool changed = enabled != getEnabledFlag();
  cXComponent::setEnabled(enabled);
  if (changed) invalidate();
}

const std::string& Label::measuredText() const {
  static const std::string placeholder = kEmptyMeasure;
  return text_.empty() ? placeholder : text_;
}

void Label::paint(HDC dc) {
  RECT client = getClientRect();
  const COLORREF oldBack = SetBkColor(dc, colorOf(COLOR_BTNFACE));
  ExtTextOutA(dc, 0, 0, ETO_OPAQUE, &client, nullptr, 0, nullptr);
  SetBkColor(dc, oldBack);
  if (text_.empty()) return;
  HFONT font = getFont();
  HGDIOBJ oldFont = SelectObject(dc, font ? static_cast<HGDIOBJ>(font) : GetStockObject(DEFAULT_GUI_FONT));
  const int oldMode = SetBkMode(dc, TRANSPARENT);
  const COLORREF oldColour = SetTextColor(dc, colorOf(getEnabledFlag() ? COLOR_WINDOWTEXT : COLOR_GRAYTEXT));
  RECT box = client;
  box.left += 2;
  box.right -= 2;
  // Not single-line, so DT_VCENTER leaves the text at the top; it breaks only at its own
  // line breaks and is cut at the edges ('&' marks a prefix, as in any DrawText).
  const UINT align = static_cast<UINT>(alignment_) & (DT_CENTER | DT_RIGHT);
  DrawTextA(dc, text_.c_str(), static_cast<int>(text_.size()), &box, align | DT_VCENTER);
  SetTextColor(dc, oldColour);
  SetBkMode(dc, oldMode);
  SelectObject(dc, oldFont);
}

SIZE Label::getPreferredSize() {
  SIZE size{};
  if (!TextExtent::measure(getFont(), measuredText(), insets_, size)) return kFallbackSize;
  return size;
}

SIZE Label::getPreferredSizeIn(const RECT& area) {
  MeasuringDC dc(getFont());
  if (!dc.valid()) return kFallbackSize;
  SIZE size = TextExtent::fromMetrics(dc, measuredText(), insets_);
  const int width = area.right - area.left, height = area.bottom - area.top;
  if (width <= 0 || height <= 0 || width >= size.cx) return size;
  const TEXTMETRICA& tm = dc.metrics();
  do {
    size.cx /= 2;
    size.cy += 2 * tm.tmDescent;
  } while (size.cx > width && size.cx >= 3 * tm.tmAveCharWidth);
  return size;
}

}  // namespace toolkit
