// XContoursView against a misbehaving host: each operation of the stand-in chart host that
// SetContoursData calls, failing or answering wrongly with success. Each row names the
// operation and kind and whether the view is still drawn; every call answers S_OK, paints
// (grey when the read failed), writes no log line and keeps none of the host's wrappers.
#include "tests/wine/common/Canvas.h"
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/FaultSweep.h"
#include "tests/wine/common/SceneClient.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/registry_test_support.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <cstdio>
#include <set>
#include <string>

using namespace br::test;

namespace {

constexpr int kWidth = 120, kHeight = 100;

// The operations, and the kinds after which the view still draws its bands: a colour map
// that claims success without an index leaves index 0, which the view cannot tell apart.
struct Row {
  const char* operation;
  std::set<int> drawn;
};

const Row kRows[] = {
    {"IPresParams.GetParam", {}},
    {"IColorMap.GetPaletteIndex", {3}},
};

}  // namespace

TEST_CASE("every host operation of SetContoursData failing or answering wrongly") {
  SavedRegistryValue logMask{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine", "LogBRCL"};
  SavedRegistryValue logFile{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine", "LogFileBRCL"};
  ScratchFolder folder;
  const std::string log = folder / "brcl.log";
  logFile.SetString(log);
  logMask.SetDword(1);
  SceneProbe probe;
  FaultSweep sweep(probe);
  {
    DllUnderTest dll;
    SceneClient scene;
    REQUIRE(scene.Load(SceneClient::SamplePath()) == S_OK);
    auto params = scene.Component(L"PresParams", L"four-shades");
    auto map = scene.Component(L"ColorMap", L"day");
    const long palette = scene.Palette(L"day");

    // Draws a fresh view after one SetContoursData; its result goes to result.
    const auto draw = [&](Canvas& canvas, bool withData, HRESULT& result) {
      ComRef<IXContoursView> view;
      REQUIRE(dll.Create(CLSID_XContoursView, IID_IXContoursView, view.OutVoid()) == S_OK);
      REQUIRE(view->put_Palette(palette) == S_OK);
      result = withData ? view->SetContoursData(params.Get(), map.Get(), 10.0) : view->SetContoursData(nullptr, nullptr, 0);
      CHECK(DrawControl(view.Get(), canvas) == S_OK);
    };
    Canvas grey(kWidth, kHeight), bands(kWidth, kHeight);
    HRESULT result = E_FAIL;
    draw(grey, false, result);
    CHECK(result == S_FALSE);
    draw(bands, true, result);
    CHECK(result == S_OK);
    REQUIRE(!bands.SamePixels(grey));

    const auto held = sweep.Held();
    for (const Row& row : kRows) {
      const std::string operation = row.operation;
      for (const FaultKind& kind : kFaultKinds) {
        const std::string what = operation + ", " + kind.name;
        INFO(what);
        Canvas picture(kWidth, kHeight);
        result = E_FAIL;
        const bool reached = sweep.Run(row.operation, kind, [&] { draw(picture, true, result); });
        CHECK(result == S_OK);
        if (!reached) continue;
        if (row.drawn.count(kind.misanswer)) {
          CHECK(!picture.SamePixels(grey));
        } else {
          CHECK(picture.SamePixels(grey));
        }
        CHECK(FaultSweep::Changes(held, sweep.Held()) == "");
      }
    }
    // GetParam: failing, a wrong type, a wrong shape, no value, a long text; the colour
    // map's index: failing, no value.
    CHECK(sweep.Reached() == 5 + 2);
    std::printf("%s\n", sweep.Summary("XContoursView", sizeof kRows / sizeof kRows[0]).c_str());
    CHECK(ReadWholeFile(log).find("ERR: ") == std::string::npos);  // nothing is reported
    params.Reset();
    map.Reset();
    CHECK(dll.CanUnloadNow() == S_OK);
  }
}
