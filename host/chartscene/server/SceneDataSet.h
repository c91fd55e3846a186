#pragma once
// A vector or library dataset of a scene: its header record, parameters (in the form the
// scene names), properties, objects by identity and an enumerator over its objects.
// Library datasets also answer IGeoLibraryDataSet.

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneDataSet final : public ComObject<IGeoDataSet, IGeoLibraryDataSet> {
public:
  SceneDataSet(SceneRef scene, std::size_t index);

  STDMETHODIMP GetDatabase(IGeoDatabase** database) override;
  STDMETHODIMP GetKindId(GUID* kind) override;
  CHARTSCENE_RESERVED(5)
  CHARTSCENE_RESERVED(6)
  CHARTSCENE_RESERVED(7)
  CHARTSCENE_RESERVED(8)
  CHARTSCENE_RESERVED(9)
  STDMETHODIMP GetHeader(SAFEARRAY** header) override;
  STDMETHODIMP GetParameters(VARIANT* parameters) override;
  CHARTSCENE_RESERVED(12)
  STDMETHODIMP GetObjectById(REFGUID id, IGeoObject** object) override;
  STDMETHODIMP GetObjectEnum(IGeoSelectionEnum** objects) override;
  CHARTSCENE_RESERVED(15)
  CHARTSCENE_RESERVED(16)
  CHARTSCENE_RESERVED(17)
  CHARTSCENE_RESERVED(18)
  CHARTSCENE_RESERVED(19)
  CHARTSCENE_RESERVED(20)
  CHARTSCENE_RESERVED(21)
  CHARTSCENE_RESERVED(22)
  CHARTSCENE_RESERVED(23)
  STDMETHODIMP GetDataSetProperty(long index, VARIANT* value) override;

  // IGeoLibraryDataSet: the dataset itself carries the library's header and parameters.
  STDMETHODIMP GetDataSet(IGeoDataSet** dataSet) override;

protected:
  ~SceneDataSet() override;
  bool Offers(REFIID iid) const override;

private:
  SceneRef scene_;
  std::size_t index_;
  VARIANT lent_;  // the parameters handed out by reference
};

}  // namespace br::chartscene
