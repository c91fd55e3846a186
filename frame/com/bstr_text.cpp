#include "frame/com/bstr_text.h"

#include <climits>
#include <new>

namespace br::com {

std::wstring WideFromAnsi(const std::string& text) {
  if (text.empty()) return std::wstring();
  if (text.size() > static_cast<std::size_t>(INT_MAX)) throw std::bad_alloc();
  const int length = static_cast<int>(text.size());
  const int needed = MultiByteToWideChar(CP_ACP, 0, text.data(), length, nullptr, 0);
  if (needed <= 0) return std::wstring();
  std::wstring wide(static_cast<std::size_t>(needed), L'\0');
  MultiByteToWideChar(CP_ACP, 0, text.data(), length, wide.data(), needed);
  return wide;
}

std::string AnsiFromWide(const wchar_t* text, std::size_t length) {
  if (!text || length == 0) return std::string();
  if (length > static_cast<std::size_t>(INT_MAX)) throw std::bad_alloc();
  const int n = static_cast<int>(length);
  const int needed = WideCharToMultiByte(CP_ACP, 0, text, n, nullptr, 0, nullptr, nullptr);
  if (needed <= 0) return std::string();
  std::string ansi(static_cast<std::size_t>(needed), '\0');
  WideCharToMultiByte(CP_ACP, 0, text, n, ansi.data(), needed, nullptr, nullptr);
  return ansi;
}

std::string AnsiFromBstr(BSTR text) {
  return text ? AnsiFromWide(text, SysStringLen(text)) : std::string();
}

BSTR BstrFromWide(const std::wstring& text) {
  if (text.size() > static_cast<std::size_t>(UINT_MAX / sizeof(wchar_t) - 2)) throw std::bad_alloc();
  BSTR result = SysAllocStringLen(text.data(), static_cast<UINT>(text.size()));
  if (!result) throw std::bad_alloc();
  return result;
}

BSTR BstrFromAnsi(const std::string& text) { return BstrFromWide(WideFromAnsi(text)); }

}  // namespace br::com
