#include "toolkit/layout/Layout.h"

#include "toolkit/base/ClassRecords.h"

namespace toolkit {

const ClassRecord* Layout::getClassRecord() const { return &records::Layout; }

Layout::~Layout() = default;

}  // namespace toolkit
