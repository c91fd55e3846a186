#include "frame/com/error_info.h"

#include <oleauto.h>

namespace br::com {

HRESULT ReportErrorInfo(const ClassIdentity& cls, HRESULT hr, const std::wstring& description) noexcept {
  ICreateErrorInfo* create = nullptr;
  if (FAILED(CreateErrorInfo(&create))) return hr;
  try {
    const std::wstring source = std::wstring(L"BR_Info.") + cls.name;
    create->SetGUID(cls.dual ? *cls.dual : GUID_NULL);
    create->SetSource(const_cast<LPOLESTR>(source.c_str()));
    create->SetDescription(const_cast<LPOLESTR>(description.c_str()));
  } catch (...) {
    // No room for the texts: the HRESULT alone still reaches the caller.
  }
  IErrorInfo* info = nullptr;
  if (SUCCEEDED(create->QueryInterface(IID_IErrorInfo, reinterpret_cast<void**>(&info)))) {
    SetErrorInfo(0, info);
    info->Release();
  }
  create->Release();
  return hr;
}

}  // namespace br::com
