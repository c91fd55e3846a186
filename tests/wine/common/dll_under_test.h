// The built BR_Info.dll, loaded by path for one test: its entry points, objects made
// through its class objects (no registration needed), and, at the end, the check that it
// can unload and the unload itself, which resets the library's process-wide state.
#pragma once

#include <windows.h>
#include <objbase.h>

#include <doctest/doctest.h>

#include <string>

#include "BR_Info.h"

namespace br::test {

// Folder of BR_Info.dll: the nearest folder above the test program that holds it.
std::wstring BuiltDllPath();

class DllUnderTest {
public:
  DllUnderTest();   // CoInitializeEx (apartment) and LoadLibrary; throws on failure
  ~DllUnderTest();  // FreeLibrary and CoUninitialize
  DllUnderTest(const DllUnderTest&) = delete;
  DllUnderTest& operator=(const DllUnderTest&) = delete;

  HRESULT CanUnloadNow() const { return canUnloadNow_(); }
  HRESULT GetClassObject(REFCLSID clsid, REFIID riid, void** out) const { return getClassObject_(clsid, riid, out); }
  HRESULT RegisterServer() const { return registerServer_(); }
  HRESULT UnregisterServer() const { return unregisterServer_(); }

  // A new object of clsid through its class object, asked for riid.
  HRESULT Create(REFCLSID clsid, REFIID riid, void** out) const;
  template <class I>
  HRESULT Create(REFCLSID clsid, I** out) const {
    return Create(clsid, __uuidof(I), reinterpret_cast<void**>(out));
  }

  HMODULE Handle() const { return module_; }
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

// A TidesDatabase of the loaded DLL opened on a station folder, and one of its ports as
// ITidesPort (both REQUIREd; the caller releases them).
ITidesDatabase* OpenedDatabase(const DllUnderTest& dll, const std::wstring& folder);
ITidesPort* PortAt(ITidesDatabase* database, long index);

// The interface I of an object: a new reference, REQUIREd.
template <class I>
I* Query(IUnknown* object) {
  I* face = nullptr;
  REQUIRE(object->QueryInterface(__uuidof(I), reinterpret_cast<void**>(&face)) == S_OK);
  REQUIRE(face != nullptr);
  return face;
}

// Releases an interface pointer and nulls it.
template <class I>
void ReleaseAndNull(I*& p) {
  if (p) {
    p->Release();
    p = nullptr;
  }
}

// Current reference count of an object (AddRef then Release).
inline ULONG RefCount(IUnknown* p) {
  p->AddRef();
  return p->Release();
}

}  // namespace br::test
