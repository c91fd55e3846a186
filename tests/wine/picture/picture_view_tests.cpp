// XPICREPView's picture: the corner pixels of BMP (8 and 24 bits), PNG with alpha, TIFF,
// GIF and JPEG files; the zoomed extent, the scroll bars and their line steps; brightness
// per display palette; drawing at bounds away from the corner; the failure text; and what
// the view does with bad arguments and with the handles and files given to it.
#include "tests/wine/common/AtlHost.h"
#include "tests/wine/common/Canvas.h"
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/image_files.h"

#include "BR_Private.h"

#include <doctest/doctest.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <limits>
#include <string>

using namespace br::test;

namespace {

struct View {
  DllUnderTest dll;
  ComRef<IXPICREPView> view;

  View() { REQUIRE(dll.Create(CLSID_XPICREPView, view.Out()) == S_OK); }
  ~View() {
    view.Reset();
    CHECK(dll.CanUnloadNow() == S_OK);
  }

  HRESULT Put(PRV_PROPERTY code, VARIANT value) { return view->put_Property(code, value); }
  HRESULT Open(const std::wstring& path) {
    VARIANT name;
    name.vt = VT_BSTR;
    name.bstrVal = SysAllocString(path.c_str());
    const HRESULT hr = Put(PRV_PICFILENAME, name);
    VariantClear(&name);
    return hr;
  }
  HRESULT Zoom(long percent) {
    VARIANT zoom;
    zoom.vt = VT_I4;
    zoom.lVal = percent;
    return Put(PRV_ZOOMPERCENT, zoom);
  }
  HRESULT Remove() {
    VARIANT empty;
    VariantInit(&empty);
    return Put(PRV_PICFILENAME, empty);
  }
  long ZoomNow() {
    VARIANT value;
    VariantInit(&value);
    REQUIRE(view->get_Property(PRV_ZOOMPERCENT, &value) == S_OK);
    REQUIRE(value.vt == VT_I4);
    return value.lVal;
  }
  std::wstring FileName() {
    VARIANT value;
    VariantInit(&value);
    REQUIRE(view->get_Property(PRV_PICFILENAME, &value) == S_OK);
    REQUIRE(value.vt == VT_BSTR);
    std::wstring name(value.bstrVal, SysStringLen(value.bstrVal));
    VariantClear(&value);
    return name;
  }
  SIZE Preferred() {
    auto embedded = Query<IEmbeddedControl>(view.Get());
    SIZE size{-1, -1};
    REQUIRE(embedded->GetPreferredSize(&size.cx, &size.cy) == S_OK);
    return size;
  }
  HRESULT Palette(VARIANT number) { return Query<IEmbeddedControl>(view.Get())->SetPalette(number); }
  HRESULT Palette(long number) {
    VARIANT value;
    value.vt = VT_I4;
    value.lVal = number;
    return Palette(value);
  }
};

int Distance(COLORREF a, COLORREF b) {
  return std::max({std::abs(GetRValue(a) - GetRValue(b)), std::abs(GetGValue(a) - GetGValue(b)),
                   std::abs(GetBValue(a) - GetBValue(b))});
}

// The four corners of the pattern drawn at (left, top), within tolerance.
void CheckCorners(const Canvas& canvas, int left, int top, int width, int height, int tolerance) {
  const POINT corners[4] = {{left, top}, {left + width - 1, top}, {left, top + height - 1},
                            {left + width - 1, top + height - 1}};
  for (int i = 0; i < 4; ++i) {
    INFO("corner ", i);
    CHECK(Distance(canvas.At(corners[i].x, corners[i].y), AsColour(kCornerColours[i])) <= tolerance);
  }
  CHECK(Distance(canvas.At(left + width / 2, top + height / 2), AsColour(kPatternGrey)) <= tolerance);
}

const COLORREF kCanvas = RGB(0x12, 0x34, 0x56);

}  // namespace

