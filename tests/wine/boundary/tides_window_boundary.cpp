// ITidesWindow at its boundary: Property with every wrong code and VARIANT type, by-reference
// forms and arrays, formats that printf must never see; SetPort with objects that are not
// ports and ports of another make that answer NaN, infinities, absurd counts or failures;
// scales and calculations with NaN and infinities; and the same late bound. A refused call
// leaves the properties and the picture as they were; any port draws and reads the pointer
// without a crash or a hang.
#include "tests/wine/boundary/boundary_support.h"
#include "tests/wine/boundary/control_host.h"
#include "tests/wine/boundary/foreign_port.h"
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"
#include "BR_Private.h"

#include <doctest/doctest.h>

#include <chrono>
#include <climits>
#include <functional>
#include <string>
#include <vector>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr int kWidth = 300, kHeight = 200;
enum DispId : DISPID { kSetPort = 1, kCalculate, kSetScale, kProperty };

struct Graph {
  StationFolder folder{{{"Harbour", 1200, -300, -1, {{0, 2000, 0}, {36, 1000, 900}}}}};
  DllUnderTest dll;
  HostedControl hosted{dll, CLSID_TidesWindow, kWidth, kHeight};
  ITidesWindow* window = hosted.Query<ITidesWindow>();
  ITidesDatabase* database = nullptr;
  ITidesPort* port = nullptr;

  Graph() {
    REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
    Variant path = Variant::Bstr(folder.Path());
    REQUIRE(database->Initialize(path.get().bstrVal) == S_OK);
    IUnknown* unknown = nullptr;
    REQUIRE(database->GetPort(0, &unknown) == S_OK);
    REQUIRE(unknown->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port)) == S_OK);
    unknown->Release();
    REQUIRE(port->Calculate(1.0, 36526.0) == S_OK);
    REQUIRE(window->SetPort(port) == S_OK);
  }
  HRESULT Finish() {
    window->Release();
    port->Release();
    database->Release();
    hosted.Close();
    return dll.CanUnloadNow();
  }
};

// The properties and the picture: equal before and after a call that changes nothing.
struct Fingerprint {
  HRESULT drawResult = S_OK, formatResult = S_OK;
  LONG drawText = 0;
  std::wstring format;
  std::vector<COLORREF> pixels;
  bool operator==(const Fingerprint& o) const {
    return drawResult == o.drawResult && formatResult == o.formatResult && drawText == o.drawText &&
           format == o.format && pixels == o.pixels;
  }
};

Fingerprint Read(ITidesWindow* window) {
  Fingerprint f;
  VARIANT v;
  f.drawResult = window->get_Property(TW_DRAWTEXT, &v);
  if (f.drawResult == S_OK && v.vt == VT_I4) f.drawText = v.lVal;
  VariantClear(&v);
  f.formatResult = window->get_Property(TW_FORMATTEXT, &v);
  if (f.formatResult == S_OK && v.vt == VT_BSTR) f.format = v.bstrVal ? v.bstrVal : L"";
  VariantClear(&v);
  Picture picture(kWidth, kHeight);
  REQUIRE(picture.Draw(window) == S_OK);
  for (int y = 0; y < kHeight; y += 3)
    for (int x = 0; x < kWidth; x += 3) f.pixels.push_back(picture.At(x, y));
  return f;
}

struct Row {
  const char* what;
  std::function<HRESULT()> call;
  HRESULT expected;
};

void RunUnchanged(ITidesWindow* window, const std::vector<Row>& rows) {
  for (const Row& row : rows) {
    INFO(std::string(row.what));
    const Fingerprint before = Read(window);
    CHECK(row.call() == row.expected);
    CHECK(Read(window) == before);
  }
}

HRESULT Put(ITidesWindow* w, TW_PROPERTY code, Variant value) { return w->put_Property(code, value.get()); }
HRESULT PutFormat(ITidesWindow* w, const std::wstring& text) { return Put(w, TW_FORMATTEXT, Variant::Bstr(text)); }

// An object that claims every interface and hands out null: a broken QueryInterface.
struct NullAnswering : IUnknown {
  STDMETHODIMP QueryInterface(REFIID, void** out) override {
    if (out) *out = nullptr;
    return S_OK;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
};

}  // namespace

