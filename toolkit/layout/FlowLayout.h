#pragma once
// Rows of equally sized cells, wrapped when a row is full.

#include "toolkit/layout/Layout.h"

namespace toolkit {

class FlowLayout : public Layout {
public:
  // The controls' usual flow: centred rows, 3-pixel gaps, children at their own width.
  FlowLayout();
  FlowLayout(std::int32_t alignment, std::int32_t hgap, std::int32_t vgap, bool usePreferredWidth);
  const ClassRecord* getClassRecord() const override;
};

}  // namespace toolkit