TEST_CASE("every picture format is drawn with its corner pixels in place") {
  PictureFolder folder(L"picview_formats");
  const Pixels pattern = CornerPattern(64, 48);
  struct Format {
    const wchar_t* name;
    bool written;
    int tolerance;
  } formats[] = {
      {L"p8.bmp", WriteBmp8(folder.File(L"p8.bmp"), pattern), 0},
      {L"p24.bmp", WriteBmp24(folder.File(L"p24.bmp"), pattern), 0},
      {L"p.png", WriteEncoded(folder.File(L"p.png"), pattern, L"image/png"), 0},
      {L"p.tif", WriteEncoded(folder.File(L"p.tif"), pattern, L"image/tiff"), 0},
      {L"p.gif", WriteGif(folder.File(L"p.gif"), pattern), 0},
      {L"p.jpg", WriteEncoded(folder.File(L"p.jpg"), pattern, L"image/jpeg"), 40},
  };
  View v;
  for (const Format& f : formats) {
    INFO(std::string(f.name, f.name + wcslen(f.name)));
    REQUIRE(f.written);
    REQUIRE(v.Open(folder.File(f.name)) == S_OK);
    CHECK(v.Preferred().cx == 64);
    CHECK(v.Preferred().cy == 48);
    Canvas canvas(100, 80);
    REQUIRE(DrawControl(v.view.Get(), canvas) == S_OK);
    CheckCorners(canvas, 0, 0, 64, 48, f.tolerance);
    // Right of and below the picture: the view's background, one colour.
    const COLORREF background = canvas.At(99, 79);
    CHECK(background != kCanvas);
    CHECK(canvas.Count(background, 64, 0, 100, 80) == 36 * 80);
    CHECK(canvas.Count(background, 0, 48, 64, 80) == 64 * 32);
  }
}

TEST_CASE("PNG alpha lets the background through") {
  PictureFolder folder(L"picview_alpha");
  Pixels pixels = CornerPattern(20, 20);
  for (int y = 0; y < 20; ++y)
    for (int x = 10; x < 20; ++x) pixels.at(x, y) = Argb(0, 255, 0, 255);  // right half: clear
  pixels.at(0, 19) = Argb(128, 0, 0, 255);
  REQUIRE(WriteEncoded(folder.File(L"alpha.png"), pixels, L"image/png"));
  View v;
  REQUIRE(v.Open(folder.File(L"alpha.png")) == S_OK);
  Canvas canvas(40, 40);
  REQUIRE(DrawControl(v.view.Get(), canvas) == S_OK);
  const COLORREF background = canvas.At(39, 39);
  CHECK(canvas.At(0, 0) == AsColour(kCornerColours[0]));
  CHECK(canvas.Count(background, 10, 0, 20, 20) == 200);
  // Half blue over the background.
  const COLORREF half = canvas.At(0, 19);
  CHECK(std::abs(GetBValue(half) - (255 + GetBValue(background)) / 2) <= 1);
  CHECK(std::abs(GetRValue(half) - GetRValue(background) / 2) <= 1);
}

TEST_CASE("zoom: extent, preferred size and the picture") {
  PictureFolder folder(L"picview_zoom");
  REQUIRE(WriteBmp24(folder.File(L"wide.bmp"), CornerPattern(1000, 600)));
  View v;
  CHECK(v.Preferred().cx == 0);  // nothing loaded yet
  CHECK(v.Preferred().cy == 0);
  REQUIRE(v.Open(folder.File(L"wide.bmp")) == S_OK);
  REQUIRE(v.Zoom(50) == S_OK);
  CHECK(v.ZoomNow() == 50);
  CHECK(v.Preferred().cx == 500);
  CHECK(v.Preferred().cy == 300);

  Canvas canvas(520, 320);
  REQUIRE(DrawControl(v.view.Get(), canvas) == S_OK);
  CheckCorners(canvas, 0, 0, 500, 300, 0);
  CHECK(canvas.At(510, 310) != AsColour(kPatternGrey));

  SUBCASE("zoom 0, below 0, of another type or past 32 bits is refused and kept") {
    CHECK(v.Zoom(0) == E_INVALIDARG);
    CHECK(v.Zoom(-20) == E_INVALIDARG);
    CHECK(v.Zoom(std::numeric_limits<long>::max()) == E_INVALIDARG);
    VARIANT text;
    text.vt = VT_BSTR;
    text.bstrVal = SysAllocString(L"75");
    CHECK(v.Put(PRV_ZOOMPERCENT, text) == E_INVALIDARG);
    VariantClear(&text);
    CHECK(v.ZoomNow() == 50);
    CHECK(v.Preferred().cx == 500);
  }
  SUBCASE("removing the picture resets the extent; the file can be deleted at once") {
    REQUIRE(v.Remove() == S_OK);
    CHECK(v.Preferred().cx == 0);
    CHECK(v.Preferred().cy == 0);
    CHECK(DeleteFileW(folder.File(L"wide.bmp").c_str()));
  }
}

