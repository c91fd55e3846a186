#include "toolkit/core/ContainerItems.h"

#include "toolkit/base/class_records.h"
#include "toolkit/core/Container.h"

namespace toolkit {

ContainerItems::ContainerItems(const Container& container, HDWP& batch)
    : container_(container), batch_(batch) {}

cXComponent* ContainerItems::child(int index) const { return container_.getChild(index); }

int ContainerItems::count() const { return container_.getChildCount(); }

bool ContainerItems::isPresent(int index) const {
  cXComponent* c = child(index);
  return c && c->isValid();
}

Size ContainerItems::preferredSize(int index) {
  cXComponent* c = child(index);
  if (!c) return {};
  SIZE s = c->getPreferredSize();
  return Size{s.cx, s.cy};
}

Size ContainerItems::preferredSizeIn(int index, const Rect& area) {
  cXComponent* c = child(index);
  if (!c) return {};
  SIZE s = c->getPreferredSizeIn(toRECT(area));
  return Size{s.cx, s.cy};
}

bool ContainerItems::keepsOwnHeight(int index) const {
  return isKindOf(child(index), &records::Choice);
}

std::string ContainerItems::position(int index) const { return container_.getChildPosition(index); }

Rect ContainerItems::bounds(int index) const {
  cXComponent* c = child(index);
  return c ? toRect(c->bounds()) : Rect{};
}

void ContainerItems::place(int index, int x, int y, int width, int height) {
  cXComponent* c = child(index);
  if (!c) return;
  c->deferBounds(batch_, x, y, width, height);
  c->validate();
}

void ContainerItems::show(int index, bool visible) {
  if (cXComponent* c = child(index)) c->show(visible);
}

}  // namespace toolkit
