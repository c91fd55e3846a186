#include "frame/com/guard.h"
#include "frame/com/bstr_text.h"
#include "frame/com/error_info.h"

#include <cstdio>

namespace br::com {
namespace {
std::wstring Formatted(const wchar_t* format, unsigned long value) {
  wchar_t text[64];
  swprintf(text, sizeof text / sizeof text[0], format, value);
  return text;
}
}  // namespace

HRESULT CaughtComError(const ClassIdentity& cls, HRESULT hr) noexcept {
  if (SUCCEEDED(hr)) hr = E_FAIL;  // a thrown success would read as success: refuse it
  try {
    return ReportErrorInfo(cls, hr, Formatted(L"COM error 0x%08lX", static_cast<unsigned long>(hr)));
  } catch (...) {
    return hr;
  }
}

HRESULT CaughtLibraryError(const ClassIdentity& cls, std::uint32_t code) noexcept {
  try {
    return ReportErrorInfo(cls, E_FAIL, Formatted(L"BR_Info error 0x%08lX", code));
  } catch (...) {
    return E_FAIL;
  }
}

HRESULT CaughtLine(const ClassIdentity& cls, int line) noexcept {
  try {
    return ReportErrorInfo(cls, E_FAIL, Formatted(L"failed at line %lu", static_cast<unsigned long>(line)));
  } catch (...) {
    return E_FAIL;
  }
}

HRESULT CaughtStdException(const ClassIdentity& cls, const char* what) noexcept {
  try {
    return ReportErrorInfo(cls, E_FAIL, WideFromAnsi(what ? what : ""));
  } catch (...) {
    return E_FAIL;
  }
}

HRESULT CaughtUnknown(const ClassIdentity& cls) noexcept {
  try {
    return ReportErrorInfo(cls, E_FAIL, L"unexpected failure");
  } catch (...) {
    return E_FAIL;
  }
}

}  // namespace br::com
