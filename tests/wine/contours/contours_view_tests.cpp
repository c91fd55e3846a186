// XContoursView's picture: bands and their colours, labels against a reference rendering in
// the same font, the bars beside them, grey in every invalid state, the shared palette, and
// what the view does with the host's components, palette, font and device context.
#include "tests/wine/common/Canvas.h"
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/SceneProbe.h"

#include "contours/layout/contour_layout.h"

#include "BR_Private.h"
#include "GeoData.h"

#include <doctest/doctest.h>

#include <olectl.h>

#include <algorithm>
#include <cstdlib>
#include <ios>
#include <map>
#include <string>
#include <vector>

using namespace br::test;
using br::contours::Band;
using br::contours::Boundary;
using br::contours::ContourScheme;
using br::contours::LabelMarks;

namespace {

// Reference counting shared by the fakes below.
template <class I>
class FakeObject : public I {
public:
  virtual ~FakeObject() = default;
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    if (!out) return E_POINTER;
    *out = nullptr;
    if (IsEqualIID(riid, IID_IUnknown) || (answers && IsEqualIID(riid, __uuidof(I)))) {
      *out = static_cast<I*>(this);
      AddRef();
      return S_OK;
    }
    return E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return ++references; }
  STDMETHODIMP_(ULONG) Release() override { return --references; }  // lives on the test's stack

  ULONG references = 1;
  bool answers = true;
};

// An object whose only purpose is to count the references a VARIANT holds on it.
class Tracker : public FakeObject<IUnknown> {};

class FakePresParams : public FakeObject<IPresParams> {
public:
  FakePresParams(bool twoShades, float shallow, float deep) {
    values[3].vt = VT_I4;
    values[3].lVal = twoShades ? 1 : 0;
    values[0].vt = VT_R4;
    values[0].fltVal = shallow;
    values[2].vt = VT_R4;
    values[2].fltVal = deep;
  }
  STDMETHODIMP GetParam(long index, VARIANT* value) override {
    ++calls;
    const auto it = values.find(index);
    if (it == values.end()) return E_INVALIDARG;
    VariantInit(value);
    return VariantCopy(value, &it->second);
  }
  std::map<long, VARIANT> values;
  int calls = 0;
};

class FakeColorMap : public FakeObject<IColorMap> {
public:
  STDMETHODIMP Reserved3() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved4() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved5() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved6() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved7() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved8() override { return E_NOTIMPL; }
  STDMETHODIMP GetPaletteIndex(long colour, USHORT* index) override {
    asked.push_back(colour);
    if (colour == failing) return E_FAIL;
    const auto it = indices.find(colour);
    *index = it == indices.end() ? 0 : it->second;
    return S_OK;
  }
  // Chart colour number to logical palette index.
  std::map<long, USHORT> indices{{21, 1}, {31, 2}, {30, 3}, {29, 4}, {28, 5}, {2, 6}};
  std::vector<long> asked;
  long failing = -1;
};

// The chart palette: entry i of the colour map's indices in a colour no ramp entry has.
const COLORREF kChartColours[] = {RGB(255, 255, 255), RGB(201, 237, 252), RGB(167, 217, 251), RGB(130, 202, 255),
                                  RGB(97, 183, 255),  RGB(75, 156, 211),  RGB(212, 234, 238)};

HPALETTE MakeChartPalette() {
  struct {
    LOGPALETTE head;
    PALETTEENTRY more[7];
  } table{};
  table.head.palVersion = 0x300;
  table.head.palNumEntries = 7;
  PALETTEENTRY* entries = table.head.palPalEntry;
  for (int i = 0; i < 7; ++i)
    entries[i] = PALETTEENTRY{GetRValue(kChartColours[i]), GetGValue(kChartColours[i]), GetBValue(kChartColours[i]), 0};
  return CreatePalette(&table.head);
}

long HandleNumber(HGDIOBJ handle) { return static_cast<long>(reinterpret_cast<LONG_PTR>(handle)); }

// Colour of a band's zone under the default colour map: zone z (21, 31, 30, 29, 28) is index z + 1.
COLORREF ZoneColour(int zone) { return kChartColours[zone + 1]; }

