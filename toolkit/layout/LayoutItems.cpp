#include "toolkit/layout/LayoutItems.h"

namespace toolkit {

LayoutItems::~LayoutItems() = default;

}  // namespace toolkit
