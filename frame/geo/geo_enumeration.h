#pragma once
// Walking the host's enumerators one item at a time. The walk stops at the first answer
// that is not S_OK with an item and a count of at least 1, when the visitor returns
// false, or after kMaxItems items (an enumerator that never ends). Every item received
// is released here, also the one that came with a stopping answer; the visitor borrows it.

#include <windows.h>

#include <cstddef>
#include <functional>

#include "GeoData.h"

namespace br::geo {

inline constexpr std::size_t kMaxItems = 100000;

// Returns the number of items handed to the visitor.
std::size_t ForEachItem(IGeoObjectEnum* items, const std::function<bool(IUnknown*)>& visit,
                        std::size_t maxItems = kMaxItems);
std::size_t ForEachObject(IGeoSelectionEnum* objects, const std::function<bool(IGeoObject*)>& visit,
                          std::size_t maxItems = kMaxItems);

}  // namespace br::geo
