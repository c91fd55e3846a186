#include "host/chartscene/server/SceneRasterDataSet.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include "host/chartscene/server/scene_variants.h"

namespace br::chartscene {

namespace {

HRESULT RecordVariant(const std::vector<unsigned char>& bytes, VARIANT* out) {
  if (bytes.empty()) return E_FAIL;  // the scene gives no such record
  out->parray = ByteArray(bytes);
  if (out->parray == nullptr) return E_OUTOFMEMORY;
  out->vt = VT_ARRAY | VT_UI1;
  return S_OK;
}

}  // namespace

SceneRasterDataSet::SceneRasterDataSet(SceneRef scene, std::size_t index)
    : ComObject<IGeoRasterDataSet>("RasterDataSet"), scene_(std::move(scene)), index_(index) {}

STDMETHODIMP SceneRasterDataSet::GetChartIssue(IUnknown** issue) {
  if (issue == nullptr) return E_POINTER;
  *issue = nullptr;
  SCENE_CALL("IGeoRasterDataSet.GetChartIssue");
  SCENE_MISANSWER_NULL("IGeoRasterDataSet.GetChartIssue");
  if (scene_->Model().dataSets[index_].chartIssue.empty()) return E_FAIL;
  return QueryInterface(IID_IUnknown, reinterpret_cast<void**>(issue));
}

STDMETHODIMP SceneRasterDataSet::GetChartIssueRecord(VARIANT* record) {
  if (record == nullptr) return E_POINTER;
  VariantInit(record);
  SCENE_CALL("IGeoRasterDataSet.GetChartIssueRecord");
  if (MisanswerVariant("IGeoRasterDataSet.GetChartIssueRecord", record, VT_UI1)) return S_OK;
  return RecordVariant(scene_->Model().dataSets[index_].chartIssue, record);
}

STDMETHODIMP SceneRasterDataSet::GetChartHeader(long index, VARIANT* header) {
  if (header == nullptr) return E_POINTER;
  VariantInit(header);
  SCENE_CALL("IGeoRasterDataSet.GetChartHeader");
  if (MisanswerVariant("IGeoRasterDataSet.GetChartHeader", header, VT_UI1)) return S_OK;
  if (index != 0) return E_INVALIDARG;
  return RecordVariant(scene_->Model().dataSets[index_].chartHeader, header);
}

}  // namespace br::chartscene
