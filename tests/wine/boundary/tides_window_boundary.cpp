// ITidesWindow with bad input: a refused call leaves the properties and the picture alone, and
// any port, however broken, draws, reads the pointer and ends.
#include "tests/wine/boundary/boundary_support.h"

#include "BR_Private.h"

#include <chrono>
#include <climits>
#include <tuple>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr int kWidth = 300, kHeight = 200;
constexpr DISPID kProperty = 4;

struct Graph {
  OpenTides tides{{kHarbour}};
  HostedControl hosted{tides.dll, CLSID_TidesWindow, kWidth, kHeight};
  ITidesWindow* window = hosted.Query<ITidesWindow>();
  ITidesPort* port = tides.Port(0);

  Graph() {
    REQUIRE(port->Calculate(1.0, 36526.0) == S_OK);
    REQUIRE(window->SetPort(port) == S_OK);
  }
  // Draws, paints, and moves the pointer across the plot and far outside it.
  void Exercise() const {
    Canvas canvas(kWidth, kHeight);
    CHECK(DrawControl(window, canvas) == S_OK);
    hosted.Paint();
    for (int x : {0, 9, 150, 290, 299, 65535}) hosted.MouseMove(x);
  }
  HRESULT Finish() {
    window->Release();
    port->Release();
    hosted.Close();
    return tides.Finish();
  }
};

// The two properties and a sample of the picture.
std::tuple<HRESULT, LONG, HRESULT, std::wstring, std::vector<COLORREF>> Read(ITidesWindow* window) {
  VARIANT draw, format;
  const HRESULT drawn = window->get_Property(TW_DRAWTEXT, &draw);
  const HRESULT formatted = window->get_Property(TW_FORMATTEXT, &format);
  const LONG drawText = drawn == S_OK && draw.vt == VT_I4 ? draw.lVal : 0;
  const std::wstring text = formatted == S_OK && format.vt == VT_BSTR && format.bstrVal ? format.bstrVal : L"";
  VariantClear(&draw);
  VariantClear(&format);
  Canvas canvas(kWidth, kHeight);
  REQUIRE(DrawControl(window, canvas) == S_OK);
  std::vector<COLORREF> pixels;
  for (int y = 0; y < kHeight; y += 3)
    for (int x = 0; x < kWidth; x += 3) pixels.push_back(canvas.At(x, y));
  return {drawn, drawText, formatted, text, pixels};
}

HRESULT Put(ITidesWindow* w, TW_PROPERTY code, Variant value) { return w->put_Property(code, value.get()); }

// An object that claims every interface and hands out null: a broken QueryInterface.
struct NullAnswering : IUnknown {
  STDMETHODIMP QueryInterface(REFIID, void** out) override { return out ? (*out = nullptr, S_OK) : S_OK; }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
};

}  // namespace