TEST_CASE("scroll bars and line steps in a hosted window") {
  PictureFolder folder(L"picview_scroll");
  REQUIRE(WriteBmp24(folder.File(L"wide.bmp"), CornerPattern(1000, 600)));
  REQUIRE(WriteBmp24(folder.File(L"narrow.bmp"), CornerPattern(90, 400)));
  View v;
  AtlHost atl;
  const HWND frame = AtlHost::MakeWindow(200, 150);
  REQUIRE(frame);
  ComRef<IUnknown> container;
  REQUIRE(atl.Attach(v.view.Get(), frame, container.Out()) == S_OK);
  HWND window = nullptr;
  REQUIRE(Query<IOleWindow>(v.view.Get())->GetWindow(&window) == S_OK);
  REQUIRE(window);
  const auto position = [&](int bar) {
    SCROLLINFO info{sizeof info, SIF_ALL};
    REQUIRE(GetScrollInfo(window, bar, &info));
    return info;
  };

  REQUIRE(v.Open(folder.File(L"wide.bmp")) == S_OK);
  REQUIRE(v.Zoom(50) == S_OK);  // 500 x 300: steps of 5 and 3
  RECT client{};
  GetClientRect(window, &client);
  SCROLLINFO h = position(SB_HORZ);
  CHECK(h.nMax == 499);
  CHECK(h.nPage == static_cast<UINT>(client.right));

  SendMessageW(window, WM_HSCROLL, SB_LINEDOWN, 0);
  SendMessageW(window, WM_VSCROLL, SB_LINEDOWN, 0);
  CHECK(position(SB_HORZ).nPos == 5);
  CHECK(position(SB_VERT).nPos == 3);
  SendMessageW(window, WM_VSCROLL, SB_LINEDOWN, 0);
  CHECK(position(SB_VERT).nPos == 6);
  SendMessageW(window, WM_VSCROLL, SB_LINEUP, 0);
  CHECK(position(SB_VERT).nPos == 3);

  SUBCASE("the last column and row can be reached, and are drawn at the window's edge") {
    for (int i = 0; i < 50; ++i) {
      SendMessageW(window, WM_HSCROLL, SB_PAGEDOWN, 0);
      SendMessageW(window, WM_VSCROLL, SB_PAGEDOWN, 0);
    }
    CHECK(position(SB_HORZ).nPos == 500 - client.right);
    CHECK(position(SB_VERT).nPos == 300 - client.bottom);
    Canvas canvas(client.right, client.bottom);
    REQUIRE(DrawControl(v.view.Get(), canvas) == S_OK);
    CHECK(canvas.At(client.right - 1, client.bottom - 1) == AsColour(kCornerColours[3]));
    CHECK(canvas.At(0, 0) == AsColour(kPatternGrey));
  }
  SUBCASE("a 90-pixel-wide picture has no horizontal line step") {
    REQUIRE(v.Open(folder.File(L"narrow.bmp")) == S_OK);
    REQUIRE(v.Zoom(100) == S_OK);
    // Narrower than the picture, so the bar is live but has no step.
    const RECT narrow{0, 0, 60, 150};
    REQUIRE(Query<IOleInPlaceObject>(v.view.Get())->SetObjectRects(&narrow, &narrow) == S_OK);
    CHECK(position(SB_HORZ).nMax == 89);
    SendMessageW(window, WM_HSCROLL, SB_LINEDOWN, 0);
    CHECK(position(SB_HORZ).nPos == 0);
    SendMessageW(window, WM_HSCROLL, SB_PAGEDOWN, 0);
    CHECK(position(SB_HORZ).nPos > 0);
    SendMessageW(window, WM_VSCROLL, SB_LINEDOWN, 0);
    CHECK(position(SB_VERT).nPos == 4);
  }
  SUBCASE("at 1000% the far corner is still drawn where it belongs") {
    REQUIRE(v.Zoom(1000) == S_OK);  // 10000 x 6000
    SendMessageW(window, WM_HSCROLL, MAKEWPARAM(SB_THUMBPOSITION, 10000 - client.right), 0);
    SendMessageW(window, WM_VSCROLL, MAKEWPARAM(SB_THUMBPOSITION, 6000 - client.bottom), 0);
    REQUIRE(position(SB_HORZ).nPos == 10000 - client.right);
    Canvas canvas(client.right, client.bottom);
    REQUIRE(DrawControl(v.view.Get(), canvas) == S_OK);
    // The last 80 x 80 pixels are the white corner block (8 x 8 picture pixels; its inner
    // edge blends over one picture pixel), the rest grey: the picture's own last row and
    // column too, not blended with what lies beyond the picture.
    CHECK(canvas.Count(AsColour(kCornerColours[3]), client.right - 70, client.bottom - 70, client.right,
                       client.bottom) == 4900);
    CHECK(canvas.At(client.right - 100, client.bottom - 100) == AsColour(kPatternGrey));
    CHECK(canvas.At(client.right - 100, client.bottom - 1) == AsColour(kPatternGrey));
  }
  SUBCASE("thumb positions") {
    SendMessageW(window, WM_HSCROLL, MAKEWPARAM(SB_THUMBPOSITION, 123), 0);
    CHECK(position(SB_HORZ).nPos == 123);
    SendMessageW(window, WM_VSCROLL, MAKEWPARAM(SB_THUMBTRACK, 1000), 0);
    CHECK(position(SB_VERT).nPos == 300 - client.bottom);
    SendMessageW(window, WM_HSCROLL, MAKEWPARAM(SB_ENDSCROLL, 0), 0);
    CHECK(position(SB_HORZ).nPos == 123);
  }
  SUBCASE("removing the picture puts both bars back to 0") {
    REQUIRE(v.Remove() == S_OK);
    CHECK(position(SB_HORZ).nPos == 0);
    CHECK(position(SB_VERT).nPos == 0);
  }
  container.Reset();
  DestroyWindow(frame);
}

