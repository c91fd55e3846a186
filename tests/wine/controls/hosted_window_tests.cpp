// TidesWindow in a standard container (Wine's ATL host): windowed activation as a child of
// the host's window, its own window's pictures (WM_PRINTCLIENT, PrintWindow), the
// pointer readout (MouseAction), font, cursor and erase handling, creation by
// programmatic identifier.
#include "tests/wine/common/event_sink.h"
#include "tests/wine/controls/atl_host.h"
#include "tests/wine/controls/graph_test_support.h"

#include <doctest/doctest.h>

#include <olectl.h>

#include <algorithm>
#include <string>

using namespace br::test;

namespace {

constexpr double kDate = 45000.0;  // the fake port's day, 2023-03-15

HWND WindowOf(IUnknown* control) {
  IOleWindow* window = Query<IOleWindow>(control);
  HWND handle = nullptr;
  CHECK(window->GetWindow(&handle) == S_OK);
  window->Release();
  return handle;
}

void PrintClient(HWND window, const Canvas& canvas) {
  SendMessageW(window, WM_PRINTCLIENT, reinterpret_cast<WPARAM>(canvas.Dc()), PRF_CLIENT);
}

// A graph over the fake port's cosine day, attached to a 300 x 200 host window.
struct Hosted {
  DllUnderTest dll;
  AtlHost atl;
  FakeTidesPort port;
  GraphControl graph{dll};
  HWND host = AtlHost::MakeWindow(300, 200);
  IUnknown* site = nullptr;
  HWND window = nullptr;

  Hosted() {
    port.points = CosineDay();
    REQUIRE(host != nullptr);
    REQUIRE(graph->SetPort(&port) == S_OK);
    REQUIRE(graph->SetScale(1.0, 0.0) == S_OK);
    REQUIRE(graph.SetDrawText(0) == S_OK);
    REQUIRE(atl.Attach(graph.Get(), host, &site) == S_OK);
    window = WindowOf(graph.Get());
    REQUIRE(window != nullptr);
  }
  ~Hosted() {
    if (host) DestroyWindow(host);
    ReleaseAndNull(site);
  }
  HRESULT Finish() {
    DestroyWindow(host);  // the host closes the control and lets its site go
    host = nullptr;
    CHECK_FALSE(IsWindow(window));
    ReleaseAndNull(site);
    graph.Release();
    CHECK(port.References() == 0);
    return dll.CanUnloadNow();
  }
};

double TimeOf(int hour, int minute) { return kDate + (hour * 60 + minute) / 1440.0; }

}  // namespace

TEST_CASE("in-place activation makes a window of the control's own, a child of the host sized to the site") {
  Hosted hosted;
  CHECK(GetParent(hosted.window) == hosted.host);
  CHECK(IsWindowVisible(hosted.window));
  RECT client{};
  GetClientRect(hosted.window, &client);
  CHECK(client.right == 300);
  CHECK(client.bottom == 200);
  // The site offered windowless activation; the control still has its window and says so.
  LRESULT result = -1;
  IOleInPlaceObjectWindowless* windowless = Query<IOleInPlaceObjectWindowless>(hosted.graph.Get());
  CHECK(windowless->OnWindowMessage(WM_MOUSEMOVE, 0, 0, &result) == S_FALSE);
  // The host's resizing reaches the control through the site's rectangles.
  SetWindowPos(hosted.host, nullptr, 0, 0, 420, 260, SWP_NOMOVE | SWP_NOZORDER);
  GetClientRect(hosted.window, &client);
  CHECK(client.right == 420);
  CHECK(client.bottom == 260);
  const RECT position{10, 20, 210, 120};
  CHECK(windowless->SetObjectRects(&position, &position) == S_OK);
  RECT placed{};
  GetWindowRect(hosted.window, &placed);
  MapWindowPoints(nullptr, hosted.host, reinterpret_cast<POINT*>(&placed), 2);
  CHECK(placed.left == 10);
  CHECK(placed.top == 20);
  CHECK(placed.right == 210);
  CHECK(placed.bottom == 120);
  CHECK(windowless->InPlaceDeactivate() == S_OK);
  CHECK_FALSE(IsWindow(hosted.window));
  windowless->Release();
  CHECK(hosted.Finish() == S_OK);
}

