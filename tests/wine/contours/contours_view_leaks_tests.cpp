// XContoursView's GDI objects over 1000 paints, font changes and palette replacements (the
// shared palette and the host's), and its heap over 10 000 SetContoursData calls.
#include "tests/wine/common/boundary_support.h"
#include "tests/wine/common/SceneClient.h"
#include "tests/wine/common/leak_counters.h"

#include "BR_Private.h"

#include <olectl.h>

#include <cstdio>

using namespace br::test;
using namespace br::test::boundary;

namespace {

struct Components {
  SceneClient scene;
  ComRef<IUnknown> four, two, wrong, map;
  long day = 0, night = 0;
  Components() {
    REQUIRE(scene.Load(SceneClient::SamplePath()) == S_OK);
    four = scene.Component(L"PresParams", L"four-shades");
    two = scene.Component(L"PresParams", L"two-shades");
    wrong = scene.Component(L"PresParams", L"wrong-type");
    map = scene.Component(L"ColorMap", L"day");
    day = scene.Palette(L"day");
    night = scene.Palette(L"night");
  }
};

}  // namespace

TEST_CASE("paints, font changes and palette replacements leave the GDI objects") {
  DllUnderTest dll;
  {
    Components c;
    HostedControl hosted(dll, CLSID_XContoursView);
    auto view = hosted.Query<IXContoursView>();
    auto embedded = hosted.Query<IEmbeddedControl>();
    REQUIRE(view->SetContoursData(c.four.Get(), c.map.Get(), 10.0) == S_OK);
    REQUIRE(view->put_Palette(c.day) == S_OK);
    const HWND window = hosted.Window();
    CheckGdiFlat("contours paints", 1000, [&](int i) {
      // Both schemes, and the grey of a failed read, into the window and a memory bitmap.
      IUnknown* params = i % 3 == 0 ? c.four.Get() : i % 3 == 1 ? c.two.Get() : c.wrong.Get();
      view->SetContoursData(params, c.map.Get(), 0.5 * i);
      RedrawWindow(window, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW);
      Canvas canvas(300, 200);
      DrawControl(hosted.Control(), canvas);
    });
    view->SetContoursData(c.four.Get(), c.map.Get(), 10.0);
    CheckGdiFlat("contours font changes", 1000, [&](int i) {
      FONTDESC description = {sizeof(FONTDESC), const_cast<LPOLESTR>(i % 2 ? L"Arial" : L"Tahoma"),
                              {{static_cast<ULONG>(80000 + 1000 * (i % 40)), 0}},
                              static_cast<SHORT>(i % 3 ? FW_NORMAL : FW_BOLD), ANSI_CHARSET, FALSE, FALSE, FALSE};
      IFont* font = nullptr;
      REQUIRE(OleCreateFontIndirect(&description, IID_IFont, reinterpret_cast<void**>(&font)) == S_OK);
      embedded->SetFont(0, font, 0);
      font->Release();  // the view keeps its own copy
      HFONT handle = CreateFontW(10 + i % 9, 0, 0, 0, FW_NORMAL, 0, 0, 0, 0, 0, 0, 0, 0, L"Arial");
      SendMessageW(window, WM_SETFONT, reinterpret_cast<WPARAM>(handle), TRUE);
      UpdateWindow(window);
      DeleteObject(handle);
      Canvas canvas(300, 200);
      DrawControl(hosted.Control(), canvas);
    });
    CheckGdiFlat("contours palette replacements", 1000, [&](int i) {
      std::vector<LONG> colours;
      for (int k = 0; k < 20; ++k) colours.push_back(RGB((i * 7 + k) & 0xFF, (i + 3 * k) & 0xFF, k));
      embedded->SetPalette(Variant::Array(VT_I4, MakeLongArray(colours)).get());
      view->put_Palette(i % 3 == 0 ? c.day : i % 3 == 1 ? c.night : 0);
      UpdateWindow(window);
      Canvas canvas(300, 200);
      DrawControl(hosted.Control(), canvas);
    });
    view.Reset();
    embedded.Reset();
    hosted.Close();
  }
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("10 000 SetContoursData calls leave the heaps flat") {
  DllUnderTest dll;
  {
    Components c;
    ComRef<IXContoursView> view;
    REQUIRE(dll.Create(CLSID_XContoursView, IID_IXContoursView, view.OutVoid()) == S_OK);
    // Good reads of both schemes, a wrong type, missing components.
    const auto work = [&](int i) {
      switch (i % 4) {
        case 0: CHECK(view->SetContoursData(c.four.Get(), c.map.Get(), i) == S_OK); break;
        case 1: CHECK(view->SetContoursData(c.two.Get(), c.map.Get(), -i) == S_OK); break;
        case 2: CHECK(view->SetContoursData(c.wrong.Get(), c.map.Get(), 1.0) == S_OK); break;
        default: CHECK(view->SetContoursData(nullptr, c.map.Get(), 1.0) == S_FALSE); break;
      }
    };
    for (int i = 0; i < 200; ++i) work(i);
    const std::size_t before = HeapBytesInUse();
    for (int i = 0; i < 10000; ++i) work(i);
    const std::size_t after = HeapBytesInUse();
    std::printf("heap in use: %zu bytes before, %zu after 10000 SetContoursData calls\n", before, after);
    CHECK(after <= before + 8192);
  }
  CHECK(dll.CanUnloadNow() == S_OK);
}
