// Table: notifications, mouse, keyboard and in-place editing.
#include "toolkit/table/Table.h"

#include <algorithm>

#include "toolkit/access/TableAccessible.h"
#include "toolkit/table/logic/cell_kinds.h"
#include "toolkit/widgets/cXEdit2.h"

namespace toolkit {

using namespace table;

namespace {

bool keyDown(int key) { return (GetKeyState(key) & 0x8000) != 0; }

constexpr int kBorderSlack = 3;  // pixels either side of a column border that start a resize
constexpr int kDoubleMaxChars = 10;

}  // namespace

bool Table::notify(int row, bool doubleClick, int column, int code, int keyState) {
  ToolkitEvent event(this, kEventAction, getHandle());
  event.params[0] = row;
  event.params[1] = doubleClick ? 1 : 0;
  event.params[2] = column;
  event.params[3] = code;
  event.params[4] = keyState;
  const int answer = dispatchEvent(event);
  return answer != 0 && event.params[3] == 0;
}

void Table::redrawRow(int row) {
  if (!isValid() || row < 0) return;
  RECT rect = getCellRect(-1, row);
  if (rect.bottom > rect.top) redraw(&rect, nullptr, RDW_INVALIDATE | RDW_UPDATENOW);
}

bool Table::moveCurrent(int row, int column, bool doubleClick, int keyState, bool notifyOwner) {
  if (row < 0 || row >= rowCount_) return false;
  if (column < 0 || column >= getColumnCount()) column = std::max(currentColumn_, 0);
  const int oldRow = currentRow_;
  const int oldColumn = currentColumn_;
  currentRow_ = row;
  currentColumn_ = column;
  if (!(style_ & kStyleMultiSelect)) anchorRow_ = row;
  if (notifyOwner && notify(row, doubleClick, column, kNotifySelect, keyState) && keyState == kByMouse) {
    currentRow_ = oldRow;
    currentColumn_ = oldColumn;
    return false;
  }
  scrollIntoView(currentRow_);
  redrawRow(oldRow);
  redrawRow(currentRow_);
  if (currentRow_ != oldRow) TableAccessible::announceCurrentRow(*this);
  return true;
}

void Table::selectRange(int from, int to) {
  selection_.clear();
  const int a = shownIndexOf(from), b = shownIndexOf(to);
  if (a < 0 || b < 0) return;
  for (int i = std::min(a, b); i <= std::max(a, b); ++i) selection_.insert(nthShownRow(i));
  invalidate();
}

int Table::dispatchEvent(ToolkitEvent& event) {
  if (event.id == kEventMouseWheel && event.source == this) {
    const int steps = -static_cast<short>(HIWORD(event.params[2])) / WHEEL_DELTA * 3;
    if (editing_) endEdit(true);
    topRow_ = std::max(0, topRow_ + steps);
    updateScrollBars();
    invalidate();
    return 1;
  }
  return cXComponent::dispatchEvent(event);
}

int Table::onMouseDown(ToolkitEvent& event, int x, int y) {
  if (event.source != this || !isEnabled()) return 0;
  if (HWND window = getHandle()) KillTimer(window, kTimer);
  const bool wasEditing = editing_;
  if (editing_) endEdit(true);
  event.handled = true;
  const bool doubleClick = event.params[4] != 0;

  // A column border in the header: resize that column.
  const int height = getRowHeight();
  if (y < height) {
    int left = -leftPixel_;
    for (int column : displayOrder_) {
      if (!isColumnVisible(column)) continue;
      left += getColumnWidth(column);
      if (x >= left - kBorderSlack && x <= left + kBorderSlack) {
        captureMouse();
        SetCursor(LoadCursor(nullptr, IDC_SIZEWE));
        resizing_ = column;
        resizeStartX_ = x;
        resizeStartWidth_ = getColumnWidth(column);
        return 1;
      }
    }
  }
  int row = -1, column = -1;
  if (!hitTest(x, y, row, column)) return 1;
  if (row < 0) {  // header cell
    captureMouse();
    pressedHeader_ = column;
    RECT band{0, 0, getClientRect().right, height};
    redraw(&band, nullptr, RDW_INVALIDATE | RDW_UPDATENOW);
    return 1;
  }
  notify(row, doubleClick, column, kNotifyCellPressed, kByMouse);
  if (column < 0) notify(row, doubleClick, column, kNotifyRowHeader, kByMouse);
  if (column < 0) column = std::max(currentColumn_, 0);

  bool changed = false;
  if (style_ & kStyleMultiSelect) {
    const bool control = (event.params[3] & MK_CONTROL) != 0;
    const bool shift = (event.params[3] & MK_SHIFT) != 0;
    if (shift && anchorRow_ >= 0) {
      selectRange(anchorRow_, row);
    } else if (control) {
      if (!selection_.erase(row)) selection_.insert(row);
      anchorRow_ = row;
    } else {
      selection_.clear();
      selection_.insert(row);
      anchorRow_ = row;
    }
    changed = row != currentRow_;
    moveCurrent(row, column, doubleClick, kByMouse, true);
    invalidate();
  } else {
    const bool differs = (style_ & kStyleWholeRow) ? row != currentRow_ : (row != currentRow_ || column != currentColumn_);
    if (differs || doubleClick || (style_ & kStyleNoHighlight)) {
      changed = moveCurrent(row, column, doubleClick, kByMouse, true) && differs;
      if (!changed && differs) return 1;  // refused: the old cell stays current
    }
  }
  if (!wasEditing && !doubleClick && !((style_ & kStyleNoEditOnSelect) && changed)) beginEdit(row, column);
  return 1;
}

int Table::onMouseDrag(ToolkitEvent& event, int x, int) {
  if (event.source != this || resizing_ < 0) return 0;
  columns_.setInteger(kColumnWidth, resizing_, std::max(minimumWidth_, resizeStartWidth_ + x - resizeStartX_));
  invalidate();
  return 1;
}

int Table::onMouseUp(ToolkitEvent& event, int, int) {
  if (event.source != this) return 0;
  if (resizing_ >= 0 || pressedHeader_ >= 0) {
    ReleaseCapture();
    const bool wasResizing = resizing_ >= 0;
    resizing_ = -1;
    pressedHeader_ = -1;
    if (wasResizing) fillLastColumn();
    updateScrollBars();
    invalidate();
    return 1;
  }
  return 0;
}

int Table::onSetCursor(ToolkitEvent& event) {
  if (event.source != this || resizing_ < 0) return 0;
  SetCursor(LoadCursor(nullptr, IDC_SIZEWE));
  event.handled = true;
  return 1;
}

bool Table::navigate(int key, bool shift, bool control) {
  if (rowCount_ <= 0) return false;
  const int columnCount = getColumnCount();
  int index = shownIndexOf(currentRow_);
  if (index < 0) index = 0;
  int column = std::max(currentColumn_, 0);
  int displayColumn = static_cast<int>(std::find(displayOrder_.begin(), displayOrder_.end(), column) - displayOrder_.begin());
  const int lastShown = displayRowCount() - 1;
  const bool multi = (style_ & kStyleMultiSelect) != 0;
  switch (key) {
    case VK_END:
      if (control) index = lastShown;
      else displayColumn = static_cast<int>(displayOrder_.size()) - 1;
      break;
    case VK_HOME:
      if (control) index = 0;
      else displayColumn = 0;
      break;
    case VK_LEFT: displayColumn = std::max(displayColumn - 1, 0); break;
    case VK_RIGHT: displayColumn = std::min(displayColumn + 1, static_cast<int>(displayOrder_.size()) - 1); break;
    case VK_UP: index = std::max(index - 1, 0); break;
    case VK_DOWN: index = std::min(index + 1, lastShown); break;
    default: return false;
  }
  if (displayColumn >= 0 && displayColumn < static_cast<int>(displayOrder_.size())) column = displayOrder_[displayColumn];
  if (column >= columnCount) column = 0;
  const int row = nthShownRow(index);
  if (row < 0) return false;
  if (multi) {
    const bool extend = shift && (key == VK_UP || key == VK_DOWN || (control && (key == VK_END || key == VK_HOME)));
    if (extend) {
      if (anchorRow_ < 0) anchorRow_ = currentRow_;
      selectRange(anchorRow_, row);
    } else {
      selection_.clear();
      selection_.insert(row);
      anchorRow_ = row;
      invalidate();
    }
  }
  const bool arrow = key == VK_LEFT || key == VK_RIGHT || key == VK_UP || key == VK_DOWN;
  moveCurrent(row, column, false, kByKeys, arrow);
  return true;
}

int Table::onKeyDown(ToolkitEvent& event, int key) {
  if (!isEnabled()) return 0;
  const bool fromEditor = editor_ && event.source == editor_.get();
  if (event.source != this && !fromEditor) return 0;
  if (editing_) {
    // Only Esc stays here; the keys that end an edit with commit go on to the parents.
    switch (key) {
      case VK_ESCAPE:
        endEdit(false);
        requestFocus();
        event.handled = true;
        return 1;
      case VK_RETURN:
        endEdit(true);
        requestFocus();
        return 0;
      case VK_PRIOR:
      case VK_NEXT:
      case VK_UP:
      case VK_DOWN: {
        endEdit(true);
        requestFocus();
        int row = currentRow_;
        if (key == VK_UP || key == VK_DOWN) {
          const int index = shownIndexOf(currentRow_) + (key == VK_UP ? -1 : 1);
          if (index >= 0 && index < displayRowCount()) row = nthShownRow(index);
        }
        moveCurrent(row, currentColumn_, false, kByKeys, true);
        return 0;
      }
      default:
        return 0;  // the editor's own keys
    }
  }
  if (fromEditor) return 0;
  const bool shift = keyDown(VK_SHIFT);
  const bool control = keyDown(VK_CONTROL);
  switch (key) {
    case VK_END:
    case VK_HOME:
    case VK_LEFT:
    case VK_RIGHT:
    case VK_UP:
    case VK_DOWN:
      navigate(key, shift, control);
      return 0;  // the parents see navigation keys too
    case VK_DELETE:
    case VK_INSERT:
    case VK_PRIOR:
    case VK_NEXT:
    case VK_SHIFT:
    case VK_CONTROL:
    case VK_ESCAPE:
    case VK_TAB:
      return 0;
    default:
      break;
  }
  if (currentRow_ < 0 || currentRow_ >= rowCount_) return 0;
  if (!(style_ & (kStyleWholeRow | kStyleMultiSelect))) scrollIntoView(currentRow_);
  if (!beginEdit(currentRow_, currentColumn_) && !(style_ & kStyleMultiSelect)) {
    notify(currentRow_, true, currentColumn_, kNotifySelect, kByKeys);
  }
  event.handled = true;
  return 1;
}

int Table::onFocusGained(ToolkitEvent& event) {
  if (event.source != this) return 0;
  redrawRow(currentRow_);
  TableAccessible::announceFocus(*this);
  return 0;
}

int Table::onFocusLost(ToolkitEvent& event) {
  if (editor_ && event.source == editor_.get() && editing_) {
    endEdit(true);
    return 1;
  }
  if (event.source == this) redrawRow(currentRow_);
  return 0;
}

int Table::onScroll(ToolkitEvent& event) {
  if (event.source != this) return 0;
  if (editing_) endEdit(true);
  const bool horizontal = event.id == kEventScrollThumb ? event.params[1] != 0 : event.params[0] != 0;
  int& position = horizontal ? leftPixel_ : topRow_;
  const int line = horizontal ? 20 : 1;
  const int page = horizontal ? std::max<int>(getClientRect().right, 1) : std::max(visibleRowCount(), 1);
  switch (event.id) {
    case kEventScrollThumb: position = static_cast<int>(event.params[0]); break;
    case kEventScrollLineDown: position += line; break;
    case kEventScrollLineUp: position -= line; break;
    case kEventScrollPageDown: position += page; break;
    case kEventScrollPageUp: position -= page; break;
    default: return 0;
  }
  position = std::max(position, 0);
  updateScrollBars();
  invalidate();
  return 1;
}

int Table::onResized(ToolkitEvent& event) {
  if (event.source != this) return 0;
  if (editing_) endEdit(true);
  fillLastColumn();
  updateScrollBars();
  invalidate();
  return 0;
}

int Table::onEraseBackground(ToolkitEvent& event) {
  if (event.source != this) return 0;
  event.handled = true;  // paint covers the whole client area
  return 1;
}

bool Table::setFontIndirect(const LOGFONTA& font) {
  rowHeight_ = 0;
  const bool made = cXComponent::setFontIndirect(font);
  rowHeight_ = 0;
  updateScrollBars();
  return made;
}

void Table::lendFont(HFONT font) {
  rowHeight_ = 0;
  cXComponent::lendFont(font);
  rowHeight_ = 0;
  if (editor_) editor_->lendFont(font);
  updateScrollBars();
}

// ---- in-place editing

bool Table::beginEdit(int row, int column) {
  if (row < 0 || row >= rowCount_ || column < 0 || column >= getColumnCount()) return false;
  if (!columns_.integer(kColumnEditable, column) || !isValid()) return false;
  const int kind = getColumnKind(column);
  if (kind == kCellBool) {
    currentRow_ = row;
    currentColumn_ = column;
    setCellLong(column, row, getCellLong(column, row) ? 0 : 1);
    redrawRow(row);
    return true;
  }
  if (kind == kCellState || kind == kCellDateTime) return false;
  if (!editor_) {
    editor_ = std::make_unique<cXEdit2>(0);
    editor_->setParent(this);
    if (!editor_->create(getHandle())) {
      editor_.reset();
      return false;
    }
    editor_->lendFont(getFont());
  }
  if (editing_) endEdit(true);
  currentRow_ = row;
  currentColumn_ = column;
  scrollIntoView(row);
  const std::string mask = columns_.text(kColumnMask, column);
  DataTable* cells = cellsOf(column);
  // The editor is shared by every column: each edit sets its own limit, while the editor
  // is plain text (the other types and masks ignore a new limit) and before any value
  // is set (a limit cuts the text it finds).
  int limit = getColumnMaxLength(column);
  if (limit == 0 && kind == kCellDouble) limit = kDoubleMaxChars;
  editor_->setText("");
  editor_->setMaxLength(limit);
  switch (kind) {
    case kCellLong:
      editor_->setEditType(2);
      editor_->setNumber(static_cast<int>(cells->integer(0, row)));
      break;
    case kCellDouble:
      editor_->setEditType(3);
      editor_->setValue(cells->number(0, row));
      break;
    case kCellLatitude:
    case kCellLongitude:
      editor_->setEditType(kind, mask.empty() ? nullptr : mask.c_str());
      editor_->setValue(cells->number(0, row));
      break;
    default:
      editor_->setEditType(1, mask.empty() ? nullptr : mask.c_str());
      editor_->setText(cells->text(0, row));
      break;
  }
  editor_->setOverwrite(true);
  editStartText_ = editor_->getText();
  const RECT rect = getCellRect(column, row);
  editRow_ = row;
  editColumn_ = column;
  editing_ = true;
  editor_->setBounds(rect.left, rect.top, rect.right - rect.left - 1, rect.bottom - rect.top - 1, true, true);
  editor_->show(true);
  SetFocus(editor_->getHandle());
  return true;
}

void Table::storeEditedValue() {
  DataTable* cells = cellsOf(editColumn_);
  if (!cells || editRow_ < 0 || editRow_ >= rowCount_) return;
  // An untouched text would only store the value as shown: a double rounded to four
  // places, a coordinate to its mask.
  if (editor_->getText() == editStartText_) return;
  switch (getColumnKind(editColumn_)) {
    case kCellLong: cells->setInteger(0, editRow_, editor_->getNumber()); break;
    case kCellDouble:
    case kCellLatitude:
    case kCellLongitude: cells->setDouble(0, editRow_, editor_->getValue()); break;
    default: cells->setText(0, editRow_, editor_->getText()); break;
  }
}

void Table::endEdit(bool commit) {
  if (!editing_) return;
  editing_ = false;  // first: hiding the editor moves the focus, which ends edits
  if (commit && editor_) storeEditedValue();
  if (editor_) editor_->show(false);
  redrawRow(editRow_);
  editRow_ = -1;
  editColumn_ = -1;
}

}  // namespace toolkit
