#pragma once
// An object of a scene: class, primitive, attributes, related objects both ways, hit test
// against any IGeoProjection (with a map-metrics block the stand-in geodesy library made),
// properties and the files stored with it (an IStorage over memory, one stream each).

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneObject final : public ComObject<IGeoObject> {
public:
  SceneObject(SceneRef scene, std::size_t index);

  STDMETHODIMP GetDataSet(IGeoDataSet** dataSet) override;
  STDMETHODIMP GetKindId(GUID* kind) override;
  STDMETHODIMP GetId(GUID* id) override;
  CHARTSCENE_RESERVED(6)
  STDMETHODIMP GetClassCode(long* classCode) override;
  STDMETHODIMP GetPrimitive(long* primitive) override;
  CHARTSCENE_RESERVED(9)
  STDMETHODIMP GetAttribute(long code, IGeoAttribute** attribute) override;
  STDMETHODIMP GetAttributes(IGeoObjectEnum** attributes) override;
  STDMETHODIMP GetRelated(IGeoObjectEnum** objects) override;
  STDMETHODIMP GetMembers(IGeoObjectEnum** objects) override;
  CHARTSCENE_RESERVED(14)
  STDMETHODIMP HitTest(IGeoProjection* projection, const RECT* pixels, GEO_MAP_METRICS* metrics) override;
  CHARTSCENE_RESERVED(16)
  STDMETHODIMP GetText(BSTR* text) override;
  CHARTSCENE_RESERVED(18)
  STDMETHODIMP GetProperty(long index, VARIANT* value) override;
  STDMETHODIMP GetStorage(IStorage** storage) override;

private:
  const SceneObjectModel& Model() const { return scene_->Model().objects[index_]; }

  SceneRef scene_;
  std::size_t index_;
};

}  // namespace br::chartscene
