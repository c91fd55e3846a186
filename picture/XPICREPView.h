// XPICREPView: one picture (a file GDI+ reads, or a GDI bitmap handed over) drawn zoomed and
// scrolled, its colours scaled by the shading chosen for the current display palette.
//
//   SetPalIdxShading(palette 0..4, shading -100..100)  brightness (100 - shading) %
//   Property PRV_PICFILENAME   the file (UTF-16 kept whole); VT_EMPTY removes the picture
//   Property PRV_ZOOMPERCENT   VT_I4 above 0; the scroll extent is the zoomed size
//   Property PRV_BITMAP        put only: a bitmap handle (VT_I4, or VT_I8 on 64-bit) the view
//                              owns once GDI+ accepted it; VT_EMPTY removes the picture
//   IEmbeddedControl           slot 1 the palette number (clamped to 0..4), slot 4 the extent
//
// Every view starts GDI+ for itself and shuts it down when it goes. A file GDI+ cannot read
// gives E_FAIL and the view shows "Failed to open image file:" with the name.
#pragma once

#include "frame/control/ControlObject.h"
#include "picture/logic/view_geometry.h"

#include "BR_Info.h"

#include <string>

namespace br::picture {

class XPICREPView final : public br::control::ControlObject<XPICREPView, IXPICREPView> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  XPICREPView();
  ~XPICREPView() override;

  // IXPICREPView
  STDMETHODIMP SetPalIdxShading(ULONG palette, double shading) override;
  STDMETHODIMP get_Property(PRV_PROPERTY code, VARIANT* value) override;
  STDMETHODIMP put_Property(PRV_PROPERTY code, VARIANT value) override;

protected:
  void Paint(HDC dc, const RECT& client) override;
  bool OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override;
  HRESULT SetPalette(const VARIANT& palette) override;
  HRESULT GetPreferredSize(long* width, long* height) override;

private:
  HRESULT PutFileName(const VARIANT& value);
  HRESULT PutZoom(const VARIANT& value);
  HRESULT PutBitmap(const VARIANT& value);
  HRESULT Load();
  // Takes image (and the bitmap handle it was made from, or null) after releasing the old one.
  void Adopt(void* image, HBITMAP bitmap);
  void RemoveImage();
  // Extent from the zoom, then the scroll bars.
  void FollowZoom();
  void UpdateBars();
  void Scroll(HWND window, int bar, WPARAM request);
  void PaintImage(HDC dc);
  void PaintFailure(HDC dc, const RECT& client);

  ULONG_PTR gdiplus_ = 0;
  void* image_ = nullptr;  // GpBitmap
  HBITMAP ownedBitmap_ = nullptr;
  std::wstring fileName_;
  long zoom_ = 100;
  double shading_[kPaletteCount] = {};
  int palette_ = 0;
  std::uint32_t imageWidth_ = 0;
  std::uint32_t imageHeight_ = 0;
  ZoomExtent extent_;
  AxisBar barX_;
  AxisBar barY_;
  long scrollX_ = 0;
  long scrollY_ = 0;
  bool updatingBars_ = false;
};

}  // namespace br::picture
