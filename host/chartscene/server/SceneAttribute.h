#pragma once
// One attribute of a scene object.

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneAttribute final : public ComObject<IGeoAttribute> {
public:
  SceneAttribute(SceneRef scene, std::size_t object, std::size_t attribute);

  // The owning object (a new wrapper).
  STDMETHODIMP GetOwner(IUnknown** owner) override;
  STDMETHODIMP GetCode(long* code) override;
  CHARTSCENE_RESERVED(5)
  STDMETHODIMP GetValue(VARIANT* value) override;

private:
  SceneRef scene_;
  std::size_t object_;
  std::size_t attribute_;
};

}  // namespace br::chartscene
