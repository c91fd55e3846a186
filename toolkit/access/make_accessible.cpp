#include "toolkit/access/make_accessible.h"

#include <new>

#include "toolkit/access/TableAccessible.h"
#include "toolkit/base/class_records.h"
#include "toolkit/table/Table.h"

namespace toolkit {

ComponentAccessible* makeAccessible(cXComponent& component) {
  if (isKindOf(&component, &records::Table)) return new (std::nothrow) TableAccessible(static_cast<Table&>(component));
  if (whichOf(&component, &records::Label, &records::Button, &records::cXEdit2) >= 0)
    return new (std::nothrow) ComponentAccessible(component);
  return nullptr;
}

}  // namespace toolkit