TEST_CASE("brightness follows the shading of the current display palette") {
  PictureFolder folder(L"picview_shade");
  Pixels grey{8, 8, std::vector<std::uint32_t>(64, Argb(255, 100, 100, 100))};
  REQUIRE(WriteBmp24(folder.File(L"grey.bmp"), grey));
  View v;
  REQUIRE(v.Open(folder.File(L"grey.bmp")) == S_OK);
  const double shading[5] = {0, 10, 25, 75, 90};
  for (ULONG p = 0; p < 5; ++p) REQUIRE(v.view->SetPalIdxShading(p, shading[p]) == S_OK);
  const auto drawn = [&] {
    Canvas canvas(8, 8);
    REQUIRE(DrawControl(v.view.Get(), canvas) == S_OK);
    return static_cast<int>(GetGValue(canvas.At(4, 4)));
  };
  const int expected[5] = {100, 90, 75, 25, 10};
  for (int p = 0; p < 5; ++p) {
    INFO("palette ", p);
    REQUIRE(v.Palette(p) == S_OK);
    CHECK(std::abs(drawn() - expected[p]) <= 1);
  }
  SUBCASE("-100 doubles the colour values") {
    REQUIRE(v.view->SetPalIdxShading(2, -100) == S_OK);
    REQUIRE(v.Palette(2) == S_OK);
    CHECK(std::abs(drawn() - 200) <= 1);
  }
  SUBCASE("palette numbers are clamped: 9 is 4, 0x80000000 is 0") {
    REQUIRE(v.Palette(9) == S_OK);
    CHECK(std::abs(drawn() - 10) <= 1);
    VARIANT big;
    big.vt = VT_UI4;
    big.ulVal = 0x80000000u;
    REQUIRE(v.Palette(big) == S_OK);
    CHECK(std::abs(drawn() - 100) <= 1);
    VARIANT text;
    text.vt = VT_BSTR;
    text.bstrVal = SysAllocString(L"not a number");
    CHECK(v.Palette(text) == E_INVALIDARG);
    VariantClear(&text);
  }
  SUBCASE("out-of-range shadings change nothing") {
    CHECK(v.view->SetPalIdxShading(5, 10) == E_INVALIDARG);
    CHECK(v.view->SetPalIdxShading(0, 101) == E_INVALIDARG);
    CHECK(v.view->SetPalIdxShading(0, std::nan("")) == E_INVALIDARG);
    REQUIRE(v.Palette(0) == S_OK);
    CHECK(std::abs(drawn() - 100) <= 1);
  }
}

