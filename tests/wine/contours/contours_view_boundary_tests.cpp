// IXContoursView with bad input, early and late bound: arguments of wrong types and forms,
// NaN, infinite and huge safety contours, handles that are no palette, objects without the
// host's interfaces. A refused call leaves the picture as it was; an accepted odd one
// paints bands or grey, never fails.
#include "tests/wine/common/boundary_support.h"
#include "tests/wine/common/SceneClient.h"

#include "BR_Private.h"

#include <climits>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr int kWidth = 120, kHeight = 100;

VARIANT Unknown(IUnknown* object) {
  VARIANT v;
  v.vt = VT_UNKNOWN;
  v.punkVal = object;  // borrowed
  return v;
}
VARIANT Double(double x) {
  VARIANT v;
  v.vt = VT_R8;
  v.dblVal = x;
  return v;
}

struct Scheme {
  DllUnderTest dll;
  SceneClient scene;
  ComRef<IUnknown> params, map;
  long palette = 0;
  ComRef<IXContoursView> view;
  Scheme() {
    REQUIRE(scene.Load(SceneClient::SamplePath()) == S_OK);
    params = scene.Component(L"PresParams", L"four-shades");
    map = scene.Component(L"ColorMap", L"day");
    palette = scene.Palette(L"day");
    REQUIRE(dll.Create(CLSID_XContoursView, IID_IXContoursView, view.OutVoid()) == S_OK);
    REQUIRE(view->put_Palette(palette) == S_OK);
    REQUIRE(view->SetContoursData(params.Get(), map.Get(), 10.0) == S_OK);
  }
  // The picture's pixels and the preferred size.
  std::vector<COLORREF> Picture() const {
    Canvas canvas(kWidth, kHeight);
    CHECK(DrawControl(view.Get(), canvas) == S_OK);
    std::vector<COLORREF> pixels;
    for (int y = 0; y < kHeight; y += 2)
      for (int x = 0; x < kWidth; x += 2) pixels.push_back(canvas.At(x, y));
    LONG width = 0, height = 0;
    CHECK(Query<IEmbeddedControl>(view.Get())->GetPreferredSize(&width, &height) == S_OK);
    pixels.push_back(static_cast<COLORREF>(width));
    pixels.push_back(static_cast<COLORREF>(height));
    return pixels;
  }
  // Whether the view paints in one colour (grey) at its corner and middle.
  bool Grey() const {
    Canvas canvas(kWidth, kHeight);
    CHECK(DrawControl(view.Get(), canvas) == S_OK);
    return canvas.Count(canvas.At(0, 0), 0, 0, kWidth, kHeight) == kWidth * kHeight;
  }
  HRESULT Finish() { return view.Reset(), params.Reset(), map.Reset(), dll.CanUnloadNow(); }
};

}  // namespace

