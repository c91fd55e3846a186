// TidesWindow: the tide graph control. It draws one day of a TidesPort (night, twilight
// and daylight bands from the sun times, an hour and height grid with labels, the
// curve) and fires MouseAction with the time and height under the pointer.
#pragma once

#include "frame/com/ComRef.h"
#include "frame/control/ControlObject.h"
#include "tides/controls/UnitsOptionFace.h"

#include "BR_Info.h"

#include <string>

namespace br::tides {

class TidesWindow final : public br::control::ControlObject<TidesWindow, ITidesWindow> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  TidesWindow() = default;
  ~TidesWindow() override;

  // ITidesWindow
  STDMETHODIMP SetPort(IUnknown* port) override;
  STDMETHODIMP Calculate(double step, double predictDate) override;
  STDMETHODIMP SetScale(double maximum, double minimum) override;
  STDMETHODIMP put_Property(TW_PROPERTY code, VARIANT value) override;
  STDMETHODIMP get_Property(TW_PROPERTY code, VARIANT* value) override;

  // IUnitsOption (through its face)
  HRESULT SetFeet(LONG feet);

protected:
  void Paint(HDC dc, const RECT& client) override;
  bool OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override;
  HRESULT SetFont(IFont* font) override;

private:
  static IUnknown* UnitsOption(TidesWindow& w) { return &w.unitsOption_; }

  // Makes the own font a copy of font (none for null), deleting the previous one.
  void CopyFont(HFONT font);
  // Fires MouseAction for the pointer at x; false when nothing was fired.
  bool ReportPointer(HWND window, unsigned pointerX);
  bool ReportPointerOf(ITidesPort* port, HWND window, unsigned pointerX);
  HRESULT PutDrawText(const VARIANT& value);
  HRESULT PutFormatText(const VARIANT& value);

  // Fields in the order the graph keeps them, with their first values.
  LONG bottomMargin_ = 8;
  LONG leftMargin_ = 8;
  br::com::ComRef<ITidesPort> port_;
  HFONT font_ = nullptr;
  double scaleMax_ = 0.0;
  double scaleMin_ = 0.0;
  std::string formatText_ = "%.2f";
  LONG drawText_ = 1;
  LONG feet_ = 0;

  UnitsOptionFace unitsOption_{*static_cast<ITidesWindow*>(this), *this};
};

}  // namespace br::tides
