#pragma once
// The arithmetic of the five layouts, over a container's children. The container
// picks the algorithm by its layout's class; every placement goes to
// LayoutItems::place, which the container turns into a deferred window move.
//
// Rectangles given here are already less the container's insets, and sizes
// answered here do not include them: the container adds its insets.

#include <vector>

#include "toolkit/base/geometry.h"
#include "toolkit/layout/Layout.h"
#include "toolkit/layout/LayoutItems.h"

namespace toolkit {

class LayoutEngine {
public:
  struct Measure {
    int count = 0;
    int maxWidth = 0;   // cellWidth when taken over all children
    int maxHeight = 0;  // cellHeight likewise
    int sumWidth = 0;
    int sumHeight = 0;
  };
  struct BorderSizes {
    Size north, south, west, east, center;
  };

  LayoutEngine(LayoutItems& items, Layout& layout);

  // Index of the layout's class among Flow, Border, Grid, Tab, Splitter; -1 otherwise.
  int kind() const;

  // The present children, or only those whose position names `region` (ignoring case).
  Measure measure(const char* region = nullptr);

  // (0, 0) without children. With `initializeSplit`, a SplitterLayout's ratio is set
  // from the first two panes' preferred extents.
  Size preferredSize(bool initializeSplit = false);
  Size preferredSizeIn(const Rect& area);

  // Places every child by the layout's class.
  void layOut(const Rect& area);

  Size layoutFlow(const Rect& area, int cellWidth, int cellHeight, int alignment, bool place);
  Size layoutBorderRegion(const Rect& area, int region, bool place);
  BorderSizes layoutBorder(const Rect& area, bool place);
  Size layoutGrid(const Rect& area, bool place);
  Size layoutTabs(const Rect& area);
  Size layoutSplitter(const Rect& area, int orientation, bool place);

private:
  Size preferredBorderSize();
  Size preferredGridSize(const Measure& all);
  Size preferredTabSize(const Measure& all);
  Size preferredSplitterSize(bool initializeSplit);
  std::vector<int> presentChildren(const char* region = nullptr) const;
  void placeChild(int index, int x, int y, int width, int height);

  LayoutItems& items_;
  Layout& layout_;
};

}  // namespace toolkit