const COLORREF kGrey = RampColour(7);
const COLORREF kText = RampColour(0);

struct View {
  DllUnderTest dll;
  ComRef<IXContoursView> view;
  FakeColorMap colours;
  HPALETTE palette = MakeChartPalette();

  View() {
    REQUIRE(dll.Create(CLSID_XContoursView, view.Out()) == S_OK);
    REQUIRE(SetRampPalette(view.Get()) == S_OK);
    REQUIRE(palette != nullptr);
  }
  ~View() {
    view.Reset();
    DeleteObject(palette);
    CHECK(dll.CanUnloadNow() == S_OK);
  }
  HRESULT Give(FakePresParams& params, double safety) { return view->SetContoursData(&params, &colours, safety); }
  void ShowPalette() { REQUIRE(view->put_Palette(HandleNumber(palette)) == S_OK); }
  void Draw(const Canvas& canvas) const { REQUIRE(DrawControl(view.Get(), canvas) == S_OK); }
  bool AllGrey(int width, int height) const {
    Canvas canvas(width, height);
    Draw(canvas);
    return canvas.Count(kGrey, 0, 0, width, height) == width * height;
  }
};

// A font with pixels a label can be compared by, handed to the view through IEmbeddedControl.
ComRef<IFont> MakeLabelFont() {
  FONTDESC description{sizeof description, const_cast<LPOLESTR>(L"Tahoma"), {}, FW_NORMAL, ANSI_CHARSET, FALSE, FALSE, FALSE};
  description.cySize.int64 = 12 * 10000;  // 12 points
  ComRef<IFont> font;
  REQUIRE(OleCreateFontIndirect(&description, IID_IFont, font.OutVoid()) == S_OK);
  return font;
}

void GiveFont(IUnknown* view, IFont* font) {
  ComRef<IEmbeddedControl> embedded = Query<IEmbeddedControl>(view);
  REQUIRE(embedded->SetFont(0, font, 0) == S_OK);
}

// What the view should draw, drawn here with plain GDI: the bands in their RGB colours, then
// each label in font with the same format, and the bars.
void PaintReference(const Canvas& canvas, const ContourScheme& scheme, HFONT font) {
  const HDC dc = canvas.Dc();
  for (const Band& band : br::contours::LayBands(scheme, 0, canvas.Height())) {
    const RECT area{0, band.top, canvas.Width(), band.bottom};
    const HBRUSH brush = CreateSolidBrush(ZoneColour(band.zone));
    FillRect(dc, &area, brush);
    DeleteObject(brush);
  }
  const HGDIOBJ old = SelectObject(dc, font);
  SetBkMode(dc, TRANSPARENT);
  SetTextColor(dc, kText);
  const HBRUSH bar = CreateSolidBrush(kText);
  for (const Boundary& boundary : br::contours::LabelBoundaries(scheme, 0, canvas.Height())) {
    SIZE extent{};
    GetTextExtentPoint32A(dc, boundary.label.c_str(), static_cast<int>(boundary.label.size()), &extent);
    const LabelMarks marks = br::contours::MarkLabel(0, canvas.Width(), boundary.y, extent.cx, extent.cy);
    RECT box{0, marks.boxTop, canvas.Width(), marks.boxBottom};
    DrawTextA(dc, boundary.label.c_str(), static_cast<int>(boundary.label.size()), &box, 0x25);
    const RECT left{marks.leftBarX, marks.barTop, marks.leftBarX + marks.barWidth, marks.barTop + 2};
    const RECT right{marks.rightBarX, marks.barTop, marks.rightBarX + marks.barWidth, marks.barTop + 2};
    if (marks.barWidth > 0) {
      FillRect(dc, &left, bar);
      FillRect(dc, &right, bar);
    }
  }
  DeleteObject(bar);
  SelectObject(dc, old);
}

// Width of a label in font.
SIZE Extent(HFONT font, const char* text) {
  Canvas canvas(4, 4);
  const HGDIOBJ old = SelectObject(canvas.Dc(), font);
  SIZE extent{};
  GetTextExtentPoint32A(canvas.Dc(), text, lstrlenA(text), &extent);
  SelectObject(canvas.Dc(), old);
  return extent;
}

}  // namespace

