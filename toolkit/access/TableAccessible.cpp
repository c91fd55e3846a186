#include "toolkit/access/TableAccessible.h"

#include <algorithm>
#include <new>
#include <vector>

#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/table/Table.h"

namespace toolkit {

namespace {

// The selected rows of a multiple-selection table, as get_accSelection hands
// several children out: an enumerator of VT_I4 child ids.
class ChildIds : public IEnumVARIANT {
public:
  explicit ChildIds(std::vector<LONG> ids, size_t next = 0) : ids_(std::move(ids)), next_(next) {}

  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID iid, void** object) override {
    if (!object) return E_POINTER;
    if (iid == IID_IUnknown || iid == IID_IEnumVARIANT) {
      *object = static_cast<IEnumVARIANT*>(this);
      AddRef();
      return S_OK;
    }
    *object = nullptr;
    return E_NOINTERFACE;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return static_cast<ULONG>(InterlockedIncrement(&references_)); }
  ULONG STDMETHODCALLTYPE Release() override {
    const LONG left = InterlockedDecrement(&references_);
    if (left == 0) delete this;
    return static_cast<ULONG>(left);
  }
  HRESULT STDMETHODCALLTYPE Next(ULONG count, VARIANT* out, ULONG* fetched) override {
    if (!out || (count > 1 && !fetched)) return E_POINTER;
    ULONG given = 0;
    for (; given < count && next_ < ids_.size(); ++given, ++next_) {
      VariantInit(&out[given]);
      out[given].vt = VT_I4;
      out[given].lVal = ids_[next_];
    }
    if (fetched) *fetched = given;
    return given == count ? S_OK : S_FALSE;
  }
  HRESULT STDMETHODCALLTYPE Skip(ULONG count) override {
    const size_t left = ids_.size() - next_;
    next_ += std::min<size_t>(count, left);
    return count <= left ? S_OK : S_FALSE;
  }
  HRESULT STDMETHODCALLTYPE Reset() override {
    next_ = 0;
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE Clone(IEnumVARIANT** copy) override {
    if (!copy) return E_POINTER;
    *copy = new (std::nothrow) ChildIds(ids_, next_);
    return *copy ? S_OK : E_OUTOFMEMORY;
  }

private:
  virtual ~ChildIds() = default;

  ComponentAccessible::Counted counted_;
  std::vector<LONG> ids_;
  size_t next_;
  LONG references_ = 1;
};

bool multiSelect(const Table& table) { return (table.getTableStyle() & Table::kStyleMultiSelect) != 0; }

}  // namespace

TableAccessible::TableAccessible(Table& table) : ComponentAccessible(table) {}

Table& TableAccessible::table() const { return static_cast<Table&>(component()); }

int TableAccessible::rowOf(LONG child) const { return table().nthShownRow(static_cast<int>(child) - 1); }

LONG TableAccessible::childIdOf(const Table& table, int storedRow) {
  return table.shownIndexOf(storedRow) + 1;
}

void TableAccessible::announceCurrentRow(const Table& table) {
  HWND window = table.getHandle();
  const LONG child = childIdOf(table, table.getCurrentRow());
  if (!window || child <= 0) return;
  if (GetFocus() == window) NotifyWinEvent(EVENT_OBJECT_FOCUS, window, OBJID_CLIENT, child);
  if (multiSelect(table)) NotifyWinEvent(EVENT_OBJECT_SELECTIONWITHIN, window, OBJID_CLIENT, CHILDID_SELF);
  else NotifyWinEvent(EVENT_OBJECT_SELECTION, window, OBJID_CLIENT, child);
}

void TableAccessible::announceFocus(const Table& table) {
  HWND window = table.getHandle();
  const LONG child = childIdOf(table, table.getCurrentRow());
  if (window && child > 0 && GetFocus() == window) NotifyWinEvent(EVENT_OBJECT_FOCUS, window, OBJID_CLIENT, child);
}

void TableAccessible::announceReorder(const Table& table) {
  if (HWND window = table.getHandle()) NotifyWinEvent(EVENT_OBJECT_REORDER, window, OBJID_CLIENT, CHILDID_SELF);
}

LONG TableAccessible::childCount() const { return table().displayRowCount(); }

// A row reads as it is shown: the visible columns in display order.
std::string TableAccessible::cellsOf(int row) const {
  const Table& t = table();
  std::string cells;
  bool first = true;
  for (int column : t.displayOrder()) {
    if (!t.isColumnVisible(column)) continue;
    if (!first) cells += '\t';
    cells += t.getCellText(row, column);
    first = false;
  }
  return cells;
}

std::string TableAccessible::nameOf(LONG child) const {
  if (child == CHILDID_SELF) return ComponentAccessible::nameOf(child);
  const int row = rowOf(child);
  std::string name = table().rowName(row);
  return name.empty() ? cellsOf(row) : name;
}

bool TableAccessible::valueOf(LONG child, std::string& value) const {
  if (child == CHILDID_SELF) return ComponentAccessible::valueOf(child, value);
  const int row = rowOf(child);
  // Only rows named by their owner: the others already read their cells as their name.
  if (table().rowName(row).empty()) return ComponentAccessible::valueOf(child, value);
  value = cellsOf(row);
  return true;
}

// Wide text cells reach the client as they are stored, never through the ANSI code page.
std::wstring TableAccessible::wideCellsOf(int row) const {
  const Table& t = table();
  std::wstring cells;
  bool first = true;
  for (int column : t.displayOrder()) {
    if (!t.isColumnVisible(column)) continue;
    if (!first) cells += L'\t';
    cells += t.getCellWideText(row, column);
    first = false;
  }
  return cells;
}

std::wstring TableAccessible::wideNameOf(LONG child) const {
  if (child == CHILDID_SELF || !table().rowName(rowOf(child)).empty()) return ComponentAccessible::wideNameOf(child);
  return wideCellsOf(rowOf(child));
}

bool TableAccessible::wideValueOf(LONG child, std::wstring& value) const {
  if (child == CHILDID_SELF || table().rowName(rowOf(child)).empty()) {
    return ComponentAccessible::wideValueOf(child, value);
  }
  value = wideCellsOf(rowOf(child));
  return true;
}

LONG TableAccessible::roleOf(LONG child) const {
  return child == CHILDID_SELF ? ROLE_SYSTEM_LIST : ROLE_SYSTEM_LISTITEM;
}

LONG TableAccessible::stateOf(LONG child) const {
  const Table& t = table();
  LONG state = windowState();
  if (multiSelect(t)) state |= STATE_SYSTEM_MULTISELECTABLE | STATE_SYSTEM_EXTSELECTABLE;
  if (child == CHILDID_SELF) return state | STATE_SYSTEM_FOCUSABLE;
  // Rows carry the table's visibility and availability, and the focus only when it rests on them.
  state &= ~STATE_SYSTEM_FOCUSED;
  state |= STATE_SYSTEM_SELECTABLE | STATE_SYSTEM_FOCUSABLE;
  const int row = rowOf(child);
  if (t.isRowSelected(row)) state |= STATE_SYSTEM_SELECTED;
  if (row == t.getCurrentRow() && hasFocus()) state |= STATE_SYSTEM_FOCUSED;
  // Scrolled above the top row (under the header) or below the client area.
  const RECT rect = t.getCellRect(-1, row);
  if (rect.top < t.getRowHeight() || rect.top >= t.getClientRect().bottom) state |= STATE_SYSTEM_OFFSCREEN;
  return state;
}

RECT TableAccessible::screenRectOf(LONG child) const {
  if (child == CHILDID_SELF) return ComponentAccessible::screenRectOf(child);
  const Table& t = table();
  RECT rect = t.getCellRect(-1, rowOf(child));
  MapWindowPoints(t.getHandle(), nullptr, reinterpret_cast<POINT*>(&rect), 2);
  return rect;
}

LONG TableAccessible::childAt(POINT client) const {
  int row = -1, column = -1;
  if (!table().hitTest(client.x, client.y, row, column) || row < 0) return CHILDID_SELF;
  return std::max<LONG>(childIdOf(table(), row), CHILDID_SELF);
}

LONG TableAccessible::focusedChild() const {
  if (!hasFocus()) return -1;
  return std::max<LONG>(childIdOf(table(), table().getCurrentRow()), CHILDID_SELF);
}

HRESULT TableAccessible::selectionOf(VARIANT& selection) const {
  const Table& t = table();
  std::vector<LONG> ids;
  if (multiSelect(t)) {
    for (int row : t.selectedRows()) {
      if (const LONG id = childIdOf(t, row); id > 0) ids.push_back(id);
    }
    std::sort(ids.begin(), ids.end());
  } else if (const LONG id = childIdOf(t, t.getCurrentRow()); id > 0) {
    ids.push_back(id);
  }
  if (ids.empty()) return S_FALSE;
  if (ids.size() == 1) {
    selection.vt = VT_I4;
    selection.lVal = ids[0];
    return S_OK;
  }
  IEnumVARIANT* all = new (std::nothrow) ChildIds(std::move(ids));
  if (!all) return E_OUTOFMEMORY;
  selection.vt = VT_UNKNOWN;
  selection.punkVal = all;
  return S_OK;
}

// Taking the focus and taking the selection (single-selection tables) only: the
// table has no way for a client to add or remove rows of a selection.
HRESULT TableAccessible::select(LONG flags, LONG child) {
  constexpr LONG kSupported = SELFLAG_TAKEFOCUS | SELFLAG_TAKESELECTION;
  if (flags == SELFLAG_NONE || (flags & ~kSupported)) return E_INVALIDARG;
  Table& t = table();
  if (child == CHILDID_SELF) {
    if (flags != SELFLAG_TAKEFOCUS) return E_INVALIDARG;
    t.requestFocus();
    return S_OK;
  }
  if ((flags & SELFLAG_TAKESELECTION) && multiSelect(t)) return E_INVALIDARG;
  // The owner hears of the new row and may close everything from its handler:
  // the components it lets go wait until this call has returned.
  const ToolkitWindows::Busy busy;
  if (flags & SELFLAG_TAKEFOCUS) t.requestFocus();
  const int row = rowOf(child);
  // In a single-selection table the focused row is the selected one.
  if (row != t.getCurrentRow() && !multiSelect(t)) t.selectRow(row, true);
  return S_OK;
}

LONG TableAccessible::neighbour(LONG child, LONG direction) const {
  const LONG count = childCount();
  if (child == CHILDID_SELF) {
    if (direction == NAVDIR_FIRSTCHILD) return count > 0 ? 1 : 0;
    if (direction == NAVDIR_LASTCHILD) return count;
    return 0;  // the table's siblings are its window's business
  }
  switch (direction) {
    case NAVDIR_NEXT:
    case NAVDIR_DOWN: return child < count ? child + 1 : 0;
    case NAVDIR_PREVIOUS:
    case NAVDIR_UP: return child - 1;
    default: return 0;
  }
}

}  // namespace toolkit
