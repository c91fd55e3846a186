// TidesWindow's automation interface: SetPort, Calculate, SetScale and Property.
#include "tests/wine/controls/graph_test_support.h"

#include <doctest/doctest.h>

#include <string>

using namespace br::test;

namespace {

VARIANT Get(ITidesWindow* window, TW_PROPERTY code) {
  VARIANT value;
  VariantInit(&value);
  REQUIRE(window->get_Property(code, &value) == S_OK);
  return value;
}

std::wstring FormatOf(ITidesWindow* window) {
  VARIANT value = Get(window, TW_FORMATTEXT);
  REQUIRE(value.vt == VT_BSTR);
  std::wstring text(value.bstrVal, SysStringLen(value.bstrVal));
  VariantClear(&value);
  return text;
}

long DrawTextOf(ITidesWindow* window) {
  VARIANT value = Get(window, TW_DRAWTEXT);
  REQUIRE(value.vt == VT_I4);
  return value.lVal;
}

}  // namespace

TEST_CASE("Property: TW_DRAWTEXT 1 and %.2f at first; VT_I2 sign-extended, VT_UI1 zero-extended") {
  DllUnderTest dll;
  GraphControl graph(dll);
  CHECK(DrawTextOf(graph.Get()) == 1);
  CHECK(FormatOf(graph.Get()) == L"%.2f");
  VARIANT v;
  VariantInit(&v);
  v.vt = VT_UI1;
  v.bVal = 255;
  CHECK(graph->put_Property(TW_DRAWTEXT, v) == S_OK);
  CHECK(DrawTextOf(graph.Get()) == 255);
  v.vt = VT_I2;
  v.iVal = -1;
  CHECK(graph->put_Property(TW_DRAWTEXT, v) == S_OK);
  CHECK(DrawTextOf(graph.Get()) == -1);
  CHECK(graph.SetDrawText(0) == S_OK);
  CHECK(DrawTextOf(graph.Get()) == 0);
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

// Other types and codes are refused in the boundary suite; the unsafe formats stay here
// too, with the previous format kept.
TEST_CASE("TW_FORMATTEXT keeps one floating conversion and refuses anything else") {
  DllUnderTest dll;
  GraphControl graph(dll);
  CHECK(graph.SetFormat(L"%.1f m") == S_OK);
  CHECK(FormatOf(graph.Get()) == L"%.1f m");
  CHECK(graph.SetFormat(L"") == S_OK);  // empty selects the default
  CHECK(FormatOf(graph.Get()) == L"%.2f");
  CHECK(graph.SetFormat(L"%+08.3e%%") == S_OK);
  // Which formats are unsafe is the native label-format suite's; here the refusal keeps the last.
  for (const wchar_t* bad : {L"%n", L"%.2f %.2f"}) {
    CAPTURE(std::wstring(bad));
    CHECK(graph.SetFormat(bad) == E_INVALIDARG);
    CHECK(FormatOf(graph.Get()) == L"%+08.3e%%");
  }
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("SetPort: S_FALSE for null, E_INVALIDARG for a non-port, the old port released") {
  DllUnderTest dll;
  FakeTidesPort first;
  FakeTidesPort second;
  NotAPort stranger;
  GraphControl graph(dll);
  CHECK(graph->SetPort(&first) == S_OK);
  CHECK(first.References() == 1);
  CHECK(graph->SetPort(&second) == S_OK);
  CHECK(first.References() == 0);
  CHECK(second.References() == 1);
  CHECK(graph->SetPort(&stranger) == E_INVALIDARG);
  CHECK(second.References() == 0);
  CHECK(stranger.References() == 0);
  // No port now: Calculate forwards nothing and still answers S_OK.
  CHECK(graph->Calculate(1.0, 45000.0) == S_OK);
  CHECK(graph->SetPort(&first) == S_OK);
  CHECK(graph->SetPort(nullptr) == S_FALSE);
  CHECK(first.References() == 0);
  CHECK(first.calculateCalls == 0);
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("Calculate forwards step and date to the port; SetScale 0 keeps the automatic scale") {
  DllUnderTest dll;
  FakeTidesPort port;
  port.points = CosineDay();
  GraphControl graph(dll);
  REQUIRE(graph->SetPort(&port) == S_OK);
  CHECK(graph->Calculate(0.25, 45123.75) == S_OK);
  CHECK(port.calculateCalls == 1);
  CHECK(port.lastStep == 0.25);
  CHECK(port.lastDate == 45123.75);

  REQUIRE(graph.SetDrawText(0) == S_OK);
  Canvas automatic(300, 200);
  REQUIRE(DrawControl(graph.Get(), automatic) == S_OK);
  CHECK(graph->SetScale(0.0, -1.0) == S_OK);  // Min is ignored while Max is 0
  Canvas stillAutomatic(300, 200);
  REQUIRE(DrawControl(graph.Get(), stillAutomatic) == S_OK);
  CHECK(automatic.SamePixels(stillAutomatic));
  CHECK(graph->SetScale(2.0, -1.0) == S_OK);
  Canvas fixed(300, 200);
  REQUIRE(DrawControl(graph.Get(), fixed) == S_OK);
  CHECK_FALSE(fixed.SamePixels(automatic));
  graph.Release();
  CHECK(port.References() == 0);
  CHECK(dll.CanUnloadNow() == S_OK);
}
