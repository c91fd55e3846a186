// XPICREPView's GDI objects over 1000 paints, font changes, palette replacements and
// pictures replaced (from files and from bitmap handles the view takes over).
#include "tests/wine/common/boundary_support.h"
#include "tests/wine/common/image_files.h"
#include "tests/wine/common/leak_counters.h"

#include "BR_Private.h"

#include <olectl.h>

using namespace br::test;
using namespace br::test::boundary;

TEST_CASE("paints, font changes, palette replacements and new pictures leave the GDI objects") {
  DllUnderTest dll;
  {
    PictureFolder folder(L"picture_leaks");
    const std::wstring bmp = folder.File(L"corners.bmp"), png = folder.File(L"corners.png");
    REQUIRE(WriteBmp24(bmp, CornerPattern(240, 180)));  // larger than the window: scroll bars
    REQUIRE(WriteEncoded(png, CornerPattern(64, 48), L"image/png"));
    HostedControl hosted(dll, CLSID_XPICREPView, 200, 150);
    auto view = hosted.Query<IXPICREPView>();
    auto embedded = hosted.Query<IEmbeddedControl>();
    const HWND window = hosted.Window();
    REQUIRE(view->put_Property(PRV_PICFILENAME, Variant::Bstr(bmp).get()) == S_OK);
    REQUIRE(view->SetPalIdxShading(1, 50.0) == S_OK);
    CheckGdiFlat("picture paints", 1000, [&](int i) {
      // Zoomed and scrolled, into the window and a memory bitmap.
      view->put_Property(PRV_ZOOMPERCENT, Variant::I4(i % 2 ? 150 : 75).get());
      SendMessageW(window, WM_HSCROLL, i % 3 ? SB_LINEDOWN : SB_PAGEUP, 0);
      RedrawWindow(window, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW | RDW_FRAME);
      Canvas canvas(200, 150);
      DrawControl(hosted.Control(), canvas);
    });
    CheckGdiFlat("picture font changes", 1000, [&](int i) {
      FONTDESC description = {sizeof(FONTDESC), const_cast<LPOLESTR>(L"Arial"),
                              {{static_cast<ULONG>(80000 + 1000 * (i % 40)), 0}}, FW_NORMAL, ANSI_CHARSET,
                              FALSE, FALSE, FALSE};
      IFont* font = nullptr;
      REQUIRE(OleCreateFontIndirect(&description, IID_IFont, reinterpret_cast<void**>(&font)) == S_OK);
      embedded->SetFont(0, font, 0);
      font->Release();
      UpdateWindow(window);
    });
    CheckGdiFlat("picture palette replacements", 1000, [&](int i) {
      embedded->SetPalette(Variant::I4(i % 5).get());
      view->SetPalIdxShading(i % 5, (i % 201) - 100.0);
      Canvas canvas(200, 150);
      DrawControl(hosted.Control(), canvas);
    });
    CheckGdiFlat("pictures replaced", 200, [&](int i) {
      switch (i % 4) {
        case 0: view->put_Property(PRV_PICFILENAME, Variant::Bstr(png).get()); break;
        case 1: {
          // The view owns the handle it took and deletes it with the picture.
          const HBITMAP bitmap = CreateBitmap(16 + i % 7, 12, 1, 32, nullptr);
          CHECK(view->put_Property(PRV_BITMAP, Variant::I4(static_cast<LONG>(reinterpret_cast<LONG_PTR>(bitmap))).get()) ==
                S_OK);
          break;
        }
        case 2: view->put_Property(PRV_PICFILENAME, Variant::Empty().get()); break;
        default: view->put_Property(PRV_PICFILENAME, Variant::Bstr(folder.File(L"missing.png")).get()); break;
      }
      Canvas canvas(200, 150);
      DrawControl(hosted.Control(), canvas);
    });
    view.Reset();
    embedded.Reset();
    hosted.Close();
  }
  CHECK(dll.CanUnloadNow() == S_OK);
}
