// The COM frame on a class of its own: connection points, the method boundary and class
// factories.
#include "tests/wine/com/frame_test_object.h"

#include "frame/com/class_factory.h"
#include "frame/com/module.h"
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/not_a_port.h"

#include <doctest/doctest.h>

#include <string>

using br::com::Module;
using br::test::EventSink;
using br::test::FrameTestObject;

namespace {

struct ComApartment {
  ComApartment() { CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED); }
  ~ComApartment() { CoUninitialize(); }
};

// A fresh object with one reference, switches reset.
FrameTestObject* NewTestObject() {
  FrameTestObject::finalConstructResult = S_OK;
  FrameTestObject::throwInConstructor = false;
  FrameTestObject* object = nullptr;
  REQUIRE(br::com::NewObject(&object) == S_OK);
  return object;
}

}  // namespace

// QueryInterface, IProvideClassInfo2 and firing are checked on the real classes (the
// module, control and list suites); texts through station names (the database suite).

TEST_CASE("connection point container, point and enumerators; an enumerator holds a lock and its object") {
  ComApartment apartment;
  const LONG base = Module::LockCount();
  FrameTestObject* object = NewTestObject();
  IConnectionPointContainer* container = br::test::Query<IConnectionPointContainer>(object);

  IConnectionPoint* other = reinterpret_cast<IConnectionPoint*>(1);
  CHECK(container->FindConnectionPoint(DIID__ITidesPortEvents, &other) == CONNECT_E_NOCONNECTION);
  CHECK(other == nullptr);
  CHECK(container->FindConnectionPoint(DIID__ITidesPortListEvents, nullptr) == E_POINTER);

  IEnumConnectionPoints* points = nullptr;
  REQUIRE(container->EnumConnectionPoints(&points) == S_OK);
  CHECK(Module::LockCount() == base + 2);
  IConnectionPoint* got[2] = {};
  ULONG fetched = 0;
  CHECK(points->Next(2, got, &fetched) == S_FALSE);
  REQUIRE(fetched == 1);
  IID iid = {};
  CHECK(got[0]->GetConnectionInterface(&iid) == S_OK);
  CHECK(IsEqualIID(iid, DIID__ITidesPortListEvents));
  IConnectionPointContainer* back = nullptr;
  CHECK(got[0]->GetConnectionPointContainer(&back) == S_OK);
  CHECK(back == container);
  back->Release();
  got[0]->Release();
  CHECK(points->Next(2, got, nullptr) == E_INVALIDARG);  // more than one needs a count
  CHECK(points->Reset() == S_OK);
  CHECK(points->Skip(2) == S_FALSE);
  IEnumConnectionPoints* clone = nullptr;
  CHECK(points->Clone(&clone) == S_OK);
  CHECK(clone->Next(1, got, nullptr) == S_FALSE);
  clone->Release();

  IConnectionPoint* point = nullptr;
  REQUIRE(container->FindConnectionPoint(DIID__ITidesPortListEvents, &point) == S_OK);
  EventSink first(DIID__ITidesPortListEvents), second(DIID__ITidesPortListEvents);
  DWORD cookie = 99;
  CHECK(point->Advise(nullptr, &cookie) == E_POINTER);
  CHECK(cookie == 0);
  br::test::NotAPort plain;  // a sink that is no dispatch interface
  CHECK(point->Advise(&plain, &cookie) == CONNECT_E_CANNOTCONNECT);
  REQUIRE(first.Connect(object));
  REQUIRE(second.Connect(object));
  CHECK(first.Cookie() != 0);
  CHECK(first.Cookie() != second.Cookie());
  CHECK(first.References() == 1);  // held by the connection

  IEnumConnections* connections = nullptr;
  REQUIRE(point->EnumConnections(&connections) == S_OK);
  CONNECTDATA data[3] = {};
  CHECK(connections->Next(3, data, &fetched) == S_FALSE);
  REQUIRE(fetched == 2);
  CHECK(data[0].dwCookie == first.Cookie());
  CHECK(data[1].dwCookie == second.Cookie());
  data[0].pUnk->Release();
  data[1].pUnk->Release();
  connections->Release();

  CHECK(point->Unadvise(12345) == CONNECT_E_NOCONNECTION);
  first.Disconnect();
  second.Disconnect();
  CHECK(first.References() == 0);
  point->Release();
  container->Release();
  object->Release();  // the enumerator's point still holds the object
  CHECK(FrameTestObject::live == 1);
  points->Release();
  CHECK(FrameTestObject::live == 0);
  CHECK(Module::LockCount() == base);
}