TEST_CASE("bands: rows and colours for two and four shades") {
  View v;
  v.ShowPalette();
  for (const bool twoShades : {false, true}) {
    FakePresParams params(twoShades, 2.0f, 30.0f);
    REQUIRE(v.Give(params, 10.0) == S_OK);
    CHECK(params.references == 1);  // nothing kept
    CHECK(v.colours.references == 1);
    for (const int height : {100, 103}) {
      CAPTURE(twoShades);
      CAPTURE(height);
      Canvas canvas(300, height);
      v.Draw(canvas);
      const int n = twoShades ? 3 : 5;
      const int band = height / n;
      const int zones[2][5] = {{0, 1, 2, 3, 4}, {0, 1, 4, -1, -1}};
      // Column 0 down the picture: band colours, the text colour only in the bar rows.
      const int labelled = n - 2;
      std::vector<bool> barRow(height, false);
      for (int j = 1; j <= labelled; ++j) barRow[j * band - 1] = barRow[j * band] = true;
      for (int y = 0; y < height; ++y) {
        if (barRow[y]) continue;
        const int i = std::min(y / band, n - 1);
        if (canvas.At(0, y) != ZoneColour(zones[twoShades][i])) {
          FAIL_CHECK("row " << y << " is " << std::hex << canvas.At(0, y));
          break;
        }
      }
      // The last band reaches the bottom.
      CHECK(canvas.Count(ZoneColour(4), 0, band * (n - 1) + 1, 300, height) == 300 * (height - band * (n - 1) - 1));
      // The bars: two rows of text colour at each labelled boundary, from x = 0.
      for (int j = 1; j <= labelled; ++j) {
        CHECK(canvas.At(0, j * band - 1) == kText);
        CHECK(canvas.At(0, j * band) == kText);
        CHECK(canvas.At(0, j * band + 1) == ZoneColour(zones[twoShades][j]));
        CHECK(canvas.At(0, j * band - 2) == ZoneColour(zones[twoShades][j - 1]));
      }
    }
  }
}

TEST_CASE("labels: the boxes match a reference rendering in the same font, bars at the computed columns") {
  View v;
  v.ShowPalette();
  ComRef<IFont> font = MakeLabelFont();
  GiveFont(v.view.Get(), font.Get());
  HFONT handle = nullptr;
  REQUIRE(font->get_hFont(&handle) == S_OK);
  LOGFONTW description{};
  REQUIRE(GetObjectW(handle, sizeof description, &description) > 0);

  for (const bool twoShades : {false, true}) {
    FakePresParams params(twoShades, 2.0f, 30.0f);
    REQUIRE(v.Give(params, 10.0) == S_OK);
    const ContourScheme scheme{twoShades, 2.0, 10.0, 30.0};
    for (const int height : {100, 103}) {
      CAPTURE(twoShades);
      CAPTURE(height);
      Canvas picture(300, height);
      v.Draw(picture);
      Canvas reference(300, height);
      PaintReference(reference, scheme, handle);
      CHECK(picture.SamePixels(reference));
      // The labels are really there: text pixels between the bars.
      for (const Boundary& b : br::contours::LabelBoundaries(scheme, 0, height)) {
        const SIZE extent = Extent(handle, b.label.c_str());
        const LabelMarks marks = br::contours::MarkLabel(0, 300, b.y, extent.cx, extent.cy);
        CHECK(picture.Count(kText, marks.leftBarX + marks.barWidth, marks.boxTop, marks.rightBarX, marks.boxBottom) > 10);
      }
    }
  }
  SUBCASE("the font is the view's own copy: it outlives the host's font object") {
    FakePresParams params(false, 2.0f, 30.0f);
    REQUIRE(v.Give(params, 10.0) == S_OK);
    font.Reset();  // the OLE font deletes its handle
    const HFONT again = CreateFontIndirectW(&description);
    Canvas picture(300, 200);
    v.Draw(picture);
    Canvas reference(300, 200);
    PaintReference(reference, ContourScheme{false, 2.0, 10.0, 30.0}, again);
    CHECK(picture.SamePixels(reference));
    DeleteObject(again);
  }
}

