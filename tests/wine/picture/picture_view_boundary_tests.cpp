// IXPICREPView and its IEmbeddedControl with bad input, early and late bound: every wrong
// VARIANT type and by-reference form for each property code, codes that do not exist,
// NaN, infinite and out-of-range shadings and palettes, huge zooms, handles that are no
// bitmap. A refused call leaves the name, the zoom, the size and the picture as they were.
#include "tests/wine/common/boundary_support.h"
#include "tests/wine/common/image_files.h"

#include "BR_Private.h"

#include <climits>
#include <tuple>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr int kWidth = 80, kHeight = 60;

struct Shown {
  DllUnderTest dll;
  PictureFolder folder{L"picture_boundary"};
  std::wstring file = folder.File(L"corners.bmp");
  ComRef<IXPICREPView> view;
  Shown() {
    REQUIRE(WriteBmp24(file, CornerPattern(40, 30)));
    REQUIRE(dll.Create(CLSID_XPICREPView, IID_IXPICREPView, view.OutVoid()) == S_OK);
    Variant name = Variant::Bstr(file);
    REQUIRE(view->put_Property(PRV_PICFILENAME, name.get()) == S_OK);
    REQUIRE(view->put_Property(PRV_ZOOMPERCENT, Variant::I4(150).get()) == S_OK);
    // Palette 4 draws black: a changed palette number shows in the picture.
    REQUIRE(view->SetPalIdxShading(4, 100.0) == S_OK);
    REQUIRE(view->SetPalIdxShading(0, -50.0) == S_OK);
  }
  // Name, zoom, preferred size and a sample of the picture.
  std::tuple<std::wstring, LONG, LONG, LONG, std::vector<COLORREF>> Snapshot() const {
    Variant name, zoom;
    CHECK(view->get_Property(PRV_PICFILENAME, &name.get()) == S_OK);
    CHECK(view->get_Property(PRV_ZOOMPERCENT, &zoom.get()) == S_OK);
    LONG width = -1, height = -1;
    CHECK(Query<IEmbeddedControl>(view.Get())->GetPreferredSize(&width, &height) == S_OK);
    Canvas canvas(kWidth, kHeight);
    CHECK(DrawControl(view.Get(), canvas) == S_OK);
    std::vector<COLORREF> pixels;
    for (int y = 0; y < kHeight; y += 3)
      for (int x = 0; x < kWidth; x += 3) pixels.push_back(canvas.At(x, y));
    return {name.get().vt == VT_BSTR && name.get().bstrVal ? name.get().bstrVal : L"", zoom.get().lVal, width, height,
            pixels};
  }
  HRESULT Finish() { return view.Reset(), dll.CanUnloadNow(); }
};

HRESULT Put(IXPICREPView* v, PRV_PROPERTY code, Variant value) { return v->put_Property(code, value.get()); }

}  // namespace

