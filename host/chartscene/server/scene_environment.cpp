#include "host/chartscene/server/scene_environment.h"

#include <cwchar>

namespace br::chartscene {

std::wstring EnvironmentText(const wchar_t* name) {
  const DWORD size = GetEnvironmentVariableW(name, nullptr, 0);
  if (size == 0) return std::wstring();
  std::wstring value(size, L'\0');
  const DWORD length = GetEnvironmentVariableW(name, &value[0], size);
  value.resize(length < size ? length : 0);
  return value;
}

long EnvironmentNumber(const wchar_t* name, long fallback) {
  const std::wstring text = EnvironmentText(name);
  if (text.empty()) return fallback;
  wchar_t* end = nullptr;
  const long value = std::wcstol(text.c_str(), &end, 0);
  return (end != nullptr && *end == L'\0') ? value : fallback;
}

}  // namespace br::chartscene
