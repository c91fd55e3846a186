#include "toolkit/layout/Layout.h"

#include "toolkit/base/class_records.h"

namespace toolkit {

const ClassRecord* Layout::getClassRecord() const { return &records::Layout; }

Layout::~Layout() = default;

}  // namespace toolkit
