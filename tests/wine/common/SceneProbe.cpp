#include "tests/wine/common/SceneProbe.h"

#include <doctest/doctest.h>

#include <vector>

namespace br::test {

namespace {

// Where COM finds the stand-in: the server path registered for its text table class.
std::wstring RegisteredPath() {
  const wchar_t* key = L"CLSID\\{D4FD44F9-6C8E-479E-A52B-CD60D4B67B24}\\InprocServer32";
  wchar_t path[MAX_PATH * 2] = {};
  LONG size = sizeof(path);
  if (RegQueryValueW(HKEY_CLASSES_ROOT, key, path, &size) != ERROR_SUCCESS) return std::wstring();
  return path;
}

}  // namespace

SceneProbe::SceneProbe() : path_(RegisteredPath()) {
  REQUIRE_MESSAGE(!path_.empty(), "chartscene.dll is registered in the prefix (./run makes it so)");
  HMODULE module = LoadLibraryW(path_.c_str());
  REQUIRE(module != nullptr);
  HMODULE pinned = nullptr;
  GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_PIN | GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS,
                     reinterpret_cast<LPCWSTR>(GetProcAddress(module, "ChartSceneCounter")), &pinned);
  const auto entry = [module](const char* name) { return reinterpret_cast<void*>(GetProcAddress(module, name)); };
  counter_ = reinterpret_cast<decltype(counter_)>(entry("ChartSceneCounter"));
  setFault_ = reinterpret_cast<decltype(setFault_)>(entry("ChartSceneSetFault"));
  clearFaults_ = reinterpret_cast<decltype(clearFaults_)>(entry("ChartSceneClearFaults"));
  setMisanswer_ = reinterpret_cast<decltype(setMisanswer_)>(entry("ChartSceneSetMisanswer"));
  REQUIRE((counter_ && setFault_ && clearFaults_ && setMisanswer_));
}

ScopedEnvironment::ScopedEnvironment(const wchar_t* name, const wchar_t* value) : name_(name) {
  const DWORD size = GetEnvironmentVariableW(name, nullptr, 0);
  if (size > 0) {
    std::vector<wchar_t> old(size);
    GetEnvironmentVariableW(name, old.data(), size);
    old_ = old.data();
    hadOld_ = true;
  }
  SetEnvironmentVariableW(name, value);
}

ScopedEnvironment::~ScopedEnvironment() {
  SetEnvironmentVariableW(name_.c_str(), hadOld_ ? old_.c_str() : nullptr);
}

}  // namespace br::test