TEST_CASE("ITidesWindow Property and IUnitsOption: wrong codes, types, by-reference forms and formats change nothing") {
  Graph g;
  ITidesWindow* w = g.window;
  IUnitsOption* units = g.hosted.Query<IUnitsOption>();
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
      {"SetUnits(1e20)", [&] { return setUnits(Variant::R8(1e20)); }, E_INVALIDARG},
      {"SetUnits(VT_NULL)", [&] { return setUnits(Variant::Null()); }, E_INVALIDARG},
      {"SetUnits(an array)", [&] { return setUnits(Variant::Array(VT_I4, MakeLongArray({1}))); }, E_INVALIDARG},
      {"SetUnits(null object)", [&] { return setUnits(Variant::Dispatch(nullptr)); }, E_INVALIDARG},
      {"SetOption(anything)", [&] { return units->SetOption(LONG_MIN); }, S_OK},
  };
  // Types neither property takes, by-reference forms of the ones they take included.
  const std::pair<const char*, std::function<Variant()>> wrong[] = {
      {"VT_EMPTY", [] { return Variant::Empty(); }},
      {"VT_R8 0", [] { return Variant::R8(0); }},
      {"VT_BOOL false", [] { return Variant::Bool(false); }},
      {"VT_BYREF|VT_I4", [&] { return Variant::RefI4(&drawText); }},
      {"VT_BYREF|VT_BSTR", [&] { return Variant::RefBstr(&format); }},
      {"VT_ARRAY|VT_I4", [] { return Variant::Array(VT_I4, MakeLongArray({0})); }},
      {"VT_DISPATCH null", [] { return Variant::Dispatch(nullptr); }},
  };
  for (TW_PROPERTY code : {TW_DRAWTEXT, TW_FORMATTEXT})
    for (const auto& [what, make] : wrong)
      rows.push_back({std::to_string(code) + " " + what, [=, &make] { return Put(w, code, make()); }, E_INVALIDARG});
  for (int code : {-1, 3, INT_MAX})
    rows.push_back({"put code " + std::to_string(code),
                    [=] { return Put(w, static_cast<TW_PROPERTY>(code), Variant::I4(0)); }, E_INVALIDARG});
  // Which formats are unsafe is the label-format suites'; a zero inside the BSTR hides none.
  rows.push_back({"format with a zero inside",
                  [=] { return Put(w, TW_FORMATTEXT, Variant::Bstr(std::wstring(L"%.2f\0%s", 7))); }, E_INVALIDARG});
  RunRows(rows, [&] { return Read(w); });
  SysFreeString(format);

  // A null BSTR is the empty text: the default format.
  CHECK(Put(w, TW_FORMATTEXT, Variant::NullBstr()) == S_OK);
  VARIANT v;
  REQUIRE(w->get_Property(TW_FORMATTEXT, &v) == S_OK);
  CHECK(std::wstring(v.bstrVal) == L"%.2f");
  VariantClear(&v);
  CHECK(setUnits(Variant::RefI4(&drawText)) == S_OK);  // a whole number by reference is converted
  units->Release();
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow SetPort: a null from QueryInterface leaves no port; a port without a station draws none") {
  Graph g;
  ITidesWindow* w = g.window;
  NullAnswering broken;
  ITidesPort* unopened = nullptr;
  REQUIRE(g.tides.dll.Create(CLSID_TidesPort, &unopened) == S_OK);
  const std::tuple<const char*, IUnknown*, HRESULT> rows[] = {
      {"a QueryInterface that answers S_OK and null", &broken, E_INVALIDARG},
      {"a port created directly (no station)", unopened, S_OK},
  };
  REQUIRE(w->SetPort(nullptr) == S_FALSE);
  const auto empty = Read(w);
  for (const auto& [what, object, expected] : rows) {
    INFO(what);
    REQUIRE(w->SetPort(g.port) == S_OK);
    CHECK(w->SetPort(object) == expected);
    CHECK(Read(w) == empty);  // no port, or one without points: the frame and the night
    CHECK(w->Calculate(1.0, 36526.0) == S_OK);
  }
  REQUIRE(w->SetPort(nullptr) == S_FALSE);
  CHECK(RefCount(unopened) == 1);
  unopened->Release();
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow: NaN and infinite scales and days, and ports of another make, draw, read the pointer, end") {
  Graph g;
  const double scales[][2] = {{kNaN, kNaN}, {kInfinity, -kInfinity}, {-1.0, 1.0}, {1.0, 1.0}, {0.0, kNaN}};
  for (const auto& s : scales) {
    CAPTURE(s[0]);
    CAPTURE(s[1]);
    CHECK(g.window->SetScale(s[0], s[1]) == S_OK);
    g.Exercise();
  }
  const double days[][2] = {{kNaN, 36526.0}, {1.0, kNaN}, {kInfinity, kInfinity}};
  for (const auto& d : days) {
    CHECK(g.window->Calculate(d[0], d[1]) == S_OK);
    g.Exercise();
  }
  // Ports of another make, under the automatic scale the last row set.
  const std::pair<const char*, std::function<void(ForeignPort&)>> rows[] = {
      {"NaN heights", [](ForeignPort& p) { p.height = kNaN; }},
      {"infinite heights and extremes",
       [](ForeignPort& p) { p.heights = {kInfinity, -kInfinity}, p.maxValue = kInfinity, p.minValue = -kInfinity; }},
      {"NaN extremes", [](ForeignPort& p) { p.maxValue = p.minValue = kNaN; }},
      {"one point", [](ForeignPort& p) { p.points = 1; }},
      {"no points", [](ForeignPort& p) { p.points = 0; }},
      {"a negative count", [](ForeignPort& p) { p.points = -5; }},
      {"every getter fails", [](ForeignPort& p) { p.result = E_FAIL; }},
      {"sun times far outside the platform's dates",
       [](ForeignPort& p) { p.sunRise = 1e300, p.sunSet = -1e300, p.twilightBegin = 3e6, p.twilightEnd = -7e5; }},
      {"NaN prediction date", [](ForeignPort& p) { p.predictionDate = kNaN; }},
      {"an absurd count (LONG_MAX)", [](ForeignPort& p) { p.points = LONG_MAX; }},
      {"a count of a hundred million", [](ForeignPort& p) { p.points = 100000000; }},
  };
  for (const auto& [what, make] : rows) {
    INFO(what);
    ForeignPort* port = ForeignPort::Create();
    make(*port);
    CHECK(g.window->SetPort(port) == S_OK);
    const auto start = std::chrono::steady_clock::now();
    g.Exercise();
    CHECK(g.window->Calculate(1.0, 36526.0) == S_OK);
    CHECK(std::chrono::steady_clock::now() - start < std::chrono::seconds(5));
    CHECK(g.window->SetPort(nullptr) == S_FALSE);
    CHECK(port->References() == 1);  // the window took and gave back its own
    port->Release();
  }
  CHECK(ForeignPort::Alive() == 0);
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow with a port whose sunrise is NaN: that event counts as absent, and so no band is drawn") {
  Graph g;
  const COLORREF daylight = RGB(0x00, 0x80, 0x80), twilight = RGB(0x00, 0x00, 0xFF);  // palette 5 and 12
  auto bandPixels = [&](double sunRise) {
    ForeignPort* port = ForeignPort::Create();
    port->sunRise = sunRise;  // the other three events are times of the day
    REQUIRE(g.window->SetPort(port) == S_OK);
    port->Release();
    Canvas canvas(kWidth, kHeight);
    REQUIRE(DrawControl(g.window, canvas) == S_OK);
    return canvas.Count(daylight, 0, 0, kWidth, kHeight) + canvas.Count(twilight, 0, 0, kWidth, kHeight);
  };
  CHECK(bandPixels(45000.25) > 1000);
  // Wine reads a NaN date as 00:00; a set without a rise is none of the drawn combinations.
  CHECK(bandPixels(kNaN) == 0);
  CHECK(g.window->SetPort(nullptr) == S_FALSE);
  CHECK(ForeignPort::Alive() == 0);
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow late bound: Property through Invoke with every form a script host may pass") {
  Graph g;
  ITidesWindow* w = g.window;
  const WORD put = DISPATCH_PROPERTYPUT, get = DISPATCH_PROPERTYGET;
  RunRows({  // the method's own refusals through the type library
      {"Property put code 9",
       [&] { return LateCall(w, kProperty, put).Arg(Variant::I4(9)).Arg(Variant::I4(0)).Result(); }, E_INVALIDARG},
      {"Property get code 0", [&] { return LateCall(w, kProperty, get).Arg(Variant::I4(0)).Result(); }, E_INVALIDARG},
  }, [&] { return Read(w); });
  // A value by reference is none of the three integer types the property takes; the
  // integer itself, with the code as a short or a double, is.
  Variant value = Variant::I2(0);
  LateCall byReference(w, kProperty, put);
  CHECK(byReference.Arg(Variant::I2(TW_DRAWTEXT)).Arg(Variant::RefVariant(&value.get())).Result() == E_INVALIDARG);
  LateCall plain(w, kProperty, put);
  CHECK(plain.Arg(Variant::I2(TW_DRAWTEXT)).Arg(Variant::I2(0)).Result() == S_OK);
  LateCall read(w, kProperty, get);
  REQUIRE(read.Arg(Variant::R8(TW_DRAWTEXT)).Run() == S_OK);
  CHECK(read.result.vt == VT_I4);
  CHECK(read.result.lVal == 0);
  CHECK(g.Finish() == S_OK);
}
