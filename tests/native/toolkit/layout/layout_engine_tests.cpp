#include <doctest/doctest.h>

#include <array>
#include <string>
#include <vector>

#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/GridLayout.h"
#include "toolkit/layout/LayoutEngine.h"
#include "toolkit/layout/SplitterLayout.h"

using namespace toolkit;

namespace {

struct Child {
  Size pref;
  std::string position;
  Rect bounds;
  int placements = 0;
};

class Items : public LayoutItems {
public:
  std::vector<Child> children;

  void add(int w, int h, const char* position = "") { children.push_back(Child{Size{w, h}, position, Rect{}, 0}); }
  Rect at(int i) const { return children[i].bounds; }

  int count() const override { return static_cast<int>(children.size()); }
  bool isPresent(int) const override { return true; }
  Size preferredSize(int i) override { return children[i].pref; }
  Size preferredSizeIn(int i, const Rect&) override { return children[i].pref; }
  bool keepsOwnHeight(int) const override { return false; }
  std::string position(int i) const override { return children[i].position; }
  Rect bounds(int i) const override { return children[i].bounds; }
  void place(int i, int x, int y, int w, int h) override {
    children[i].bounds = Rect{x, y, x + w, y + h};
    ++children[i].placements;
  }
  void show(int, bool) override {}
};

Rect xywh(int x, int y, int w, int h) { return Rect{x, y, x + w, y + h}; }

// The children's bounds, in order, against {x, y, w, h} rows.
void CheckBounds(const Items& items, std::initializer_list<std::array<int, 4>> expected) {
  int i = 0;
  for (const auto& e : expected) {
    CAPTURE(i);
    CHECK(items.at(i++) == xywh(e[0], e[1], e[2], e[3]));
  }
}

}  // namespace

TEST_CASE("border: all five regions shrink the rectangle in order") {
  Items items;
  items.add(10, 20, "North");
  items.add(10, 15, "South");
  items.add(30, 10, "West");
  items.add(40, 10, "East");
  items.add(25, 35, "Center");
  items.add(99, 99, "Nowhere");
  BorderLayout border(2, 3);
  LayoutEngine engine(items, border);
  engine.layOut(Rect{0, 0, 300, 200});
  // An unknown position is not placed.
  CHECK(items.children[5].placements == 0);

  // width = max(N.w, S.w, W.w + C.w + 2 hgap + E.w); height = N.h + S.h + 2 vgap + max(W.h, E.h, C.h)
  // with West/East heights summing vgap + pref height and North/South widths hgap + pref width.
  CHECK(engine.preferredSize() == Size{30 + 25 + 4 + 40, 20 + 15 + 6 + 35});

  // In a rectangle: N.w + (hgap + W.w) + (hgap + E.w) + (hgap + C.w), N.h + (vgap + S.h) + (vgap + C.h).
  Size in = engine.preferredSizeIn(Rect{0, 0, 300, 200});
  CHECK(in == Size{300 + 32 + 42 + 2 + 226, 20 + 18 + 3 + 159});
  CHECK(items.at(4) == xywh(32, 23, 226, 159));
}

TEST_CASE("border: West children stack in equal shares; a centred Center child") {
  Items items;
  items.add(20, 5, "West");
  items.add(30, 5, "West");
  items.add(30, 5, "West");
  items.add(60, 40, "Center");
  BorderLayout border(0, 0, true);
  LayoutEngine engine(items, border);
  engine.layOut(Rect{0, 0, 200, 100});
  // Remaining 170 x 100: Center centred at its preferred size.
  CheckBounds(items, {{0, 0, 30, 33}, {0, 33, 30, 33}, {0, 66, 30, 33}, {85, 30, 60, 40}});
}

TEST_CASE("grid: column percentages \"25;75\" in 400 pixels give 100 and 300") {
  Items items;
  items.add(10, 10);
  items.add(10, 10);
  GridLayout grid(1, 2, 0, 0, "25;75", 68);
  LayoutEngine engine(items, grid);
  Size used = engine.layoutGrid(Rect{0, 0, 400, 50}, true);
  CheckBounds(items, {{0, 0, 100, 50}, {100, 0, 300, 50}});
  CHECK(used == Size{400, 50});
}

TEST_CASE("grid: gaps, equal shares and row heights by mode") {
  Items items;
  items.add(10, 10);
  items.add(10, 30);
  items.add(10, 20);
  GridLayout grid(2, 2, 4, 6, nullptr, 0);  // rows as high as their tallest child
  LayoutEngine engine(items, grid);
  engine.layOut(Rect{0, 0, 200, 100});
  CheckBounds(items, {{2, 3, 96, 24}, {102, 3, 96, 24}, {2, 33, 96, 14}});
  // Rows: 2 * (hgap + cellWidth) wide; heights 30 and 20.
  CHECK(engine.preferredSize() == Size{2 * (4 + 10), 30 + 20});

  grid.mode = 68;  // equal rows of H / rows
  engine.layOut(Rect{0, 0, 200, 100});
  CHECK(items.at(2) == xywh(2, 53, 96, 44));
  CHECK(engine.preferredSize() == Size{2 * (4 + 10), 30 + 30});
}


// Regression: an unset split (0 / 0) shares the extent instead of dividing by zero.
TEST_CASE("splitter: a set split places the first pane; an unset one shares the extent") {
  Items items;
  for (int i = 0; i < 2; ++i) items.add(20, 30);
  SplitterLayout split(kSplitSideBySide, 4);
  LayoutEngine(items, split).layOut(Rect{0, 0, 400, 100});
  CheckBounds(items, {{0, 0, 198, 100}, {202, 0, 198, 100}});
  split.splitNumerator = 1;  // first = 1 * 400 / 4 - 4 / 2
  split.splitDenominator = 4;
  LayoutEngine(items, split).layOut(Rect{0, 0, 400, 100});
  CheckBounds(items, {{0, 0, 98, 100}, {102, 0, 298, 100}});
}
