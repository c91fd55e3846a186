#include "toolkit/layout/LayoutEngine.h"

#include <algorithm>
#include <cstdint>

#include "toolkit/base/class_records.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/GridLayout.h"
#include "toolkit/layout/TabLayout.h"

namespace toolkit {

namespace {

enum Kind { kFlow = 0, kBorder = 1, kGrid = 2, kTab = 3, kSplitter = 4 };

bool equalsIgnoringCase(const std::string& a, const char* b) {
  size_t i = 0;
  for (; i < a.size() && b[i]; ++i) {
    char x = a[i], y = b[i];
    if (x >= 'A' && x <= 'Z') x = static_cast<char>(x - 'A' + 'a');
    if (y >= 'A' && y <= 'Z') y = static_cast<char>(y - 'A' + 'a');
    if (x != y) return false;
  }
  return i == a.size() && b[i] == '\0';
}

int atLeastOne(std::int32_t n) { return n > 0 ? n : 1; }

// a * b / c without overflowing 32 bits on the way; c must not be 0.
int scale(std::int64_t a, std::int64_t b, std::int64_t c) {
  std::int64_t v = a * b / c;
  return static_cast<int>(std::clamp<std::int64_t>(v, INT32_MIN, INT32_MAX));
}

}  // namespace

LayoutEngine::LayoutEngine(LayoutItems& items, Layout& layout) : items_(items), layout_(layout) {}

int LayoutEngine::kind() const {
  return whichOf(&layout_, &records::FlowLayout, &records::BorderLayout, &records::GridLayout,
                 &records::TabLayout, &records::SplitterLayout);
}

std::vector<int> LayoutEngine::presentChildren(const char* region) const {
  std::vector<int> present;
  const int n = items_.count();
  for (int i = 0; i < n; ++i) {
    if (!items_.isPresent(i)) continue;
    if (region && !equalsIgnoringCase(items_.position(i), region)) continue;
    present.push_back(i);
  }
  return present;
}

LayoutEngine::Measure LayoutEngine::measure(const char* region) {
  Measure m;
  for (int i : presentChildren(region)) {
    Size pref = items_.preferredSize(i);
    ++m.count;
    m.maxWidth = std::max(m.maxWidth, pref.width);
    m.maxHeight = std::max(m.maxHeight, pref.height);
    m.sumWidth += pref.width;
    m.sumHeight += pref.height;
  }
  return m;
}

void LayoutEngine::placeChild(int index, int x, int y, int width, int height) {
  // A drop-down list keeps its own height: its window height is the opened list's.
  if (items_.keepsOwnHeight(index)) {
    height = items_.preferredSizeIn(index, Rect{x, y, x + width, y + height}).height;
  }
  items_.place(index, x, y, std::max(width, 0), std::max(height, 0));
}

Size LayoutEngine::preferredSize(bool initializeSplit) {
  const Measure all = measure();
  if (all.count == 0) return {};
  switch (kind()) {
    case kFlow: return {all.count * (layout_.hgap + all.maxWidth), all.maxHeight};
    case kBorder: return preferredBorderSize();
    case kGrid: return preferredGridSize(all);
    case kTab: return preferredTabSize(all);
    case kSplitter: return preferredSplitterSize(initializeSplit);
    default: return {};
  }
}

Size LayoutEngine::preferredBorderSize() {
  const int hgap = layout_.hgap, vgap = layout_.vgap;
  const Measure west = measure("West"), east = measure("East");
  const Measure north = measure("North"), south = measure("South");
  const Size w{west.maxWidth, west.sumHeight + west.count * vgap};
  const Size e{east.maxWidth, east.sumHeight + east.count * vgap};
  const Size n{north.sumWidth + north.count * hgap, north.maxHeight};
  const Size s{south.sumWidth + south.count * hgap, south.maxHeight};
  Size c;
  const std::vector<int> center = presentChildren("Center");
  if (!center.empty()) c = items_.preferredSize(center.back());
  // The gaps count whether or not the regions are occupied.
  return {std::max({n.width, s.width, w.width + c.width + 2 * hgap + e.width}),
          n.height + s.height + 2 * vgap + std::max({w.height, e.height, c.height})};
}

Size LayoutEngine::preferredGridSize(const Measure& all) {
  const std::vector<int> kids = presentChildren();
  const int rows = atLeastOne(layout_.rows), columns = atLeastOne(layout_.columns);
  const size_t n = kids.size();
  int width = 0, height = 0;
  size_t next = 0;
  for (int row = 0; row < rows && next < n; ++row) {
    const size_t rowStart = next;
    const size_t rowEnd = std::min(n, rowStart + static_cast<size_t>(columns));
    int rowHeight = all.maxHeight;
    if (layout_.mode != kAlignCenter) {
      rowHeight = 0;
      for (size_t k = rowStart; k < rowEnd; ++k)
        rowHeight = std::max(rowHeight, items_.preferredSize(kids[k]).height);
    }
    width = std::max(width, static_cast<int>(rowEnd - rowStart) * (layout_.hgap + all.maxWidth));
    height += rowHeight;
    next = rowEnd;
  }
  return {width, height};
}

Size LayoutEngine::preferredTabSize(const Measure& all) {
  const auto& tabs = static_cast<const TabLayout&>(layout_);
  if (tabs.selectedIndex == -1) return {};
  if (tabs.preferredOfAll) return {all.maxWidth, all.maxHeight};
  if (tabs.selectedIndex < 0 || tabs.selectedIndex >= items_.count() || !items_.isPresent(tabs.selectedIndex))
    return {};
  return items_.preferredSize(tabs.selectedIndex);
}

Size LayoutEngine::preferredSplitterSize(bool initializeSplit) {
  std::vector<int> panes = presentChildren();
  if (panes.size() > 3) panes.resize(3);
  const bool stacked = layout_.mode == kSplitStacked;
  int along = 0, across = 0, firstAlong = 0;
  for (size_t k = 0; k < panes.size(); ++k) {
    const Size pref = items_.preferredSize(panes[k]);
    const int a = stacked ? pref.height : pref.width;
    if (k == 0) firstAlong = a;
    along += a;
    across = std::max(across, stacked ? pref.width : pref.height);
  }
  if (panes.size() > 1) along += layout_.hgap;
  if (initializeSplit && panes.size() >= 2 && along != 0) {
    layout_.splitNumerator = layout_.hgap / 2 + firstAlong;
    layout_.splitDenominator = along;
  }
  return stacked ? Size{across, along} : Size{along, across};
}

Size LayoutEngine::preferredSizeIn(const Rect& area) {
  const Measure all = measure();
  if (all.count == 0) return {};
  switch (kind()) {
    case kFlow:
      return layoutFlow(area, all.maxWidth, all.maxHeight, layout_.mode, false);
    case kBorder: {
      const BorderSizes s = layoutBorder(area, false);
      const int hgap = layout_.hgap, vgap = layout_.vgap;
      return {s.north.width + (hgap + s.west.width) + (hgap + s.east.width) + (hgap + s.center.width),
              s.north.height + (vgap + s.south.height) + (vgap + s.center.height)};
    }
    case kGrid:
    case kTab:
      return preferredSize(false);
    case kSplitter:
      return layoutSplitter(area, layout_.mode, false);
    default:
      return {};
  }
}

void LayoutEngine::layOut(const Rect& area) {
  const Measure all = measure();
  if (all.count == 0) return;
  switch (kind()) {
    case kFlow: layoutFlow(area, all.maxWidth, all.maxHeight, layout_.mode, true); break;
    case kBorder: layoutBorder(area, true); break;
    case kGrid: layoutGrid(area, true); break;
    case kTab: layoutTabs(area); break;
    case kSplitter: layoutSplitter(area, layout_.mode, true); break;
    default: break;
  }
}

Size LayoutEngine::layoutFlow(const Rect& area, int cellWidth, int cellHeight, int alignment,
                              bool place) {
  const std::vector<int> kids = presentChildren();
  const size_t n = kids.size();
  if (n == 0) return {};
  const int hgap = layout_.hgap, vgap = layout_.vgap;

  // A row takes children while the next cell still fits; it always takes one.
  // The test uses the common cell width even when children keep their own.
  auto rowEnd = [&](size_t start) {
    size_t end = start;
    std::int64_t x = area.left;
    while (end < n) {
      if (end > start && x + cellWidth > area.right) break;
      x += hgap + cellWidth;
      ++end;
    }
    return end;
  };
  auto rowLeft = [&](size_t start, size_t end) {
    const int rowWidth = static_cast<int>(end - start) * (hgap + cellWidth);
    if (alignment == kAlignRight) return area.right - rowWidth;
    if (alignment == kAlignCenter) return area.left + (area.right - rowWidth - area.left) / 2;
    return area.left;
  };

  size_t end = rowEnd(0);
  int x = rowLeft(0, end);
  int y = area.top;
  int rows = 1, firstRowWidth = 0;
  for (size_t k = 0; k < n; ++k) {
    const int w = layout_.usePreferredWidth ? items_.preferredSize(kids[k]).width : cellWidth;
    if (k >= end) {
      const size_t start = k;
      end = rowEnd(start);
      x = rowLeft(start, end);
      y += vgap + cellHeight;
      ++rows;
    }
    if (place) placeChild(kids[k], x, y, w, cellHeight);
    if (rows == 1) firstRowWidth += hgap + w;
    x += hgap + w;
  }
  return {firstRowWidth, rows * (vgap + cellHeight)};
}

Size LayoutEngine::layoutBorderRegion(const Rect& area, int region, bool place) {
  const char* name = borderRegionName(region);
  if (!name) return {};
  const std::vector<int> kids = presentChildren(name);
  const int n = static_cast<int>(kids.size());
  if (n == 0) return {};
  int maxW = 0, maxH = 0;
  for (int i : kids) {
    Size pref = items_.preferredSize(i);
    maxW = std::max(maxW, pref.width);
    maxH = std::max(maxH, pref.height);
  }
  const int l = area.left, t = area.top, r = area.right, b = area.bottom;

  switch (region) {
    case kRegionWest:
    case kRegionEast: {
      // Equal shares top to bottom; the remainder of the division stays empty.
      const int x = region == kRegionWest ? l : r - maxW;
      const int h = (b - t) / n;
      int y = t;
      for (int i : kids) {
        if (place) placeChild(i, x, y, maxW, h);
        y += h;
      }
      return {maxW, b - t};
    }
    case kRegionNorth:
    case kRegionSouth: {
      const int y = region == kRegionNorth ? t : b - maxH;
      const int w = (r - l) / n;
      int x = l;
      for (int i : kids) {
        if (place) placeChild(i, x, y, w, maxH);
        x += w;
      }
      return {r - l, maxH};
    }
    default: {  // Center
      if (layout_.centerAtPreferredSize && n == 1) {
        const int w = maxW < r - l ? maxW : r - l;
        const int x = maxW < r - l ? l + (r - l - maxW) / 2 : l;
        const int h = maxH < b - t ? maxH : b - t;
        const int y = maxH < b - t ? t + (b - t - maxH) / 2 : t;
        if (place) placeChild(kids.front(), x, y, w, h);
        return {w, h};
      }
      for (int i : kids) {
        if (place) placeChild(i, l, t, r - l, b - t);
      }
      return {r - l, b - t};
    }
  }
}

LayoutEngine::BorderSizes LayoutEngine::layoutBorder(const Rect& area, bool place) {
  // Each gap is applied even when its region is empty.
  BorderSizes s;
  Rect rest = area;
  s.north = layoutBorderRegion(rest, kRegionNorth, place);
  rest.top += layout_.vgap + s.north.height;
  s.south = layoutBorderRegion(rest, kRegionSouth, place);
  rest.bottom -= layout_.vgap + s.south.height;
  s.west = layoutBorderRegion(rest, kRegionWest, place);
  rest.left += layout_.hgap + s.west.width;
  s.east = layoutBorderRegion(rest, kRegionEast, place);
  rest.right -= layout_.hgap + s.east.width;
  s.center = layoutBorderRegion(rest, kRegionCenter, place);
  return s;
}

Size LayoutEngine::layoutGrid(const Rect& area, bool place) {
  const int W = area.width(), H = area.height();
  if (!place) return {W, H};
  // Only a GridLayout carries column percentages; another layout gets equal columns.
  const GridLayout* grid = kind() == kGrid ? static_cast<const GridLayout*>(&layout_) : nullptr;
  const std::vector<int> kids = presentChildren();
  const size_t n = kids.size();
  const int rows = atLeastOne(layout_.rows), columns = atLeastOne(layout_.columns);
  const int hgap = layout_.hgap, vgap = layout_.vgap;
  const int equalWidth = W / columns;
  int rowHeight = H / rows;

  // Rows continue past `rows` while children remain, so that no child keeps stale
  // bounds; those rows lie below the container.
  size_t next = 0;
  int y = area.top;
  while (next < n) {
    const size_t rowStart = next;
    if (layout_.mode != kAlignCenter) {
      rowHeight = 0;
      const size_t rowEnd = std::min(n, rowStart + static_cast<size_t>(columns));
      for (size_t k = rowStart; k < rowEnd; ++k)
        rowHeight = std::max(rowHeight, items_.preferredSize(kids[k]).height);
    }
    int x = area.left;
    for (int c = 0; c < columns && next < n; ++c) {
      const int percent = grid && c < GridLayout::kMaxColumnPercents ? grid->columnPercent[c] : 0;
      const int w = percent != 0 ? scale(percent, W, 100) : equalWidth;
      placeChild(kids[next++], x + hgap / 2, y + vgap / 2, w - hgap, rowHeight - vgap);
      x += w;
    }
    y += rowHeight;
  }
  return {W, H};
}

Size LayoutEngine::layoutTabs(const Rect& area) {
  if (kind() != kTab) return {};
  const auto& tabs = static_cast<const TabLayout&>(layout_);
  const std::vector<int> kids = presentChildren();
  const int selected = tabs.selectedIndex;
  const int l = area.left, t = area.top, w = area.width(), h = area.height();

  if (kids.size() == 1 && selected != -1) {
    placeChild(kids.front(), l, t, w, h);
    items_.show(kids.front(), true);
    return {w, h};
  }
  bool selectedPresent = false;
  for (int i : kids) {
    if (i == selected) {
      selectedPresent = true;
      continue;
    }
    // Hidden pages get a size once, so that they are ready when selected.
    if (items_.bounds(i).isEmpty()) placeChild(i, l, t, w, h);
    items_.show(i, false);
  }
  if (selectedPresent) {
    placeChild(selected, l, t, w, h);
    items_.show(selected, true);
  }
  return {w, h};
}

Size LayoutEngine::layoutSplitter(const Rect& area, int orientation, bool place) {
  std::vector<int> panes = presentChildren();
  if (panes.size() > 3) panes.resize(3);  // a fourth child is never placed
  const bool stacked = orientation == kSplitStacked;
  const int gap = layout_.hgap;
  const int W = area.width(), H = area.height();
  const int extent = stacked ? H : W;

  int first = extent;
  if (panes.size() > 1) {
    // An unset split (denominator 0) shares the extent equally instead of dividing by 0.
    first = layout_.splitDenominator != 0
                ? scale(layout_.splitNumerator, extent, layout_.splitDenominator) - gap / 2
                : extent / 2 - gap / 2;
  }

  int along = 0, across = 0;
  int pos = stacked ? area.top : area.left;
  for (size_t k = 0; k < panes.size(); ++k) {
    if (place) {
      if (k == 0) {
        if (stacked) placeChild(panes[k], area.left, area.top, W, first);
        else placeChild(panes[k], area.left, area.top, first, H);
      } else {
        if (stacked) placeChild(panes[k], area.left, pos, W, area.bottom - pos);
        else placeChild(panes[k], pos, area.top, area.right - pos, H);
      }
    }
    pos += gap + first;
    const Size pref = items_.preferredSize(panes[k]);
    along += stacked ? pref.height : pref.width;
    across = std::max(across, stacked ? pref.width : pref.height);
  }
  return stacked ? Size{across, along} : Size{along, across};
}

}  // namespace toolkit
