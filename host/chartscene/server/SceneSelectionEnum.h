#pragma once
// The objects of a dataset, all of them or those of a selection's classes.

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneSelectionEnum final : public ComObject<IGeoSelectionEnum> {
public:
  SceneSelectionEnum(SceneRef scene, std::size_t dataSet);

  CHARTSCENE_RESERVED(3)
  // An unknown handle gives E_INVALIDARG and keeps the earlier choice.
  STDMETHODIMP SetSelection(long selection, long flags) override;
  CHARTSCENE_RESERVED(5)
  STDMETHODIMP Next(ULONG count, IGeoObject** object, ULONG* fetched) override;
  CHARTSCENE_RESERVED(7)
  STDMETHODIMP Reset() override;

private:
  SceneRef scene_;
  std::size_t dataSet_;
  std::vector<long> classes_;  // empty: every object
  bool selected_ = false;
  std::size_t next_ = 0;
};

}  // namespace br::chartscene
