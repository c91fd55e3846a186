#pragma once
// A container's child list as the layout arithmetic sees it. Placements become
// deferred moves in the running batch, each followed by the child's validate.

#include <windows.h>

#include "toolkit/layout/LayoutItems.h"

namespace toolkit {

class Container;
class cXComponent;

class ContainerItems : public LayoutItems {
public:
  ContainerItems(const Container& container, HDWP& batch);

  int count() const override;
  bool isPresent(int index) const override;
  Size preferredSize(int index) override;
  Size preferredSizeIn(int index, const Rect& area) override;
  bool keepsOwnHeight(int index) const override;
  std::string position(int index) const override;
  Rect bounds(int index) const override;
  void place(int index, int x, int y, int width, int height) override;
  void show(int index, bool visible) override;

  static Rect toRect(const RECT& r) { return Rect{r.left, r.top, r.right, r.bottom}; }
  static RECT toRECT(const Rect& r) { return RECT{r.left, r.top, r.right, r.bottom}; }
  static SIZE toSIZE(const Size& s) { return SIZE{s.width, s.height}; }

private:
  cXComponent* child(int index) const;

  const Container& container_;
  HDWP& batch_;
};

}  // namespace toolkit
