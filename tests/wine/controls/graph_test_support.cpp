#include "tests/wine/controls/graph_test_support.h"

#include <doctest/doctest.h>

#include <algorithm>
#include <cmath>
#include <cstring>

namespace br::test {

std::vector<COLORREF> InitialPalette() {
  return {0x000000, 0x000080, 0x008000, 0x008080, 0x800000, 0x808000, 0x800080, 0xC0C0C0, 0x808080, 0x0000FF,
          0x00FF00, 0x00FFFF, 0xFF0000, 0xFFFF00, 0xFF00FF, 0xFFFFFF, 0x000000, 0x808080, 0xA4A0A0, 0xF0FBFF};
}

VARIANT PaletteVariant(const std::vector<COLORREF>& values) {
  SAFEARRAY* array = SafeArrayCreateVector(VT_I4, 0, static_cast<ULONG>(values.size()));
  for (LONG i = 0; i < static_cast<LONG>(values.size()); ++i) {
    LONG v = static_cast<LONG>(values[static_cast<std::size_t>(i)]);
    SafeArrayPutElement(array, &i, &v);
  }
  VARIANT variant;
  VariantInit(&variant);
  variant.vt = VT_ARRAY | VT_I4;
  variant.parray = array;
  return variant;
}

std::vector<double> CosineDay() {
  std::vector<double> values(25);
  for (int k = 0; k < 25; ++k) values[k] = 0.75 + 0.25 * std::cos(2.0 * 3.141592653589793 * k / 12.4206);
  return values;
}

bool Layout::OnHourLine(int x) const {
  for (int h = 1; h <= 23; ++h)
    if (x >= HourLine(h) && x < HourLine(h) + 2) return true;
  return false;
}

POINT Layout::CurvePoint(int k, int count, double value, double maximum, double minimum) const {
  const int x = static_cast<int>(left + static_cast<double>(k) * W() / (count - 1));
  const int y = static_cast<int>(PlotBottom() - (value - minimum) * Hp() / (maximum - minimum));
  return POINT{x, y};
}

Layout LabelledLayout(HFONT font, const char* high, const char* low) {
  Canvas measuring(1, 1);
  SelectObject(measuring.Dc(), font ? font : static_cast<HFONT>(GetStockObject(DEFAULT_GUI_FONT)));
  TEXTMETRICA metrics{};
  GetTextMetricsA(measuring.Dc(), &metrics);
  SIZE highSize{}, lowSize{};
  GetTextExtentPoint32A(measuring.Dc(), high, static_cast<int>(std::strlen(high)), &highSize);
  GetTextExtentPoint32A(measuring.Dc(), low, static_cast<int>(std::strlen(low)), &lowSize);
  Layout layout;
  layout.left = std::max(highSize.cx, lowSize.cx) + metrics.tmAveCharWidth;
  layout.bottom = metrics.tmHeight + metrics.tmDescent;
  return layout;
}

void CheckBandRow(const Canvas& canvas, const Layout& layout, int y, int dayFrom, int dayTo, int twilightFrom,
                  int twilightTo) {
  int wrong = 0;
  for (int x = layout.left; x < layout.left + layout.W(); ++x) {
    COLORREF expected = kNightColour;
    if (layout.OnHourLine(x)) {
      expected = kFrameColour;
    } else if (x >= dayFrom && x < dayTo) {
      expected = kDaylightColour;
    } else if (x >= twilightFrom && x < twilightTo) {
      expected = kTwilightColour;
    }
    if (canvas.At(x, y) != expected && ++wrong <= 5) {
      CAPTURE(x);
      CHECK(canvas.At(x, y) == expected);
    }
  }
  CHECK(wrong == 0);
}

GraphControl::GraphControl(const DllUnderTest& dll) {
  REQUIRE(dll.Create(CLSID_TidesWindow, &window_) == S_OK);
}

GraphControl::~GraphControl() { Release(); }

void GraphControl::Release() { ReleaseAndNull(window_); }

HRESULT GraphControl::SetDrawText(long value) {
  VARIANT v;
  VariantInit(&v);
  v.vt = VT_I4;
  v.lVal = value;
  return window_->put_Property(TW_DRAWTEXT, v);
}

HRESULT GraphControl::SetFormat(const wchar_t* format) {
  VARIANT v;
  VariantInit(&v);
  v.vt = VT_BSTR;
  v.bstrVal = SysAllocString(format);
  const HRESULT hr = window_->put_Property(TW_FORMATTEXT, v);
  VariantClear(&v);
  return hr;
}

HRESULT GraphControl::SetPalette(const VARIANT& palette) {
  IEmbeddedControl* embedded = nullptr;
  HRESULT hr = window_->QueryInterface(IID_IEmbeddedControl, reinterpret_cast<void**>(&embedded));
  if (FAILED(hr)) return hr;
  hr = embedded->SetPalette(palette);
  embedded->Release();
  return hr;
}

}  // namespace br::test
