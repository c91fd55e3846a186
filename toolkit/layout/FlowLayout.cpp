#include "toolkit/layout/FlowLayout.h"

#include "toolkit/base/class_records.h"

namespace toolkit {

FlowLayout::FlowLayout() : FlowLayout(kAlignCenter, 3, 3, true) {}

FlowLayout::FlowLayout(std::int32_t alignment, std::int32_t h, std::int32_t v, bool preferredWidth) {
  mode = alignment;
  hgap = h;
  vgap = v;
  usePreferredWidth = preferredWidth ? 1 : 0;
}

const ClassRecord* FlowLayout::getClassRecord() const { return &records::FlowLayout; }

}  // namespace toolkit
