#include "toolkit/layout/TabLayout.h"

#include "toolkit/base/class_records.h"

namespace toolkit {

const ClassRecord* TabLayout::getClassRecord() const { return &records::TabLayout; }

}  // namespace toolkit
