// IEmbeddedControl at its boundary, for every control that answers it: the palette slot
// with every VARIANT type, by-reference forms and SAFEARRAY shape (only a one-dimensional
// array of 20 four-byte elements from 0 replaces the shared palette; everything else leaves
// it, and the answer is S_OK either way), the reserved slot with any values, the font slot
// with no font, a font object that fails and one with a bogus handle, and the size slot with
// missing out-parameters.
#include "tests/wine/boundary/boundary_support.h"
#include "tests/wine/boundary/control_host.h"
#include "tests/wine/common/dll_under_test.h"

#include "BR_Info.h"
#include "BR_Private.h"

#include <doctest/doctest.h>

#include <olectl.h>

#include <climits>
#include <functional>
#include <string>
#include <vector>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr int kPaletteSize = 20;
constexpr int kFrameColour = 7;  // fills the frame of a TidesWindow without a port

struct NamedControl {
  const char* name;
  const CLSID* clsid;
};
const NamedControl kControls[] = {{"TidesWindow", &CLSID_TidesWindow}, {"TidesPortList", &CLSID_TidesPortList}};

std::vector<LONG> Colours(int seed) {
  std::vector<LONG> colours;
  for (int i = 0; i < kPaletteSize; ++i) colours.push_back(RGB(seed + i, 2 * i + 1, 255 - seed));
  return colours;
}

// The shared palette's colour 7 as an unhosted TidesWindow without a port draws it.
COLORREF FrameColour(IUnknown* probe) {
  Picture picture(60, 40);
  REQUIRE(picture.Draw(probe) == S_OK);
  return picture.At(4, 4);
}

HRESULT Set(IEmbeddedControl* control, Variant value) { return control->SetPalette(value.get()); }

struct PaletteRow {
  const char* what;
  std::function<Variant(const std::vector<LONG>&)> make;  // from the 20 colours to give
  bool replaces;
};

SAFEARRAY* Filled(VARTYPE type, const std::vector<LONG>& colours, ULONG count, LONG lower = 0) {
  SAFEARRAY* array = MakeArray(type, {{count, lower}});
  void* data = nullptr;
  SafeArrayAccessData(array, &data);
  const ULONG size = SafeArrayGetElemsize(array);
  for (ULONG i = 0; i < count && i < colours.size(); ++i) {
    if (size == 4) static_cast<LONG*>(data)[i] = colours[i];
  }
  SafeArrayUnaccessData(array);
  return array;
}

std::vector<PaletteRow> PaletteRows() {
  return {
      {"VT_ARRAY|VT_I4, 20 from 0", [](auto& c) { return Variant::Array(VT_I4, MakeLongArray(c)); }, true},
      {"VT_ARRAY|VT_UI4", [](auto& c) { return Variant::Array(VT_UI4, Filled(VT_UI4, c, 20)); }, true},
      {"VT_ARRAY|VT_INT", [](auto& c) { return Variant::Array(VT_INT, Filled(VT_INT, c, 20)); }, true},
      {"20 elements of 4 bytes with no element type",
       [](auto& c) {
         SAFEARRAY* array = MakeRawArray(4, 20);
         std::copy(c.begin(), c.end(), static_cast<LONG*>(array->pvData));
         return Variant::Array(VT_I4, array);
       },
       true},
      {"19 elements", [](auto& c) { return Variant::Array(VT_I4, MakeLongArray({c.begin(), c.end() - 1})); }, false},
      {"21 elements",
       [](auto& c) {
         std::vector<LONG> more = c;
         more.push_back(0);
         return Variant::Array(VT_I4, MakeLongArray(more));
       },
       false},
      {"no elements", [](auto&) { return Variant::Array(VT_I4, MakeLongArray({})); }, false},
      {"lower bound 1", [](auto& c) { return Variant::Array(VT_I4, MakeLongArray(c, 1)); }, false},
      {"lower bound -1", [](auto& c) { return Variant::Array(VT_I4, MakeLongArray(c, -1)); }, false},
      {"two dimensions 4 x 5", [](auto&) { return Variant::Array(VT_I4, MakeArray(VT_I4, {{4, 0}, {5, 0}})); }, false},
      {"two dimensions 20 x 1", [](auto&) { return Variant::Array(VT_I4, MakeArray(VT_I4, {{20, 0}, {1, 0}})); },
       false},
      {"no dimensions",
       [](auto&) {
         Variant v;
         v.get().vt = VT_ARRAY | VT_I4;  // static descriptor: released by hand below
         v.get().parray = ZeroDimensionArray();
         return v;
       },
       false},
      {"2-byte elements", [](auto& c) { return Variant::Array(VT_I2, Filled(VT_I2, c, 20)); }, false},
      {"8-byte elements", [](auto& c) { return Variant::Array(VT_R8, Filled(VT_R8, c, 20)); }, false},
      {"VARIANT elements", [](auto& c) { return Variant::Array(VT_VARIANT, Filled(VT_VARIANT, c, 20)); }, false},
      {"8-byte elements with no element type", [](auto&) { return Variant::Array(VT_I4, MakeRawArray(8, 20)); }, false},
      {"a null array", [](auto&) { return Variant::Array(VT_I4, nullptr); }, false},
      {"VT_EMPTY", [](auto&) { return Variant::Empty(); }, false},
      {"VT_NULL", [](auto&) { return Variant::Null(); }, false},
      {"VT_I4", [](auto& c) { return Variant::I4(c[0]); }, false},
      {"VT_BSTR", [](auto&) { return Variant::Bstr(L"red"); }, false},
      {"null BSTR", [](auto&) { return Variant::NullBstr(); }, false},
      {"VT_UNKNOWN null", [](auto&) { return Variant::Unknown(nullptr); }, false},
  };
}

