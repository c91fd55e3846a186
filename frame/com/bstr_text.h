// Texts inside the library are 8-bit strings in the system's ANSI code page; at the
// automation boundary they are UTF-16 (BSTR). These are the only conversions between them.
#pragma once

#include <windows.h>
#include <oleauto.h>

#include <string>

namespace br::com {

std::wstring WideFromAnsi(const std::string& text);
std::string AnsiFromWide(const wchar_t* text, std::size_t length);
// A null BSTR reads as the empty string; embedded zeros are kept.
std::string AnsiFromBstr(BSTR text);

// New BSTRs owned by the caller; both throw std::bad_alloc when no string can be allocated.
BSTR BstrFromAnsi(const std::string& text);
BSTR BstrFromWide(const std::wstring& text);

// Owns one BSTR and frees it; Release() hands it over.
class BstrHolder {
public:
  BstrHolder() = default;
  explicit BstrHolder(BSTR text) noexcept : text_(text) {}
  ~BstrHolder() { SysFreeString(text_); }
  BstrHolder(const BstrHolder&) = delete;
  BstrHolder& operator=(const BstrHolder&) = delete;

  BSTR Get() const noexcept { return text_; }
  BSTR* Out() noexcept { SysFreeString(text_); text_ = nullptr; return &text_; }
  BSTR Release() noexcept { BSTR t = text_; text_ = nullptr; return t; }

private:
  BSTR text_ = nullptr;
};

}  // namespace br::com
