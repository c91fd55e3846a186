#pragma once
// A colour map of a scene: chart colour numbers to indices of the scene's logical palette.

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneColorMap final : public ComObject<IColorMap> {
public:
  SceneColorMap(SceneRef scene, std::size_t index);

  CHARTSCENE_RESERVED(3)
  CHARTSCENE_RESERVED(4)
  CHARTSCENE_RESERVED(5)
  CHARTSCENE_RESERVED(6)
  CHARTSCENE_RESERVED(7)
  CHARTSCENE_RESERVED(8)
  // E_INVALIDARG for a colour number the map does not hold.
  STDMETHODIMP GetPaletteIndex(long colorNumber, USHORT* index) override;

private:
  SceneRef scene_;
  std::size_t index_;
};

}  // namespace br::chartscene
