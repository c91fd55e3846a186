#include "host/chartscene/server/SceneObject.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include <cmath>

#include "host/brgbase/map_metrics.h"
#include "host/chartscene/model/scene_geometry.h"
#include "host/chartscene/server/scene_text.h"
#include "host/chartscene/server/scene_variants.h"

namespace br::chartscene {

SceneObject::SceneObject(SceneRef scene, std::size_t index)
    : ComObject<IGeoObject>("Object"), scene_(std::move(scene)), index_(index) {}

IGeoObject* NewObject(const SceneRef& scene, std::size_t object) { return new SceneObject(scene, object); }

STDMETHODIMP SceneObject::GetDataSet(IGeoDataSet** dataSet) {
  if (dataSet == nullptr) return E_POINTER;
  *dataSet = nullptr;
  SCENE_CALL("IGeoObject.GetDataSet");
  SCENE_MISANSWER_NULL("IGeoObject.GetDataSet");
  IUnknown* wrapper = NewDataSet(scene_, Model().dataSet);
  const HRESULT hr = wrapper->QueryInterface(IID_IGeoDataSet, reinterpret_cast<void**>(dataSet));
  wrapper->Release();
  return hr;
}

STDMETHODIMP SceneObject::GetKindId(GUID* kind) {
  SCENE_CALL("IGeoObject.GetKindId");
  if (kind == nullptr) return E_POINTER;
  const SceneModel& model = scene_->Model();
  *kind = GuidOf(model.databases[model.dataSets[Model().dataSet].database].kindId);
  return S_OK;
}

STDMETHODIMP SceneObject::GetId(GUID* id) {
  SCENE_CALL("IGeoObject.GetId");
  if (id == nullptr) return E_POINTER;
  *id = GuidOf(ObjectIdentity(scene_->Model(), index_));
  return S_OK;
}

STDMETHODIMP SceneObject::GetClassCode(long* classCode) {
  SCENE_CALL("IGeoObject.GetClassCode");
  if (classCode == nullptr) return E_POINTER;
  *classCode = Model().classCode;
  return S_OK;
}

STDMETHODIMP SceneObject::GetPrimitive(long* primitive) {
  SCENE_CALL("IGeoObject.GetPrimitive");
  if (primitive == nullptr) return E_POINTER;
  *primitive = Model().primitive;
  return S_OK;
}

STDMETHODIMP SceneObject::GetAttribute(long code, IGeoAttribute** attribute) {
  if (attribute == nullptr) return E_POINTER;
  *attribute = nullptr;
  SCENE_CALL("IGeoObject.GetAttribute");
  SCENE_MISANSWER_NULL("IGeoObject.GetAttribute");
  const auto& attributes = Model().attributes;
  for (std::size_t i = 0; i < attributes.size(); ++i) {
    if (attributes[i].code == code) {
      *attribute = NewAttribute(scene_, index_, i);
      return S_OK;
    }
  }
  return S_FALSE;
}

STDMETHODIMP SceneObject::GetAttributes(IGeoObjectEnum** attributes) {
  if (attributes == nullptr) return E_POINTER;
  *attributes = nullptr;
  SCENE_CALL("IGeoObject.GetAttributes");
  *attributes = NewAttributeEnum(scene_, index_);
  return S_OK;
}

STDMETHODIMP SceneObject::GetRelated(IGeoObjectEnum** objects) {
  if (objects == nullptr) return E_POINTER;
  *objects = nullptr;
  SCENE_CALL("IGeoObject.GetRelated");
  std::vector<std::size_t> related = Model().holders;
  related.insert(related.end(), Model().members.begin(), Model().members.end());
  *objects = NewObjectEnum(scene_, std::move(related));
  return S_OK;
}

STDMETHODIMP SceneObject::GetMembers(IGeoObjectEnum** objects) {
  if (objects == nullptr) return E_POINTER;
  *objects = nullptr;
  SCENE_CALL("IGeoObject.GetMembers");
  *objects = NewObjectEnum(scene_, Model().members);
  return S_OK;
}

STDMETHODIMP SceneObject::HitTest(IGeoProjection* projection, const RECT* pixels, GEO_MAP_METRICS* metrics) {
  SCENE_CALL("IGeoObject.HitTest");
  if (projection == nullptr || pixels == nullptr) return E_POINTER;
  if (!brgbase::IsInitialisedMetrics(metrics)) return E_INVALIDARG;
  std::vector<PixelPoint> shape;
  for (const GeoPosition& position : Model().geometry) {
    GEO_POINT geo{static_cast<long>(std::lround(position.lat * 1e7)), static_cast<long>(std::lround(position.lon * 1e7))};
    POINT pixel{};
    const HRESULT hr = projection->GeoToPixel(&geo, &pixel, 1);
    if (FAILED(hr)) return hr;
    shape.push_back({pixel.x, pixel.y});
  }
  const PixelRect rect{pixels->left, pixels->top, pixels->right, pixels->bottom};
  return ShapeHitsRect(Model().primitive, shape, rect) ? S_OK : S_FALSE;
}

STDMETHODIMP SceneObject::GetText(BSTR* text) {
  if (text == nullptr) return E_POINTER;
  *text = nullptr;
  SCENE_CALL("IGeoObject.GetText");
  *text = BstrFromUtf8(Model().text);
  return *text ? S_OK : E_OUTOFMEMORY;
}

STDMETHODIMP SceneObject::GetProperty(long index, VARIANT* value) {
  if (value == nullptr) return E_POINTER;
  VariantInit(value);
  SCENE_CALL("IGeoObject.GetProperty");
  const auto found = Model().properties.find(index);
  if (found == Model().properties.end()) return E_INVALIDARG;
  return VariantFromTyped(found->second, value);
}

STDMETHODIMP SceneObject::GetStorage(IStorage** storage) {
  if (storage == nullptr) return E_POINTER;
  *storage = nullptr;
  SCENE_CALL("IGeoObject.GetStorage");
  if (Model().files.empty()) return STG_E_FILENOTFOUND;
  ILockBytes* memory = nullptr;
  HRESULT hr = CreateILockBytesOnHGlobal(nullptr, TRUE, &memory);
  if (FAILED(hr)) return hr;
  IStorage* made = nullptr;
  hr = StgCreateDocfileOnILockBytes(memory, STGM_CREATE | STGM_READWRITE | STGM_SHARE_EXCLUSIVE, 0, &made);
  memory->Release();  // the storage holds it
  if (FAILED(hr)) return hr;
  for (const StoredFile& file : Model().files) {
    IStream* stream = nullptr;
    hr = made->CreateStream(WideFromUtf8(file.name).c_str(), STGM_CREATE | STGM_WRITE | STGM_SHARE_EXCLUSIVE, 0,
                            0, &stream);
    if (FAILED(hr)) break;
    ULONG written = 0;
    hr = stream->Write(file.bytes.data(), static_cast<ULONG>(file.bytes.size()), &written);
    stream->Release();
    if (FAILED(hr)) break;
  }
  if (SUCCEEDED(hr)) hr = made->Commit(STGC_DEFAULT);
  if (FAILED(hr)) {
    made->Release();
    return hr;
  }
  *storage = made;
  return S_OK;
}

}  // namespace br::chartscene
