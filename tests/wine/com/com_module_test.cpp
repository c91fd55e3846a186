// BR_Info.dll's entry points and class objects, loaded by path as the platform loads it.
#include "tests/wine/common/dll_under_test.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <string>
#include <vector>

using br::test::DllUnderTest;

TEST_CASE("the four entry points are exported by name with ordinals 1 to 4") {
  DllUnderTest dll;
  const char* const names[] = {"DllCanUnloadNow", "DllGetClassObject", "DllRegisterServer", "DllUnregisterServer"};
  for (WORD ordinal = 1; ordinal <= 4; ++ordinal) {
    FARPROC byOrdinal = GetProcAddress(dll.Handle(), reinterpret_cast<LPCSTR>(static_cast<ULONG_PTR>(ordinal)));
    REQUIRE(reinterpret_cast<void*>(byOrdinal) != nullptr);
    CHECK(reinterpret_cast<void*>(byOrdinal) == reinterpret_cast<void*>(GetProcAddress(dll.Handle(), names[ordinal - 1])));
  }
  CHECK(reinterpret_cast<void*>(GetProcAddress(dll.Handle(), reinterpret_cast<LPCSTR>(static_cast<ULONG_PTR>(5)))) == nullptr);
  CHECK(reinterpret_cast<void*>(GetProcAddress(dll.Handle(), "DllMain")) == nullptr);

  // Nothing exported besides the four: the export directory has exactly four names.
  auto* base = reinterpret_cast<const BYTE*>(dll.Handle());
  auto* dos = reinterpret_cast<const IMAGE_DOS_HEADER*>(base);
  auto* nt = reinterpret_cast<const IMAGE_NT_HEADERS*>(base + dos->e_lfanew);
  const IMAGE_DATA_DIRECTORY& dir = nt->OptionalHeader.DataDirectory[IMAGE_DIRECTORY_ENTRY_EXPORT];
  auto* exports = reinterpret_cast<const IMAGE_EXPORT_DIRECTORY*>(base + dir.VirtualAddress);
  CHECK(exports->NumberOfNames == 4);
  CHECK(exports->NumberOfFunctions == 4);
  CHECK(exports->Base == 1);
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("DllGetClassObject: same object twice, unknown classes, null out-pointer") {
  DllUnderTest dll;
  IClassFactory* first = nullptr;
  IClassFactory* second = nullptr;
  REQUIRE(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, reinterpret_cast<void**>(&first)) == S_OK);
  REQUIRE(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, reinterpret_cast<void**>(&second)) == S_OK);
  CHECK(first == second);
  IUnknown* asUnknown = nullptr;
  REQUIRE(dll.GetClassObject(CLSID_TidesPort, IID_IUnknown, reinterpret_cast<void**>(&asUnknown)) == S_OK);
  CHECK(asUnknown == static_cast<IUnknown*>(first));
  asUnknown->Release();
  IClassFactory* database = nullptr;
  REQUIRE(dll.GetClassObject(CLSID_TidesDatabase, IID_IClassFactory, reinterpret_cast<void**>(&database)) == S_OK);
  CHECK(database != first);
  database->Release();
  first->Release();
  second->Release();

  void* out = reinterpret_cast<void*>(1);
  CHECK(dll.GetClassObject(IID_ITidesPort, IID_IClassFactory, &out) == CLASS_E_CLASSNOTAVAILABLE);
  CHECK(out == nullptr);
  CHECK(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, nullptr) == E_POINTER);
  out = reinterpret_cast<void*>(1);
  CHECK(dll.GetClassObject(CLSID_TidesPort, IID_IDispatch, &out) == E_NOINTERFACE);
  CHECK(out == nullptr);
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("DllCanUnloadNow follows live objects, class objects held by clients and LockServer") {
  DllUnderTest dll;
  CHECK(dll.CanUnloadNow() == S_OK);

  IClassFactory* factory = nullptr;
  REQUIRE(dll.GetClassObject(CLSID_TidesDatabase, IID_IClassFactory, reinterpret_cast<void**>(&factory)) == S_OK);
  CHECK(dll.CanUnloadNow() == S_FALSE);  // a client holds the class object

  ITidesDatabase* database = nullptr;
  REQUIRE(factory->CreateInstance(nullptr, IID_ITidesDatabase, reinterpret_cast<void**>(&database)) == S_OK);
  factory->Release();
  CHECK(dll.CanUnloadNow() == S_FALSE);  // one instance alive
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);

  REQUIRE(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, reinterpret_cast<void**>(&factory)) == S_OK);
  CHECK(factory->LockServer(TRUE) == S_OK);
  factory->Release();
  CHECK(dll.CanUnloadNow() == S_FALSE);  // no object, no client reference: the lock alone
  REQUIRE(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, reinterpret_cast<void**>(&factory)) == S_OK);
  CHECK(factory->LockServer(FALSE) == S_OK);
  factory->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("plain objects answer their dual interface, IDispatch, connection points and error info only") {
  DllUnderTest dll;
  struct PlainClass {
    const CLSID* clsid;
    const IID* dual;
    const IID* events;
  };
  const PlainClass classes[] = {{&CLSID_TidesDatabase, &IID_ITidesDatabase, &DIID__ITidesDatabaseEvents},
                                {&CLSID_TidesPort, &IID_ITidesPort, &DIID__ITidesPortEvents}};
  for (const PlainClass& c : classes) {
    IUnknown* object = nullptr;
    REQUIRE(dll.Create(*c.clsid, IID_IUnknown, reinterpret_cast<void**>(&object)) == S_OK);
    for (const IID* iid : {c.dual, &IID_IDispatch, &IID_IConnectionPointContainer, &IID_ISupportErrorInfo}) {
      IUnknown* face = nullptr;
      CHECK(object->QueryInterface(*iid, reinterpret_cast<void**>(&face)) == S_OK);
      if (face) face->Release();
    }
    for (const IID* iid : {&IID_IProvideClassInfo, &IID_IOleObject, &IID_IPersistStreamInit, &IID_IViewObject}) {
      IUnknown* face = nullptr;
      CHECK(object->QueryInterface(*iid, reinterpret_cast<void**>(&face)) == E_NOINTERFACE);
    }
    IConnectionPointContainer* container = br::test::Query<IConnectionPointContainer>(object);
    IConnectionPoint* point = nullptr;
    CHECK(container->FindConnectionPoint(*c.events, &point) == S_OK);
    if (point) point->Release();
    container->Release();
    object->Release();
  }
  CHECK(dll.CanUnloadNow() == S_OK);
}

// Late-bound calls (the method's refusal as the exception's scode, a foreign interface)
// are the boundary suites'; names through GetIDsOfNames the script suites'.
TEST_CASE("the dispatch interface hands out its type information") {
  DllUnderTest dll;
  IDispatch* database = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  UINT count = 0;
  CHECK(database->GetTypeInfoCount(&count) == S_OK);
  CHECK(count == 1);
  ITypeInfo* info = nullptr;
  CHECK(database->GetTypeInfo(1, 0, &info) == DISP_E_BADINDEX);
  REQUIRE(database->GetTypeInfo(0, 0, &info) == S_OK);
  TYPEATTR* attributes = nullptr;
  REQUIRE(info->GetTypeAttr(&attributes) == S_OK);
  CHECK(IsEqualIID(attributes->guid, IID_ITidesDatabase));
  info->ReleaseTypeAttr(attributes);
  info->Release();
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