TEST_CASE("labels too wide for the view: no bars, and huge depths are written in full") {
  View v;
  v.ShowPalette();
  ComRef<IFont> font = MakeLabelFont();
  GiveFont(v.view.Get(), font.Get());
  HFONT handle = nullptr;
  REQUIRE(font->get_hFont(&handle) == S_OK);

  FakePresParams params(true, 2.0f, 30.0f);
  REQUIRE(v.Give(params, 10.0) == S_OK);
  const SIZE extent = Extent(handle, "10.0");
  const int width = extent.cx + 4;  // (W - tw) / 2 - 4 < 0, while the text stays off the edges
  Canvas narrow(width, 90);
  v.Draw(narrow);
  CHECK(narrow.At(0, 29) == ZoneColour(0));  // no bar at either edge
  CHECK(narrow.At(width - 1, 29) == ZoneColour(0));
  CHECK(narrow.Count(kText, 0, 20, width, 40) > 10);

  REQUIRE(v.Give(params, 1e300) == S_OK);
  Canvas wide(300, 90);
  v.Draw(wide);
  Canvas reference(300, 90);
  PaintReference(reference, ContourScheme{true, 2.0, 1e300, 30.0}, handle);
  CHECK(wide.SamePixels(reference));
  CHECK(wide.Count(kText, 0, 20, 300, 40) > 100);
}

TEST_CASE("grey in every invalid state") {
  View v;
  CHECK(v.AllGrey(120, 100));  // as made

  FakePresParams good(false, 2.0f, 30.0f);
  REQUIRE(v.Give(good, 10.0) == S_OK);
  CHECK(v.AllGrey(120, 100));  // no palette yet

  v.ShowPalette();
  CHECK_FALSE(v.AllGrey(120, 100));

  SUBCASE("null components") {
    CHECK(v.view->SetContoursData(nullptr, &v.colours, 10.0) == S_FALSE);
    CHECK(v.AllGrey(120, 100));
    REQUIRE(v.Give(good, 10.0) == S_OK);
    CHECK(v.view->SetContoursData(&good, nullptr, 10.0) == S_FALSE);
    CHECK(v.AllGrey(120, 100));
  }
  SUBCASE("a shallow contour of VT_R8, a deep one of VT_I4, a missing deep one") {
    const struct {
      long index;
      VARTYPE type;  // VT_EMPTY: no such parameter
    } rows[] = {{0, VT_R8}, {2, VT_I4}, {2, VT_EMPTY}};
    for (const auto& row : rows) {
      CAPTURE(row.index);
      FakePresParams wrong(false, 2.0f, 30.0f);
      if (row.type == VT_EMPTY) wrong.values.erase(row.index);
      else wrong.values[row.index].vt = row.type;
      if (row.type == VT_R8) wrong.values[row.index].dblVal = 2.0;  // the right depth, the wrong type
      CHECK(v.Give(wrong, 10.0) == S_OK);
      CHECK(v.AllGrey(120, 100));
    }
  }
  SUBCASE("components without their interfaces") {
    FakePresParams mute(false, 2.0f, 30.0f);
    mute.answers = false;
    CHECK(v.Give(mute, 10.0) == S_OK);
    CHECK(v.AllGrey(120, 100));
    CHECK(mute.calls == 0);
    v.colours.answers = false;
    CHECK(v.Give(good, 10.0) == S_OK);
    CHECK(v.AllGrey(120, 100));
    CHECK(v.colours.references == 1);
    CHECK(good.references == 1);
  }
  SUBCASE("a failing colour: the read stops there") {
    v.colours.failing = 30;
    v.colours.asked.clear();
    CHECK(v.Give(good, 10.0) == S_OK);
    CHECK(v.AllGrey(120, 100));
    CHECK(v.colours.asked == std::vector<long>{21, 31, 30});
    v.colours.failing = -1;
    v.colours.asked.clear();
    CHECK(v.Give(good, 10.0) == S_OK);
    CHECK(v.colours.asked == std::vector<long>{21, 31, 30, 29, 28, 2});
    CHECK_FALSE(v.AllGrey(120, 100));
  }
  SUBCASE("palette 0, a deleted palette, a handle that is no palette") {
    CHECK(v.view->put_Palette(0) == S_OK);
    CHECK(v.AllGrey(120, 100));
    const HPALETTE gone = MakeChartPalette();
    CHECK(v.view->put_Palette(HandleNumber(gone)) == S_OK);
    CHECK_FALSE(v.AllGrey(120, 100));
    DeleteObject(gone);
    CHECK(v.AllGrey(120, 100));
    const HBRUSH brush = CreateSolidBrush(RGB(1, 2, 3));
    CHECK(v.view->put_Palette(HandleNumber(brush)) == S_OK);
    CHECK(v.AllGrey(120, 100));
    DeleteObject(brush);
  }
}