TEST_CASE("IXPICREPView refused calls, early and late bound, leave the view as it was") {
  Shown s;
  IXPICREPView* v = s.view.Get();
  ComRef<IEmbeddedControl> embedded = Query<IEmbeddedControl>(v);
  ComRef<IDispatch> late = Query<IDispatch>(v);
  IDispatch* d = late.Get();
  const HBRUSH brush = CreateSolidBrush(RGB(1, 2, 3));
  const LONG brushHandle = static_cast<LONG>(reinterpret_cast<LONG_PTR>(brush));
  BSTR emptyName = SysAllocString(L"");
  LONG zoomValue = 50;
  std::vector<Row> rows = {
      {"SetPalIdxShading(5, 0)", [=] { return v->SetPalIdxShading(5, 0); }, E_INVALIDARG},
      {"SetPalIdxShading(ULONG_MAX, 0)", [=] { return v->SetPalIdxShading(ULONG_MAX, 0); }, E_INVALIDARG},
      {"SetPalIdxShading(0, 101)", [=] { return v->SetPalIdxShading(0, 101); }, E_INVALIDARG},
      {"SetPalIdxShading(0, -100.001)", [=] { return v->SetPalIdxShading(0, -100.001); }, E_INVALIDARG},
      {"SetPalIdxShading(0, NaN)", [=] { return v->SetPalIdxShading(0, kNaN); }, E_INVALIDARG},
      {"SetPalIdxShading(0, infinity)", [=] { return v->SetPalIdxShading(0, kInfinity); }, E_INVALIDARG},
      {"get PICFILENAME into null", [=] { return v->get_Property(PRV_PICFILENAME, nullptr); }, E_POINTER},
      {"get BITMAP", [=] {
         Variant out;
         return v->get_Property(PRV_BITMAP, &out.get());
       }, E_INVALIDARG},
      {"get code 99", [=] {
         Variant out;
         return v->get_Property(static_cast<PRV_PROPERTY>(99), &out.get());
       }, E_INVALIDARG},
      {"put code -1", [=] { return Put(v, static_cast<PRV_PROPERTY>(-1), Variant::I4(1)); }, E_INVALIDARG},
      {"PICFILENAME empty text", [=] { return Put(v, PRV_PICFILENAME, Variant::Bstr(L"")); }, E_INVALIDARG},
      {"PICFILENAME null BSTR", [=] { return Put(v, PRV_PICFILENAME, Variant::NullBstr()); }, E_INVALIDARG},
      {"PICFILENAME by reference to an empty text",
       [&] { return Put(v, PRV_PICFILENAME, Variant::RefBstr(&emptyName)); }, E_INVALIDARG},
      {"PICFILENAME VT_I4", [=] { return Put(v, PRV_PICFILENAME, Variant::I4(7)); }, E_INVALIDARG},
      {"PICFILENAME VT_UNKNOWN null", [=] { return Put(v, PRV_PICFILENAME, Variant::Unknown(nullptr)); }, E_INVALIDARG},
      {"PICFILENAME array of bytes",
       [=] { return Put(v, PRV_PICFILENAME, Variant::Array(VT_UI1, MakeArray(VT_UI1, {{4, 0}}))); }, E_INVALIDARG},
      {"PICFILENAME by reference to no VARIANT", [=] { return Put(v, PRV_PICFILENAME, Variant::RefVariant(nullptr)); },
       E_INVALIDARG},
      {"ZOOMPERCENT 0", [=] { return Put(v, PRV_ZOOMPERCENT, Variant::I4(0)); }, E_INVALIDARG},
      {"ZOOMPERCENT LONG_MIN", [=] { return Put(v, PRV_ZOOMPERCENT, Variant::I4(LONG_MIN)); }, E_INVALIDARG},
      {"ZOOMPERCENT VT_R8 50", [=] { return Put(v, PRV_ZOOMPERCENT, Variant::R8(50)); }, E_INVALIDARG},
      {"ZOOMPERCENT VT_R8 NaN", [=] { return Put(v, PRV_ZOOMPERCENT, Variant::R8(kNaN)); }, E_INVALIDARG},
      {"ZOOMPERCENT text \"50\"", [=] { return Put(v, PRV_ZOOMPERCENT, Variant::Bstr(L"50")); }, E_INVALIDARG},
      {"ZOOMPERCENT VT_EMPTY", [=] { return Put(v, PRV_ZOOMPERCENT, Variant::Empty()); }, E_INVALIDARG},
      {"BITMAP a brush handle", [=] { return Put(v, PRV_BITMAP, Variant::I4(brushHandle)); }, E_INVALIDARG},
      {"BITMAP handle 0", [=] { return Put(v, PRV_BITMAP, Variant::I4(0)); }, E_INVALIDARG},
      {"BITMAP handle -1", [=] { return Put(v, PRV_BITMAP, Variant::I4(-1)); }, E_INVALIDARG},
      {"BITMAP a text", [=] { return Put(v, PRV_BITMAP, Variant::Bstr(L"corners.bmp")); }, E_INVALIDARG},
      {"IEmbeddedControl SetPalette text", [&] { return embedded->SetPalette(Variant::Bstr(L"four").get()); },
       E_INVALIDARG},
      {"IEmbeddedControl SetPalette by reference to no VARIANT",
       [&] { return embedded->SetPalette(Variant::RefVariant(nullptr).get()); }, E_INVALIDARG},
      {"IEmbeddedControl SetPalette by reference to no number",
       [&] { return embedded->SetPalette(Variant::RefI4(nullptr).get()); }, E_INVALIDARG},
      {"ZOOMPERCENT by reference to no number", [=] { return Put(v, PRV_ZOOMPERCENT, Variant::RefI4(nullptr)); },
       E_INVALIDARG},
      {"IEmbeddedControl SetPalette array",
       [&] { return embedded->SetPalette(Variant::Array(VT_I4, MakeLongArray({4})).get()); }, E_INVALIDARG},
      {"IEmbeddedControl GetPreferredSize without a width",
       [&] {
         LONG h = kUntouchedLong;
         const HRESULT hr = embedded->GetPreferredSize(nullptr, &h);
         CHECK(h == kUntouchedLong);
         return hr;
       },
       E_POINTER},
      {"late Property without arguments", [=] { return InvokeByName(d, L"Property", DISPATCH_PROPERTYGET, {}); },
       DISP_E_BADPARAMCOUNT},
      {"late Property put, a code that is no number",
       [=] {
         Variant code = Variant::Bstr(L"zoom"), value = Variant::I4(50);
         return InvokeByName(d, L"Property", DISPATCH_PROPERTYPUT, {code.get(), value.get()});
       },
       DISP_E_TYPEMISMATCH},
      {"late SetPalIdxShading, a text palette",
       [=] {
         Variant palette = Variant::Bstr(L"night"), shading = Variant::R8(10);
         return InvokeByName(d, L"SetPalIdxShading", DISPATCH_METHOD, {palette.get(), shading.get()});
       },
       DISP_E_TYPEMISMATCH},
  };
  RunRows(rows, [&s] { return s.Snapshot(); });
  // A zoom by reference is read through.
  CHECK(Put(v, PRV_ZOOMPERCENT, Variant::RefI4(&zoomValue)) == S_OK);
  CHECK(std::get<2>(s.Snapshot()) == 20);
  SysFreeString(emptyName);
  CHECK(GetObjectType(brush) == OBJ_BRUSH);  // a refused handle is left alone
  DeleteObject(brush);
  embedded.Reset();
  late.Reset();
  CHECK(s.Finish() == S_OK);
}