TEST_CASE("IXContoursView refused calls, early and late bound, leave the picture") {
  Scheme s;
  REQUIRE(!s.Grey());
  ComRef<IDispatch> late = Query<IDispatch>(s.view.Get());
  ComRef<IEmbeddedControl> embedded = Query<IEmbeddedControl>(s.view.Get());
  IDispatch* d = late.Get();
  IUnknown* params = s.params.Get();
  IUnknown* map = s.map.Get();
  const auto set = [d](std::vector<VARIANT> arguments) {
    return InvokeByName(d, L"SetContoursData", DISPATCH_METHOD, std::move(arguments));
  };
  const auto putPalette = [d](VARIANT value) { return InvokeByName(d, L"Palette", DISPATCH_PROPERTYPUT, {value}); };
  LONG size = kUntouchedLong;
  std::vector<Row> rows = {
      {"late SetContoursData without arguments", [=] { return set({}); }, DISP_E_BADPARAMCOUNT},
      {"late SetContoursData, a text for the parameters",
       [=] {
         Variant text = Variant::Bstr(L"four-shades");
         return set({text.get(), Unknown(map), Double(10)});
       },
       DISP_E_TYPEMISMATCH},
      {"late SetContoursData, a safety contour that is no number",
       [=] {
         Variant text = Variant::Bstr(L"deep");
         return set({Unknown(params), Unknown(map), text.get()});
       },
       DISP_E_TYPEMISMATCH},
      {"late SetContoursData, a null by-reference VARIANT",
       [=] {
         VARIANT nothing;
         nothing.vt = VT_BYREF | VT_VARIANT;
         nothing.pvarVal = nullptr;
         return set({Unknown(params), Unknown(map), nothing});
       },
       DISP_E_TYPEMISMATCH},
      {"late Palette put, a text", [=] {
         Variant text = Variant::Bstr(L"day");
         return putPalette(text.get());
       }, DISP_E_TYPEMISMATCH},
      {"late Palette put, past 32 bits", [=] { return putPalette(Double(1e12)); }, DISP_E_OVERFLOW},
      {"late Palette get of a put-only property",
       [=] {
         VARIANT result;
         VariantInit(&result);
         return InvokeByName(d, L"Palette", DISPATCH_PROPERTYGET, {}, &result);
       },
       DISP_E_MEMBERNOTFOUND},
      {"GetPreferredSize without a height", [&] { return embedded->GetPreferredSize(&size, nullptr); }, E_POINTER},
  };
  RunRows(rows, [&s] { return s.Picture(); });
  CHECK(size == kUntouchedLong);
  late.Reset();
  embedded.Reset();
  CHECK(s.Finish() == S_OK);
}

TEST_CASE("IXContoursView odd but accepted calls: S_OK, bands or grey") {
  Scheme s;
  SUBCASE("NaN, infinite and huge safety contours draw the bands") {
    for (double depth : {kNaN, kInfinity, -kInfinity, 1e300, -1e300, -0.0}) {
      INFO(depth);
      CHECK(s.view->SetContoursData(s.params.Get(), s.map.Get(), depth) == S_OK);
      CHECK(!s.Grey());
    }
  }
  SUBCASE("handles that are no palette paint grey") {
    const HBITMAP bitmap = CreateBitmap(4, 4, 1, 32, nullptr);
    const HBRUSH brush = CreateSolidBrush(RGB(1, 2, 3));
    const long handles[] = {static_cast<long>(reinterpret_cast<LONG_PTR>(bitmap)),
                            static_cast<long>(reinterpret_cast<LONG_PTR>(brush)), -1, LONG_MIN, LONG_MAX, 0};
    for (long handle : handles) {
      INFO(handle);
      CHECK(s.view->put_Palette(handle) == S_OK);
      CHECK(s.Grey());
    }
    DeleteObject(bitmap);
    DeleteObject(brush);
    CHECK(s.view->put_Palette(s.palette) == S_OK);
    CHECK(!s.Grey());
  }
  SUBCASE("objects without the host's interfaces paint grey, by reference they draw") {
    CHECK(s.view->SetContoursData(s.map.Get(), s.params.Get(), 10.0) == S_OK);  // swapped
    CHECK(s.Grey());
    CHECK(s.view->SetContoursData(s.view.Get(), s.view.Get(), 10.0) == S_OK);
    CHECK(s.Grey());
    ComRef<IDispatch> d = Query<IDispatch>(s.view.Get());
    IUnknown* params = s.params.Get();
    VARIANT byRef;
    byRef.vt = VT_BYREF | VT_UNKNOWN;
    byRef.ppunkVal = &params;
    CHECK(InvokeByName(d.Get(), L"SetContoursData", DISPATCH_METHOD, {byRef, Unknown(s.map.Get()), Double(10)}) ==
          S_OK);
    CHECK(!s.Grey());
    // Null objects late bound: grey; the dispatch layer turns the method's S_FALSE into S_OK.
    CHECK(InvokeByName(d.Get(), L"SetContoursData", DISPATCH_METHOD, {Unknown(nullptr), Unknown(nullptr), Double(0)}) ==
          S_OK);
    CHECK(s.Grey());
    d.Reset();
  }
  CHECK(s.Finish() == S_OK);
}
