#include "picture/XPICREPView.h"

#include "toolkit/core/Palette.h"

#include <gdiplus.h>

namespace br::picture {

namespace gp = Gdiplus::DllExports;

namespace {

constexpr int kBackgroundEntry = 7;
constexpr wchar_t kFailureText[] = L"Failed to open image file:";

Gdiplus::GpBitmap* BitmapOf(void* image) { return static_cast<Gdiplus::GpBitmap*>(image); }

// A bitmap handle from a VARIANT: VT_I4 everywhere, VT_I8 too where handles are 64 bits.
bool HandleIn(const VARIANT& value, HBITMAP& bitmap) {
  if (value.vt == VT_I4) {
    bitmap = reinterpret_cast<HBITMAP>(static_cast<LONG_PTR>(value.lVal));
    return true;
  }
  if (sizeof(void*) == 8 && value.vt == VT_I8) {
    bitmap = reinterpret_cast<HBITMAP>(static_cast<LONG_PTR>(value.llVal));
    return true;
  }
  return false;
}

// value with one level of reference taken away. A reference to nothing is refused here:
// the platform's copy would read through it.
bool CopyPlain(const VARIANT& value, VARIANT& plain) {
  VariantInit(&plain);
  if ((value.vt & VT_BYREF) && !value.byref) return false;
  return SUCCEEDED(VariantCopyInd(&plain, const_cast<VARIANT*>(&value)));
}

}  // namespace

const br::com::ClassIdentity XPICREPView::kClass = {&CLSID_XPICREPView, &IID_IXPICREPView,
                                                    &DIID__IXPICREPViewEvents, L"XPICREPView"};

const XPICREPView::Entry XPICREPView::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_IXPICREPView, Self},
    {&IID_IDispatch, Self},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {nullptr, nullptr},
};

XPICREPView::XPICREPView() {
  Gdiplus::GdiplusStartupInput input;  // version 1, GDI+'s own background thread
  if (Gdiplus::GdiplusStartup(&gdiplus_, &input, nullptr) != Gdiplus::Ok) gdiplus_ = 0;
}

XPICREPView::~XPICREPView() {
  RemoveImage();
  if (gdiplus_) Gdiplus::GdiplusShutdown(gdiplus_);
}

// ---- IXPICREPView

STDMETHODIMP XPICREPView::SetPalIdxShading(ULONG palette, double shading) {
  if (!ShadingAccepted(palette, shading)) return E_INVALIDARG;
  shading_[palette] = shading;
  return S_OK;
}

STDMETHODIMP XPICREPView::get_Property(PRV_PROPERTY code, VARIANT* value) {
  if (!value) return E_POINTER;
  return Guard([&]() -> HRESULT {
    switch (code) {
      case PRV_PICFILENAME: {
        BSTR text = SysAllocStringLen(fileName_.data(), static_cast<UINT>(fileName_.size()));
        if (!text) return E_OUTOFMEMORY;
        VariantInit(value);
        value->vt = VT_BSTR;
        value->bstrVal = text;
        return S_OK;
      }
      case PRV_ZOOMPERCENT:
        VariantInit(value);
        value->vt = VT_I4;
        value->lVal = zoom_;
        return S_OK;
      default:
        return E_INVALIDARG;
    }
  });
}

STDMETHODIMP XPICREPView::put_Property(PRV_PROPERTY code, VARIANT value) {
  return Guard([&]() -> HRESULT {
    // Script hosts hand values by reference.
    VARIANT plain;
    if (!CopyPlain(value, plain)) return E_INVALIDARG;
    HRESULT hr = E_INVALIDARG;
    switch (code) {
      case PRV_PICFILENAME: hr = PutFileName(plain); break;
      case PRV_ZOOMPERCENT: hr = PutZoom(plain); break;
      case PRV_BITMAP: hr = PutBitmap(plain); break;
      default: break;
    }
    VariantClear(&plain);
    return hr;
  });
}

HRESULT XPICREPView::PutFileName(const VARIANT& value) {
  if (value.vt == VT_EMPTY) {
    RemoveImage();
    return S_OK;
  }
  if (value.vt != VT_BSTR || SysStringLen(value.bstrVal) == 0) return E_INVALIDARG;
  fileName_.assign(value.bstrVal, SysStringLen(value.bstrVal));
  const HRESULT hr = Load();
  Repaint();
  return hr;
}

