#include "host/chartscene/server/SceneModule.h"

namespace br::chartscene {

namespace {
HINSTANCE moduleInstance = nullptr;
volatile LONG lockCount = 0;
}  // namespace

void SceneModule::Attach(HINSTANCE instance) noexcept { moduleInstance = instance; }

HINSTANCE SceneModule::Instance() noexcept { return moduleInstance; }

std::wstring SceneModule::FilePath() {
  std::wstring path(MAX_PATH, L'\0');
  for (;;) {
    const DWORD length = GetModuleFileNameW(moduleInstance, &path[0], static_cast<DWORD>(path.size()));
    if (length == 0) return std::wstring();
    if (length < path.size()) {
      path.resize(length);
      return path;
    }
    path.resize(path.size() * 2);
  }
}

std::wstring SceneModule::Folder() {
  std::wstring path = FilePath();
  const std::size_t slash = path.find_last_of(L"\\/");
  return slash == std::wstring::npos ? std::wstring() : path.substr(0, slash + 1);
}

void SceneModule::Lock() noexcept { InterlockedIncrement(&lockCount); }
void SceneModule::Unlock() noexcept { InterlockedDecrement(&lockCount); }
LONG SceneModule::LockCount() noexcept { return lockCount; }

}  // namespace br::chartscene
