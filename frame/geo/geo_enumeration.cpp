#include "frame/geo/geo_enumeration.h"

namespace br::geo {

namespace {

// next(item, fetched) asks for one item; T is what the visitor takes.
template <typename T, typename NextCall>
std::size_t Walk(NextCall next, const std::function<bool(T*)>& visit, std::size_t maxItems) {
  std::size_t seen = 0;
  while (seen < maxItems) {
    T* item = nullptr;
    ULONG fetched = 0;
    const HRESULT hr = next(&item, &fetched);
    if (hr != S_OK || fetched == 0 || item == nullptr) {
      if (item != nullptr) item->Release();
      break;
    }
    ++seen;
    bool more = false;
    try {
      more = visit(item);
    } catch (...) {
      item->Release();
      throw;
    }
    item->Release();
    if (!more) break;
  }
  return seen;
}

}  // namespace

std::size_t ForEachItem(IGeoObjectEnum* items, const std::function<bool(IUnknown*)>& visit,
                        std::size_t maxItems) {
  if (items == nullptr) {
    return 0;
  }
  return Walk<IUnknown>([&](IUnknown** item, ULONG* fetched) { return items->Next(1, item, fetched); },
                        visit, maxItems);
}

std::size_t ForEachObject(IGeoSelectionEnum* objects, const std::function<bool(IGeoObject*)>& visit,
                          std::size_t maxItems) {
  if (objects == nullptr) {
    return 0;
  }
  return Walk<IGeoObject>(
      [&](IGeoObject** item, ULONG* fetched) { return objects->Next(1, item, fetched); }, visit,
      maxItems);
}

}  // namespace br::geo
