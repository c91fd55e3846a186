// XContoursView: the depth-shading scheme of the chart display as a column of coloured
// bands, one per depth zone, with the depth written on each labelled zone boundary. The
// host gives its presentation parameters, colour map and safety contour
// (SetContoursData) and the logical palette the chart is drawn in (Palette).
#pragma once

#include "contours/layout/contour_layout.h"
#include "frame/control/ControlObject.h"

#include "BR_Info.h"

namespace br::contours {

class XContoursView final : public br::control::ControlObject<XContoursView, IXContoursView> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  XContoursView() = default;
  ~XContoursView() override;

  // IXContoursView
  STDMETHODIMP SetContoursData(IUnknown* presParams, IUnknown* colorMap, double safetyContour) override;
  STDMETHODIMP put_Palette(long palette) override;

protected:
  void Paint(HDC dc, const RECT& client) override;
  bool OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override;
  HRESULT SetFont(IFont* font) override;

private:
  // Reads the scheme and the zone colours; false at the first failed call or wrong type.
  bool ReadScheme(IUnknown* presParams, IUnknown* colorMap);
  // The host's palette, or null when none was given or the handle is no palette now.
  HPALETTE LivePalette() const;
  void PaintScheme(HDC dc, const RECT& client);
  void PaintLabel(HDC dc, const RECT& client, const Boundary& boundary);
  // Makes the own font a copy of font (none for null), deleting the previous one.
  void CopyFont(HFONT font);

  bool valid_ = false;
  LONG palette_ = 0;
  ContourScheme scheme_;
  USHORT zoneColours_[kZoneCount] = {};
  HFONT font_ = nullptr;
};

}  // namespace br::contours
