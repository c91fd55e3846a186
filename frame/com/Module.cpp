#include "frame/com/Module.h"

#include <vector>

namespace br::com {
namespace {
HINSTANCE gInstance = nullptr;
volatile LONG gLockCount = 0;
}  // namespace

void Module::Attach(HINSTANCE instance) noexcept { gInstance = instance; }

HINSTANCE Module::Instance() noexcept {
  return gInstance ? gInstance : GetModuleHandleW(nullptr);
}

std::wstring Module::FilePath() {
  std::vector<wchar_t> buffer(MAX_PATH);
  for (;;) {
    const DWORD n = GetModuleFileNameW(Instance(), buffer.data(), static_cast<DWORD>(buffer.size()));
    if (n == 0) return std::wstring();
    if (n < buffer.size()) return std::wstring(buffer.data(), n);
    buffer.resize(buffer.size() * 2);  // truncated: try a longer buffer
  }
}

void Module::Lock() noexcept { InterlockedIncrement(&gLockCount); }
void Module::Unlock() noexcept { InterlockedDecrement(&gLockCount); }
LONG Module::LockCount() noexcept { return InterlockedCompareExchange(&gLockCount, 0, 0); }

}  // namespace br::com