TEST_CASE("every VARIANT the host hands out is cleared") {
  View v;
  Tracker tracker;
  FakePresParams params(false, 2.0f, 30.0f);
  VariantClear(&params.values[3]);
  params.values[3].vt = VT_UNKNOWN;
  params.values[3].punkVal = &tracker;  // the fake's copy of it: the test owns this one
  tracker.references = 1;
  CHECK(v.Give(params, 10.0) == S_OK);
  CHECK(tracker.references == 1);
  v.ShowPalette();
  CHECK(v.AllGrey(60, 50));
  params.values[3].vt = VT_EMPTY;
}

TEST_CASE("the shared palette through IEmbeddedControl colours the grey, the labels and the bars") {
  View v;
  ComRef<IEmbeddedControl> embedded = Query<IEmbeddedControl>(v.view.Get());
  VARIANT table;
  table.vt = VT_ARRAY | VT_I4;
  table.parray = SafeArrayCreateVector(VT_I4, 0, 20);
  for (LONG i = 0; i < 20; ++i) {
    LONG colour = RGB(5, 100 + i, 7);
    SafeArrayPutElement(table.parray, &i, &colour);
  }
  REQUIRE(embedded->SetPalette(table) == S_OK);
  VariantClear(&table);
  Canvas grey(50, 40);
  v.Draw(grey);
  CHECK(grey.Count(RGB(5, 107, 7), 0, 0, 50, 40) == 50 * 40);

  FakePresParams params(true, 2.0f, 30.0f);
  REQUIRE(v.Give(params, 10.0) == S_OK);
  v.ShowPalette();
  Canvas picture(300, 90);
  v.Draw(picture);
  CHECK(picture.At(0, 29) == RGB(5, 100, 7));
  CHECK(picture.At(0, 30) == RGB(5, 100, 7));
  CHECK(picture.Count(RGB(5, 100, 7), 150, 29, 300, 31) > 2 * 100);
  CHECK(picture.Count(kText, 0, 0, 300, 90) == 0);
}

TEST_CASE("the host's device context gets its palette back") {
  View v;
  v.ShowPalette();
  FakePresParams params(false, 2.0f, 30.0f);
  REQUIRE(v.Give(params, 10.0) == S_OK);
  Canvas canvas(100, 100);
  const HPALETTE own = MakeChartPalette();
  const HPALETTE before = SelectPalette(canvas.Dc(), own, FALSE);
  v.Draw(canvas);
  CHECK(GetCurrentObject(canvas.Dc(), OBJ_PAL) == own);
  CHECK(canvas.At(0, 0) == ZoneColour(0));
  SelectPalette(canvas.Dc(), before, FALSE);
  DeleteObject(own);
}

TEST_CASE("a control without events, with the preferred size 300 x 200") {
  View v;
  ComRef<IConnectionPointContainer> points;
  CHECK(v.view->QueryInterface(IID_IConnectionPointContainer, points.OutVoid()) == E_NOINTERFACE);
  ComRef<IEmbeddedControl> embedded = Query<IEmbeddedControl>(v.view.Get());
  long width = 0, height = 0;
  CHECK(embedded->GetPreferredSize(&width, &height) == S_OK);
  CHECK(width == 300);
  CHECK(height == 200);
}

