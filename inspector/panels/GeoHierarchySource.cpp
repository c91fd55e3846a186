#include "inspector/panels/GeoHierarchySource.h"

#include <cstring>

#include "frame/geo/geo_enumeration.h"
#include "inspector/format/hierarchy_values.h"

using Microsoft::WRL::ComPtr;

namespace br::inspector {

static_assert(sizeof(GUID) == sizeof(HierarchyId), "an identity is 16 bytes");

HierarchyId HierarchyIdOf(const GUID& guid) {
  HierarchyId id{};
  std::memcpy(id.data(), &guid, id.size());
  return id;
}

GeoHierarchySource::GeoHierarchySource(IGeoObject* start) { objects_.emplace_back(start); }

bool GeoHierarchySource::Related(std::size_t handle, std::vector<std::size_t>& related) {
  IGeoObject* object = Object(handle);
  ComPtr<IGeoObjectEnum> items;
  if (object == nullptr || FAILED(object->GetRelated(&items)) || !items) return false;
  geo::ForEachItem(items.Get(), [&](IUnknown* item) {
    ComPtr<IGeoObject> other;
    if (SUCCEEDED(item->QueryInterface(IID_IGeoObject, reinterpret_cast<void**>(other.GetAddressOf()))) && other) {
      related.push_back(objects_.size());
      objects_.push_back(std::move(other));
    }
    return true;
  });
  return true;
}

std::optional<HierarchyItem> GeoHierarchySource::Describe(std::size_t handle) {
  IGeoObject* object = Object(handle);
  HierarchyItem item;
  GUID id{};
  if (object == nullptr || FAILED(object->GetId(&id)) || FAILED(object->GetClassCode(&item.classCode))) {
    return std::nullopt;
  }
  item.id = HierarchyIdOf(id);
  if (item.classCode != kClassHierarchyNode) return item;
  ComPtr<IGeoAttribute> level;
  VARIANT value;
  VariantInit(&value);
  if (object->GetAttribute(kCodeHierarchyLevel, &level) == S_OK && level && SUCCEEDED(level->GetValue(&value)) &&
      value.vt == VT_UI2) {
    item.level = value.uiVal;
  }
  VariantClear(&value);
  return item;
}

}  // namespace br::inspector
