#pragma once
// The stand-in text component (ITextTable): BRInfo.csv of the folder the library names,
// or of CHARTSCENE_TEXTS, or of chartscene.dll's folder; one language chosen when it is
// made (scene_environment.h). Found texts give exactly S_OK (an empty text as a null
// BSTR), missing ones S_FALSE, texts asked for before a table was loaded E_UNEXPECTED.
// An injected fault on GetText is returned with a text all the same, so a client that
// trusts any success, or forgets to free, is caught.

#include <windows.h>

#include "GeoData.h"
#include "host/chartscene/model/text_table_file.h"
#include "host/chartscene/server/ComObject.h"

namespace br::chartscene {

class TextTable final : public ComObject<ITextTable> {
public:
  // CHARTSCENE_TEXTTABLE=absent refuses with REGDB_E_CLASSNOTREG.
  static HRESULT Create(IUnknown** object);

  STDMETHODIMP Reserved3() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved4() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved5() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved6() override { return E_NOTIMPL; }
  STDMETHODIMP GetLanguage(long* language) override;
  STDMETHODIMP Reserved8() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved9() override { return E_NOTIMPL; }
  STDMETHODIMP LoadTable(BSTR folder, BSTR fileName, BSTR tableName) override;
  STDMETHODIMP GetText(BSTR section, long id, BSTR* text) override;

private:
  TextTable();

  long language_;
  bool loaded_ = false;
  TextTableData table_;
};

}  // namespace br::chartscene
