#pragma once
// The preferred size of a text-showing widget (Button, Label): the measured text
// with room around it, plus the component's insets.

#include <windows.h>

#include <string>

namespace toolkit {

class MeasuringDC;

class TextExtent {
public:
  // width = 2 * tmAveCharWidth + text width; height = 3 * tmDescent + text
  // height (+ 2 * tmDescent for a text with a carriage return) + 2; then the
  // insets. False (and `out` untouched) without a screen DC.
  static bool measure(HFONT font, const std::string& text, const RECT& insets, SIZE& out);
  static SIZE fromMetrics(const MeasuringDC& dc, const std::string& text, const RECT& insets);
};

}  // namespace toolkit
