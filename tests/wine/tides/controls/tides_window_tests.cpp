// TidesWindow as a container and a program see it: interfaces, extent and persistence,
// drawing refusals, the data object, quick activation, its own window in Wine's ATL host,
// verbs, MouseAction, the automatic scale and the shared palette.
#include "tests/wine/common/EventSink.h"
#include "tests/wine/common/AtlHost.h"
#include "tests/wine/common/GraphControl.h"

#include <doctest/doctest.h>

#include <olectl.h>

#include <algorithm>

using namespace br::test;

namespace {

// A graph over the fake port's cosine day, scaled 0..1 without labels; Host() attaches it
// to a 300 x 200 window of Wine's ATL host.
struct Graph {
  DllUnderTest dll;
  AtlHost atl;
  FakeTidesPort port;
  GraphControl graph{dll};
  HWND host = nullptr;
  ComRef<IUnknown> site;
  HWND window = nullptr;

  Graph() {
    port.points = CosineDay();
    REQUIRE(graph->SetPort(&port) == S_OK);
    REQUIRE(graph->SetScale(1.0, 0.0) == S_OK);
    REQUIRE(graph.SetDrawText(0) == S_OK);
  }
  ~Graph() {
    if (host) DestroyWindow(host);
  }
  // An interface of the graph (or of another control).
  template <class I>
  ComRef<I> Face(IUnknown* of = nullptr) const {
    return Query<I>(of ? of : graph.Get());
  }
  void Host() {
    REQUIRE((host = AtlHost::MakeWindow(300, 200)) != nullptr);
    REQUIRE(atl.Attach(graph.Get(), host, site.Out()) == S_OK);
    CHECK(Face<IOleWindow>()->GetWindow(&window) == S_OK);
    REQUIRE(window != nullptr);
  }
  HRESULT Finish() {
    if (host) DestroyWindow(host);  // the host closes the control and lets its site go
    CHECK_FALSE(IsWindow(window));
    host = nullptr;
    site.Reset();
    graph.Release();
    CHECK(port.References() == 0);
    return dll.CanUnloadNow();
  }
};

}  // namespace

// (IObjectSafety is refused in the boundary suite.)
TEST_CASE("a control answers every control interface, one object behind them all; quick activation takes the sink") {
  EventSink sink(DIID__ITidesWindowEvents);
  Graph g;
  const IID* answered[] = {&IID_IDispatch, &IID_ITidesWindow, &IID_IViewObjectEx, &IID_IViewObject2,
                           &IID_IViewObject, &IID_IOleInPlaceObjectWindowless, &IID_IOleInPlaceObject,
                           &IID_IOleWindow, &IID_IOleInPlaceActiveObject, &IID_IOleControl, &IID_IOleObject,
                           &IID_IPersistStreamInit, &IID_IPersist, &IID_IConnectionPointContainer,
                           &IID_ISpecifyPropertyPages, &IID_IQuickActivate, &IID_IPersistStorage, &IID_IDataObject,
                           &IID_IProvideClassInfo, &IID_IProvideClassInfo2, &IID_IEmbeddedControl,
                           &IID_IUnitsOption};
  auto identity = g.Face<IUnknown>();
  for (const IID* iid : answered) {
    IUnknown* face = nullptr;
    REQUIRE(g.graph->QueryInterface(*iid, reinterpret_cast<void**>(&face)) == S_OK);
    CHECK(g.Face<IUnknown>(face).Get() == identity.Get());
    face->Release();
  }
  identity.Reset();
  QACONTAINER container{};
  container.cbSize = sizeof(container);
  container.pUnkEventSink = static_cast<IDispatch*>(&sink);
  QACONTROL control{};
  control.cbSize = sizeof(control);
  control.dwPointerActivationPolicy = 77;
  CHECK(g.Face<IQuickActivate>()->QuickActivate(&container, &control) == S_OK);
  CHECK(control.dwMiscStatus == 131473);
  CHECK(control.dwViewStatus == (VIEWSTATUS_OPAQUE | VIEWSTATUS_SOLIDBKGND));
  CHECK(control.dwPointerActivationPolicy == 0);
  CHECK(control.dwEventCookie != 0);
  CHECK(sink.References() == 1);
  CHECK(g.Face<IQuickActivate>()->QuickActivate(nullptr, &control) == E_POINTER);
  QACONTROL tooSmall{};
  tooSmall.cbSize = 8;
  CHECK(g.Face<IQuickActivate>()->QuickActivate(&container, &tooSmall) == E_INVALIDARG);
  CHECK(g.Finish() == S_OK);
  CHECK(sink.References() == 0);  // the control let the sink go
}