void ReleaseStatic(Variant& v) {
  if ((v.vt() & VT_ARRAY) && !(v.vt() & VT_BYREF) && v.get().parray == ZeroDimensionArray()) v.get().vt = VT_EMPTY;
}

}  // namespace

TEST_CASE("IEmbeddedControl palette: only a one-dimensional array of 20 four-byte values from 0 replaces it") {
  DllUnderTest dll;
  IUnknown* probe = nullptr;
  REQUIRE(dll.Create(CLSID_TidesWindow, IID_IUnknown, reinterpret_cast<void**>(&probe)) == S_OK);
  const std::vector<LONG> before = Colours(10), given = Colours(90);

  for (const NamedControl& c : kControls) {
    HostedControl hosted(dll, *c.clsid);
    IEmbeddedControl* embedded = hosted.Query<IEmbeddedControl>();
    for (const PaletteRow& row : PaletteRows()) {
      INFO((std::string(c.name) + ": " + row.what));
      REQUIRE(Set(embedded, Variant::Array(VT_I4, MakeLongArray(before))) == S_OK);
      REQUIRE(FrameColour(probe) == static_cast<COLORREF>(before[kFrameColour]));
      Variant value = row.make(given);
      CHECK(embedded->SetPalette(value.get()) == S_OK);
      CHECK(FrameColour(probe) == static_cast<COLORREF>(row.replaces ? given[kFrameColour] : before[kFrameColour]));
      ReleaseStatic(value);
    }

    // References: to an array, and to a VARIANT that holds one (one level only).
    SAFEARRAY* array = MakeLongArray(given);
    Variant inner = Variant::Array(VT_I4, array);
    SAFEARRAY* nothing = nullptr;
    Variant nested = Variant::RefVariant(&inner.get());
    struct RefRow {
      const char* what;
      Variant value;
      bool replaces;
    };
    RefRow refs[] = {
        {"VT_BYREF|VT_ARRAY|VT_I4", Variant::RefArray(VT_I4, &array), true},
        {"VT_BYREF|VT_VARIANT holding the array", Variant::RefVariant(&inner.get()), true},
        {"a reference to a reference", Variant::RefVariant(&nested.get()), false},
        {"VT_BYREF|VT_ARRAY to a null array", Variant::RefArray(VT_I4, &nothing), false},
        {"VT_BYREF|VT_VARIANT to nothing", Variant::RefVariant(nullptr), false},
    };
    for (RefRow& row : refs) {
      INFO((std::string(c.name) + ": " + row.what));
      REQUIRE(Set(embedded, Variant::Array(VT_I4, MakeLongArray(before))) == S_OK);
      CHECK(embedded->SetPalette(row.value.get()) == S_OK);
      CHECK(FrameColour(probe) == static_cast<COLORREF>(row.replaces ? given[kFrameColour] : before[kFrameColour]));
    }
    // An array the caller keeps locked is read all the same, and stays locked.
    REQUIRE(Set(embedded, Variant::Array(VT_I4, MakeLongArray(before))) == S_OK);
    REQUIRE(SafeArrayLock(array) == S_OK);
    CHECK(embedded->SetPalette(inner.get()) == S_OK);
    CHECK(FrameColour(probe) == static_cast<COLORREF>(given[kFrameColour]));
    CHECK(array->cLocks == 1);
    SafeArrayUnlock(array);
    embedded->Release();
  }
  probe->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

namespace {

// A font object that fails to give a handle, or gives one that is no font.
struct BadFont : IFont {
  HRESULT handleResult;
  HFONT handle;
  BadFont(HRESULT result, HFONT h) : handleResult(result), handle(h) {}
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IFont)) {
      *out = this;
      return S_OK;
    }
    *out = nullptr;
    return E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP get_Name(BSTR*) override { return E_NOTIMPL; }
  STDMETHODIMP put_Name(BSTR) override { return E_NOTIMPL; }
  STDMETHODIMP get_Size(CY*) override { return E_NOTIMPL; }
  STDMETHODIMP put_Size(CY) override { return E_NOTIMPL; }
  STDMETHODIMP get_Bold(BOOL*) override { return E_NOTIMPL; }
  STDMETHODIMP put_Bold(BOOL) override { return E_NOTIMPL; }
  STDMETHODIMP get_Italic(BOOL*) override { return E_NOTIMPL; }
  STDMETHODIMP put_Italic(BOOL) override { return E_NOTIMPL; }
  STDMETHODIMP get_Underline(BOOL*) override { return E_NOTIMPL; }
  STDMETHODIMP put_Underline(BOOL) override { return E_NOTIMPL; }
  STDMETHODIMP get_Strikethrough(BOOL*) override { return E_NOTIMPL; }
  STDMETHODIMP put_Strikethrough(BOOL) override { return E_NOTIMPL; }
  STDMETHODIMP get_Weight(SHORT*) override { return E_NOTIMPL; }
  STDMETHODIMP put_Weight(SHORT) override { return E_NOTIMPL; }
  STDMETHODIMP get_Charset(SHORT*) override { return E_NOTIMPL; }
  STDMETHODIMP put_Charset(SHORT) override { return E_NOTIMPL; }
  STDMETHODIMP get_hFont(HFONT* out) override {
    if (out) *out = handle;
    return handleResult;
  }
  STDMETHODIMP Clone(IFont**) override { return E_NOTIMPL; }
  STDMETHODIMP IsEqual(IFont*) override { return E_NOTIMPL; }
  STDMETHODIMP SetRatio(LONG, LONG) override { return E_NOTIMPL; }
  STDMETHODIMP QueryTextMetrics(TEXTMETRICOLE*) override { return E_NOTIMPL; }
  STDMETHODIMP AddRefHfont(HFONT) override { return E_NOTIMPL; }
  STDMETHODIMP ReleaseHfont(HFONT) override { return E_NOTIMPL; }
  STDMETHODIMP SetHdc(HDC) override { return E_NOTIMPL; }
};

}  // namespace

