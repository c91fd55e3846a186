#include "host/chartscene/server/ScenePresParams.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include "host/chartscene/server/scene_variants.h"

namespace br::chartscene {

ScenePresParams::ScenePresParams(SceneRef scene, std::size_t index)
    : ComObject<IPresParams>("PresParams"), scene_(std::move(scene)), index_(index) {}

IPresParams* NewPresParams(const SceneRef& scene, std::size_t params) { return new ScenePresParams(scene, params); }

STDMETHODIMP ScenePresParams::GetParam(long index, VARIANT* value) {
  if (value == nullptr) return E_POINTER;
  VariantInit(value);
  SCENE_CALL("IPresParams.GetParam");
  if (MisanswerVariant("IPresParams.GetParam", value)) return S_OK;
  const auto& values = scene_->Model().presParams[index_].values;
  const auto found = values.find(index);
  if (found == values.end()) return E_INVALIDARG;
  return VariantFromTyped(found->second, value);
}

}  // namespace br::chartscene