TEST_CASE("extent: 300 x 200 pixels at first, then the container's, carried through a saved stream; the picture") {
  Graph g;
  GraphControl second(g.dll);
  HDC screen = GetDC(nullptr);
  SIZEL extent{};
  CHECK(g.Face<IOleObject>()->GetExtent(DVASPECT_CONTENT, &extent) == S_OK);
  CHECK(extent.cx == MulDiv(300, 2540, GetDeviceCaps(screen, LOGPIXELSX)));
  CHECK(extent.cy == MulDiv(200, 2540, GetDeviceCaps(screen, LOGPIXELSY)));
  ReleaseDC(nullptr, screen);
  CHECK(g.Face<IOleObject>()->GetExtent(DVASPECT_ICON, &extent) == DV_E_DVASPECT);
  // At that extent: Draw refuses what it cannot draw on; the data object gives its picture as an
  // enhanced metafile only.
  Canvas drawn(300, 200);
  const RECTL bounds{0, 0, 300, 200};
  const auto draw = [&](DWORD aspect, HDC dc, const RECTL* box) {
    return g.Face<IViewObject>()->Draw(aspect, -1, nullptr, nullptr, nullptr, dc, box, nullptr, nullptr, 0);
  };
  CHECK(draw(DVASPECT_CONTENT, nullptr, &bounds) == E_INVALIDARG);
  CHECK(draw(DVASPECT_CONTENT, drawn.Dc(), nullptr) == E_INVALIDARG);
  CHECK(draw(DVASPECT_ICON, drawn.Dc(), &bounds) == DV_E_DVASPECT);
  REQUIRE(draw(DVASPECT_CONTENT, drawn.Dc(), &bounds) == S_OK);

  FORMATETC enhanced{CF_ENHMETAFILE, nullptr, DVASPECT_CONTENT, -1, TYMED_ENHMF};
  FORMATETC text{CF_TEXT, nullptr, DVASPECT_CONTENT, -1, TYMED_HGLOBAL};
  FORMATETC wrongMedium{CF_ENHMETAFILE, nullptr, DVASPECT_CONTENT, -1, TYMED_HGLOBAL};
  CHECK(g.Face<IDataObject>()->QueryGetData(&wrongMedium) == DV_E_TYMED);
  STGMEDIUM medium{};
  CHECK(g.Face<IDataObject>()->GetData(&text, &medium) == DV_E_FORMATETC);
  REQUIRE(g.Face<IDataObject>()->GetData(&enhanced, &medium) == S_OK);
  REQUIRE(medium.tymed == TYMED_ENHMF);
  Canvas played(300, 200);
  const RECT all{0, 0, 300, 200};
  CHECK(PlayEnhMetaFile(played.Dc(), medium.hEnhMetaFile, &all));
  ReleaseStgMedium(&medium);
  CHECK(played.SamePixels(drawn));
  CHECK(played.At(100, 137) == kDaylightColour);

  SIZEL wanted{6123, 3456};
  CHECK(g.Face<IOleObject>()->SetExtent(DVASPECT_CONTENT, &wanted) == S_OK);
  CHECK(g.Face<IViewObjectEx>()->GetExtent(DVASPECT_CONTENT, -1, nullptr, &extent) == S_OK);
  CHECK(extent.cx == 6123);
  CHECK(extent.cy == 3456);

  CHECK(g.Face<IPersistStreamInit>()->IsDirty() == S_OK);
  IStream* stream = nullptr;
  REQUIRE(CreateStreamOnHGlobal(nullptr, TRUE, &stream) == S_OK);
  CHECK(g.Face<IPersistStreamInit>()->Save(stream, TRUE) == S_OK);
  CHECK(g.Face<IPersistStreamInit>()->IsDirty() == S_FALSE);
  stream->Seek(LARGE_INTEGER{}, STREAM_SEEK_SET, nullptr);
  CHECK(g.Face<IPersistStreamInit>(second.Get())->Load(stream) == S_OK);
  CHECK(g.Face<IPersistStreamInit>(second.Get())->Load(stream) == E_FAIL);  // nothing left to read
  CHECK(g.Face<IPersistStreamInit>(second.Get())->Load(nullptr) == E_POINTER);
  stream->Release();
  extent = SIZEL{};
  CHECK(g.Face<IOleObject>(second.Get())->GetExtent(DVASPECT_CONTENT, &extent) == S_OK);
  CHECK(extent.cx == 6123);
  CHECK(extent.cy == 3456);
  second.Release();
  CHECK(g.Finish() == S_OK);
}