TEST_CASE("drawing at bounds away from the corner keeps the picture inside them") {
  PictureFolder folder(L"picview_bounds");
  REQUIRE(WriteBmp24(folder.File(L"p.bmp"), CornerPattern(40, 30)));
  View v;
  REQUIRE(v.Open(folder.File(L"p.bmp")) == S_OK);
  Canvas canvas(120, 100);
  auto viewObject = Query<IViewObject>(v.view.Get());
  const RECTL bounds{30, 20, 90, 70};
  REQUIRE(viewObject->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, canvas.Dc(), &bounds, nullptr, nullptr,
                           0) == S_OK);
  CheckCorners(canvas, 30, 20, 40, 30, 0);
  // Outside the bounds the canvas is untouched.
  CHECK(canvas.Count(kCanvas, 0, 0, 120, 20) == 120 * 20);
  CHECK(canvas.Count(kCanvas, 0, 0, 30, 100) == 30 * 100);
  CHECK(canvas.Count(kCanvas, 90, 0, 120, 100) == 30 * 100);
  CHECK(canvas.Count(kCanvas, 0, 70, 120, 100) == 120 * 30);
}

TEST_CASE("a file GDI+ cannot read: E_FAIL and the failure text with the name") {
  PictureFolder folder(L"picview_broken");
  const std::wstring path = folder.File(L"broken.png");
  REQUIRE(WriteBroken(path));
  View v;
  CHECK(v.Open(path) == E_FAIL);
  CHECK(v.FileName() == path);
  CHECK(v.Preferred().cx == 0);

  Canvas canvas(300, 60);
  REQUIRE(DrawControl(v.view.Get(), canvas) == S_OK);
  const COLORREF background = canvas.At(0, 0);
  // The same text drawn the same way over the same background.
  Canvas expected(300, 60, background);
  SetBkMode(expected.Dc(), TRANSPARENT);
  SetTextAlign(expected.Dc(), TA_CENTER | TA_BASELINE);
  SelectObject(expected.Dc(), GetStockObject(DEFAULT_GUI_FONT));
  SetTextColor(expected.Dc(), canvas.At(0, 0) == RGB(0, 0, 0) ? RGB(255, 255, 255) : RGB(0, 0, 0));
  const std::wstring text = L"Failed to open image file:" + path;
  TextOutW(expected.Dc(), 150, 30, text.c_str(), static_cast<int>(text.size()));
  CHECK(canvas.SamePixels(expected));
  CHECK(canvas.Count(background, 0, 0, 300, 60) < 300 * 60);

  SUBCASE("a missing file is the same failure") {
    CHECK(v.Open(folder.File(L"missing.png")) == E_FAIL);
    CHECK(v.FileName() == folder.File(L"missing.png"));
  }
}

TEST_CASE("file names: UTF-16 kept whole, empty and wrongly typed names refused") {
  PictureFolder folder(L"picview_names");
  const std::wstring path = folder.File(L"\u0645\u064A\u0646\u0627\u0621_\u03A9.bmp");  // Arabic and Greek
  REQUIRE(WriteBmp24(path, CornerPattern(16, 16)));
  View v;
  REQUIRE(v.Open(path) == S_OK);
  CHECK(v.FileName() == path);
  CHECK(v.Preferred().cx == 16);

  CHECK(v.Open(L"") == E_INVALIDARG);
  VARIANT number;
  number.vt = VT_I4;
  number.lVal = 3;
  CHECK(v.Put(PRV_PICFILENAME, number) == E_INVALIDARG);
  CHECK(v.FileName() == path);
  CHECK(v.Preferred().cx == 16);

  VARIANT out;
  VariantInit(&out);
  CHECK(v.view->get_Property(PRV_BITMAP, &out) == E_INVALIDARG);
  CHECK(v.view->get_Property(static_cast<PRV_PROPERTY>(9), &out) == E_INVALIDARG);
  CHECK(v.view->get_Property(PRV_ZOOMPERCENT, nullptr) == E_POINTER);
  CHECK(v.Put(static_cast<PRV_PROPERTY>(9), number) == E_INVALIDARG);
}

