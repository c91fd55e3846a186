#include "toolkit/widgets/Button.h"

#include "toolkit/base/class_records.h"
#include "toolkit/core/Container.h"
#include "toolkit/widgets/support/TextExtent.h"

namespace toolkit {

namespace {

// One 3-D frame: top and left edges in `topLeft`, bottom and right in `bottomRight`.
void frame3d(HDC dc, const RECT& r, COLORREF topLeft, COLORREF bottomRight) {
  auto bar = [dc](int left, int top, int right, int bottom, COLORREF colour) {
    const RECT edge{left, top, right, bottom};
    const COLORREF old = SetBkColor(dc, colour);
    ExtTextOutA(dc, 0, 0, ETO_OPAQUE, &edge, nullptr, 0, nullptr);
    SetBkColor(dc, old);
  };
  bar(r.left, r.top, r.right - 1, r.top + 1, topLeft);
  bar(r.left, r.top, r.left + 1, r.bottom - 1, topLeft);
  bar(r.left, r.bottom - 1, r.right, r.bottom, bottomRight);
  bar(r.right - 1, r.top, r.right, r.bottom, bottomRight);
}

void fill(HDC dc, const RECT& r, COLORREF colour) {
  const COLORREF old = SetBkColor(dc, colour);
  ExtTextOutA(dc, 0, 0, ETO_OPAQUE, &r, nullptr, 0, nullptr);
  SetBkColor(dc, old);
}

}  // namespace

Button::Button(const char* text) {
  state_ = kStateRaised;
  if (text) text_ = text;
}

Button::Button(HIMAGELIST images, int imageIndex, int disabledImageIndex)
    : images_(images), imageIndex_(imageIndex), disabledImageIndex_(disabledImageIndex) {
  state_ = kStateRaised;
  if (images_) {
    int w = 0, h = 0;
    if (ImageList_GetIconSize(images_, &w, &h)) {
      imageWidth_ = w;
      imageHeight_ = h;
    }
  }
}

const ClassRecord* Button::getClassRecord() const { return &records::Button; }

void Button::setPressedState(bool pressed) {
  const int now = (state_ & kStateDisabled) | (pressed ? kStatePressed : kStateRaised);
  if (now == state_) return;
  state_ = now;
  drawButton();
}

void Button::setChecked(bool checked) {
  setPressedState(checked);
  if (checked && kind == kRadio) releaseRadioSiblings();
}

void Button::releaseRadioSiblings() {
  if (!parent_ || !isKindOf(parent_, &records::Container)) return;
  auto* container = static_cast<Container*>(parent_);
  for (int i = 0; i < container->getChildCount(); ++i) {
    cXComponent* child = container->getChild(i);
    if (child == this || !isKindOf(child, &records::Button)) continue;
    auto* sibling = static_cast<Button*>(child);
    if (sibling->kind == kRadio) sibling->setPressedState(false);
  }
}

void Button::setEnabled(bool enabled) {
  cXComponent::setEnabled(enabled);
  const int now = enabled ? (state_ & ~kStateDisabled) : (state_ | kStateDisabled);
  if (now == state_) return;
  state_ = now;
  drawButton();
}

void Button::setText(std::string_view text) {
  cXComponent::setText(text);
  invalidate();
}

int Button::onMouseDown(ToolkitEvent& event, int, int) {
  if (event.source != this) return 0;  // either mouse button
  if (isDisabledLook()) return 1;
  if (kind == kToggle || kind == kRadio) {
    // A radio-like button is released only by its siblings.
    setPressedState(kind == kRadio ? true : !isPressed());
    if (kind == kRadio) releaseRadioSiblings();
    fireAction();
    return 1;
  }
  setPressedState(true);
  captureMouse();
  return 1;
}

int Button::onMouseDrag(ToolkitEvent& event, int x, int y) {
  if (event.source != this || kind != kPush || !isValid()) return 0;
  if (GetCapture() != getHandle()) return 1;  // the press did not start here
  POINT at{x, y};
  ClientToScreen(getHandle(), &at);
  const RECT window = getWindowRect();
  setPressedState(PtInRect(&window, at) != FALSE);
  return 1;
}

int Button::onMouseUp(ToolkitEvent& event, int x, int y) {
  if (event.source != this || kind != kPush) return 0;
  if (isDisabledLook()) return 1;
  // Where the button goes up decides, even when no drag reported the way out.
  POINT at{x, y};
  if (isValid()) ClientToScreen(getHandle(), &at);
  const RECT window = getWindowRect();
  const bool wasPressed = isPressed() && PtInRect(&window, at);
  setPressedState(false);
  if (GetCapture() == getHandle()) ReleaseCapture();
  if (wasPressed) fireAction();
  return 1;
}

void Button::paint(HDC dc) { drawButton(dc); }

void Button::drawButton(HDC dc) {
  const bool own = dc == nullptr;
  if (own) {
    if (!isValid() || !isRedrawEnabled()) return;
    dc = GetDC(getHandle());
    if (!dc) return;
  }
  const RECT client = getClientRect();
  drawFace(dc, client);
  if (own) ReleaseDC(getHandle(), dc);
}

void Button::drawFace(HDC dc, const RECT& rect) {
  RECT r = rect;
  if (isPressed()) {
    fill(dc, r, colorOf(COLOR_GRAYTEXT));
    frame3d(dc, r, colorOf(COLOR_BTNSHADOW), colorOf(COLOR_BTNHIGHLIGHT));
    InflateRect(&r, -1, -1);
    frame3d(dc, r, colorOf(COLOR_BTNSHADOW), colorOf(COLOR_BTNHIGHLIGHT));
    InflateRect(&r, -1, -1);
    OffsetRect(&r, 1, 1);  // the content sinks in by one more pixel
  } else {
    frame3d(dc, r, colorOf(COLOR_BTNHIGHLIGHT), colorOf(COLOR_BTNSHADOW));
    InflateRect(&r, -1, -1);
    frame3d(dc, r, colorOf(COLOR_BTNHIGHLIGHT), colorOf(COLOR_BTNSHADOW));
    InflateRect(&r, -1, -1);
    fill(dc, r, colorOf(COLOR_BTNFACE));
  }
  drawContent(dc, r);
}

void Button::drawContent(HDC dc, RECT r) {
  const int index = isDisabledLook() && disabledImageIndex_ >= 0 ? disabledImageIndex_ : imageIndex_;
  const bool hasText = !text_.empty();
  if (images_ && index >= 0) {
    const int x = hasText ? r.left + 2 : r.left + (r.right - r.left - imageWidth_) / 2;
    const int y = r.top + (r.bottom - r.top - imageHeight_) / 2;
    ImageList_Draw(images_, index, dc, x, y, ILD_TRANSPARENT);
    if (hasText) r.left += imageWidth_ + 2;
  }
  if (!hasText) return;
  COLORREF colour;
  if (isPressed()) colour = colorOf(isDisabledLook() ? COLOR_BTNFACE : COLOR_HIGHLIGHTTEXT);
  else colour = colorOf(isDisabledLook() ? COLOR_GRAYTEXT : COLOR_WINDOWTEXT);
  HFONT font = getFont();
  HGDIOBJ oldFont = SelectObject(dc, font ? static_cast<HGDIOBJ>(font) : GetStockObject(DEFAULT_GUI_FONT));
  const int oldMode = SetBkMode(dc, TRANSPARENT);
  const COLORREF oldColour = SetTextColor(dc, colour);
  if (text_.find('\r') == std::string::npos) {
    DrawTextA(dc, text_.c_str(), static_cast<int>(text_.size()), &r,
              DT_CENTER | DT_VCENTER | DT_SINGLELINE | DT_NOPREFIX);
  } else {
    RECT box = r;
    DrawTextA(dc, text_.c_str(), static_cast<int>(text_.size()), &box, DT_CENTER | DT_CALCRECT | DT_NOPREFIX);
    const int h = box.bottom - box.top;
    r.top += (r.bottom - r.top - h) / 2;
    DrawTextA(dc, text_.c_str(), static_cast<int>(text_.size()), &r, DT_CENTER | DT_NOPREFIX);
  }
  SetTextColor(dc, oldColour);
  SetBkMode(dc, oldMode);
  SelectObject(dc, oldFont);
}

SIZE Button::getPreferredSize() {
  if (images_ && text_.empty()) {
    return SIZE{imageWidth_ + 4 + insets_.left + insets_.right, imageHeight_ + 4 + insets_.top + insets_.bottom};
  }
  SIZE size{};
  if (!TextExtent::measure(getFont(), text_, insets_, size)) return kFallbackSize;
  return size;
}

SIZE Button::getPreferredSizeIn(const RECT&) { return getPreferredSize(); }

}  // namespace toolkit
