#pragma once
// A screen device context with a font selected, for the size computations of
// the widgets. Without a screen DC (valid() false) callers fall back to fixed
// sizes; tests can force that case.

#include <windows.h>

#include <string>

namespace toolkit {

class MeasuringDC {
public:
  // A null font measures with the default GUI font.
  explicit MeasuringDC(HFONT font);
  ~MeasuringDC();
  MeasuringDC(const MeasuringDC&) = delete;
  MeasuringDC& operator=(const MeasuringDC&) = delete;

  bool valid() const { return dc_ != nullptr; }
  HDC dc() const { return dc_; }
  const TEXTMETRICA& metrics() const { return metrics_; }
  // DrawText with DT_CALCRECT (plus `flags`): width and height of the text.
  SIZE measure(const std::string& text, UINT flags = 0) const;

  // Makes every MeasuringDC behave as if the screen DC could not be had.
  static void simulateNoScreen(bool on);

private:
  HDC dc_ = nullptr;
  HGDIOBJ oldFont_ = nullptr;
  TEXTMETRICA metrics_{};
};

}  // namespace toolkit
