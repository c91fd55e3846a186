// IEmbeddedControl of each control (the tide controls and the contours view) with bad
// input: only one dimension of 20 four-byte elements from 0 replaces the shared palette;
// every call answers S_OK or E_POINTER.
#include "tests/wine/common/boundary_support.h"

#include "BR_Private.h"

#include <algorithm>
#include <climits>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr int kFrameColour = 7;  // fills the frame of a TidesWindow without a port
const std::pair<const char*, const CLSID*> kControls[] = {{"TidesWindow", &CLSID_TidesWindow},
                                                          {"TidesPortList", &CLSID_TidesPortList},
                                                          {"XContoursView", &CLSID_XContoursView}};


// The shared palette's colour 7 as an unhosted TidesWindow without a port draws it.
COLORREF FrameColour(IUnknown* probe) {
  Canvas canvas(60, 40);
  REQUIRE(DrawControl(probe, canvas) == S_OK);
  return canvas.At(4, 4);
}

// An array of count elements of the type (VT_EMPTY: 4 bytes, no type), the 4-byte ones
// holding the colours.
SAFEARRAY* Filled(VARTYPE type, const std::vector<LONG>& colours, ULONG count = 20) {
  SAFEARRAY* array = type == VT_EMPTY ? MakeRawArray(4, count) : MakeArray(type, {{count, 0}});
  if (SafeArrayGetElemsize(array) == 4)
    std::copy_n(colours.begin(), std::min<ULONG>(count, 20), static_cast<LONG*>(array->pvData));
  return array;
}

struct PaletteRow {
  const char* what;
  std::function<Variant(const std::vector<LONG>&)> make;  // from the 20 colours to give
  bool replaces = false;
};

std::vector<PaletteRow> PaletteRows() {
  using C = const std::vector<LONG>&;
  return {
      {"VT_ARRAY|VT_I4, 20 from 0", [](C c) { return Variant::Array(VT_I4, MakeLongArray(c)); }, true},
      {"VT_ARRAY|VT_UI4", [](C c) { return Variant::Array(VT_UI4, Filled(VT_UI4, c)); }, true},
      {"20 elements of 4 bytes with no element type", [](C c) { return Variant::Array(VT_I4, Filled(VT_EMPTY, c)); },
       true},
      {"19 elements", [](C c) { return Variant::Array(VT_I4, Filled(VT_I4, c, 19)); }},
      {"no elements", [](C) { return Variant::Array(VT_I4, MakeLongArray({})); }},
      {"lower bound 1", [](C c) { return Variant::Array(VT_I4, MakeLongArray(c, 1)); }},
      {"two dimensions 20 x 1", [](C) { return Variant::Array(VT_I4, MakeArray(VT_I4, {{20, 0}, {1, 0}})); }},
      {"no dimensions", [](C) { return Variant::ZeroDimensions(VT_I4); }},
      {"2-byte elements", [](C c) { return Variant::Array(VT_I2, Filled(VT_I2, c)); }},
      {"VARIANT elements", [](C c) { return Variant::Array(VT_VARIANT, Filled(VT_VARIANT, c)); }},
      {"a null array", [](C) { return Variant::Array(VT_I4, nullptr); }},
      {"VT_EMPTY", [](C) { return Variant::Empty(); }},
      {"null BSTR", [](C) { return Variant::NullBstr(); }},
  };
}

}  // namespace

TEST_CASE("IEmbeddedControl palette: only a one-dimensional array of 20 four-byte values from 0 replaces it") {
  DllUnderTest dll;
  IUnknown* probe = nullptr;
  REQUIRE(dll.Create(CLSID_TidesWindow, IID_IUnknown, reinterpret_cast<void**>(&probe)) == S_OK);
  std::vector<LONG> before, given;
  for (int i = 0; i < 20; ++i) before.push_back(RGB(10 + i, 2 * i + 1, 245)), given.push_back(RGB(90 + i, 2 * i, 165));
  for (const auto& [name, clsid] : kControls) {
    HostedControl hosted(dll, *clsid);
    auto embedded = hosted.Query<IEmbeddedControl>();
    // Puts the old palette back, sets the value, and tells whether it replaced it.
    auto replaced = [&](VARIANT& value) {
      REQUIRE(embedded->SetPalette(Variant::Array(VT_I4, MakeLongArray(before)).get()) == S_OK);
      REQUIRE(FrameColour(probe) == static_cast<COLORREF>(before[kFrameColour]));
      CHECK(embedded->SetPalette(value) == S_OK);
      return FrameColour(probe) == static_cast<COLORREF>(given[kFrameColour]);
    };
    for (const PaletteRow& row : PaletteRows()) {
      INFO(name << ": " << row.what);
      CHECK(replaced(row.make(given).get()) == row.replaces);
    }
    // References: to an array, and to a VARIANT that holds one.
    SAFEARRAY* array = MakeLongArray(given);
    Variant inner = Variant::Array(VT_I4, array);
    std::tuple<const char*, Variant, bool> refs[] = {
        {"VT_BYREF|VT_ARRAY|VT_I4", Variant::RefArray(VT_I4, &array), true},
        {"VT_BYREF|VT_VARIANT holding the array", Variant::RefVariant(&inner.get()), true},
        {"VT_BYREF|VT_VARIANT to nothing", Variant::RefVariant(nullptr), false},
    };
    for (auto& [what, value, replaces] : refs) {
      INFO(name << ": " << what);
      CHECK(replaced(value.get()) == replaces);
    }
    // An array the caller keeps locked is read all the same, and stays locked.
    REQUIRE(SafeArrayLock(array) == S_OK);
    CHECK(replaced(inner.get()));
    CHECK(array->cLocks == 1);
    SafeArrayUnlock(array);
    // The other slots: missing out-pointers, a null font, extreme reserved values.
    LONG width = kUntouchedLong, height = kUntouchedLong;
    CHECK(embedded->GetPreferredSize(&width, nullptr) == E_POINTER);
    CHECK(embedded->GetPreferredSize(nullptr, &height) == E_POINTER);
    CHECK(width == kUntouchedLong);
    CHECK(height == kUntouchedLong);
    CHECK(embedded->SetFont(-1, nullptr, LONG_MAX) == S_OK);
    CHECK(embedded->Reserved(LONG_MIN, LONG_MAX) == S_OK);
    hosted.Paint();
    embedded.Reset();
  }
  probe->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
