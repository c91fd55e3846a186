#include "host/chartscene/server/SceneDataSet.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include "host/chartscene/server/SceneRasterDataSet.h"
#include "host/chartscene/server/scene_variants.h"

namespace br::chartscene {

SceneDataSet::SceneDataSet(SceneRef scene, std::size_t index)
    : ComObject<IGeoDataSet, IGeoLibraryDataSet>("DataSet"), scene_(std::move(scene)), index_(index) {
  VariantInit(&lent_);
}

SceneDataSet::~SceneDataSet() { VariantClear(&lent_); }

IUnknown* NewDataSet(const SceneRef& scene, std::size_t dataSet) {
  if (scene->Model().dataSets[dataSet].type == DataSetType::Raster) {
    return static_cast<IGeoRasterDataSet*>(new SceneRasterDataSet(scene, dataSet));
  }
  return static_cast<IGeoDataSet*>(new SceneDataSet(scene, dataSet));
}

bool SceneDataSet::Offers(REFIID iid) const {
  return !IsEqualIID(iid, IID_IGeoLibraryDataSet) || scene_->Model().dataSets[index_].type == DataSetType::Library;
}

STDMETHODIMP SceneDataSet::GetDatabase(IGeoDatabase** database) {
  if (database == nullptr) return E_POINTER;
  *database = nullptr;
  SCENE_CALL("IGeoDataSet.GetDatabase");
  SCENE_MISANSWER_NULL("IGeoDataSet.GetDatabase");
  *database = NewDatabase(scene_, scene_->Model().dataSets[index_].database);
  return S_OK;
}

STDMETHODIMP SceneDataSet::GetKindId(GUID* kind) {
  SCENE_CALL("IGeoDataSet.GetKindId");
  if (kind == nullptr) return E_POINTER;
  *kind = GuidOf(scene_->Model().databases[scene_->Model().dataSets[index_].database].kindId);
  return S_OK;
}

STDMETHODIMP SceneDataSet::GetHeader(SAFEARRAY** header) {
  if (header == nullptr) return E_POINTER;
  *header = nullptr;
  SCENE_CALL("IGeoDataSet.GetHeader");
  if (MisanswerByteArray("IGeoDataSet.GetHeader", header,
                         static_cast<ULONG>(scene_->Model().dataSets[index_].header.size()))) {
    return S_OK;
  }
  *header = ByteArray(scene_->Model().dataSets[index_].header);
  return *header ? S_OK : E_OUTOFMEMORY;
}

STDMETHODIMP SceneDataSet::GetParameters(VARIANT* parameters) {
  if (parameters == nullptr) return E_POINTER;
  VariantInit(parameters);
  SCENE_CALL("IGeoDataSet.GetParameters");
  if (MisanswerVariant("IGeoDataSet.GetParameters", parameters)) return S_OK;
  const SceneDataSetModel& model = scene_->Model().dataSets[index_];
  SAFEARRAY* array = SafeArrayCreateVector(VT_VARIANT, 0, static_cast<ULONG>(model.parameters.size()));
  if (array == nullptr) return E_OUTOFMEMORY;
  for (LONG i = 0; i < static_cast<LONG>(model.parameters.size()); ++i) {
    VARIANT element;
    VariantFromTyped(model.parameters[static_cast<std::size_t>(i)], &element);
    SafeArrayPutElement(array, &i, &element);
    VariantClear(&element);
  }
  switch (model.parameterForm) {
    case ParameterForm::Direct:
      parameters->vt = VT_ARRAY | VT_VARIANT;
      parameters->parray = array;
      return S_OK;
    case ParameterForm::ByReference:
    case ParameterForm::InVariant:
      // By reference the caller frees nothing: the array stays the dataset's, as a host
      // lends its own storage, until the next call or the wrapper's end.
      VariantClear(&lent_);
      lent_.vt = VT_ARRAY | VT_VARIANT;
      lent_.parray = array;
      if (model.parameterForm == ParameterForm::ByReference) {
        parameters->vt = VT_BYREF | VT_ARRAY | VT_VARIANT;
        parameters->pparray = &lent_.parray;
      } else {
        parameters->vt = VT_BYREF | VT_VARIANT;
        parameters->pvarVal = &lent_;
      }
      return S_OK;
  }
  SafeArrayDestroy(array);
  return E_UNEXPECTED;
}

STDMETHODIMP SceneDataSet::GetObjectById(REFGUID id, IGeoObject** object) {
  if (object == nullptr) return E_POINTER;
  *object = nullptr;
  SCENE_CALL("IGeoDataSet.GetObjectById");
  SCENE_MISANSWER_NULL("IGeoDataSet.GetObjectById");
  const std::size_t found = FindObject(scene_->Model(), BytesOf(id));
  if (found == SIZE_MAX || scene_->Model().objects[found].dataSet != index_) return S_FALSE;
  *object = NewObject(scene_, found);
  return S_OK;
}

STDMETHODIMP SceneDataSet::GetObjectEnum(IGeoSelectionEnum** objects) {
  if (objects == nullptr) return E_POINTER;
  *objects = nullptr;
  SCENE_CALL("IGeoDataSet.GetObjectEnum");
  SCENE_MISANSWER_NULL("IGeoDataSet.GetObjectEnum");
  *objects = NewSelectionEnum(scene_, index_);
  return S_OK;
}

STDMETHODIMP SceneDataSet::GetDataSetProperty(long index, VARIANT* value) {
  if (value == nullptr) return E_POINTER;
  VariantInit(value);
  SCENE_CALL("IGeoDataSet.GetDataSetProperty");
  if (MisanswerVariant("IGeoDataSet.GetDataSetProperty", value)) return S_OK;
  const auto& properties = scene_->Model().dataSets[index_].properties;
  const auto found = properties.find(index);
  if (found == properties.end()) return E_INVALIDARG;
  return VariantFromTyped(found->second, value);
}

STDMETHODIMP SceneDataSet::GetDataSet(IGeoDataSet** dataSet) {
  if (dataSet == nullptr) return E_POINTER;
  *dataSet = nullptr;
  SCENE_CALL("IGeoLibraryDataSet.GetDataSet");
  return QueryInterface(IID_IGeoDataSet, reinterpret_cast<void**>(dataSet));
}

}  // namespace br::chartscene