HRESULT XPICREPView::PutZoom(const VARIANT& value) {
  if (value.vt != VT_I4) return E_INVALIDARG;
  ZoomExtent extent;
  if (!ExtentAt(imageWidth_, imageHeight_, value.lVal, extent)) return E_INVALIDARG;
  zoom_ = value.lVal;
  FollowZoom();
  Repaint();
  return S_OK;
}

HRESULT XPICREPView::PutBitmap(const VARIANT& value) {
  if (value.vt == VT_EMPTY) {
    RemoveImage();
    Repaint();
    return S_OK;
  }
  HBITMAP bitmap = nullptr;
  if (!HandleIn(value, bitmap) || GetObjectType(bitmap) != OBJ_BITMAP) return E_INVALIDARG;
  Gdiplus::GpBitmap* image = nullptr;
  if (!gdiplus_ || gp::GdipCreateBitmapFromHBITMAP(bitmap, nullptr, &image) != Gdiplus::Ok || !image)
    return E_UNEXPECTED;
  UINT width = 0, height = 0;
  ZoomExtent extent;
  if (gp::GdipGetImageWidth(image, &width) != Gdiplus::Ok || gp::GdipGetImageHeight(image, &height) != Gdiplus::Ok ||
      !ExtentAt(width, height, zoom_, extent)) {
    gp::GdipDisposeImage(image);
    return E_UNEXPECTED;
  }
  // The same handle again: GDI+ copied its pixels, the handle stays owned once.
  if (bitmap == ownedBitmap_) ownedBitmap_ = nullptr;
  Adopt(image, bitmap);
  imageWidth_ = width;
  imageHeight_ = height;
  FollowZoom();
  Repaint();
  return S_OK;
}

HRESULT XPICREPView::Load() {
  RemoveImage();
  Gdiplus::GpBitmap* image = nullptr;
  if (!gdiplus_ || gp::GdipCreateBitmapFromFile(fileName_.c_str(), &image) != Gdiplus::Ok || !image) return E_FAIL;
  UINT width = 0, height = 0;
  ZoomExtent extent;
  if (gp::GdipGetImageWidth(image, &width) != Gdiplus::Ok || gp::GdipGetImageHeight(image, &height) != Gdiplus::Ok ||
      !ExtentAt(width, height, zoom_, extent)) {
    gp::GdipDisposeImage(image);
    return E_FAIL;
  }
  Adopt(image, nullptr);
  imageWidth_ = width;
  imageHeight_ = height;
  FollowZoom();
  return S_OK;
}

void XPICREPView::Adopt(void* image, HBITMAP bitmap) {
  RemoveImage();
  image_ = image;
  ownedBitmap_ = bitmap;
}

void XPICREPView::RemoveImage() {
  // GDI+ keeps a file open while its image lives: release it first.
  if (image_) gp::GdipDisposeImage(BitmapOf(image_));
  image_ = nullptr;
  if (ownedBitmap_) DeleteObject(ownedBitmap_);
  ownedBitmap_ = nullptr;
  imageWidth_ = imageHeight_ = 0;
  extent_ = ZoomExtent{};
  UpdateBars();
}

void XPICREPView::FollowZoom() {
  if (!ExtentAt(imageWidth_, imageHeight_, zoom_, extent_)) extent_ = ZoomExtent{};
  UpdateBars();
}

// ---- scrolling

