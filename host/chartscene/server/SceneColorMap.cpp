#include "host/chartscene/server/SceneColorMap.h"

#include "host/chartscene/server/scene_misanswer_values.h"

namespace br::chartscene {

SceneColorMap::SceneColorMap(SceneRef scene, std::size_t index)
    : ComObject<IColorMap>("ColorMap"), scene_(std::move(scene)), index_(index) {}

IColorMap* NewColorMap(const SceneRef& scene, std::size_t map) { return new SceneColorMap(scene, map); }

STDMETHODIMP SceneColorMap::GetPaletteIndex(long colorNumber, USHORT* index) {
  if (index == nullptr) return E_POINTER;
  *index = 0;
  SCENE_CALL("IColorMap.GetPaletteIndex");
  SCENE_MISANSWER_NULL("IColorMap.GetPaletteIndex");
  const auto& indices = scene_->Model().colorMaps[index_].indices;
  const auto found = indices.find(colorNumber);
  if (found == indices.end()) return E_INVALIDARG;
  *index = found->second;
  return S_OK;
}

}  // namespace br::chartscene
