#include "contours/XContoursView.h"

#include "frame/com/ComRef.h"
#include "toolkit/core/Palette.h"

#include "GeoData.h"

namespace br::contours {

namespace {

constexpr long kShallowContourParam = 0;
constexpr long kDeepContourParam = 2;
constexpr long kTwoShadesParam = 3;
constexpr int kGreyEntry = 7;
constexpr int kTextEntry = 0;
constexpr UINT kLabelFormat = DT_CENTER | DT_VCENTER | DT_SINGLELINE;  // 0x25
constexpr COLORREF kPaletteRelative = 0x01000000;

// One parameter of the expected type; the VARIANT is cleared whatever the host put in it.
bool ReadParam(IPresParams* params, long index, VARTYPE type, VARIANT& value) {
  VariantInit(&value);
  const HRESULT hr = params->GetParam(index, &value);
  const bool ok = SUCCEEDED(hr) && value.vt == type;
  if (!ok) VariantClear(&value);
  return ok;
}

}  // namespace

const br::com::ClassIdentity XContoursView::kClass = {&CLSID_XContoursView, &IID_IXContoursView, nullptr,
                                                      L"XContoursView"};

const XContoursView::Entry XContoursView::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_IXContoursView, Self},
    {&IID_IDispatch, Self},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {nullptr, nullptr},
};

XContoursView::~XContoursView() {
  if (font_) DeleteObject(font_);
}

// ---- IXContoursView

STDMETHODIMP XContoursView::SetContoursData(IUnknown* presParams, IUnknown* colorMap, double safetyContour) {
  return Guard([&] {
    valid_ = false;
    if (!presParams || !colorMap) {
      Repaint();
      return S_FALSE;
    }
    scheme_.safety = safetyContour;
    valid_ = ReadScheme(presParams, colorMap);
    // A failed read leaves the view grey: show that at once too.
    Repaint();
    return S_OK;
  });
}

bool XContoursView::ReadScheme(IUnknown* presParams, IUnknown* colorMap) {
  br::com::ComRef<IColorMap> map = br::com::ComRef<IUnknown>(colorMap).Query<IColorMap>(IID_IColorMap);
  if (!map) return false;
  br::com::ComRef<IPresParams> params = br::com::ComRef<IUnknown>(presParams).Query<IPresParams>(IID_IPresParams);
  if (!params) return false;

  VARIANT value;
  if (!ReadParam(params.Get(), kTwoShadesParam, VT_I4, value)) return false;
  scheme_.twoShades = value.lVal != 0;
  VariantClear(&value);
  if (!ReadParam(params.Get(), kShallowContourParam, VT_R4, value)) return false;
  scheme_.shallow = value.fltVal;
  VariantClear(&value);
  if (!ReadParam(params.Get(), kDeepContourParam, VT_R4, value)) return false;
  scheme_.deep = value.fltVal;
  VariantClear(&value);

  for (int i = 0; i < kZoneCount; ++i) {
    USHORT index = 0;
    if (FAILED(map->GetPaletteIndex(kZoneColourNumbers[i], &index))) return false;
    zoneColours_[i] = index;
  }
  return true;
}

STDMETHODIMP XContoursView::put_Palette(long palette) {
  palette_ = palette;
  Repaint();
  return S_OK;
}

// ---- painting and font

HPALETTE XContoursView::LivePalette() const {
  if (palette_ == 0) return nullptr;
  // The host passes its handle as 32 bits; GDI handles keep their value in the low 32 bits
  // on 64-bit Windows too, sign-extended.
  const auto handle = reinterpret_cast<HPALETTE>(static_cast<LONG_PTR>(palette_));
  return GetObjectType(handle) == OBJ_PAL ? handle : nullptr;
}

void XContoursView::Paint(HDC dc, const RECT& client) {
  if (!valid_ || !LivePalette()) {
    toolkit::Palette::fill(dc, client, kGreyEntry);
    return;
  }
  PaintScheme(dc, client);
}

void XContoursView::PaintScheme(HDC dc, const RECT& client) {
  const HPALETTE oldPalette = SelectPalette(dc, LivePalette(), FALSE);
  RealizePalette(dc);

  for (const Band& band : LayBands(scheme_, client.top, client.bottom)) {
    const RECT area{client.left, band.top, client.right, band.bottom};
    if (const HBRUSH brush = CreateSolidBrush(kPaletteRelative | zoneColours_[band.zone])) {
      FillRect(dc, &area, brush);
      DeleteObject(brush);
    }
  }

  const HGDIOBJ oldFont = font_ ? SelectObject(dc, font_) : nullptr;
  const int oldMode = SetBkMode(dc, TRANSPARENT);
  const COLORREF oldColour = SetTextColor(dc, toolkit::Palette::colour(kTextEntry));
  for (const Boundary& boundary : LabelBoundaries(scheme_, client.top, client.bottom))
    PaintLabel(dc, client, boundary);
  SetTextColor(dc, oldColour);
  SetBkMode(dc, oldMode);
  if (oldFont) SelectObject(dc, oldFont);

  // The DC is the host's: give it back its palette.
  if (oldPalette) SelectPalette(dc, oldPalette, TRUE);
}

void XContoursView::PaintLabel(HDC dc, const RECT& client, const Boundary& boundary) {
  const int length = static_cast<int>(boundary.label.size());
  SIZE extent{};
  if (!GetTextExtentPoint32A(dc, boundary.label.c_str(), length, &extent)) extent = SIZE{};
  const LabelMarks marks = MarkLabel(client.left, client.right, boundary.y, extent.cx, extent.cy);
  RECT box{client.left, marks.boxTop, client.right, marks.boxBottom};
  DrawTextA(dc, boundary.label.c_str(), length, &box, kLabelFormat);
  if (marks.barWidth <= 0) return;
  const RECT leftBar{marks.leftBarX, marks.barTop, marks.leftBarX + marks.barWidth,
                     marks.barTop + LabelMarks::kBarHeight};
  const RECT rightBar{marks.rightBarX, marks.barTop, marks.rightBarX + marks.barWidth,
                      marks.barTop + LabelMarks::kBarHeight};
  toolkit::Palette::fill(dc, leftBar, kTextEntry);
  toolkit::Palette::fill(dc, rightBar, kTextEntry);
}

HRESULT XContoursView::SetFont(IFont* font) {
  HFONT handle = nullptr;
  if (font && FAILED(font->get_hFont(&handle))) handle = nullptr;
  CopyFont(handle);
  Repaint();
  return S_OK;
}

void XContoursView::CopyFont(HFONT font) {
  HFONT copy = nullptr;
  LOGFONTA description{};
  if (font && GetObjectA(font, sizeof description, &description) > 0) copy = CreateFontIndirectA(&description);
  if (font_) DeleteObject(font_);
  font_ = copy;
}

bool XContoursView::OnMessage(HWND, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) {
  switch (message) {
    case WM_SETFONT:
      CopyFont(reinterpret_cast<HFONT>(wParam));
      if (LOWORD(lParam)) Repaint();
      result = 0;
      return true;
    case WM_GETFONT:
      result = reinterpret_cast<LRESULT>(font_);
      return true;
    default:
      return false;
  }
}

}  // namespace br::contours
