#include "toolkit/core/Container.h"

#include <oleauto.h>

#include <algorithm>
#include <cstring>

#include "toolkit/base/class_records.h"
#include "toolkit/core/ContainerItems.h"
#include "toolkit/core/Palette.h"
#include "toolkit/layout/LayoutEngine.h"

namespace toolkit {

namespace {

Container* asContainer(cXComponent* component) {
  return isKindOf(component, &records::Container) ? static_cast<Container*>(component) : nullptr;
}

SIZE plusInsets(SIZE size, const RECT& insets) {
  return SIZE{size.cx + insets.left + insets.right, size.cy + insets.top + insets.bottom};
}

}  // namespace

Container::Container() {
  children_.addColumn(ColumnType::Integer, "Component");
  children_.addColumn(ColumnType::Text, "Position");
  children_.addColumn(ColumnType::Text, "Name");
}

Container::~Container() {
  // Children outlive the container unless their owner deletes them: they must
  // not keep pointing here, nor bubble the events of their windows' end to us.
  if (peer_) peer_->silence();
  for (int i = 0; i < children_.rowCount(); ++i) {
    if (cXComponent* child = getChild(i)) child->setParent(nullptr);
  }
  destroyWindow();
  layout_.reset();
}

const ClassRecord* Container::getClassRecord() const { return &records::Container; }

// Child list ------------------------------------------------------------------

int Container::getChildCount() const { return children_.rowCount(); }

cXComponent* Container::getChild(int index) const {
  return static_cast<cXComponent*>(children_.pointer(kColumnComponent, index));
}

std::string Container::getChildName(int index) const { return children_.text(kColumnName, index); }

std::string Container::getChildPosition(int index) const {
  return children_.text(kColumnPosition, index);
}

int Container::indexOf(const cXComponent* component) const {
  if (!component) return -1;
  for (int i = 0; i < children_.rowCount(); ++i) {
    if (getChild(i) == component) return i;
  }
  return -1;
}

cXComponent* Container::findChild(const char* name) const {
  const std::string wanted = name ? name : "";
  for (int i = 0; i < children_.rowCount(); ++i) {
    if (children_.text(kColumnName, i) == wanted) return getChild(i);
  }
  return nullptr;
}

cXComponent* Container::findNamed(const char* name) const {
  const std::string wanted = name ? name : "";
  for (int i = 0; i < children_.rowCount(); ++i) {
    cXComponent* child = getChild(i);
    if (!child) continue;
    if (children_.text(kColumnName, i) == wanted) return child;
    if (const Container* nested = asContainer(child); nested && nested != this) {
      if (cXComponent* found = nested->findNamed(name)) return found;
    }
  }
  return nullptr;
}

HWND Container::windowForChildren() const {
  if (HWND own = getHandle()) return own;
  return creationParent_ && IsWindow(creationParent_) ? creationParent_ : nullptr;
}

int Container::insertRow(int before, const char* position, cXComponent* component, const char* name) {
  if (!component || component == this) return 0;
  const int existing = indexOf(component);
  if (existing >= 0) return existing;  // already a child: one row per child
  int row;
  if (before >= 0 && children_.moveTo(before)) {
    row = children_.insertRow();
  } else {
    row = children_.appendRow();
  }
  children_.setPointer(kColumnComponent, row, component);
  children_.setText(kColumnPosition, row, position ? position : "");
  children_.setText(kColumnName, row, name ? name : "");
  component->setParent(this);
  HWND parentWindow = windowForChildren();
  if (parentWindow && !component->isValid()) component->create(parentWindow);
  // A child without a font of its own takes the container's.
  HFONT font = getFont();
  if (font && !component->getFont()) component->lendFont(font);
  return row;
}

int Container::add(cXComponent* component, const char* name) {
  return insertNamed(nullptr, component, name);
}

int Container::insertNamed(const char* position, cXComponent* component, const char* name) {
  return insertRow(-1, position, component, name);
}

int Container::insertAt(int index, cXComponent* component, const char* name) {
  return insertAtNamed(index, nullptr, component, name);
}

int Container::insertAtNamed(int index, const char* position, cXComponent* component,
                             const char* name) {
  if (index >= 0 && index < children_.rowCount()) return insertRow(index, position, component, name);
  // No such row: appended without its position.
  return add(component, name);
}

bool Container::removeRow(int row, bool destroy) {
  cXComponent* child = getChild(row);
  if (!children_.deleteRowAt(row)) return false;
  if (child) {
    child->setParent(nullptr);
    if (destroy) delete child;
  }
  return true;
}

bool Container::removeComponent(cXComponent* component, bool destroy) {
  const int row = indexOf(component);
  return row >= 0 && removeRow(row, destroy);
}

bool Container::removeNamed(const char* name, bool destroy) {
  const int row = children_.findText(kColumnName, name ? name : "");
  return row >= 0 && removeRow(row, destroy);
}

bool Container::removeAt(int index, bool destroy) {
  if (index < 0 || index >= children_.rowCount()) return false;
  return removeRow(index, destroy);
}

void Container::forgetChild(cXComponent* child) {
  const int row = indexOf(child);
  if (row >= 0) children_.deleteRowAt(row);
}

void Container::setChildValues(int value) {
  for (int i = 0; i < children_.rowCount(); ++i) {
    if (cXComponent* child = getChild(i)) {
      child->setUserValue1(value);
      child->setUserValue2(value);
    }
  }
}

// Windows, fonts, painting ----------------------------------------------------

bool Container::create(HWND parentHwnd) {
  if (!cXComponent::create(parentHwnd)) return false;
  HWND own = getHandle();
  for (int i = 0; i < children_.rowCount(); ++i) {
    cXComponent* child = getChild(i);
    if (child && !child->isValid()) child->create(own);
  }
  return true;
}

bool Container::hasHandle(HWND hwnd) const {
  if (cXComponent::hasHandle(hwnd)) return true;
  for (int i = 0; i < children_.rowCount(); ++i) {
    cXComponent* child = getChild(i);
    if (child && child->hasHandle(hwnd)) return true;
  }
  return false;
}

bool Container::setFontIndirect(const LOGFONTA& font) {
  if (!cXComponent::setFontIndirect(font)) return false;
  // The children may still hold the font just deleted.
  for (int i = 0; i < children_.rowCount(); ++i) {
    if (cXComponent* child = getChild(i)) child->lendFont(ownFont_);
  }
  return true;
}

void Container::setFontObject(IFont* font) {
  if (!font) return;
  HFONT hfont = nullptr;
  if (SUCCEEDED(font->get_hFont(&hfont)) && hfont) lendFont(hfont);
  for (int i = 0; i < children_.rowCount(); ++i) {
    if (cXComponent* child = getChild(i)) child->setFontObject(font);
  }
}

void Container::lendFont(HFONT font) {
  cXComponent::lendFont(font);
  for (int i = 0; i < children_.rowCount(); ++i) {
    if (cXComponent* child = getChild(i)) child->lendFont(font);
  }
}

void Container::repaintAll() {
  cXComponent::repaintAll();
  for (int i = 0; i < children_.rowCount(); ++i) {
    if (cXComponent* child = getChild(i)) child->repaintAll();
  }
}

HRESULT Container::setPalette(const VARIANT& palette) {
  if (!Palette::replace(palette)) return E_INVALIDARG;
  repaintAll();
  return S_OK;
}

// Focus -----------------------------------------------------------------------

void Container::collectFocusable(std::vector<cXComponent*>& out) const {
  for (int i = 0; i < children_.rowCount(); ++i) {
    cXComponent* child = getChild(i);
    if (!child || !child->isValid() || !child->isVisible() || !child->isEnabled()) continue;
    Container* nested = asContainer(child);
    if (nested && nested->getChildCount() > 0) {
      nested->collectFocusable(out);
    } else if (child->getStyle() & WS_TABSTOP) {
      out.push_back(child);
    }
  }
}

void Container::requestFocus() {
  HWND focus = GetFocus();
  if (focus && hasHandle(focus)) return;
  cXComponent::requestFocus();
}

void Container::transferFocus() {
  if (parent_) {
    parent_->transferFocus();
    return;
  }
  std::vector<cXComponent*> order;
  collectFocusable(order);
  if (order.empty()) return;
  const bool backwards = GetKeyState(VK_SHIFT) < 0;
  HWND focus = GetFocus();
  int current = -1;
  for (size_t i = 0; i < order.size(); ++i) {
    if (order[i]->hasHandle(focus)) current = static_cast<int>(i);
  }
  const int n = static_cast<int>(order.size());
  // Past either end the window around the tree (a control's own window, a dialog) is
  // asked to move the focus on; the focus wraps around only if it stayed in the tree.
  const HWND root = getHandle();
  if (current == (backwards ? 0 : n - 1) && root && (GetWindowLongPtrA(root, GWL_STYLE) & WS_CHILD)) {
    SendMessageA(GetAncestor(root, GA_PARENT), WM_NEXTDLGCTL, backwards ? 1 : 0, FALSE);
    focus = GetFocus();
    if (focus != root && !IsChild(root, focus)) return;
  }
  int next;
  if (current < 0) next = backwards ? n - 1 : 0;
  else next = backwards ? (current + n - 1) % n : (current + 1) % n;
  order[next]->requestFocus();
}

// Layout ----------------------------------------------------------------------

void Container::setLayout(std::unique_ptr<Layout> layout) { layout_ = std::move(layout); }

RECT Container::layoutArea() const {
  RECT area = getClientRect();
  area.left += insets_.left;
  area.top += insets_.top;
  area.right -= insets_.right;
  area.bottom -= insets_.bottom;
  return area;
}

int Container::countWindows() const {
  int count = 0;
  for (int i = 0; i < children_.rowCount(); ++i) {
    cXComponent* child = getChild(i);
    if (!child) continue;
    ++count;
    if (Container* nested = asContainer(child)) count += nested->countWindows();
  }
  return count;
}

void Container::doLayout() {
  if (!layout_ || !windowForChildren()) return;
  const RECT client = getClientRect();
  if (client.right - client.left == 0 || client.bottom - client.top == 0) return;
  HDWP batch = BeginDeferWindowPos(std::max(1, countWindows()));
  layoutStep(batch);
  // A refused DeferWindowPos has nulled the batch; the moves were made at once.
  if (batch) EndDeferWindowPos(batch);
}

void Container::layoutStep(HDWP& batch) {
  const RECT client = getClientRect();
  if (client.right - client.left <= 0 || client.bottom - client.top <= 0) return;
  if (layout_) {
    ContainerItems items(*this, batch);
    LayoutEngine(items, *layout_).layOut(ContainerItems::toRect(layoutArea()));
  }
  for (int i = 0; i < children_.rowCount(); ++i) {
    Container* nested = asContainer(getChild(i));
    if (nested && nested->isValid() && (nested->getStyle() & WS_VISIBLE)) nested->layoutStep(batch);
  }
}

SIZE Container::getPreferredSize() {
  if (!layout_) return SIZE{0, 0};
  HDWP none = nullptr;
  ContainerItems items(*this, none);
  LayoutEngine engine(items, *layout_);
  if (engine.measure().count == 0) return SIZE{0, 0};
  return plusInsets(ContainerItems::toSIZE(engine.preferredSize(false)), insets_);
}

SIZE Container::getPreferredSizeIn(const RECT& area) {
  if (!layout_) return SIZE{0, 0};
  HDWP none = nullptr;
  ContainerItems items(*this, none);
  LayoutEngine engine(items, *layout_);
  if (engine.measure().count == 0) return SIZE{0, 0};
  const Rect inner{area.left + insets_.left, area.top + insets_.top, area.right - insets_.right,
                   area.bottom - insets_.bottom};
  return plusInsets(ContainerItems::toSIZE(engine.preferredSizeIn(inner)), insets_);
}

void Container::initializeSplit() {
  if (!layout_) return;
  HDWP none = nullptr;
  ContainerItems items(*this, none);
  LayoutEngine(items, *layout_).preferredSize(true);
}

SIZE Container::layoutGrid(const RECT& area, bool place, HDWP& batch) {
  if (!layout_) return SIZE{0, 0};
  ContainerItems items(*this, batch);
  return ContainerItems::toSIZE(LayoutEngine(items, *layout_).layoutGrid(ContainerItems::toRect(area), place));
}

SIZE Container::layoutBorderRegion(const RECT& area, int region, bool place, HDWP& batch) {
  if (!layout_) return SIZE{0, 0};
  ContainerItems items(*this, batch);
  return ContainerItems::toSIZE(
      LayoutEngine(items, *layout_).layoutBorderRegion(ContainerItems::toRect(area), region, place));
}

SIZE Container::layoutFlow(const RECT& area, int cellWidth, int cellHeight, int alignment, bool place,
                           HDWP& batch) {
  if (!layout_) return SIZE{0, 0};
  ContainerItems items(*this, batch);
  return ContainerItems::toSIZE(LayoutEngine(items, *layout_).layoutFlow(
      ContainerItems::toRect(area), cellWidth, cellHeight, alignment, place));
}

SIZE Container::layoutTabs(const RECT& area, HDWP& batch) {
  if (!layout_ || !isKindOf(layout_.get(), &records::TabLayout)) return SIZE{0, 0};
  ContainerItems items(*this, batch);
  return ContainerItems::toSIZE(LayoutEngine(items, *layout_).layoutTabs(ContainerItems::toRect(area)));
}

SIZE Container::layoutSplitter(const RECT& area, int orientation, bool place, HDWP& batch) {
  if (!layout_) return SIZE{0, 0};
  ContainerItems items(*this, batch);
  return ContainerItems::toSIZE(
      LayoutEngine(items, *layout_).layoutSplitter(ContainerItems::toRect(area), orientation, place));
}

}  // namespace toolkit
