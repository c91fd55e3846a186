#pragma once
// The texts the hierarchy panel shows of one node: its title (the catalogue's class
// name, else the class code) and a row per attribute, "name: value", with the value text
// chosen by the VARIANT's type.

#include <windows.h>

#include <string>
#include <vector>

#include "GeoData.h"
#include "inspector/format/hierarchy_values.h"

namespace br::inspector {

// The value as the panel's rules see it; the catalogue (may be null) names enumerated values.
HierarchyValue ToHierarchyValue(const VARIANT& value, IGeoCatalog* catalogue, long attributeCode);

std::string HierarchyTitle(IGeoCatalog* catalogue, long classCode);
// One row per attribute in the object's order; none when the attributes cannot be listed.
std::vector<std::string> HierarchyAttributeRows(IGeoObject* object, IGeoCatalog* catalogue);

}  // namespace br::inspector
