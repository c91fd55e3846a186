// Layouts moving real child windows (the arithmetic itself is the native layout suite's):
// every placement is read back from the child windows' rectangles.
#include <doctest/doctest.h>

#include <memory>
#include <vector>

#include "ToolkitTestSupport.h"
#include "toolkit/core/Panel.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/GridLayout.h"

using namespace toolkit;
using namespace tktest;

namespace {

// A root panel of the given size under a host window, with probe children.
struct Tree {
  HostWindow host{600, 400};
  Panel root;
  std::vector<std::unique_ptr<Probe>> kids;

  Tree(std::unique_ptr<Layout> layout, int width, int height) : root(std::move(layout)) {
    REQUIRE(root.create(host.hwnd()));
    root.setBounds(0, 0, width, height, true, true);
  }
  ~Tree() {
    for (auto& k : kids) root.removeComponent(k.get(), false);
  }
  Probe& add(int w, int h, const char* position = nullptr, Container* into = nullptr) {
    kids.push_back(std::make_unique<Probe>());
    Probe& p = *kids.back();
    p.pref = SIZE{w, h};
    (into ? into : &root)->insertNamed(position, &p, nullptr);
    return p;
  }
};

#define CHECK_PLACED(component, x, y, w, h) CHECK(str(placed(component)) == str(xywh(x, y, w, h)))

}  // namespace

// Region arithmetic is the native layout suite's; the documented example places a border tree of real windows.
TEST_CASE("insets shrink the area; nested visible containers are laid out in the same pass") {
  Tree t(std::make_unique<BorderLayout>(), 400, 300);
  t.root.setInsets(10, 20, 30, 40);
  auto* side = new Panel(std::make_unique<GridLayout>(2, 1, 0, 0, nullptr, 68));
  t.root.insertNamed("West", side, "side");
  side->setInsets(5, 5, 5, 5);
  Probe& top = t.add(50, 10, nullptr, side);
  Probe& bottom = t.add(80, 10, nullptr, side);
  auto* hiddenBox = new Panel(std::make_unique<GridLayout>(1, 1, 0, 0, nullptr, 68));
  t.root.insertNamed("Center", hiddenBox, "box");
  Probe& inHidden = t.add(10, 10, nullptr, hiddenBox);
  hiddenBox->show(false);

  t.root.doLayout();
  // West region: as wide as the side panel prefers (grid: 1 * (0 + 80) + insets 10).
  SIZE sidePref = side->getPreferredSize();
  CHECK(str(sidePref) == "90x30");
  CHECK_PLACED(*side, 10, 20, 90, 240);
  CHECK_PLACED(top, 5, 5, 80, 115);
  CHECK_PLACED(bottom, 5, 120, 80, 115);
  CHECK_PLACED(*hiddenBox, 100, 20, 270, 240);
  CHECK_PLACED(inHidden, 0, 0, 0, 0);  // an invisible container is not recursed into

  // The container's preferred size in a rectangle works inside it less the insets.
  SIZE in = t.root.getPreferredSizeIn(RECT{0, 0, 400, 300});
  CHECK(str(in) == str(SIZE{10 + 30 + 90 + 270, 20 + 40 + 240}));

  t.root.removeComponent(side, true);
  t.root.removeComponent(hiddenBox, true);
}

TEST_CASE("nothing is laid out without a layout, children or a client area") {
  Tree t(std::make_unique<GridLayout>(1, 1), 100, 100);
  Probe& a = t.add(10, 10);
  a.setBounds(3, 3, 7, 7, true, true);
  t.root.setBounds(0, 0, 0, 100, true, true);
  t.root.doLayout();
  CHECK_PLACED(a, 3, 3, 7, 7);
  t.root.setBounds(0, 0, 100, 100, true, true);
  t.root.setLayout(nullptr);
  t.root.doLayout();
  CHECK_PLACED(a, 3, 3, 7, 7);
  SIZE pref = t.root.getPreferredSize();
  CHECK(pref.cx == 0);

  Panel empty;
  empty.setInsets(4, 4, 4, 4);
  SIZE none = empty.getPreferredSize();
  CHECK(str(none) == "0x0");
  empty.doLayout();
}

TEST_CASE("a batch the platform refuses falls back to immediate moves for the rest of the pass") {
  Tree t(std::make_unique<GridLayout>(1, 3, 0, 0, nullptr, 68), 300, 60);
  Probe& a = t.add(10, 10);
  Probe& b = t.add(10, 10);
  Probe& c = t.add(10, 10);
  HDWP stale = BeginDeferWindowPos(3);
  REQUIRE(stale != nullptr);
  EndDeferWindowPos(stale);  // freed: DeferWindowPos refuses it
  t.root.layoutStep(stale);
  CHECK(stale == nullptr);
  CHECK_PLACED(a, 0, 0, 100, 60);
  CHECK_PLACED(b, 100, 0, 100, 60);
  CHECK_PLACED(c, 200, 0, 100, 60);
}
