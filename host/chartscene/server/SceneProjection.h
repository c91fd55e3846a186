#pragma once
// A projection of a scene: positions (1e-7 degree) to the pixels of its display,
// Mercator or plate carrée about its centre.

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneProjection final : public ComObject<IGeoProjection> {
public:
  SceneProjection(SceneRef scene, std::size_t index);

  CHARTSCENE_RESERVED(3)
  CHARTSCENE_RESERVED(4)
  CHARTSCENE_RESERVED(5)
  CHARTSCENE_RESERVED(6)
  CHARTSCENE_RESERVED(7)
  CHARTSCENE_RESERVED(8)
  CHARTSCENE_RESERVED(9)
  STDMETHODIMP GeoToPixel(const GEO_POINT* geo, POINT* pixels, long count) override;

private:
  SceneRef scene_;
  std::size_t index_;
};

}  // namespace br::chartscene
