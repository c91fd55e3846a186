#include <doctest/doctest.h>

#include <array>
#include <string>
#include <vector>

#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/FlowLayout.h"
#include "toolkit/layout/GridLayout.h"
#include "toolkit/layout/LayoutEngine.h"
#include "toolkit/layout/SplitterLayout.h"
#include "toolkit/layout/TabLayout.h"

using namespace toolkit;

namespace {

struct Child {
  Size pref;
  std::string position;
  bool present = true;
  bool choice = false;
  int choiceHeight = 0;
  Rect bounds;
  bool visible = true;
  int placements = 0;
};

class Items : public LayoutItems {
public:
  std::vector<Child> children;

  Child& add(int w, int h, const char* position = "") {
    Child c;
    c.pref = Size{w, h};
    c.position = position;
    children.push_back(c);
    return children.back();
  }
  Rect at(int i) const { return children[i].bounds; }

  int count() const override { return static_cast<int>(children.size()); }
  bool isPresent(int i) const override { return children[i].present; }
  Size preferredSize(int i) override { return children[i].pref; }
  Size preferredSizeIn(int i, const Rect&) override {
    return Size{children[i].pref.width, children[i].choiceHeight};
  }
  bool keepsOwnHeight(int i) const override { return children[i].choice; }
  std::string position(int i) const override { return children[i].position; }
  Rect bounds(int i) const override { return children[i].bounds; }
  void place(int i, int x, int y, int w, int h) override {
    children[i].bounds = Rect{x, y, x + w, y + h};
    ++children[i].placements;
  }
  void show(int i, bool visible) override { children[i].visible = visible; }
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

TEST_CASE("flow: rows of common cells, wrapping, alignment") {
  Items items;
  for (int i = 0; i < 3; ++i) items.add(30, 20);
  FlowLayout flow(0, 3, 3, false);  // left aligned, common width
  LayoutEngine engine(items, flow);

  Size used = engine.layoutFlow(Rect{0, 0, 100, 50}, 30, 20, 0, true);
  CheckBounds(items, {{0, 0, 30, 20}, {33, 0, 30, 20}, {66, 0, 30, 20}});
  CHECK(used == Size{99, 23});

  // 70 pixels take two cells per row; the third starts a row vgap + cell lower.
  used = engine.layoutFlow(Rect{0, 0, 70, 50}, 30, 20, 0, true);
  CheckBounds(items, {{0, 0, 30, 20}, {33, 0, 30, 20}, {0, 23, 30, 20}});
  CHECK(used == Size{66, 46});

  // Right alignment: x = r - rowWidth (a centred row: the Wine doc-example suite's button row).
  engine.layoutFlow(Rect{10, 0, 200, 50}, 30, 20, kAlignRight, true);
  CHECK(items.at(0).left == 200 - 99);

  // Without placing, nothing moves.
  items.children[0].placements = 0;
  engine.layoutFlow(Rect{0, 0, 100, 50}, 30, 20, 0, false);
  CHECK(items.children[0].placements == 0);
}

TEST_CASE("flow: a row that cannot fit its first child still holds it") {
  Items items;
  items.add(200, 10);
  items.add(200, 10);
  FlowLayout flow(0, 3, 3, false);
  LayoutEngine engine(items, flow);
  engine.layOut(Rect{0, 0, 100, 100});
  CheckBounds(items, {{0, 0, 200, 10}, {0, 13, 200, 10}});
}

TEST_CASE("flow: own widths, the row break still uses the cell width; absent children skipped") {
  Items items;
  items.add(10, 5);
  items.add(40, 8).present = false;
  items.add(30, 12);
  items.add(20, 6);
  FlowLayout flow(0, 2, 4, true);
  LayoutEngine engine(items, flow);
  // cellWidth 30: in 70 pixels two cells fit (x 0 -> 32 -> 64, 64 + 30 > 70).
  Size used = engine.layoutFlow(Rect{0, 0, 70, 100}, 30, 12, 0, true);
  CHECK(items.children[1].placements == 0);
  CheckBounds(items, {{0, 0, 10, 12}, {0, 0, 0, 0}, {12, 0, 30, 12}, {0, 16, 20, 12}});
  CHECK(used == Size{(2 + 10) + (2 + 30), 2 * (4 + 12)});

  // Preferred size: n * (hgap + cellWidth) by the largest height.
  CHECK(engine.preferredSize() == Size{3 * (2 + 30), 12});
}

TEST_CASE("flow: a drop-down list keeps its own height") {
  Items items;
  items.add(30, 20);
  Child& list = items.add(50, 22);
  list.choice = true;
  list.choiceHeight = 150;
  FlowLayout flow(0, 0, 0, true);
  LayoutEngine(items, flow).layOut(Rect{0, 0, 300, 40});
  CHECK(items.at(0).height() == 22);
  CHECK(items.at(1) == xywh(30, 0, 50, 150));
}

TEST_CASE("border: a lone lower-case center child gets the area less the empty regions' gaps") {
  Items items;
  items.add(50, 40, "center");
  BorderLayout border(5, 7);
  LayoutEngine engine(items, border);
  engine.layOut(Rect{0, 0, 200, 100});
  CHECK(items.at(0) == xywh(5, 7, 190, 86));
  // Preferred size counts the gaps of the empty regions too.
  CHECK(engine.preferredSize() == Size{50 + 2 * 5, 40 + 2 * 7});
}

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
  // The five regions' places are the Wine layout suite's; an unknown position is not placed.
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