TEST_CASE("the method boundary turns every thrown value into an HRESULT with error information") {
  ComApartment apartment;
  FrameTestObject* object = NewTestObject();
  struct Case {
    FrameTestObject::Throw thrown;
    HRESULT expected;
    const wchar_t* description;
  };
  const Case cases[] = {
      {FrameTestObject::Throw::ComError, E_ABORT, L"COM error 0x80004004"},
      {FrameTestObject::Throw::ComSuccess, E_FAIL, L"COM error 0x80004005"},
      {FrameTestObject::Throw::LibraryError, E_FAIL, L"BR_Info error 0xE0040001"},
      {FrameTestObject::Throw::Line, E_FAIL, L"failed at line 123"},
      {FrameTestObject::Throw::BadAlloc, E_OUTOFMEMORY, nullptr},
      {FrameTestObject::Throw::StdException, E_FAIL, L"station block cut short"},
      {FrameTestObject::Throw::Other, E_FAIL, L"unexpected failure"},
      {FrameTestObject::Throw::Nothing, S_OK, nullptr},
  };
  for (const Case& c : cases) {
    SetErrorInfo(0, nullptr);
    object->thrown = c.thrown;
    IUnknown* out = nullptr;
    CHECK(object->get_Selected(&out) == c.expected);
    IErrorInfo* info = nullptr;
    const HRESULT got = GetErrorInfo(0, &info);
    if (!c.description) {
      CHECK(got == S_FALSE);
      continue;
    }
    REQUIRE(got == S_OK);
    BSTR description = nullptr, source = nullptr;
    info->GetDescription(&description);
    info->GetSource(&source);
    GUID guid = {};
    info->GetGUID(&guid);
    CHECK(std::wstring(description) == c.description);
    CHECK(std::wstring(source) == L"BR_Info.FrameTestObject");
    CHECK(IsEqualIID(guid, IID_ITidesPortList));
    SysFreeString(description);
    SysFreeString(source);
    info->Release();
  }
  ISupportErrorInfo* support = br::test::Query<ISupportErrorInfo>(object);
  CHECK(support->InterfaceSupportsErrorInfo(IID_ITidesPortList) == S_OK);
  CHECK(support->InterfaceSupportsErrorInfo(IID_IDispatch) == S_FALSE);
  support->Release();
  object->Release();
}

// The lock a client's reference and LockServer take: DllCanUnloadNow in the module suite.
TEST_CASE("class factory: aggregation, creation failures, one lock per object") {
  ComApartment apartment;
  const LONG base = Module::LockCount();
  IClassFactory* factory = nullptr;
  REQUIRE(br::com::ClassFactory::Create(&br::com::CreateInstance<FrameTestObject>, &factory) == S_OK);
  CHECK(Module::LockCount() == base);  // the cache's own reference holds no lock

  FrameTestObject::finalConstructResult = S_OK;
  FrameTestObject::throwInConstructor = false;
  CHECK(factory->CreateInstance(nullptr, IID_IDispatch, nullptr) == E_POINTER);
  IUnknown* outer = reinterpret_cast<IUnknown*>(factory);
  void* out = reinterpret_cast<void*>(1);
  CHECK(factory->CreateInstance(outer, IID_IUnknown, &out) == CLASS_E_NOAGGREGATION);
  CHECK(out == nullptr);

  out = reinterpret_cast<void*>(1);
  CHECK(factory->CreateInstance(nullptr, IID_IClassFactory, &out) == E_NOINTERFACE);
  CHECK(out == nullptr);
  CHECK(FrameTestObject::live == 0);  // refused interface: the object is gone again

  FrameTestObject::finalConstructResult = E_UNEXPECTED;
  CHECK(factory->CreateInstance(nullptr, IID_IUnknown, &out) == E_UNEXPECTED);
  CHECK(out == nullptr);
  CHECK(FrameTestObject::live == 0);
  FrameTestObject::finalConstructResult = S_OK;

  FrameTestObject::throwInConstructor = true;
  CHECK(factory->CreateInstance(nullptr, IID_IUnknown, &out) == E_OUTOFMEMORY);
  CHECK(out == nullptr);
  FrameTestObject::throwInConstructor = false;

  ITidesPortList* list = nullptr;
  CHECK(factory->CreateInstance(nullptr, IID_ITidesPortList, reinterpret_cast<void**>(&list)) == S_OK);
  CHECK(FrameTestObject::live == 1);
  CHECK(Module::LockCount() == base + 1);
  list->Release();
  CHECK(Module::LockCount() == base);
  factory->Release();
}
