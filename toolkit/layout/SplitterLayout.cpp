#include "toolkit/layout/SplitterLayout.h"

#include "toolkit/base/class_records.h"

namespace toolkit {

SplitterLayout::SplitterLayout(std::int32_t orientation, std::int32_t gap) {
  mode = orientation;
  hgap = gap;
}

const ClassRecord* SplitterLayout::getClassRecord() const { return &records::SplitterLayout; }

}  // namespace toolkit
