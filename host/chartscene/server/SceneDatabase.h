#pragma once
// A database of a scene: its kind and name, datasets and objects by identity, selections,
// and the scene's attribute catalogue (IGeoCatalog).

#include "host/chartscene/server/ComObject.h"
#include "host/chartscene/server/scene_wrappers.h"

namespace br::chartscene {

class SceneDatabase final : public ComObject<IGeoDatabase, IGeoCatalog> {
public:
  SceneDatabase(SceneRef scene, std::size_t index);

  // IGeoDatabase
  CHARTSCENE_RESERVED(3)
  STDMETHODIMP GetKindId(GUID* kind) override;
  CHARTSCENE_RESERVED(5)
  CHARTSCENE_RESERVED(6)
  STDMETHODIMP GetDataSetById(REFGUID id, IGeoDataSet** dataSet) override;
  STDMETHODIMP GetDataSetHeader(REFGUID id, SAFEARRAY** header) override;
  STDMETHODIMP GetGeoObject(REFGUID id, IGeoObject** object) override;
  CHARTSCENE_RESERVED(10)
  CHARTSCENE_RESERVED(11)
  STDMETHODIMP CreateSelection(long count, const GEO_SELECTION_RECORD* records, long* selection) override;
  STDMETHODIMP ReleaseSelection(long selection) override;
  CHARTSCENE_RESERVED(14)
  CHARTSCENE_RESERVED(15)
  CHARTSCENE_RESERVED(16)
  STDMETHODIMP GetName(BSTR* name) override;

  // IGeoCatalog (its slots 3 to 7 share the names of the database's: one body serves both)
  CHARTSCENE_RESERVED(4)
  CHARTSCENE_RESERVED(7)
  STDMETHODIMP GetClassFlags(long classCode, long* flags) override;
  CHARTSCENE_RESERVED(9)
  STDMETHODIMP GetClassNameLength(long classCode, long* length) override;
  STDMETHODIMP GetClassNameText(long classCode, long size, char* buffer) override;
  CHARTSCENE_RESERVED(13)
  CHARTSCENE_RESERVED(17)
  CHARTSCENE_RESERVED(18)
  CHARTSCENE_RESERVED(19)
  CHARTSCENE_RESERVED(20)
  CHARTSCENE_RESERVED(21)
  CHARTSCENE_RESERVED(22)
  CHARTSCENE_RESERVED(23)
  STDMETHODIMP GetAttributeCode(const char* acronym, long* code) override;
  STDMETHODIMP GetAttributeFlags(long code, long* flags) override;
  CHARTSCENE_RESERVED(26)
  CHARTSCENE_RESERVED(27)
  STDMETHODIMP GetAttributeNameLength(long code, long* length) override;
  STDMETHODIMP GetAttributeNameText(long code, long size, char* buffer) override;
  CHARTSCENE_RESERVED(30)
  STDMETHODIMP GetEnumTextLength(long code, ULONG value, long* length) override;
  STDMETHODIMP GetEnumText(long code, ULONG value, long size, char* buffer) override;

private:
  // The dataset of this database that an identity's last 8 bytes name; SIZE_MAX if none.
  std::size_t OwnDataSet(REFGUID id) const;

  SceneRef scene_;
  std::size_t index_;
};

}  // namespace br::chartscene
