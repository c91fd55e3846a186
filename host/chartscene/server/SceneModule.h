#pragma once
// The stand-in host's module record: its instance handle, its folder and the lock count
// that DllCanUnloadNow reads (every live object and LockServer(TRUE) holds one lock).

#include <windows.h>

#include <string>

namespace br::chartscene {

class SceneModule {
public:
  static void Attach(HINSTANCE instance) noexcept;
  static HINSTANCE Instance() noexcept;
  // Full path of chartscene.dll, and its folder with a closing backslash.
  static std::wstring FilePath();
  static std::wstring Folder();

  static void Lock() noexcept;
  static void Unlock() noexcept;
  static LONG LockCount() noexcept;
};

}  // namespace br::chartscene