void XPICREPView::UpdateBars() {
  const HWND window = Window();
  if (!window) {
    barX_ = barY_ = AxisBar{};
    scrollX_ = scrollY_ = 0;
    return;
  }
  // Showing a bar resizes the client area, which brings WM_SIZE back here.
  if (updatingBars_) return;
  updatingBars_ = true;
  for (int pass = 0; pass < 2; ++pass) {
    RECT client{};
    GetClientRect(window, &client);
    barX_ = BarFor(client.right - client.left, extent_.width);
    barY_ = BarFor(client.bottom - client.top, extent_.height);
    scrollX_ = std::min(scrollX_, LastPosition(barX_));
    scrollY_ = std::min(scrollY_, LastPosition(barY_));
    for (int bar : {SB_HORZ, SB_VERT}) {
      const AxisBar& axis = bar == SB_HORZ ? barX_ : barY_;
      SCROLLINFO info{};
      info.cbSize = sizeof info;
      info.fMask = SIF_ALL | SIF_DISABLENOSCROLL;
      info.nMax = axis.max;
      info.nPage = static_cast<UINT>(axis.page);
      info.nPos = bar == SB_HORZ ? scrollX_ : scrollY_;
      SetScrollInfo(window, bar, &info, TRUE);
      EnableScrollBar(window, bar, axis.enabled ? ESB_ENABLE_BOTH : ESB_DISABLE_BOTH);
    }
  }
  updatingBars_ = false;
}

void XPICREPView::Scroll(HWND window, int bar, WPARAM request) {
  const bool horizontal = bar == SB_HORZ;
  const AxisBar& axis = horizontal ? barX_ : barY_;
  long& position = horizontal ? scrollX_ : scrollY_;
  ScrollRequest kind = ScrollRequest::Other;
  switch (LOWORD(request)) {
    case SB_LINEUP: kind = ScrollRequest::LineUp; break;
    case SB_LINEDOWN: kind = ScrollRequest::LineDown; break;
    case SB_PAGEUP: kind = ScrollRequest::PageUp; break;
    case SB_PAGEDOWN: kind = ScrollRequest::PageDown; break;
    case SB_THUMBPOSITION:
    case SB_THUMBTRACK: kind = ScrollRequest::Thumb; break;
    default: break;
  }
  long thumb = 0;
  if (kind == ScrollRequest::Thumb) {
    // The message carries 16 bits only; the bar knows all 32 while its thumb is dragged.
    // A request whose 16 bits differ from the bar's was not made by the bar: take those.
    thumb = HIWORD(request);
    SCROLLINFO info{};
    info.cbSize = sizeof info;
    info.fMask = SIF_TRACKPOS;
    if (GetScrollInfo(window, bar, &info) && (info.nTrackPos & 0xFFFF) == static_cast<int>(HIWORD(request)))
      thumb = info.nTrackPos;
  }
  const long next = ScrollTo(kind, position, horizontal ? extent_.lineX : extent_.lineY, axis, thumb);
  if (next == position) return;
  const long moved = position - next;
  position = next;
  SetScrollPos(window, bar, next, TRUE);
  ScrollWindowEx(window, horizontal ? moved : 0, horizontal ? 0 : moved, nullptr, nullptr, nullptr, nullptr,
                 SW_INVALIDATE | SW_ERASE);
}

bool XPICREPView::OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM, LRESULT& result) {
  switch (message) {
    case WM_SIZE:
      UpdateBars();
      return false;
    case WM_HSCROLL:
    case WM_VSCROLL:
      Scroll(window, message == WM_HSCROLL ? SB_HORZ : SB_VERT, wParam);
      result = 0;
      return true;
    default:
      return false;
  }
}

// ---- embedding

HRESULT XPICREPView::SetPalette(const VARIANT& palette) {
  VARIANT number, source;
  VariantInit(&number);
  if (!CopyPlain(palette, source)) return E_INVALIDARG;
  const HRESULT hr = VariantChangeType(&number, &source, 0, VT_UI4);
  VariantClear(&source);
  if (FAILED(hr)) return E_INVALIDARG;
  palette_ = ClampPalette(number.ulVal);
  Repaint();
  return S_OK;
}

HRESULT XPICREPView::GetPreferredSize(long* width, long* height) {
  if (!width || !height) return E_POINTER;
  *width = extent_.width;
  *height = extent_.height;
  return S_OK;
}

// ---- painting

void XPICREPView::Paint(HDC dc, const RECT& client) {
  toolkit::Palette::fill(dc, client, kBackgroundEntry);
  // The frame set the window origin for the bounds it draws into: scroll by the viewport.
  const int saved = SaveDC(dc);
  POINT viewport{};
  GetViewportOrgEx(dc, &viewport);
  SetViewportOrgEx(dc, viewport.x - scrollX_, viewport.y - scrollY_, nullptr);
  if (image_)
    PaintImage(dc);
  else
    PaintFailure(dc, client);
  RestoreDC(dc, saved);
}

