#pragma once
// The children of a container as the layout arithmetic sees them. The container
// answers these questions about its child list; the native tests answer them
// from plain records.

#include <string>

#include "toolkit/base/geometry.h"

namespace toolkit {

class LayoutItems {
public:
  virtual ~LayoutItems();

  virtual int count() const = 0;                 // rows of the child list
  virtual bool isPresent(int index) const = 0;   // a component with a live window
  virtual Size preferredSize(int index) = 0;
  virtual Size preferredSizeIn(int index, const Rect& area) = 0;
  virtual bool keepsOwnHeight(int index) const = 0;  // a drop-down list (Choice)
  virtual std::string position(int index) const = 0; // the layout constraint
  virtual Rect bounds(int index) const = 0;      // last bounds the toolkit gave it
  virtual void place(int index, int x, int y, int width, int height) = 0;
  virtual void show(int index, bool visible) = 0;
};

}  // namespace toolkit