TEST_CASE("ITidesWindow Property: wrong codes, wrong types, by-reference forms and unsafe formats change nothing") {
  Graph g;
  ITidesWindow* w = g.window;
  LONG drawText = 1;
  BSTR format = SysAllocString(L"%.1f");
  RunUnchanged(w, {
      {"put code 0", [&] { return Put(w, static_cast<TW_PROPERTY>(0), Variant::I4(0)); }, E_INVALIDARG},
      {"put code 3", [&] { return Put(w, static_cast<TW_PROPERTY>(3), Variant::I4(0)); }, E_INVALIDARG},
      {"put code -1", [&] { return Put(w, static_cast<TW_PROPERTY>(-1), Variant::Bstr(L"%f")); }, E_INVALIDARG},
      {"put code INT_MAX", [&] { return Put(w, static_cast<TW_PROPERTY>(INT_MAX), Variant::I4(0)); }, E_INVALIDARG},
      {"DRAWTEXT VT_EMPTY", [&] { return Put(w, TW_DRAWTEXT, Variant::Empty()); }, E_INVALIDARG},
      {"DRAWTEXT VT_NULL", [&] { return Put(w, TW_DRAWTEXT, Variant::Null()); }, E_INVALIDARG},
      {"DRAWTEXT VT_BSTR \"0\"", [&] { return Put(w, TW_DRAWTEXT, Variant::Bstr(L"0")); }, E_INVALIDARG},
      {"DRAWTEXT VT_R8 0", [&] { return Put(w, TW_DRAWTEXT, Variant::R8(0)); }, E_INVALIDARG},
      {"DRAWTEXT VT_R4 0", [&] { return Put(w, TW_DRAWTEXT, Variant::R4(0)); }, E_INVALIDARG},
      {"DRAWTEXT VT_BOOL false", [&] { return Put(w, TW_DRAWTEXT, Variant::Bool(false)); }, E_INVALIDARG},
      {"DRAWTEXT VT_ERROR", [&] { return Put(w, TW_DRAWTEXT, Variant::Error(DISP_E_PARAMNOTFOUND)); }, E_INVALIDARG},
      {"DRAWTEXT VT_BYREF|VT_I4", [&] { return Put(w, TW_DRAWTEXT, Variant::RefI4(&drawText)); }, E_INVALIDARG},
      {"DRAWTEXT VT_ARRAY|VT_I4", [&] { return Put(w, TW_DRAWTEXT, Variant::Array(VT_I4, MakeLongArray({0}))); },
       E_INVALIDARG},
      {"DRAWTEXT VT_DISPATCH null", [&] { return Put(w, TW_DRAWTEXT, Variant::Dispatch(nullptr)); }, E_INVALIDARG},
      {"FORMATTEXT VT_I4", [&] { return Put(w, TW_FORMATTEXT, Variant::I4(2)); }, E_INVALIDARG},
      {"FORMATTEXT VT_EMPTY", [&] { return Put(w, TW_FORMATTEXT, Variant::Empty()); }, E_INVALIDARG},
      {"FORMATTEXT VT_NULL", [&] { return Put(w, TW_FORMATTEXT, Variant::Null()); }, E_INVALIDARG},
      {"FORMATTEXT VT_BYREF|VT_BSTR", [&] { return Put(w, TW_FORMATTEXT, Variant::RefBstr(&format)); }, E_INVALIDARG},
      {"FORMATTEXT VT_ARRAY|VT_BSTR",
       [&] { return Put(w, TW_FORMATTEXT, Variant::Array(VT_BSTR, MakeArray(VT_BSTR, {{1, 0}}))); }, E_INVALIDARG},
      // Formats that would make printf read or write what it should not.
      {"\"%s\"", [&] { return PutFormat(w, L"%s"); }, E_INVALIDARG},
      {"\"%n\"", [&] { return PutFormat(w, L"%n%f"); }, E_INVALIDARG},
      {"two conversions", [&] { return PutFormat(w, L"%f to %f"); }, E_INVALIDARG},
      {"a lone percent", [&] { return PutFormat(w, L"%.2f %"); }, E_INVALIDARG},
      {"star width", [&] { return PutFormat(w, L"%*f"); }, E_INVALIDARG},
      {"width 1000", [&] { return PutFormat(w, L"%1000f"); }, E_INVALIDARG},
      {"precision 1000", [&] { return PutFormat(w, L"%.1000f"); }, E_INVALIDARG},
      {"length modifier", [&] { return PutFormat(w, L"%Lf"); }, E_INVALIDARG},
      {"an integer conversion", [&] { return PutFormat(w, L"%d"); }, E_INVALIDARG},
      {"Windows size prefix", [&] { return PutFormat(w, L"%I64d"); }, E_INVALIDARG},
      {"a zero inside", [&] { return PutFormat(w, std::wstring(L"%.2f") + L'\0' + L"%s"); }, E_INVALIDARG},
      {"get with a null out-pointer", [&] { return w->get_Property(TW_DRAWTEXT, nullptr); }, E_INVALIDARG},
      {"get code 0", [&] {
         VARIANT v;
         v.vt = VT_I2;
         const HRESULT hr = w->get_Property(static_cast<TW_PROPERTY>(0), &v);
         CHECK(v.vt == VT_EMPTY);  // initialised even when refused
         return hr;
       }, E_INVALIDARG},
  });
  SysFreeString(format);

  // A null BSTR is the empty text: the default format.
  CHECK(Put(w, TW_FORMATTEXT, Variant::NullBstr()) == S_OK);
  VARIANT v;
  REQUIRE(w->get_Property(TW_FORMATTEXT, &v) == S_OK);
  CHECK(std::wstring(v.bstrVal) == L"%.2f");
  VariantClear(&v);
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("IUnitsOption of TidesWindow: values that are no whole number change nothing") {
  Graph g;
  IUnitsOption* units = g.hosted.Query<IUnitsOption>();
  LONG feet = 1;
  RunUnchanged(g.window, {
      {"SetUnits(\"feet\")", [&] { return units->SetUnits(Variant::Bstr(L"feet").get()); }, E_INVALIDARG},
      {"SetUnits(1e20)", [&] { return units->SetUnits(Variant::R8(1e20).get()); }, E_INVALIDARG},
      {"SetUnits(VT_NULL)", [&] { return units->SetUnits(Variant::Null().get()); }, E_INVALIDARG},
      {"SetUnits(an array)", [&] { return units->SetUnits(Variant::Array(VT_I4, MakeLongArray({1})).get()); },
       E_INVALIDARG},
      {"SetUnits(null object)", [&] { return units->SetUnits(Variant::Dispatch(nullptr).get()); }, E_INVALIDARG},
      {"SetOption(anything)", [&] { return units->SetOption(LONG_MIN); }, S_OK},
  });
  // A whole number by reference is converted like any other.
  CHECK(units->SetUnits(Variant::RefI4(&feet).get()) == S_OK);
  units->Release();
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow SetPort: objects that are not ports leave no port; null gives S_FALSE") {
  Graph g;
  ITidesWindow* w = g.window;
  NullAnswering broken;
  struct SetRow {
    const char* what;
    IUnknown* object;
    HRESULT expected;
  };
  ITidesPort* unopened = nullptr;
  REQUIRE(g.dll.Create(CLSID_TidesPort, &unopened) == S_OK);
  const SetRow rows[] = {
      {"the database", g.database, E_INVALIDARG},
      {"a QueryInterface that answers S_OK and null", &broken, E_INVALIDARG},
      {"null", nullptr, S_FALSE},
      {"a port created directly (no station)", unopened, S_OK},
  };
  const Fingerprint empty = [&] {
    REQUIRE(w->SetPort(nullptr) == S_FALSE);
    return Read(w);
  }();
  for (const SetRow& row : rows) {
    INFO(std::string(row.what));
    REQUIRE(w->SetPort(g.port) == S_OK);
    CHECK(w->SetPort(row.object) == row.expected);
    CHECK(Read(w) == empty);  // no port, or one without points: the frame and the night
    CHECK(w->Calculate(1.0, 36526.0) == S_OK);
  }
  REQUIRE(w->SetPort(nullptr) == S_FALSE);
  CHECK(RefCount(unopened) == 1);
  unopened->Release();
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow SetScale and Calculate: NaN, infinite and degenerate values draw and read the pointer") {
  Graph g;
  ITidesWindow* w = g.window;
  struct ScaleRow {
    const char* what;
    double maximum, minimum;
  };
  const ScaleRow scales[] = {
      {"NaN scale", kNaN, kNaN},        {"infinite scale", kInfinity, -kInfinity},
      {"largest doubles", kLargest, -kLargest}, {"inverted", -1.0, 1.0},
      {"flat", 1.0, 1.0},               {"denormal span", kSmallestDenormal, 0.0},
      {"NaN minimum", 1.0, kNaN},       {"automatic", 0.0, kNaN},
  };
  for (const ScaleRow& row : scales) {
    INFO(std::string(row.what));
    CHECK(w->SetScale(row.maximum, row.minimum) == S_OK);
    Picture picture(kWidth, kHeight);
    CHECK(picture.Draw(w) == S_OK);
    RedrawWindow(g.hosted.Window(), nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW);
    for (int x : {0, 5, 100, 299, 65535}) SendMessageW(g.hosted.Window(), WM_MOUSEMOVE, 0, MAKELPARAM(x, 50));
  }
  const double calculations[][2] = {{kNaN, 36526.0}, {1.0, kNaN}, {kInfinity, kInfinity}, {-kLargest, -kLargest},
                                    {1e-9, 36526.0}};
  for (const auto& c : calculations) {
    CHECK(w->Calculate(c[0], c[1]) == S_OK);
    Picture picture(kWidth, kHeight);
    CHECK(picture.Draw(w) == S_OK);
  }
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow with ports of another make: any answer draws, reads the pointer, and ends") {
  Graph g;
  ITidesWindow* w = g.window;
  struct PortRow {
    const char* what;
    std::function<void(ForeignPort&)> make;
  };
  const PortRow rows[] = {
      {"NaN heights", [](ForeignPort& p) { p.height = kNaN; }},
      {"infinite heights and extremes",
       [](ForeignPort& p) { p.heights = {kInfinity, -kInfinity}; p.maxValue = kInfinity; p.minValue = -kInfinity; }},
      {"largest heights", [](ForeignPort& p) { p.heights = {kLargest, -kLargest}; p.maxValue = kLargest; p.minValue = -kLargest; }},
      {"NaN extremes", [](ForeignPort& p) { p.maxValue = kNaN; p.minValue = kNaN; }},
      {"one point", [](ForeignPort& p) { p.points = 1; }},
      {"no points", [](ForeignPort& p) { p.points = 0; }},
      {"a negative count", [](ForeignPort& p) { p.points = -5; }},
      {"every getter fails", [](ForeignPort& p) { p.result = E_FAIL; }},
      {"NaN sun times", [](ForeignPort& p) { p.sunRise = p.sunSet = p.twilightBegin = p.twilightEnd = kNaN; }},
      {"infinite sun times", [](ForeignPort& p) { p.sunRise = kInfinity; p.sunSet = -kInfinity; }},
      {"sun times far outside the platform's dates",
       [](ForeignPort& p) { p.sunRise = 1e300; p.sunSet = -1e300; p.twilightBegin = 3e6; p.twilightEnd = -7e5; }},
      {"NaN prediction date", [](ForeignPort& p) { p.predictionDate = kNaN; }},
      {"a prediction date past the platform's", [](ForeignPort& p) { p.predictionDate = 3e6; }},
      {"an absurd count (LONG_MAX)", [](ForeignPort& p) { p.points = LONG_MAX; }},
      {"a count of a hundred million", [](ForeignPort& p) { p.points = 100000000; }},
  };
  for (const PortRow& row : rows) {
    INFO(std::string(row.what));
    ForeignPort* port = ForeignPort::Create();
    row.make(*port);
    CHECK(w->SetPort(port) == S_OK);
    const auto start = std::chrono::steady_clock::now();
    Picture picture(kWidth, kHeight);
    CHECK(picture.Draw(w) == S_OK);
    RedrawWindow(g.hosted.Window(), nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW);
    for (int x : {0, 9, 150, 290, 299, 65535}) SendMessageW(g.hosted.Window(), WM_MOUSEMOVE, 0, MAKELPARAM(x, 50));
    CHECK(w->Calculate(1.0, 36526.0) == S_OK);
    const double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    CHECK(seconds < 5.0);
    CHECK(w->SetPort(nullptr) == S_FALSE);
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
    Picture picture(kWidth, kHeight);
    REQUIRE(picture.Draw(g.window) == S_OK);
    int count = 0;
    for (int y = 0; y < kHeight; ++y)
      for (int x = 0; x < kWidth; ++x) count += picture.At(x, y) == daylight || picture.At(x, y) == twilight;
    return count;
  };
  CHECK(bandPixels(45000.25) > 1000);
  // Wine's date conversion reads NaN as 00:00; taken so, the day would run from midnight.
  // A set without a rise is none of the drawn combinations: the plot stays night.
  CHECK(bandPixels(kNaN) == 0);
  CHECK(g.window->SetPort(nullptr) == S_FALSE);
  CHECK(ForeignPort::Alive() == 0);
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("ITidesWindow late bound: Property through Invoke with every form a script host may pass") {
  Graph g;
  IDispatch* d = g.window;
  struct LateRow {
    const char* what;
    DISPID id;
    WORD flags;
    std::function<void(LateCall&)> build;
    HRESULT expected;
  };
  const LateRow rows[] = {
      {"Property put code \"x\"", kProperty, DISPATCH_PROPERTYPUT,
       [](LateCall& c) { c.Arg(Variant::Bstr(L"x")).Arg(Variant::I4(0)); }, DISP_E_TYPEMISMATCH},
      {"Property put code 9", kProperty, DISPATCH_PROPERTYPUT,
       [](LateCall& c) { c.Arg(Variant::I4(9)).Arg(Variant::I4(0)); }, E_INVALIDARG},
      {"Property put DRAWTEXT as text", kProperty, DISPATCH_PROPERTYPUT,
       [](LateCall& c) { c.Arg(Variant::I4(TW_DRAWTEXT)).Arg(Variant::Bstr(L"0")); }, E_INVALIDARG},
      {"Property put FORMATTEXT \"%s\"", kProperty, DISPATCH_PROPERTYPUT,
       [](LateCall& c) { c.Arg(Variant::I4(TW_FORMATTEXT)).Arg(Variant::Bstr(L"%s")); }, E_INVALIDARG},
      {"Property put without a value", kProperty, DISPATCH_PROPERTYPUT,
       [](LateCall& c) { c.Arg(Variant::I4(TW_DRAWTEXT)); }, DISP_E_BADPARAMCOUNT},
      {"Property get code 0", kProperty, DISPATCH_PROPERTYGET, [](LateCall& c) { c.Arg(Variant::I4(0)); },
       E_INVALIDARG},
      {"Property get without a code", kProperty, DISPATCH_PROPERTYGET, [](LateCall&) {}, DISP_E_BADPARAMCOUNT},
      {"SetScale(\"high\", 0)", kSetScale, DISPATCH_METHOD,
       [](LateCall& c) { c.Arg(Variant::Bstr(L"high")).Arg(Variant::R8(0)); }, DISP_E_TYPEMISMATCH},
      {"SetPort(text)", kSetPort, DISPATCH_METHOD, [](LateCall& c) { c.Arg(Variant::Bstr(L"port")); },
       DISP_E_TYPEMISMATCH},
      {"Calculate(\"x\", 0)", kCalculate, DISPATCH_METHOD,
       [](LateCall& c) { c.Arg(Variant::Bstr(L"x")).Arg(Variant::R8(0)); }, DISP_E_TYPEMISMATCH},
  };
  for (const LateRow& row : rows) {
    INFO(std::string(row.what));
    const Fingerprint before = Read(g.window);
    LateCall call(d, row.id, row.flags);
    row.build(call);
    const HRESULT result = LateResult(call.Run(), call.exception);
    CAPTURE(result);
    CHECK(result == row.expected);
    CHECK(Read(g.window) == before);
  }
  // A value by reference is none of the three integer types the property takes; the
  // integer itself, with the code as a short or a double, is.
  {
    Variant value = Variant::I2(0);
    VARIANT inner = value.get();
    LateCall byReference(d, kProperty, DISPATCH_PROPERTYPUT);
    byReference.Arg(Variant::I2(TW_DRAWTEXT)).Arg(Variant::RefVariant(&inner));
    CHECK(LateResult(byReference.Run(), byReference.exception) == E_INVALIDARG);
    LateCall call(d, kProperty, DISPATCH_PROPERTYPUT);
    call.Arg(Variant::I2(TW_DRAWTEXT)).Arg(Variant::I2(0));
    CHECK(LateResult(call.Run(), call.exception) == S_OK);
    LateCall get(d, kProperty, DISPATCH_PROPERTYGET);
    get.Arg(Variant::R8(TW_DRAWTEXT));
    REQUIRE(get.Run() == S_OK);
    CHECK(get.result.vt == VT_I4);
    CHECK(get.result.lVal == 0);
  }
  CHECK(g.Finish() == S_OK);
}
