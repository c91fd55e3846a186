#include "host/chartscene/server/SceneAttribute.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include "host/chartscene/server/scene_variants.h"

namespace br::chartscene {

SceneAttribute::SceneAttribute(SceneRef scene, std::size_t object, std::size_t attribute)
    : ComObject<IGeoAttribute>("Attribute"), scene_(std::move(scene)), object_(object), attribute_(attribute) {}

IGeoAttribute* NewAttribute(const SceneRef& scene, std::size_t object, std::size_t attribute) {
  return new SceneAttribute(scene, object, attribute);
}

STDMETHODIMP SceneAttribute::GetOwner(IUnknown** owner) {
  if (owner == nullptr) return E_POINTER;
  *owner = nullptr;
  SCENE_CALL("IGeoAttribute.GetOwner");
  *owner = NewObject(scene_, object_);
  return S_OK;
}

STDMETHODIMP SceneAttribute::GetCode(long* code) {
  SCENE_CALL("IGeoAttribute.GetCode");
  if (code == nullptr) return E_POINTER;
  *code = scene_->Model().objects[object_].attributes[attribute_].code;
  return S_OK;
}

STDMETHODIMP SceneAttribute::GetValue(VARIANT* value) {
  if (value == nullptr) return E_POINTER;
  VariantInit(value);
  SCENE_CALL("IGeoAttribute.GetValue");
  if (MisanswerVariant("IGeoAttribute.GetValue", value)) return S_OK;
  return VariantFromTyped(scene_->Model().objects[object_].attributes[attribute_].value, value);
}

}  // namespace br::chartscene