void XPICREPView::PaintFailure(HDC dc, const RECT& client) {
  const std::wstring text = kFailureText + fileName_;
  SetBkMode(dc, TRANSPARENT);
  SetTextAlign(dc, TA_CENTER | TA_BASELINE);
  SelectObject(dc, GetStockObject(DEFAULT_GUI_FONT));
  SetTextColor(dc, toolkit::Palette::colour(0));
  TextOutW(dc, (client.left + client.right) / 2 + scrollX_, (client.top + client.bottom) / 2 + scrollY_, text.c_str(),
           static_cast<int>(text.size()));
}

void XPICREPView::PaintImage(HDC dc) {
  // Only the part of the image under the clip box: a large picture costs what is visible.
  // A DC that cannot tell (some metafile DCs) gets the whole picture.
  RECT clip{0, 0, extent_.width, extent_.height};
  if (GetClipBox(dc, &clip) == NULLREGION) return;
  const SourceRect source = SourceFor(clip.left, clip.top, clip.right, clip.bottom, imageWidth_, imageHeight_, zoom_);
  if (source.right <= source.left) return;
  // GDI+ takes floats: move the origin to the part's corner so that its coordinates stay
  // small and exact however far the picture is scrolled.
  const long cornerX = static_cast<long>(static_cast<long long>(source.left) * zoom_ / 100);
  const long cornerY = static_cast<long>(static_cast<long long>(source.top) * zoom_ / 100);
  POINT viewport{};
  GetViewportOrgEx(dc, &viewport);
  SetViewportOrgEx(dc, viewport.x + cornerX, viewport.y + cornerY, nullptr);

  Gdiplus::GpGraphics* graphics = nullptr;
  if (gp::GdipCreateFromHDC(dc, &graphics) != Gdiplus::Ok || !graphics) return;
  gp::GdipSetPageUnit(graphics, Gdiplus::UnitPixel);
  gp::GdipSetInterpolationMode(graphics, zoom_ == 100 ? Gdiplus::InterpolationModeNearestNeighbor
                                                      : Gdiplus::InterpolationModeBilinear);
  gp::GdipSetPixelOffsetMode(graphics, Gdiplus::PixelOffsetModeHalf);

  Gdiplus::GpImageAttributes* attributes = nullptr;
  gp::GdipCreateImageAttributes(&attributes);
  // Filtering at the picture's edges samples mirrored pixels, not transparent ones, so the
  // last row and column keep their colour when zoomed.
  if (attributes) gp::GdipSetImageAttributesWrapMode(attributes, Gdiplus::WrapModeTileFlipXY, 0, FALSE);
  // The identity matrix changes nothing.
  const float factor = BrightnessOf(shading_[palette_]);
  if (attributes && factor != 1.0f) {
    const ColourMatrix m = MatrixFor(factor);
    Gdiplus::ColorMatrix matrix{};
    for (int r = 0; r < 5; ++r)
      for (int c = 0; c < 5; ++c) matrix.m[r][c] = m[r][c];
    gp::GdipSetImageAttributesColorMatrix(attributes, Gdiplus::ColorAdjustTypeDefault, TRUE, &matrix, nullptr,
                                          Gdiplus::ColorMatrixFlagsDefault);
  }

  const double scale = zoom_ * 0.01;
  const float sw = static_cast<float>(source.right - source.left);
  const float sh = static_cast<float>(source.bottom - source.top);
  gp::GdipDrawImageRectRect(graphics, BitmapOf(image_), static_cast<float>(source.left * scale - cornerX),
                            static_cast<float>(source.top * scale - cornerY), static_cast<float>(sw * scale),
                            static_cast<float>(sh * scale), static_cast<float>(source.left),
                            static_cast<float>(source.top), sw, sh, Gdiplus::UnitPixel, attributes, nullptr, nullptr);
  if (attributes) gp::GdipDisposeImageAttributes(attributes);
  gp::GdipDeleteGraphics(graphics);
  SetViewportOrgEx(dc, viewport.x, viewport.y, nullptr);
}

}  // namespace br::picture
