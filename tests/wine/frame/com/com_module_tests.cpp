// BR_Info.dll's class objects, loaded by path as the platform loads it, and the COM faces
// of a plain object made through them.
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/NotAPort.h"

#include <doctest/doctest.h>
#include <olectl.h>

using br::test::DllUnderTest;

TEST_CASE("DllGetClassObject and DllCanUnloadNow: one class object per class, refusals, locks") {
  DllUnderTest dll;
  IClassFactory* first = nullptr;
  IClassFactory* second = nullptr;
  REQUIRE(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, reinterpret_cast<void**>(&first)) == S_OK);
  REQUIRE(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, reinterpret_cast<void**>(&second)) == S_OK);
  CHECK(first == second);
  second->Release();
  CHECK(dll.CanUnloadNow() == S_FALSE);  // a client holds the class object
  void* out = reinterpret_cast<void*>(1);
  CHECK(dll.GetClassObject(IID_ITidesPort, IID_IClassFactory, &out) == CLASS_E_CLASSNOTAVAILABLE);
  CHECK(out == nullptr);
  CHECK(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, nullptr) == E_POINTER);
  out = reinterpret_cast<void*>(1);
  CHECK(dll.GetClassObject(CLSID_TidesPort, IID_IDispatch, &out) == E_NOINTERFACE);
  CHECK(out == nullptr);

  ITidesPort* port = nullptr;
  REQUIRE(first->CreateInstance(nullptr, IID_ITidesPort, reinterpret_cast<void**>(&port)) == S_OK);
  CHECK(first->LockServer(TRUE) == S_OK);
  first->Release();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_FALSE);  // no object, no client reference: the lock alone
  REQUIRE(dll.GetClassObject(CLSID_TidesPort, IID_IClassFactory, reinterpret_cast<void**>(&first)) == S_OK);
  CHECK(first->LockServer(FALSE) == S_OK);
  first->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("a plain object: its interfaces, error information support and one connection point") {
  DllUnderTest dll;
  IUnknown* object = nullptr;
  REQUIRE(dll.Create(CLSID_TidesPort, IID_IUnknown, reinterpret_cast<void**>(&object)) == S_OK);
  for (const IID* iid : {&IID_IProvideClassInfo, &IID_IOleObject, &IID_IPersistStreamInit, &IID_IViewObject}) {
    IUnknown* face = nullptr;
    CHECK(object->QueryInterface(*iid, reinterpret_cast<void**>(&face)) == E_NOINTERFACE);
  }
  auto support = br::test::Query<ISupportErrorInfo>(object);
  CHECK(support->InterfaceSupportsErrorInfo(IID_ITidesPort) == S_OK);
  CHECK(support->InterfaceSupportsErrorInfo(IID_IDispatch) == S_FALSE);
  support.Reset();

  auto container = br::test::Query<IConnectionPointContainer>(object);
  IConnectionPoint* point = reinterpret_cast<IConnectionPoint*>(1);
  CHECK(container->FindConnectionPoint(DIID__ITidesDatabaseEvents, &point) == CONNECT_E_NOCONNECTION);
  CHECK(point == nullptr);
  IEnumConnectionPoints* points = nullptr;
  REQUIRE(container->EnumConnectionPoints(&points) == S_OK);
  ULONG fetched = 0;
  CHECK(points->Next(1, &point, &fetched) == S_OK);
  IConnectionPoint* extra = nullptr;
  CHECK(points->Next(1, &extra, &fetched) == S_FALSE);  // the events' point only
  points->Release();
  IID iid = {};
  CHECK(point->GetConnectionInterface(&iid) == S_OK);
  CHECK(IsEqualIID(iid, DIID__ITidesPortEvents));
  DWORD cookie = 99;
  CHECK(point->Advise(nullptr, &cookie) == E_POINTER);
  CHECK(cookie == 0);
  br::test::NotAPort plain;  // a sink that is no dispatch interface
  CHECK(point->Advise(&plain, &cookie) == CONNECT_E_CANNOTCONNECT);
  CHECK(point->Unadvise(12345) == CONNECT_E_NOCONNECTION);
  point->Release();
  container.Reset();
  object->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
