#include "host/chartscene/server/SceneObjectEnum.h"

namespace br::chartscene {

SceneObjectEnum::SceneObjectEnum(SceneRef scene, std::size_t attributesOf, std::vector<std::size_t> objects)
    : ComObject<IGeoObjectEnum>("ObjectEnum"),
      scene_(std::move(scene)),
      attributesOf_(attributesOf),
      objects_(std::move(objects)) {}

IGeoObjectEnum* NewAttributeEnum(const SceneRef& scene, std::size_t object) {
  return new SceneObjectEnum(scene, object, {});
}

IGeoObjectEnum* NewObjectEnum(const SceneRef& scene, std::vector<std::size_t> objects) {
  return new SceneObjectEnum(scene, SIZE_MAX, std::move(objects));
}

STDMETHODIMP SceneObjectEnum::Next(ULONG count, IUnknown** item, ULONG* fetched) {
  if (item == nullptr || fetched == nullptr) return E_POINTER;
  *item = nullptr;
  *fetched = 0;
  SCENE_CALL("IGeoObjectEnum.Next");
  if (count != 1) return E_INVALIDARG;
  const std::size_t size =
      attributesOf_ != SIZE_MAX ? scene_->Model().objects[attributesOf_].attributes.size() : objects_.size();
  if (next_ >= size) return S_FALSE;
  if (attributesOf_ != SIZE_MAX) {
    *item = NewAttribute(scene_, attributesOf_, next_);
  } else {
    *item = NewObject(scene_, objects_[next_]);
  }
  ++next_;
  *fetched = 1;
  return S_OK;
}

}  // namespace br::chartscene
