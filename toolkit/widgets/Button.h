#pragma once
// A self-drawn button: a 3-D box with an optional image-list image and a centred
// text. Push buttons (kind 0) fire when released over themselves; toggle kinds
// (2, and 3 which behaves like a radio button among its kind-3 siblings) fire
// when pressed. The owner sets the kind right after construction.

#include <windows.h>
#include <commctrl.h>

#include "toolkit/core/cXComponent.h"

namespace toolkit {

class Button : public cXComponent {
public:
  enum Kind : int { kPush = 0, kToggle = 2, kRadio = 3 };
  // Values of the state field.
  static constexpr int kStatePressed = 1;
  static constexpr int kStateRaised = 2;
  static constexpr int kStateDisabled = 4;  // flag, beside pressed or raised
  // Used when no screen DC is to be had.
  static constexpr SIZE kFallbackSize{100, 20};

  explicit Button(const char* text = nullptr);
  // The image list is borrowed; -1 means no disabled image.
  Button(HIMAGELIST images, int imageIndex, int disabledImageIndex);

  const ClassRecord* getClassRecord() const override;

  int kind = kPush;

  void setChecked(bool checked);
  bool isChecked() const { return isPressed(); }
  bool isPressed() const { return (state_ & 3) == kStatePressed; }
  bool isDisabledLook() const { return (state_ & kStateDisabled) != 0; }

  // Draws into `dc`, or into the button's own window when `dc` is null.
  void drawButton(HDC dc = nullptr);

  void setEnabled(bool enabled) override;
  void setText(std::string_view text) override;
  void paint(HDC dc) override;
  int onMouseDown(ToolkitEvent& event, int x, int y) override;
  int onMouseDrag(ToolkitEvent& event, int x, int y) override;
  int onMouseUp(ToolkitEvent& event, int x, int y) override;
  SIZE getPreferredSize() override;
  SIZE getPreferredSizeIn(const RECT& area) override;

  HIMAGELIST imageList() const { return images_; }
  SIZE imageSize() const { return SIZE{imageWidth_, imageHeight_}; }

private:
  void setPressedState(bool pressed);
  void releaseRadioSiblings();
  void drawFace(HDC dc, const RECT& rect);
  void drawContent(HDC dc, RECT rect);

  HIMAGELIST images_ = nullptr;
  int imageIndex_ = -1;
  int disabledImageIndex_ = -1;
  int imageWidth_ = 0;
  int imageHeight_ = 0;
};

}  // namespace toolkit
