#pragma once
// A raster dataset of a scene: only IGeoRasterDataSet, whose records are the byte records
// the scene file describes.

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneRasterDataSet final : public ComObject<IGeoRasterDataSet> {
public:
  SceneRasterDataSet(SceneRef scene, std::size_t index);

  CHARTSCENE_RESERVED(3)
  CHARTSCENE_RESERVED(4)
  CHARTSCENE_RESERVED(5)
  CHARTSCENE_RESERVED(6)
  // The object carrying the issue record: this dataset.
  STDMETHODIMP GetChartIssue(IUnknown** issue) override;
  STDMETHODIMP GetChartIssueRecord(VARIANT* record) override;
  CHARTSCENE_RESERVED(9)
  // Index 0 only.
  STDMETHODIMP GetChartHeader(long index, VARIANT* header) override;

private:
  SceneRef scene_;
  std::size_t index_;
};

}  // namespace br::chartscene
