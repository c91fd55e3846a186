// ITidesWindow with bad input: a refused call leaves the properties and the picture alone, and
// NaN and infinite scales and days draw, read the pointer and end.
#include "tests/wine/common/boundary_support.h"

#include "BR_Private.h"

#include <climits>
#include <tuple>
#include <utility>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr int kWidth = 300, kHeight = 200;

struct Graph {
  OpenTides tides{{kHarbour}};
  HostedControl hosted{tides.dll, CLSID_TidesWindow, kWidth, kHeight};
  ComRef<ITidesWindow> window = hosted.Query<ITidesWindow>();
  ComRef<ITidesPort> port = ComRef<ITidesPort>::Adopt(tides.Port(0));

  Graph() {
    REQUIRE(port->Calculate(1.0, 36526.0) == S_OK);
    REQUIRE(window->SetPort(port.Get()) == S_OK);
  }
  // Draws, paints, and moves the pointer across the plot and far outside it.
  void Exercise() const {
    Canvas canvas(kWidth, kHeight);
    CHECK(DrawControl(window.Get(), canvas) == S_OK);
    hosted.Paint();
    for (int x : {0, 9, 150, 290, 299, 65535}) hosted.MouseMove(x);
  }
  HRESULT Finish() { return window.Reset(), port.Reset(), hosted.Close(), tides.Finish(); }
};

// The two properties and a sample of the picture.
std::tuple<HRESULT, LONG, HRESULT, std::wstring, std::vector<COLORREF>> Read(ITidesWindow* window) {
  Variant draw, format;
  const HRESULT drawn = window->get_Property(TW_DRAWTEXT, &draw.get());
  const HRESULT formatted = window->get_Property(TW_FORMATTEXT, &format.get());
  const LONG drawText = draw.get().vt == VT_I4 ? draw.get().lVal : 0;
  const std::wstring text = format.get().vt == VT_BSTR && format.get().bstrVal ? format.get().bstrVal : L"";
  Canvas canvas(kWidth, kHeight);
  REQUIRE(DrawControl(window, canvas) == S_OK);
  std::vector<COLORREF> pixels;
  for (int y = 0; y < kHeight; y += 3)
    for (int x = 0; x < kWidth; x += 3) pixels.push_back(canvas.At(x, y));
  return {drawn, drawText, formatted, text, pixels};
}

HRESULT Put(ITidesWindow* w, TW_PROPERTY code, Variant value) { return w->put_Property(code, value.get()); }

}  // namespace

TEST_CASE("ITidesWindow Property and IUnitsOption: wrong codes, types, by-reference forms and formats change nothing") {
  Graph g;
  ITidesWindow* w = g.window.Get();
  auto units = g.hosted.Query<IUnitsOption>();
  auto setUnits = [&](Variant v) { return units->SetUnits(v.get()); };
  LONG drawText = 1;
  BSTR format = SysAllocString(L"%.1f");
  std::vector<Row> rows = {
      {"DRAWTEXT VT_BSTR \"0\"", [&] { return Put(w, TW_DRAWTEXT, Variant::Bstr(L"0")); }, E_INVALIDARG},
      {"FORMATTEXT VT_I4", [&] { return Put(w, TW_FORMATTEXT, Variant::I4(2)); }, E_INVALIDARG},
      {"get with a null out-pointer", [&] { return w->get_Property(TW_DRAWTEXT, nullptr); }, E_INVALIDARG},
      {"get code 0", [&] {
         VARIANT v;
         v.vt = VT_I2;
         const HRESULT hr = w->get_Property(static_cast<TW_PROPERTY>(0), &v);
         CHECK(v.vt == VT_EMPTY);  // initialised even when refused
         return hr;
       }, E_INVALIDARG},
      {"SetUnits(\"feet\")", [&] { return setUnits(Variant::Bstr(L"feet")); }, E_INVALIDARG},
  };
  // Types neither property takes, by-reference forms of the ones they take included.
  const std::pair<const char*, std::function<Variant()>> wrong[] = {
      {"VT_EMPTY", [] { return Variant::Empty(); }},
      {"VT_R8 0", [] { return Variant::R8(0); }},
      {"VT_BYREF|VT_I4", [&] { return Variant::RefI4(&drawText); }},
      {"VT_BYREF|VT_BSTR", [&] { return Variant::RefBstr(&format); }},
      {"VT_ARRAY|VT_I4", [] { return Variant::Array(VT_I4, MakeLongArray({0})); }},
  };
  for (TW_PROPERTY code : {TW_DRAWTEXT, TW_FORMATTEXT})
    for (const auto& [what, make] : wrong)
      rows.push_back({std::to_string(code) + " " + what, [=, &make] { return Put(w, code, make()); }, E_INVALIDARG});
  for (int code : {-1, INT_MAX})
    rows.push_back({"put code " + std::to_string(code),
                    [=] { return Put(w, static_cast<TW_PROPERTY>(code), Variant::I4(0)); }, E_INVALIDARG});
  rows.push_back({"format with a zero inside (unsafe formats: the label-format suites)",
                  [=] { return Put(w, TW_FORMATTEXT, Variant::Bstr(std::wstring(L"%.2f\0%s", 7))); }, E_INVALIDARG});
  RunRows(rows, [&] { return Read(w); });
  SysFreeString(format);

  // A null BSTR is the empty text: the default format.
  CHECK(Put(w, TW_FORMATTEXT, Variant::NullBstr()) == S_OK);
  VARIANT v;
  REQUIRE(w->get_Property(TW_FORMATTEXT, &v) == S_OK);
  CHECK(std::wstring(v.bstrVal) == L"%.2f");
  VariantClear(&v);
  units.Reset();
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow: NaN and infinite scales and days draw, read the pointer and end") {
  Graph g;
  for (const auto& s : {std::pair{kNaN, kNaN}, {kInfinity, -kInfinity}, {1.0, 1.0}}) {
    CHECK(g.window->SetScale(s.first, s.second) == S_OK);
    g.Exercise();
  }
  for (const auto& d : {std::pair{kNaN, 36526.0}, {kInfinity, kInfinity}}) {
    CHECK(g.window->Calculate(d.first, d.second) == S_OK);
    g.Exercise();
  }
  CHECK(g.Finish() == S_OK);
}