TEST_CASE("verbs: UI activation takes the focus, hide and show, and the verbs a control has not") {
  Hosted hosted;
  IOleObject* ole = Query<IOleObject>(hosted.graph.Get());
  IOleClientSite* site = nullptr;
  CHECK(ole->GetClientSite(&site) == S_OK);
  CHECK(site != nullptr);
  RECT position{0, 0, 300, 200};
  CHECK(ole->DoVerb(OLEIVERB_UIACTIVATE, nullptr, site, 0, hosted.host, &position) == S_OK);
  CHECK(GetFocus() == hosted.window);
  CHECK(ole->DoVerb(OLEIVERB_HIDE, nullptr, site, 0, hosted.host, &position) == S_OK);
  CHECK_FALSE(IsWindowVisible(hosted.window));
  CHECK(ole->DoVerb(OLEIVERB_SHOW, nullptr, site, 0, hosted.host, &position) == S_OK);
  CHECK(IsWindowVisible(hosted.window));
  CHECK(ole->DoVerb(OLEIVERB_OPEN, nullptr, site, 0, hosted.host, &position) == OLEOBJ_S_CANNOT_DOVERB_NOW);
  CHECK(ole->DoVerb(OLEIVERB_PROPERTIES, nullptr, site, 0, hosted.host, &position) == E_NOTIMPL);
  CHECK(ole->DoVerb(7, nullptr, site, 0, hosted.host, &position) == OLEOBJ_S_INVALIDVERB);
  CHECK(WindowOf(hosted.graph.Get()) == hosted.window);  // still the one window
  // Closing deactivates: the window goes, the site stays until the host lets it go.
  CHECK(ole->Close(OLECLOSE_NOSAVE) == S_OK);
  CHECK_FALSE(IsWindow(hosted.window));
  site->Release();
  ole->Release();
  CHECK(hosted.Finish() == S_OK);
}

TEST_CASE("the control's own window paints the same picture as IViewObject::Draw, under the library's cursor 203") {
  Hosted hosted;
  Canvas drawn(300, 200);
  REQUIRE(DrawControl(hosted.graph.Get(), drawn) == S_OK);
  Canvas printed(300, 200);
  PrintClient(hosted.window, printed);
  CHECK(printed.SamePixels(drawn));
  CHECK(printed.At(100, 137) == kDaylightColour);
  Canvas windowPrint(300, 200);
  CHECK(PrintWindow(hosted.window, windowPrint.Dc(), 0));
  CHECK(windowPrint.SamePixels(drawn));
  // Erasing is claimed and does nothing: painting covers the client area.
  const COLORREF marker = RGB(0x12, 0x34, 0x56);
  Canvas erased(300, 200, marker);
  CHECK(SendMessageW(hosted.window, WM_ERASEBKGND, reinterpret_cast<WPARAM>(erased.Dc()), 0) != 0);
  CHECK(erased.Count(marker, 0, 0, 300, 200) == 300 * 200);
  const HCURSOR expected = LoadCursorW(hosted.dll.Handle(), MAKEINTRESOURCEW(203));
  REQUIRE(expected != nullptr);
  SetCursor(LoadCursor(nullptr, IDC_ARROW));
  CHECK(SendMessageW(hosted.window, WM_SETCURSOR, reinterpret_cast<WPARAM>(hosted.window),
                     MAKELPARAM(HTCLIENT, WM_MOUSEMOVE)) == TRUE);
  CHECK(GetCursor() == expected);
  CHECK(hosted.Finish() == S_OK);
}