TEST_CASE("PRV_BITMAP takes a real bitmap handle and owns it once GDI+ took it") {
  View v;
  const HDC screen = GetDC(nullptr);
  const HBITMAP bitmap = CreateCompatibleBitmap(screen, 30, 20);
  ReleaseDC(nullptr, screen);
  REQUIRE(bitmap);
  {
    const HDC dc = CreateCompatibleDC(nullptr);
    const HGDIOBJ old = SelectObject(dc, bitmap);
    const RECT all{0, 0, 30, 20};
    const HBRUSH brush = CreateSolidBrush(RGB(0, 200, 0));
    FillRect(dc, &all, brush);
    DeleteObject(brush);
    SelectObject(dc, old);
    DeleteDC(dc);
  }
  const auto handleVariant = [](HGDIOBJ handle) {
    VARIANT value;
    if (sizeof(void*) == 8) {
      value.vt = VT_I8;
      value.llVal = reinterpret_cast<LONG_PTR>(handle);
    } else {
      value.vt = VT_I4;
      value.lVal = static_cast<LONG>(reinterpret_cast<LONG_PTR>(handle));
    }
    return value;
  };

  SUBCASE("a brush is no bitmap: refused, and left alone") {
    const HBRUSH brush = CreateSolidBrush(RGB(1, 2, 3));
    CHECK(v.Put(PRV_BITMAP, handleVariant(brush)) == E_INVALIDARG);
    CHECK(GetObjectType(brush) == OBJ_BRUSH);
    DeleteObject(brush);
    DeleteObject(bitmap);
  }
  SUBCASE("other types are refused") {
    VARIANT text;
    text.vt = VT_BSTR;
    text.bstrVal = SysAllocString(L"1234");
    CHECK(v.Put(PRV_BITMAP, text) == E_INVALIDARG);
    VariantClear(&text);
    DeleteObject(bitmap);
  }
  SUBCASE("a bitmap is drawn, and deleted with the picture") {
    REQUIRE(v.Put(PRV_BITMAP, handleVariant(bitmap)) == S_OK);
    CHECK(v.Preferred().cx == 30);
    CHECK(v.Preferred().cy == 20);
    Canvas canvas(40, 30);
    REQUIRE(DrawControl(v.view.Get(), canvas) == S_OK);
    CHECK(canvas.Count(RGB(0, 200, 0), 0, 0, 30, 20) == 600);
    // Given again: still owned once, not deleted under the view.
    REQUIRE(v.Put(PRV_BITMAP, handleVariant(bitmap)) == S_OK);
    CHECK(GetObjectType(bitmap) == OBJ_BITMAP);
    VARIANT empty;
    VariantInit(&empty);
    REQUIRE(v.Put(PRV_BITMAP, empty) == S_OK);
    CHECK(GetObjectType(bitmap) == 0);
    CHECK(v.Preferred().cx == 0);
  }
}

TEST_CASE("two views hold two GDI+ start-ups") {
  PictureFolder folder(L"picview_two");
  REQUIRE(WriteBmp24(folder.File(L"p.bmp"), CornerPattern(16, 16)));
  DllUnderTest dll;
  ComRef<IXPICREPView> first, second;
  REQUIRE(dll.Create(CLSID_XPICREPView, first.Out()) == S_OK);
  REQUIRE(dll.Create(CLSID_XPICREPView, second.Out()) == S_OK);
  first.Reset();  // the other's GDI+ keeps running
  VARIANT name;
  name.vt = VT_BSTR;
  name.bstrVal = SysAllocString(folder.File(L"p.bmp").c_str());
  CHECK(second->put_Property(PRV_PICFILENAME, name) == S_OK);
  VariantClear(&name);
  Canvas canvas(16, 16);
  REQUIRE(DrawControl(second.Get(), canvas) == S_OK);
  CHECK(canvas.At(0, 0) == AsColour(kCornerColours[0]));
  second.Reset();
  CHECK(dll.CanUnloadNow() == S_OK);
}
