#include "tests/wine/common/DllUnderTest.h"

#include <doctest/doctest.h>

#include <stdexcept>
#include <vector>

namespace br::test {

std::wstring BuiltDllPath() {
  std::vector<wchar_t> buffer(32768);
  const DWORD n = GetModuleFileNameW(nullptr, buffer.data(), static_cast<DWORD>(buffer.size()));
  std::wstring folder(buffer.data(), n);
  for (;;) {
    const std::size_t cut = folder.find_last_of(L"\\/");
    if (cut == std::wstring::npos) break;
    folder.resize(cut);
    const std::wstring candidate = folder + L"\\BR_Info.dll";
    if (GetFileAttributesW(candidate.c_str()) != INVALID_FILE_ATTRIBUTES) return candidate;
  }
  throw std::runtime_error("BR_Info.dll not found above the test program");
}

DllUnderTest::DllUnderTest() : DllUnderTest(BuiltDllPath()) {}

DllUnderTest::DllUnderTest(const std::wstring& path) : path_(path) {
  comInitialised_ = SUCCEEDED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED));
  module_ = LoadLibraryW(path_.c_str());
  if (!module_) throw std::runtime_error("BR_Info.dll cannot be loaded");
  auto entry = [this](const char* name) { return reinterpret_cast<void*>(GetProcAddress(module_, name)); };
  canUnloadNow_ = reinterpret_cast<Entry0>(entry("DllCanUnloadNow"));
  getClassObject_ = reinterpret_cast<GetClassObjectEntry>(entry("DllGetClassObject"));
  registerServer_ = reinterpret_cast<Entry0>(entry("DllRegisterServer"));
  unregisterServer_ = reinterpret_cast<Entry0>(entry("DllUnregisterServer"));
  if (!canUnloadNow_ || !getClassObject_ || !registerServer_ || !unregisterServer_) {
    FreeLibrary(module_);
    throw std::runtime_error("BR_Info.dll lacks an entry point");
  }
}

DllUnderTest::~DllUnderTest() {
  // Every test ends with everything of the library released.
  CHECK_MESSAGE(canUnloadNow_() == S_OK, "objects, class objects or locks of the library outlive the test");
  FreeLibrary(module_);
  if (comInitialised_) CoUninitialize();
}

HRESULT DllUnderTest::Create(REFCLSID clsid, REFIID riid, void** out) const {
  IClassFactory* factory = nullptr;
  HRESULT hr = GetClassObject(clsid, IID_IClassFactory, reinterpret_cast<void**>(&factory));
  if (FAILED(hr)) return hr;
  hr = factory->CreateInstance(nullptr, riid, out);
  factory->Release();
  return hr;
}

ITidesDatabase* OpenedDatabase(const DllUnderTest& dll, const std::wstring& folder) {
  ITidesDatabase* database = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  BSTR path = SysAllocString(folder.c_str());
  const HRESULT opened = database->Initialize(path);
  SysFreeString(path);
  REQUIRE(opened == S_OK);
  return database;
}

ITidesPort* PortAt(ITidesDatabase* database, long index) {
  ComRef<IUnknown> unknown;
  REQUIRE(database->GetPort(index, unknown.Out()) == S_OK);
  REQUIRE(unknown);
  return Query<ITidesPort>(unknown.Get()).Detach();
}

}  // namespace br::test
