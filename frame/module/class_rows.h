// The module's class table (class_rows.cpp) as DllMain and the entry points see it.
#pragma once

#include "frame/module/ClassTable.h"

namespace br::module {

ClassTable& TheClassTable();

}  // namespace br::module
