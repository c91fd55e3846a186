#pragma once
// The stand-in's IGeoObjectEnum: an object's attributes, or a list of objects, one per
// Next; S_FALSE, a null item and 0 at the end.

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneObjectEnum final : public ComObject<IGeoObjectEnum> {
public:
  // attributesOf: the object whose attributes are listed, or SIZE_MAX for `objects`.
  SceneObjectEnum(SceneRef scene, std::size_t attributesOf, std::vector<std::size_t> objects);

  CHARTSCENE_RESERVED(3)
  STDMETHODIMP Next(ULONG count, IUnknown** item, ULONG* fetched) override;

private:
  SceneRef scene_;
  std::size_t attributesOf_;
  std::vector<std::size_t> objects_;
  std::size_t next_ = 0;
};

}  // namespace br::chartscene
