// The module's table of creatable classes, in table order: class objects are made on
// first request under a critical section and cached in their row until unload.
#pragma once

#include "frame/module/ClassEntry.h"

#include <cstddef>
#include <string>

namespace br::module {

class ClassTable {
public:
  ClassTable(ClassEntry* rows, std::size_t count) noexcept;
  ~ClassTable();
  ClassTable(const ClassTable&) = delete;
  ClassTable& operator=(const ClassTable&) = delete;

  // DllGetClassObject: the cached class object of clsid asked for riid, or
  // CLASS_E_CLASSNOTAVAILABLE for a class not in the table.
  HRESULT GetClassObject(REFCLSID clsid, REFIID riid, void** out) noexcept;

  // Writes every row's keys in table order, stopping at the first failure.
  HRESULT RegisterClasses(const std::wstring& modulePath, const GUID& libid) noexcept;
  // Removes every row's keys in table order, stopping at the first failure.
  HRESULT UnregisterClasses() noexcept;

  // Releases and forgets every cached class object (module detach).
  void ReleaseClassObjects() noexcept;

  std::size_t Count() const noexcept { return count_; }
  const ClassEntry& Row(std::size_t i) const noexcept { return rows_[i]; }

private:
  ClassEntry* rows_;
  std::size_t count_;
  CRITICAL_SECTION lock_;
};

}  // namespace br::module
