// Layouts moving real child windows (the arithmetic itself is the native layout suite's, a border tree
// of real windows the documented example's): placements read back from the child windows.
#include <doctest/doctest.h>

#include "tests/wine/common/toolkit_test_support.h"
#include "toolkit/core/Panel.h"
#include "toolkit/layout/GridLayout.h"

using namespace toolkit;
using namespace tktest;

TEST_CASE("a batch the platform refuses falls back to immediate moves for the rest of the pass") {
  HostWindow host{600, 400};
  Panel root(std::make_unique<GridLayout>(1, 3, 0, 0, nullptr, 68));
  REQUIRE(root.create(host.hwnd()));
  root.setBounds(0, 0, 300, 60, true, true);
  Probe kids[3];
  for (Probe& k : kids) root.add(&k);
  HDWP stale = BeginDeferWindowPos(3);
  REQUIRE(stale != nullptr);
  EndDeferWindowPos(stale);  // freed: DeferWindowPos refuses it
  root.layoutStep(stale);
  CHECK(stale == nullptr);
  for (int i = 0; i < 3; ++i) CHECK(str(placed(kids[i])) == str(xywh(100 * i, 0, 100, 60)));
  for (Probe& k : kids) root.removeComponent(&k, false);
}
