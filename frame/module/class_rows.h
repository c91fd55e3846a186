// The module's class table (class_rows.cpp) as DllMain and the entry points see it.
#pragma once

#include "frame/module/class_table.h"

namespace br::module {

ClassTable& TheClassTable();

}  // namespace br::module
