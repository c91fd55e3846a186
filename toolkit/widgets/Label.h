#pragma once
// A self-drawn line (or a few lines) of text on the button-face colour.

#include "toolkit/core/cXComponent.h"

namespace toolkit {

class Label : public cXComponent {
public:
  // DrawText's horizontal alignment flags.
  enum Alignment : int { kLeft = DT_LEFT, kCenter = DT_CENTER, kRight = DT_RIGHT };
  // What an empty label measures, so that it keeps a usable size.
  static constexpr const char* kEmptyMeasure = "AAAAA";
  static constexpr SIZE kFallbackSize{100, 20};

  explicit Label(const char* text = nullptr, int alignment = kLeft);

  const ClassRecord* getClassRecord() const override;

  // Redraws only when the text really changes.
  void setText(std::string_view text) override;
  void setAlignment(int alignment);
  int getAlignment() const { return alignment_; }

  void setEnabled(bool enabled) override;
  void paint(HDC dc) override;
  SIZE getPreferredSize() override;
  // Narrower than the text: the width halves (and a line of height is added)
  // until it fits or would drop below three average characters.
  SIZE getPreferredSizeIn(const RECT& area) override;

private:
  const std::string& measuredText() const;

  int alignment_ = kLeft;
};

}  // namespace toolkit
