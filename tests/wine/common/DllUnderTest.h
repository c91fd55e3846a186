// The built BR_Info.dll loaded by path for one test: objects through its class objects, and
// at the end the check that it can unload and the unload, which resets its process state.
#pragma once

#include <windows.h>
#include <objbase.h>

#include <doctest/doctest.h>

#include <string>

#include "BR_Info.h"
#include "frame/com/ComRef.h"

namespace br::test {

// Folder of BR_Info.dll: the nearest folder above the test program that holds it.
std::wstring BuiltDllPath();

class DllUnderTest {
public:
  DllUnderTest();   // CoInitializeEx (apartment) and LoadLibrary; throws on failure
  explicit DllUnderTest(const std::wstring& path);  // a copy of the DLL elsewhere
  ~DllUnderTest();  // FreeLibrary and CoUninitialize
  DllUnderTest(const DllUnderTest&) = delete;
  DllUnderTest& operator=(const DllUnderTest&) = delete;

  HRESULT CanUnloadNow() const { return canUnloadNow_(); }
  HRESULT GetClassObject(REFCLSID clsid, REFIID riid, void** out) const { return getClassObject_(clsid, riid, out); }
  HRESULT RegisterServer() const { return registerServer_(); }
  HRESULT UnregisterServer() const { return unregisterServer_(); }

  HRESULT Create(REFCLSID clsid, REFIID riid, void** out) const;
  template <class I>
  HRESULT Create(REFCLSID clsid, I** out) const {
    return Create(clsid, __uuidof(I), reinterpret_cast<void**>(out));
  }

  const std::wstring& Path() const { return path_; }

private:
  using Entry0 = HRESULT(STDAPICALLTYPE*)();
  using GetClassObjectEntry = HRESULT(STDAPICALLTYPE*)(REFCLSID, REFIID, void**);

  std::wstring path_;
  HMODULE module_ = nullptr;
  bool comInitialised_ = false;
  Entry0 canUnloadNow_ = nullptr;
  GetClassObjectEntry getClassObject_ = nullptr;
  Entry0 registerServer_ = nullptr;
  Entry0 unregisterServer_ = nullptr;
};

// A database opened on a folder, and its port as ITidesPort (REQUIREd; the caller releases).
ITidesDatabase* OpenedDatabase(const DllUnderTest& dll, const std::wstring& folder);
ITidesPort* PortAt(ITidesDatabase* database, long index);

using br::com::ComRef;

// The interface I of an object, REQUIREd.
template <class I>
ComRef<I> Query(IUnknown* object) {
  ComRef<I> face;
  REQUIRE(object->QueryInterface(__uuidof(I), face.OutVoid()) == S_OK);
  REQUIRE(face);
  return face;
}

// Current reference count of an object (AddRef then Release).
inline ULONG RefCount(IUnknown* p) { return p->AddRef(), p->Release(); }

// NumPoints of a port and NumPorts of a database, REQUIREd to answer.
inline long Points(ITidesPort* port) {
  long n = -1;
  REQUIRE(port->get_NumPoints(&n) == S_OK);
  return n;
}
inline long CountOf(ITidesDatabase* database) {
  long n = -1;
  REQUIRE(database->get_NumPorts(&n) == S_OK);
  return n;
}

}  // namespace br::test