// The readout's arithmetic is in the native graph suite; here the event that carries it.
TEST_CASE("MouseAction reports the time and height under the pointer") {
  Hosted hosted;
  Canvas painted(300, 200);
  PrintClient(hosted.window, painted);  // margins of 8: W = 284
  EventSink sink(DIID__ITidesWindowEvents);
  REQUIRE(sink.Connect(hosted.graph.Get()));
  const std::vector<double>& heights = hosted.port.points;
  const auto move = [&](int x) { return SendMessageW(hosted.window, WM_MOUSEMOVE, 0, MAKELPARAM(x, 100)); };

  struct Move {
    int x;
    int hour, minute;
    std::size_t point;
  };
  const Move moves[] = {
      {150, 12, 0, 12},   // dx 142 = 12 hours exactly; point trunc(142 / 284 * 25) = 12
      {291, 23, 54, 24},  // the last pixel of the plot: 23:54, the last point
  };
  int calls = 0;
  for (const Move& m : moves) {
    CAPTURE(m.x);
    move(m.x);
    REQUIRE(sink.calls == ++calls);
    REQUIRE(sink.lastDoubles.size() == 2);
    CHECK(sink.lastDoubles[0] == doctest::Approx(TimeOf(m.hour, m.minute)).epsilon(1e-12));
    CHECK(sink.lastDoubles[1] == heights[m.point]);
  }
  CHECK(sink.lastId == 1);
  CHECK(sink.lastIidNull);
  CHECK(sink.lastFlags == DISPATCH_METHOD);
  CHECK(sink.lastLocale == LOCALE_USER_DEFAULT);

  // 24:00 and the strip right of the plot: no time of this day, no event. (No reading
  // without points or a port: the native graph suite's readout rules.)
  move(292);
  move(296);
  CHECK(sink.calls == calls);
  sink.Disconnect();
  CHECK(hosted.Finish() == S_OK);
}

TEST_CASE("the pointer readout follows the margins of the last paint") {
  Hosted hosted;
  REQUIRE(hosted.graph.SetDrawText(1) == S_OK);
  Canvas painted(300, 200);
  PrintClient(hosted.window, painted);
  // The plot now starts at the first column of night colour.
  int left = 0;
  while (left < 100 && painted.At(left, 137) != kNightColour) ++left;
  REQUIRE(left > 8);
  EventSink sink(DIID__ITidesWindowEvents);
  REQUIRE(sink.Connect(hosted.graph.Get()));
  SendMessageW(hosted.window, WM_MOUSEMOVE, 0, MAKELPARAM(left, 100));
  REQUIRE(sink.calls == 1);
  CHECK(sink.lastDoubles[0] == doctest::Approx(kDate).epsilon(1e-12));  // dx = 0: 00:00
  const int width = 300 - left - 8;
  SendMessageW(hosted.window, WM_MOUSEMOVE, 0, MAKELPARAM(left + width / 2, 100));
  REQUIRE(sink.calls == 2);
  const int dx = width / 2;
  const int hour = dx * 24 / width;
  const int minute = (dx * 24 - hour * width) * 60 / width;
  CHECK(sink.lastDoubles[0] == doctest::Approx(TimeOf(hour, minute)).epsilon(1e-12));
  CHECK(sink.lastDoubles[1] == hosted.port.points[static_cast<std::size_t>(dx * 25 / width)]);
  sink.Disconnect();
  CHECK(hosted.Finish() == S_OK);
}

