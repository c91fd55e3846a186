#pragma once
// One visible child at a time, filling the container; the others are hidden.

#include "toolkit/layout/Layout.h"

namespace toolkit {

class TabLayout : public Layout {
public:
  TabLayout() = default;
  const ClassRecord* getClassRecord() const override;

  std::int32_t selectedIndex = 0;   // child-list index of the visible child; -1 = none
  std::int32_t preferredOfAll = 1;  // preferred size over all children (1) or the selected one (0)
};

}  // namespace toolkit