TEST_CASE("IEmbeddedControl reserved, font and size slots with odd and missing arguments") {
  DllUnderTest dll;
  HFONT deleted = CreateFontW(12, 0, 0, 0, FW_NORMAL, 0, 0, 0, 0, 0, 0, 0, 0, L"Arial");
  DeleteObject(deleted);
  BadFont failing(E_FAIL, nullptr), bogus(S_OK, reinterpret_cast<HFONT>(static_cast<UINT_PTR>(0x1234))),
      stale(S_OK, deleted);
  FONTDESC description = {sizeof(FONTDESC), const_cast<LPOLESTR>(L"Arial"), {{120000, 0}}, FW_BOLD, ANSI_CHARSET,
                          FALSE, FALSE, FALSE};
  IFont* real = nullptr;
  REQUIRE(OleCreateFontIndirect(&description, IID_IFont, reinterpret_cast<void**>(&real)) == S_OK);

  for (const NamedControl& c : kControls) {
    INFO(std::string(c.name));
    HostedControl hosted(dll, *c.clsid);
    IEmbeddedControl* embedded = hosted.Query<IEmbeddedControl>();
    CHECK(embedded->Reserved(0, 0) == S_OK);
    CHECK(embedded->Reserved(LONG_MIN, LONG_MAX) == S_OK);
    for (IFont* font : {static_cast<IFont*>(nullptr), static_cast<IFont*>(&failing), static_cast<IFont*>(&bogus),
                        static_cast<IFont*>(&stale), real, static_cast<IFont*>(nullptr)}) {
      CHECK(embedded->SetFont(-1, font, LONG_MAX) == S_OK);
      Picture picture(300, 200);
      CHECK(picture.Draw(hosted.Control()) == S_OK);
      RedrawWindow(hosted.Window(), nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN);
    }
    LONG width = kUntouchedLong, height = kUntouchedLong;
    CHECK(embedded->GetPreferredSize(nullptr, nullptr) == E_POINTER);
    CHECK(embedded->GetPreferredSize(&width, nullptr) == E_POINTER);
    CHECK(embedded->GetPreferredSize(nullptr, &height) == E_POINTER);
    CHECK(width == kUntouchedLong);
    CHECK(height == kUntouchedLong);
    CHECK(embedded->GetPreferredSize(&width, &height) == S_OK);
    CHECK(width == 300);
    CHECK(height == 200);
    embedded->Release();
  }
  real->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