namespace {

// The stand-in chart host's scene object, called through IDispatch.
class Scene {
public:
  Scene() {
    CLSID clsid{};
    REQUIRE(CLSIDFromProgID(L"ChartScene.Scene", &clsid) == S_OK);
    REQUIRE(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch, scene_.OutVoid()) == S_OK);
    const char* root = getenv("BR_SOURCE_DIR");
    REQUIRE(root != nullptr);
    std::wstring path = L"Z:";
    for (const char* c = root; *c; ++c) path += *c == '/' ? L'\\' : static_cast<wchar_t>(*c);
    path += L"\\data\\harbour\\harbour.json";
    VARIANT result = Call(L"Load", path.c_str());
    VariantClear(&result);
  }
  // The scene's component of that kind and name (one reference for the caller).
  ComRef<IUnknown> Component(const wchar_t* kind, const wchar_t* name) {
    VARIANT result = Call(kind, name);
    REQUIRE(result.vt == VT_UNKNOWN);
    return ComRef<IUnknown>::Adopt(result.punkVal);
  }
  long Palette(const wchar_t* name) {
    VARIANT result = Call(L"Palette", name);
    REQUIRE(result.vt == VT_I4);
    return result.lVal;
  }

private:
  VARIANT Call(const wchar_t* method, const wchar_t* text) {
    DISPID id = 0;
    LPOLESTR names[] = {const_cast<LPOLESTR>(method)};
    REQUIRE(scene_->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id) == S_OK);
    VARIANT argument;
    argument.vt = VT_BSTR;
    argument.bstrVal = SysAllocString(text);
    DISPPARAMS parameters{&argument, nullptr, 1, 0};
    VARIANT result;
    VariantInit(&result);
    const HRESULT hr = scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, &result,
                                      nullptr, nullptr);
    VariantClear(&argument);
    REQUIRE(hr == S_OK);
    return result;
  }
  ComRef<IDispatch> scene_;
};

COLORREF Hex(unsigned rgb) { return RGB(rgb >> 16, (rgb >> 8) & 0xFF, rgb & 0xFF); }

}  // namespace

TEST_CASE("over the stand-in host's sample scene") {
  View v;
  SceneProbe probe;
  Scene scene;
  const long liveParams = probe.Counter("live.PresParams");
  const long liveMaps = probe.Counter("live.ColorMap");
  REQUIRE(v.view->put_Palette(scene.Palette(L"day")) == S_OK);
  // The day palette's colours of the chart colours 21, 31, 30, 29 and 28.
  const COLORREF zones[] = {Hex(0xC9EDFC), Hex(0xA7D9FB), Hex(0x82CAFF), Hex(0x61B7FF), Hex(0xD4EAEE)};
  {
    ComRef<IUnknown> map = scene.Component(L"ColorMap", L"day");
    ComRef<IUnknown> four = scene.Component(L"PresParams", L"four-shades");
    ComRef<IUnknown> wrong = scene.Component(L"PresParams", L"wrong-type");
    const long params = probe.Counter("calls.IPresParams.GetParam");
    const long indices = probe.Counter("calls.IColorMap.GetPaletteIndex");

    REQUIRE(v.view->SetContoursData(four.Get(), map.Get(), 10.0) == S_OK);
    CHECK(probe.Counter("calls.IPresParams.GetParam") - params == 3);
    CHECK(probe.Counter("calls.IColorMap.GetPaletteIndex") - indices == 6);
    Canvas picture(300, 100);
    v.Draw(picture);
    for (int i = 0; i < 5; ++i) CHECK(picture.At(0, 20 * i + 10) == zones[i]);

    REQUIRE(v.view->SetContoursData(wrong.Get(), map.Get(), 10.0) == S_OK);
    CHECK(v.AllGrey(300, 100));
  }
  // No component of the host is kept.
  CHECK(probe.Counter("live.PresParams") == liveParams);
  CHECK(probe.Counter("live.ColorMap") == liveMaps);
}
