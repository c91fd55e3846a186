#pragma once
// The stand-in object formatter (CLSID_ObjectFormatter). It reads objects and attributes
// only through the host interfaces and their database's catalogue:
//   FormatObject flags 6 (any with bit 2): "<class name> <object text>", the label;
//   FormatObject flags 4: "<class name>#<name>=<value>|<name>=<value>...", list items
//     joined by ", ";
//   FormatAttribute flags 4: "<name>=<value>", list items joined by "|";
//   GetAttributeName: the S-57 name of an attribute of the chart database kind.
// Enumerated values show as their catalogue texts, a missing value as option 64's text.
// Every option given is recorded process-wide (FormatterOption in scene_counters.h).

#include <string>

#include "GeoData.h"
#include "host/chartscene/server/ComObject.h"

namespace br::chartscene {

class ObjectFormatter final : public ComObject<IObjectFormatter> {
public:
  static HRESULT Create(IUnknown** object);

  STDMETHODIMP Reserved3() override { return E_NOTIMPL; }
  STDMETHODIMP SetOption(long id, VARIANT value) override;
  STDMETHODIMP FormatObject(long reserved1, long flags, IGeoObject* object, long reserved2, long reserved3,
                            BSTR* text) override;
  STDMETHODIMP FormatAttribute(long reserved1, long flags, IGeoAttribute* attribute, long reserved2,
                               long reserved3, BSTR* text) override;
  STDMETHODIMP Reserved7() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved8() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved9() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved10() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved11() override { return E_NOTIMPL; }
  STDMETHODIMP Reserved12() override { return E_NOTIMPL; }
  STDMETHODIMP GetAttributeName(REFGUID kind, long reserved1, long code, long reserved2, long reserved3,
                                BSTR* name) override;

private:
  ObjectFormatter();

  // "<name>=<value>" of one attribute, through its owner's catalogue.
  HRESULT AttributeText(IGeoAttribute* attribute, const std::wstring& listSeparator, std::wstring& text) const;

  long language_ = 1033;
  std::wstring missing_;
};

}  // namespace br::chartscene
