#pragma once
// The host's hierarchy objects as a HierarchySource: each object met gets a handle (its
// index here) and keeps a reference until the source goes. Related objects come from
// GetRelated (slot 12); a node's level is its attribute 57003 as VT_UI2, anything else
// counting as unreadable.

#include <windows.h>

#include <optional>
#include <vector>

#include <wrl/client.h>

#include "GeoData.h"
#include "inspector/format/hierarchy_tree.h"

namespace br::inspector {

class GeoHierarchySource final : public HierarchySource {
public:
  // The first handle (0) is the object given.
  explicit GeoHierarchySource(IGeoObject* start);

  bool Related(std::size_t handle, std::vector<std::size_t>& related) override;
  std::optional<HierarchyItem> Describe(std::size_t handle) override;

  IGeoObject* Object(std::size_t handle) const { return handle < objects_.size() ? objects_[handle].Get() : nullptr; }

private:
  std::vector<Microsoft::WRL::ComPtr<IGeoObject>> objects_;
};

HierarchyId HierarchyIdOf(const GUID& guid);

}  // namespace br::inspector