TEST_CASE("set-font copies the font; IEmbeddedControl's font slot does the same from a font object") {
  Hosted hosted;
  REQUIRE(hosted.graph.SetDrawText(1) == S_OK);
  HFONT big = CreateFontW(-24, 0, 0, 0, FW_BOLD, FALSE, FALSE, FALSE, DEFAULT_CHARSET, 0, 0, 0, 0, L"Tahoma");
  REQUIRE(big != nullptr);
  // Margins by the font's measures; the plot's left edge is checked just above its bottom
  // (the curve stays in the upper half, no height line there).
  const auto checkPlotLeft = [](const Canvas& canvas, const Layout& layout) {
    const int row = layout.PlotBottom() - 5;
    CAPTURE(layout.left);
    CHECK(canvas.At(layout.left - 1, row) == kFrameColour);
    CHECK(canvas.At(layout.left, row) == kNightColour);
    CAPTURE(layout.bottom);
    CHECK(canvas.At(layout.left + 3, layout.PlotBottom() - 1) == kNightColour);
    CHECK(canvas.At(layout.left + 3, layout.PlotBottom()) == kFrameColour);  // height line 0
  };
  const Layout bigLayout = LabelledLayout(big, "1.00", "0.00");
  const Layout defaultLayout = LabelledLayout(nullptr, "1.00", "0.00");
  const int bigMargin = bigLayout.left;
  const int defaultMargin = defaultLayout.left;
  REQUIRE(bigMargin > defaultMargin);

  SendMessageW(hosted.window, WM_SETFONT, reinterpret_cast<WPARAM>(big), FALSE);
  const HFONT kept = reinterpret_cast<HFONT>(SendMessageW(hosted.window, WM_GETFONT, 0, 0));
  CHECK(kept != nullptr);
  CHECK(kept != big);  // a copy of its own
  DeleteObject(big);   // the caller's font may go: the control draws with its copy
  Canvas withBig(300, 200);
  PrintClient(hosted.window, withBig);
  checkPlotLeft(withBig, bigLayout);

  IEmbeddedControl* embedded = Query<IEmbeddedControl>(hosted.graph.Get());
  FONTDESC description{sizeof(FONTDESC), const_cast<LPOLESTR>(L"Tahoma"), {}, FW_NORMAL, DEFAULT_CHARSET,
                       FALSE, FALSE, FALSE};
  description.cySize.int64 = 20 * 10000;  // 20 points
  IFont* font = nullptr;
  REQUIRE(OleCreateFontIndirect(&description, IID_IFont, reinterpret_cast<void**>(&font)) == S_OK);
  HFONT objectFont = nullptr;
  REQUIRE(font->get_hFont(&objectFont) == S_OK);
  const Layout objectLayout = LabelledLayout(objectFont, "1.00", "0.00");
  CHECK(embedded->SetFont(0, font, 0) == S_OK);
  Canvas withObjectFont(300, 200);
  PrintClient(hosted.window, withObjectFont);
  checkPlotLeft(withObjectFont, objectLayout);
  font->Release();
  // No font object: back to the platform's default GUI font.
  CHECK(embedded->SetFont(0, nullptr, 0) == S_OK);
  CHECK(SendMessageW(hosted.window, WM_GETFONT, 0, 0) == 0);
  Canvas withDefault(300, 200);
  PrintClient(hosted.window, withDefault);
  checkPlotLeft(withDefault, defaultLayout);
  embedded->Release();
  CHECK(hosted.Finish() == S_OK);
}

TEST_CASE("created by its programmatic identifier in Wine's ATL host, it takes a port and goes with the host") {
  DllUnderTest dll;
  AtlHost atl;
  REQUIRE(atl.WinInit());
  FakeTidesPort port;
  port.points = CosineDay();
  HWND host = AtlHost::MakeWindow(300, 200);
  IUnknown* site = nullptr;
  IUnknown* control = nullptr;
  REQUIRE(atl.CreateEx(L"BR_Info.TidesWindow", host, &site, &control) == S_OK);
  REQUIRE(control != nullptr);
  ITidesWindow* hosted = Query<ITidesWindow>(control);
  const HWND window = WindowOf(control);
  CHECK(GetParent(window) == host);
  REQUIRE(hosted->SetPort(&port) == S_OK);
  Canvas printed(300, 200);
  PrintClient(window, printed);
  CHECK(printed.Count(kCurveColour, 0, 0, 300, 200) > 284);  // the port's day is drawn

  DestroyWindow(host);
  CHECK_FALSE(IsWindow(window));
  hosted->Release();
  control->Release();
  ReleaseAndNull(site);
  CHECK(port.References() == 0);
  CHECK(dll.CanUnloadNow() == S_OK);
}