TEST_CASE("IXPICREPView odd but accepted values") {
  Shown s;
  IXPICREPView* v = s.view.Get();
  ComRef<IEmbeddedControl> embedded = Query<IEmbeddedControl>(v);
  SUBCASE("palette numbers of every type and size clamp to 0..4") {
    const auto black = [&] {
      Canvas canvas(kWidth, kHeight);
      CHECK(DrawControl(v, canvas) == S_OK);
      return canvas.At(30, 20) == RGB(0, 0, 0);  // mid-picture: grey but at palette 4
    };
    std::pair<Variant, bool> values[] = {
        {Variant::I4(9), true},        {Variant::I4(-3), false},      {Variant::Bstr(L"4"), true},
        {Variant::R8(3.7), true},      {Variant::I4(LONG_MIN), false}, {Variant::Empty(), false},
    };
    for (auto& [value, isBlack] : values) {
      INFO(value.get().vt);
      CHECK(embedded->SetPalette(value.get()) == S_OK);
      CHECK(black() == isBlack);
    }
  }
  SUBCASE("huge zooms within 32 bits are drawn; by reference and late bound") {
    CHECK(Put(v, PRV_ZOOMPERCENT, Variant::I4(1000000)) == S_OK);
    CHECK(std::get<2>(s.Snapshot()) == 400000);
    CHECK(Put(v, PRV_ZOOMPERCENT, Variant::I4(LONG_MAX)) == S_OK);  // 40 pixels: still within 32 bits
    CHECK(std::get<2>(s.Snapshot()) == 858993458);
    ComRef<IDispatch> d = Query<IDispatch>(v);
    Variant code = Variant::I4(PRV_ZOOMPERCENT), zoom = Variant::I4(200);
    CHECK(InvokeByName(d.Get(), L"Property", DISPATCH_PROPERTYPUT, {code.get(), zoom.get()}) == S_OK);
    CHECK(std::get<2>(s.Snapshot()) == 80);
    // A name through a reference to a VARIANT that holds it.
    Variant inner = Variant::Bstr(s.file);
    CHECK(Put(v, PRV_PICFILENAME, Variant::RefVariant(&inner.get())) == S_OK);
    d.Reset();
  }
  SUBCASE("a name that is no file: E_FAIL, the failure text, the size 0") {
    CHECK(Put(v, PRV_PICFILENAME, Variant::Bstr(std::wstring(5000, L'x'))) == E_FAIL);
    CHECK(Put(v, PRV_PICFILENAME, Variant::Bstr(L"\\\\no-such-server\\share\\x.png")) == E_FAIL);
    CHECK(std::get<2>(s.Snapshot()) == 0);
  }
  embedded.Reset();
  CHECK(s.Finish() == S_OK);
}
