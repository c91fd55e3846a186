// Table: geometry, scrolling and drawing.
#include "toolkit/table/Table.h"

#include <algorithm>

#include "toolkit/core/Palette.h"
#include "toolkit/table/logic/cell_kinds.h"
#include "toolkit/table/logic/row_heights.h"

namespace toolkit {

using namespace table;

namespace {

class Selected {
public:
  Selected(HDC dc, HGDIOBJ object) : dc_(dc), old_(SelectObject(dc, object)) {}
  ~Selected() { SelectObject(dc_, old_); }
  Selected(const Selected&) = delete;
  Selected& operator=(const Selected&) = delete;

private:
  HDC dc_;
  HGDIOBJ old_;
};

}  // namespace

int Table::columnLeft(int column) const {
  int x = 0;
  for (int c : displayOrder_) {
    if (c == column) return x;
    if (isColumnVisible(c)) x += getColumnWidth(c);
  }
  return -1;
}

int Table::visibleRowCount() const {
  const RECT client = getClientRect();
  const int height = getRowHeight();
  if (ownRowHeights()) {
    const RowHeightOf heightOf = [this](int index) { return shownRowHeight(index); };
    return rowsFitting(heightOf, displayRowCount(), topRow_, static_cast<int>(client.bottom) - height);
  }
  return std::max(0, static_cast<int>(client.bottom - height) / height);
}

RECT Table::getCellRect(int column, int row) const {
  RECT rect{0, 0, 0, 0};
  int height = getRowHeight();
  int top = 0;
  if (row >= 0) {
    const int index = shownIndexOf(row);
    if (index < 0) return rect;
    if (ownRowHeights()) {
      const RowHeightOf heightOf = [this](int i) { return shownRowHeight(i); };
      top = height + rowOffset(heightOf, topRow_, index);
      height = getRowHeightOf(row);
    } else {
      top = height * (index - topRow_ + 1);
    }
  }
  if (column < 0) {
    const RECT client = getClientRect();
    return RECT{0, top, client.right, top + height};
  }
  const int left = columnLeft(column);
  if (left < 0 || !isColumnVisible(column)) return rect;
  return RECT{left - leftPixel_, top, left - leftPixel_ + getColumnWidth(column), top + height};
}

bool Table::hitTest(int x, int y, int& row, int& column) const {
  const int height = getRowHeight();
  row = -1;
  if (y >= height) {
    if (ownRowHeights()) {
      const RowHeightOf heightOf = [this](int index) { return shownRowHeight(index); };
      row = nthShownRow(rowAtOffset(heightOf, displayRowCount(), topRow_, y - height));
    } else {
      row = nthShownRow(topRow_ + (y - height) / height);
    }
    if (row < 0) return false;
  }
  column = -1;
  int left = -leftPixel_;
  for (int c : displayOrder_) {
    if (!isColumnVisible(c)) continue;
    const int width = getColumnWidth(c);
    if (x >= left && x < left + width) {
      column = c;
      return true;
    }
    left += width;
  }
  return x < -leftPixel_;
}

void Table::updateScrollBars() {
  if (!isValid()) return;
  scrollBarsStale_ = false;
  const RECT client = getClientRect();
  SCROLLINFO info{};
  info.cbSize = sizeof info;
  info.fMask = SIF_RANGE | SIF_PAGE | SIF_POS;
  info.nMin = 0;
  info.nMax = std::max(displayRowCount() - 1, 0);
  if (ownRowHeights() && displayRowCount() > 0) {
    // Rows of their own heights: the page is what is left below the lowest top row.
    const RowHeightOf heightOf = [this](int index) { return shownRowHeight(index); };
    const int lowestTop =
        firstRowEndingAt(heightOf, displayRowCount() - 1, static_cast<int>(client.bottom) - getRowHeight());
    info.nPage = static_cast<UINT>(std::max(displayRowCount() - lowestTop, 1));
  } else {
    info.nPage = static_cast<UINT>(std::max(visibleRowCount(), 1));
  }
  topRow_ = std::max(0, std::min(topRow_, displayRowCount() - static_cast<int>(info.nPage)));
  info.nPos = topRow_;
  setScrollInfo(SB_VERT, info, true);
  int contentWidth = displayWidth_;
  if (contentWidth <= 0) {
    for (int c : displayOrder_) {
      if (isColumnVisible(c)) contentWidth += getColumnWidth(c);
    }
  }
  info.nMax = std::max(contentWidth - 1, 0);
  info.nPage = static_cast<UINT>(std::max(static_cast<int>(client.right), 1));
  leftPixel_ = std::max(0, std::min(leftPixel_, contentWidth - static_cast<int>(client.right)));
  info.nPos = leftPixel_;
  setScrollInfo(SB_HORZ, info, true);
}

void Table::scrollIntoView(int row) {
  if (scrollBarsStale_) updateScrollBars();
  const int index = shownIndexOf(row);
  if (index < 0) return;
  const int visible = std::max(visibleRowCount(), 1);
  const int before = topRow_;
  if (index < topRow_) topRow_ = index;
  else if (index >= topRow_ + visible) {
    if (ownRowHeights()) {
      const RowHeightOf heightOf = [this](int i) { return shownRowHeight(i); };
      topRow_ = firstRowEndingAt(heightOf, index, static_cast<int>(getClientRect().bottom) - getRowHeight());
    } else {
      topRow_ = index - visible + 1;
    }
  }
  if (topRow_ != before) {
    updateScrollBars();
    invalidate();
  }
}

void Table::fillLastColumn() {
  if (!(style_ & kStyleFillLast) || displayOrder_.empty() || !isValid()) return;
  const RECT client = getClientRect();
  const int last = displayOrder_.back();
  int sum = 0;
  for (int c : displayOrder_) {
    if (c != last && isColumnVisible(c)) sum += getColumnWidth(c);
  }
  if (sum >= client.right - 102) return;
  const int width = client.right - sum - 2;
  if (width <= getColumnWidth(last)) return;  // the last column never shrinks here
  columns_.setInteger(kColumnWidth, last, width);
  RECT area{std::max(0, columnLeft(last) - leftPixel_ - 10), 0, client.right, client.bottom};
  redraw(&area, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_FRAME | RDW_UPDATENOW);
}

void Table::paint(HDC dc) {
  // Twice at most: rows laid out for one width may bring the scroll bar that narrows it.
  RECT client = getClientRect();
  for (int pass = 0; pass < 2; ++pass) {
    if (client.right > 0 && client.right != laidOutWidth_) {
      laidOutWidth_ = client.right;
      ToolkitEvent layout(this, kEventLayoutRows, getHandle());
      layout.params[0] = client.right;
      dispatchEvent(layout);
    }
    if (scrollBarsStale_) updateScrollBars();
    client = getClientRect();
  }
  if (client.right <= 0 || client.bottom <= 0) return;
  HFONT font = getFont();
  Selected selectedFont(dc, font ? static_cast<HGDIOBJ>(font) : GetStockObject(DEFAULT_GUI_FONT));
  const int oldMode = SetBkMode(dc, TRANSPARENT);
  drawHeader(dc, client);
  int y = getRowHeight();
  for (int index = topRow_, height = 0; y < client.bottom; ++index, y += height) {
    const int row = nthShownRow(index);
    if (row < 0) break;
    height = getRowHeightOf(row);
    int x = -leftPixel_;
    for (int column : displayOrder_) {
      if (!isColumnVisible(column)) continue;
      const int width = getColumnWidth(column);
      if (x + width > 0 && x < client.right) drawCell(dc, RECT{x, y, x + width, y + height}, column, row);
      x += width;
    }
    if (x < client.right) {
      RECT rest{x, y, client.right, y + height};
      FillRect(dc, &rest, GetSysColorBrush(COLOR_WINDOW));
    }
  }
  if (y < client.bottom) {
    RECT rest{0, y, client.right, client.bottom};
    FillRect(dc, &rest, GetSysColorBrush(COLOR_WINDOW));
  }
  SetBkMode(dc, oldMode);
}

void Table::drawHeader(HDC dc, const RECT& client) {
  const int height = getRowHeight();
  RECT band{0, 0, client.right, height};
  FillRect(dc, &band, GetSysColorBrush(COLOR_BTNFACE));
  int x = -leftPixel_;
  const COLORREF oldColour = SetTextColor(dc, GetSysColor(COLOR_BTNTEXT));
  for (int column : displayOrder_) {
    if (!isColumnVisible(column)) continue;
    const int width = getColumnWidth(column);
    RECT cell{x, 0, x + width, height};
    DrawEdge(dc, &cell, column == pressedHeader_ ? EDGE_SUNKEN : EDGE_RAISED, BF_RECT);
    RECT text{cell.left + 3, cell.top + 1, cell.right - 3, cell.bottom - 1};
    const std::string alias = getColumnAlias(column);
    DrawTextA(dc, alias.c_str(), static_cast<int>(alias.size()), &text,
              DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | DT_END_ELLIPSIS | DT_LEFT);
    x += width;
  }
  SetTextColor(dc, oldColour);
}

void Table::drawCell(HDC dc, RECT rect, int column, int row) {
  if (style_ & (kStyleHorizontalGrid | kStyleVerticalGrid)) {
    HPEN pen = Palette::makePen(17);
    Selected selectedPen(dc, pen);
    if (style_ & kStyleHorizontalGrid) {
      MoveToEx(dc, rect.left, rect.bottom - 1, nullptr);
      LineTo(dc, rect.right, rect.bottom - 1);
      --rect.bottom;
    }
    if (style_ & kStyleVerticalGrid) {
      MoveToEx(dc, rect.right - 1, rect.top, nullptr);
      LineTo(dc, rect.right - 1, rect.bottom);
      --rect.right;
    }
    SelectObject(dc, GetStockObject(BLACK_PEN));
    DeleteObject(pen);
  }
  const HWND window = getHandle();
  const bool selected = isCurrentCell(column, row);
  const int state = (window && GetFocus() == window ? 2 : 0) + (selected ? 1 : 0);
  const bool highlight = selected && !(style_ & kStyleNoHighlight);
  const int textColour = highlight ? COLOR_HIGHLIGHTTEXT : (isEnabled() ? COLOR_WINDOWTEXT : COLOR_GRAYTEXT);
  if (style_ & kStyleOwnerDraw) {
    SetTextColor(dc, GetSysColor(textColour));
    ToolkitEvent event(this, kEventDrawCell, window);
    event.params[0] = reinterpret_cast<std::intptr_t>(dc);
    event.params[1] = reinterpret_cast<std::intptr_t>(&rect);
    event.params[2] = state;
    event.params[3] = column;
    event.params[4] = row;
    if (dispatchEvent(event)) return;
  }
  FillRect(dc, &rect, GetSysColorBrush(highlight ? COLOR_HIGHLIGHT : COLOR_WINDOW));
  InflateRect(&rect, -1, -1);
  if (!(style_ & kStyleHorizontalGrid)) --rect.bottom;
  if (!(style_ & kStyleVerticalGrid)) --rect.right;
  const int kind = getColumnKind(column);
  if (kind == kCellBool || kind == kCellState) {
    drawMark(dc, rect, kind, getCellLong(column, row), selected);
    return;
  }
  RECT box{rect.left + 3, rect.top + 1, rect.right - 3, rect.bottom - 1};
  const int align = static_cast<int>(columns_.integer(kColumnAlign, column));
  const UINT format = ((align & 2) ? DT_RIGHT : (align & 4) ? DT_CENTER : DT_LEFT) | DT_SINGLELINE | DT_VCENTER |
                      DT_NOPREFIX | DT_END_ELLIPSIS;
  if (kind == kCellWideText) {
    const std::wstring text = getCellWideText(row, column);
    if (text.empty()) return;
    const COLORREF oldColour = SetTextColor(dc, GetSysColor(textColour));
    DrawTextW(dc, text.c_str(), static_cast<int>(text.size()), &box, format);
    SetTextColor(dc, oldColour);
    return;
  }
  const std::string text = getCellText(row, column);
  if (text.empty()) return;
  const COLORREF oldColour = SetTextColor(dc, GetSysColor(textColour));
  DrawTextA(dc, text.c_str(), static_cast<int>(text.size()), &box, format);
  SetTextColor(dc, oldColour);
}

void Table::drawMark(HDC dc, const RECT& rect, int kind, int value, bool selected) {
  const int size = std::min<int>(kMarkSize, std::min(rect.right - rect.left, rect.bottom - rect.top));
  if (size <= 2) return;
  const int left = rect.left + 3;
  const int top = rect.top + (rect.bottom - rect.top - size) / 2;
  int background = 0;
  int foreground = 0;
  if (kind == kCellBool) {
    const int pair = (value != 0 ? 2 : 0) + (selected ? 1 : 0);
    background = boolBack_[pair];
    foreground = boolFore_[pair];
  } else {
    background = value & 0xFFFF;
    foreground = (value >> 16) & 0xFFFF;
  }
  HPEN pen = Palette::makePen(foreground < Palette::kSize ? foreground : 0);
  HBRUSH brush = Palette::makeBrush(background < Palette::kSize ? background : 0);
  {
    Selected selectedPen(dc, pen);
    Selected selectedBrush(dc, brush);
    if (kind == kCellState && background >= Palette::kSize) SelectObject(dc, GetStockObject(NULL_BRUSH));
    Ellipse(dc, left, top, left + size, top + size);
    if (kind == kCellBool && value != 0) {
      // A tick inside the circle.
      const POINT tick[3] = {{left + size / 4, top + size / 2},
                             {left + size / 2 - 1, top + size * 3 / 4},
                             {left + size * 3 / 4 + 1, top + size / 4}};
      Polyline(dc, tick, 3);
    }
  }
  DeleteObject(pen);
  DeleteObject(brush);
}

}  // namespace toolkit