  // Larger than the area: it fills the area instead.
  items.children[3].pref = Size{500, 500};
  engine.layOut(Rect{0, 0, 200, 100});
  CHECK(items.at(3) == xywh(30, 0, 170, 100));
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

TEST_CASE("grid: percentages parse at blanks, commas and semicolons") {
  std::string many;
  for (int i = 1; i <= 25; ++i) many += std::to_string(i) + ";";
  const struct {
    int columns;
    std::string text;
    int column, percent;
  } rows[] = {{2, "35,65", 2, 0},         {4, "10 20;30,,40", 3, 40}, {2, "abc;50x", 0, 0},
              {2, "abc;50x", 1, 50},       {25, many, 19, 20},         {1, "99999999999999999999", 0, 0x7fffffff}};
  for (const auto& r : rows) {
    CAPTURE(r.text);
    CHECK(GridLayout(1, r.columns, 0, 0, r.text.c_str()).columnPercent[r.column] == r.percent);
  }
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

TEST_CASE("grid: 0 x 0 behaves as 1 x 1") {
  Items items;
  items.add(15, 25);
  items.add(40, 50);
  GridLayout grid(0, 0, 0, 0, nullptr, 68);
  LayoutEngine engine(items, grid);
  engine.layOut(Rect{0, 0, 120, 80});
  CHECK(items.at(0) == xywh(0, 0, 120, 80));
  // The preferred size counts the rows there are: one row of one child.
  CHECK(engine.preferredSize() == Size{40, 50});
}

TEST_CASE("tabs: index -1 hides every child and prefers (0, 0)") {
  Items items;
  for (int i = 0; i < 3; ++i) items.add(50, 60);
  TabLayout tabs;
  tabs.selectedIndex = -1;
  LayoutEngine engine(items, tabs);
  engine.layOut(Rect{0, 0, 100, 80});
  for (const Child& c : items.children) {
    CHECK_FALSE(c.visible);
    CHECK(c.bounds == xywh(0, 0, 100, 80));  // hidden pages still get a size once
  }
  CHECK(engine.preferredSize() == Size{0, 0});
}

TEST_CASE("tabs: the selected child fills the area and is the only one shown") {
  Items items;
  items.add(50, 60);
  items.add(70, 20);
  items.add(30, 90);
  items.children[2].bounds = xywh(1, 1, 5, 5);  // already sized: left where it is
  TabLayout tabs;
  tabs.selectedIndex = 1;
  LayoutEngine engine(items, tabs);
  engine.layOut(Rect{4, 4, 104, 84});
  CHECK((!items.children[0].visible && items.children[1].visible && !items.children[2].visible));
  CheckBounds(items, {{4, 4, 100, 80}, {4, 4, 100, 80}, {1, 1, 5, 5}});

  CHECK(engine.preferredSize() == Size{70, 90});
  tabs.preferredOfAll = 0;
  CHECK(engine.preferredSize() == Size{70, 20});
  tabs.selectedIndex = 7;
  CHECK(engine.preferredSize() == Size{0, 0});

  Items single;
  single.add(5, 5).visible = false;
  TabLayout one;
  LayoutEngine(single, one).layOut(Rect{0, 0, 40, 30});
  CHECK((single.children[0].visible && single.at(0) == xywh(0, 0, 40, 30)));
}

TEST_CASE("splitter: four children, only the first three are placed") {
  Items items;
  for (int i = 0; i < 4; ++i) items.add(20, 30);
  SplitterLayout split(kSplitSideBySide, 4);
  split.splitNumerator = 1;
  split.splitDenominator = 4;
  LayoutEngine engine(items, split);
  engine.layOut(Rect{0, 0, 400, 100});
  // first = 1 * 400 / 4 - 4 / 2 = 98; each later pane starts gap + first further on.
  CheckBounds(items, {{0, 0, 98, 100}, {102, 0, 298, 100}, {204, 0, 196, 100}});
  CHECK(items.children[3].placements == 0);
  CHECK(engine.layoutSplitter(Rect{0, 0, 400, 100}, kSplitSideBySide, false) == Size{60, 30});
}

// The unset split and initialising it are the Wine layout suite's (through the container).
TEST_CASE("splitter: stacked preferred size; one pane fills the area") {
  Items items;
  items.add(60, 40);
  items.add(100, 70);
  SplitterLayout split(kSplitStacked, 10);
  LayoutEngine engine(items, split);
  // Extents summed along the axis plus one gap, the largest across.
  CHECK(engine.preferredSize() == Size{100, 40 + 70 + 10});

  Items lone;
  lone.add(10, 10);
  SplitterLayout one(kSplitSideBySide, 8);
  LayoutEngine(lone, one).layOut(Rect{0, 0, 90, 30});
  CHECK(lone.at(0) == xywh(0, 0, 90, 30));
}

TEST_CASE("no children, no present children, or an unknown layout: nothing placed, (0, 0)") {
  Items items;
  BorderLayout border(3, 3);
  LayoutEngine engine(items, border);
  CHECK(engine.preferredSize() == Size{0, 0});
  CHECK(engine.preferredSizeIn(Rect{0, 0, 100, 100}) == Size{0, 0});
  engine.layOut(Rect{0, 0, 100, 100});

  items.add(10, 10, "Center").present = false;
  CHECK(engine.preferredSize() == Size{0, 0});
  engine.layOut(Rect{0, 0, 100, 100});
  CHECK(items.children[0].placements == 0);

  // Negative remaining space never gives a negative size.
  Items crowded;
  crowded.add(10, 80, "North");
  crowded.add(10, 80, "South");
  crowded.add(10, 10, "Center");
  BorderLayout tight(0, 10);
  LayoutEngine(crowded, tight).layOut(Rect{0, 0, 50, 100});
  CHECK(crowded.at(2).height() == 0);
}
