// The module record shared by every object of the library: its instance handle and the
// lock count that DllCanUnloadNow reads. Every live object, every client reference to a
// class object and every LockServer(TRUE) holds one lock.
#pragma once

#include <windows.h>

#include <string>

namespace br::com {

class Module {
public:
  // Called once from DllMain on process attach.
  static void Attach(HINSTANCE instance) noexcept;
  // The library's instance handle (the executable's in a program that links the frame).
  static HINSTANCE Instance() noexcept;
  // Full path of the module file, for the type library and the registry.
  static std::wstring FilePath();

  static void Lock() noexcept;
  static void Unlock() noexcept;
  static LONG LockCount() noexcept;
};

// Holds one module lock for its lifetime: a member of every object and enumerator.
class ModuleLockHolder {
public:
  ModuleLockHolder() noexcept { Module::Lock(); }
  ~ModuleLockHolder() { Module::Unlock(); }
  ModuleLockHolder(const ModuleLockHolder&) = delete;
  ModuleLockHolder& operator=(const ModuleLockHolder&) = delete;
};

}  // namespace br::com