// The readout's arithmetic, and no reading without points or a port: the native graph suite.
TEST_CASE("in the ATL host: a child window of its own paints Draw's picture; MouseAction; verbs") {
  Graph g;
  g.Host();
  CHECK(GetParent(g.window) == g.host);
  // The site offered windowless activation; the control still has its window and says so.
  LRESULT result = -1;
  CHECK(g.Face<IOleInPlaceObjectWindowless>()->OnWindowMessage(WM_MOUSEMOVE, 0, 0, &result) == S_FALSE);
  Canvas drawn(300, 200);
  REQUIRE(DrawControl(g.graph.Get(), drawn) == S_OK);
  Canvas printed(300, 200);
  SendMessageW(g.window, WM_PRINTCLIENT, reinterpret_cast<WPARAM>(printed.Dc()), PRF_CLIENT);
  CHECK(printed.SamePixels(drawn));
  // The pointer in the plot (W = 284) and past it.
  EventSink sink(DIID__ITidesWindowEvents);
  REQUIRE(sink.Connect(g.graph.Get()));
  const auto move = [&](int x) { SendMessageW(g.window, WM_MOUSEMOVE, 0, MAKELPARAM(x, 100)); };
  move(150);  // dx 142 = 12:00; point trunc(142 / 284 * 25) = 12
  REQUIRE(sink.calls == 1);
  REQUIRE(sink.lastDoubles.size() == 2);
  CHECK(sink.lastDoubles[0] == doctest::Approx(45000.5).epsilon(1e-12));
  CHECK(sink.lastDoubles[1] == g.port.points[12]);
  CHECK(sink.lastId == 1);
  CHECK(sink.lastFlags == DISPATCH_METHOD);
  move(291);  // the last pixel of the plot: 23:54, the last point
  REQUIRE(sink.calls == 2);
  CHECK(sink.lastDoubles[0] == doctest::Approx(45000.0 + (23 * 60 + 54) / 1440.0).epsilon(1e-12));
  CHECK(sink.lastDoubles[1] == g.port.points[24]);
  move(292);  // 24:00 and the strip right of the plot: no time of this day, no event
  move(296);
  CHECK(sink.calls == 2);
  sink.Disconnect();
  // Verbs: UI activation takes the focus, hide and show, the verbs a control has not; Close.
  ComRef<IOleClientSite> site;
  REQUIRE(g.Face<IOleObject>()->GetClientSite(site.Out()) == S_OK);
  RECT position{0, 0, 300, 200};
  const auto verb = [&](LONG v) { return g.Face<IOleObject>()->DoVerb(v, nullptr, site.Get(), 0, g.host, &position); };
  CHECK(verb(OLEIVERB_UIACTIVATE) == S_OK);
  CHECK(GetFocus() == g.window);
  CHECK(verb(OLEIVERB_HIDE) == S_OK);
  CHECK_FALSE(IsWindowVisible(g.window));
  CHECK(verb(OLEIVERB_SHOW) == S_OK);
  CHECK(IsWindowVisible(g.window));
  CHECK(verb(OLEIVERB_OPEN) == OLEOBJ_S_CANNOT_DOVERB_NOW);
  CHECK(verb(OLEIVERB_PROPERTIES) == E_NOTIMPL);
  CHECK(verb(7) == OLEOBJ_S_INVALIDVERB);
  // Closing deactivates: the window goes, the site stays until the host lets it go.
  CHECK(g.Face<IOleObject>()->Close(OLECLOSE_NOSAVE) == S_OK);
  CHECK_FALSE(IsWindow(g.window));
  site.Reset();
  CHECK(g.Finish() == S_OK);
}

// Arrays of other shapes and by-reference forms: the boundary suite. (Last: the palette
// stays changed for the module's life.)
TEST_CASE("a palette given through IEmbeddedControl recolours every band of every control; the automatic scale") {
  Graph g;
  GraphControl other(g.dll);
  REQUIRE(other->SetPort(&g.port) == S_OK);
  REQUIRE(other->SetScale(1.0, 0.0) == S_OK);
  REQUIRE(other.SetDrawText(0) == S_OK);
  CHECK(SetRampPalette(g.graph.Get()) == S_OK);
  Canvas recoloured(300, 200);
  REQUIRE(DrawControl(other.Get(), recoloured) == S_OK);
  CHECK(recoloured.At(40, 137) == RampColour(17));  // night
  CHECK(recoloured.At(75, 137) == RampColour(12));  // twilight
  CHECK(recoloured.At(100, 137) == RampColour(5));  // daylight
  CHECK(recoloured.At(4, 100) == RampColour(7));    // frame
  const POINT first = CurvePoint(0, g.port.points[0], 1.0, 0.0);
  CHECK(recoloured.At(first.x, first.y) == RampColour(10));  // curve
  other.Release();

  // SetScale with a maximum of 0: the day's lowest and highest heights span the plot, whatever the minimum.
  REQUIRE(g.graph->SetScale(0.0, -1.0) == S_OK);
  Canvas canvas(300, 200);
  REQUIRE(DrawControl(g.graph.Get(), canvas) == S_OK);
  const std::vector<double>& values = g.port.points;
  const auto [low, high] = std::minmax_element(values.begin(), values.end());
  const int highX = CurvePoint(static_cast<int>(high - values.begin()), *high, *high, *low).x;
  const int lowX = CurvePoint(static_cast<int>(low - values.begin()), *low, *high, *low).x;
  CHECK(canvas.Count(RampColour(10), highX - 1, 7, highX + 2, 10) > 0);    // around the top row, 8
  CHECK(canvas.Count(RampColour(10), lowX - 1, 190, lowX + 2, 193) > 0);  // around the bottom row, 191
  CHECK(g.Finish() == S_OK);
}
