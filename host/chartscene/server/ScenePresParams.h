#pragma once
// Presentation parameters of a scene: typed values by index, as the scene file gives them.

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class ScenePresParams final : public ComObject<IPresParams> {
public:
  ScenePresParams(SceneRef scene, std::size_t index);
  // E_INVALIDARG for an index the scene does not give.
  STDMETHODIMP GetParam(long index, VARIANT* value) override;

private:
  SceneRef scene_;
  std::size_t index_;
};

}  // namespace br::chartscene
