// The COM frame on a class of its own: interface table, module lock, connection points
// and firing, the method boundary, class factories and texts.
#include "tests/wine/com/frame_test_object.h"

#include "frame/com/bstr_text.h"
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

void FireWith(FrameTestObject* object, long id) {
  VARIANT v;
  v.vt = VT_I4;
  v.lVal = id;
  object->SetPortList(v);
}

}  // namespace

TEST_CASE("QueryInterface answers exactly the class's table, with one identity") {
  ComApartment apartment;
  FrameTestObject* object = NewTestObject();
  IUnknown* identity = br::test::Query<IUnknown>(object);

  for (const IID* iid : {&IID_ITidesPortList, &IID_IDispatch, &IID_IConnectionPointContainer,
                         &IID_IProvideClassInfo, &IID_IProvideClassInfo2, &IID_ISupportErrorInfo}) {
    IUnknown* face = nullptr;
    REQUIRE(object->QueryInterface(*iid, reinterpret_cast<void**>(&face)) == S_OK);
    IUnknown* back = br::test::Query<IUnknown>(face);
    CHECK(back == identity);  // companions hand IUnknown to their owner
    back->Release();
    face->Release();
  }
  void* none = reinterpret_cast<void*>(1);
  CHECK(object->QueryInterface(IID_IOleObject, &none) == E_NOINTERFACE);
  CHECK(none == nullptr);
  CHECK(object->QueryInterface(IID_IUnknown, nullptr) == E_POINTER);

  // Companions share the owner's count.
  const ULONG before = br::test::RefCount(identity);
  IConnectionPointContainer* container = br::test::Query<IConnectionPointContainer>(object);
  CHECK(br::test::RefCount(identity) == before + 1);
  container->Release();
  CHECK(br::test::RefCount(identity) == before);

  identity->Release();
  object->Release();
  CHECK(FrameTestObject::live == 0);
}

TEST_CASE("every live object and enumerator holds one module lock") {
  ComApartment apartment;
  const LONG base = Module::LockCount();
  FrameTestObject* a = NewTestObject();
  FrameTestObject* b = NewTestObject();
  CHECK(Module::LockCount() == base + 2);

  IConnectionPointContainer* container = br::test::Query<IConnectionPointContainer>(a);
  IEnumConnectionPoints* points = nullptr;
  REQUIRE(container->EnumConnectionPoints(&points) == S_OK);
  container->Release();
  CHECK(Module::LockCount() == base + 3);

  a->Release();  // the enumerator's point still holds the object
  CHECK(FrameTestObject::live == 2);
  points->Release();
  CHECK(FrameTestObject::live == 1);
  b->Release();
  CHECK(FrameTestObject::live == 0);
  CHECK(Module::LockCount() == base);
}

TEST_CASE("connection point container, point and enumerators") {
  ComApartment apartment;
  FrameTestObject* object = NewTestObject();
  IConnectionPointContainer* container = br::test::Query<IConnectionPointContainer>(object);

  IConnectionPoint* other = reinterpret_cast<IConnectionPoint*>(1);
  CHECK(container->FindConnectionPoint(DIID__ITidesPortEvents, &other) == CONNECT_E_NOCONNECTION);
  CHECK(other == nullptr);
  CHECK(container->FindConnectionPoint(DIID__ITidesPortListEvents, nullptr) == E_POINTER);

  IEnumConnectionPoints* points = nullptr;
  REQUIRE(container->EnumConnectionPoints(&points) == S_OK);
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
  points->Release();

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
  object->Release();
  CHECK(FrameTestObject::live == 0);
}

TEST_CASE("events reach every sink in order as a method call with the user-default locale") {
  ComApartment apartment;
  FrameTestObject* object = NewTestObject();
  EventSink a(DIID__ITidesPortListEvents), b(DIID__ITidesPortListEvents);
  REQUIRE(a.Connect(object));
  REQUIRE(b.Connect(object));
  std::string order;
  a.onCall = [&] { order += 'a'; };
  b.onCall = [&] { order += 'b'; };

  FireWith(object, 7);
  CHECK(order == "ab");
  CHECK(a.calls == 1);
  CHECK(b.calls == 1);
  CHECK(a.lastId == 7);
  CHECK(a.lastIidNull);
  CHECK(a.lastLocale == 0x400);
  CHECK(a.lastFlags == DISPATCH_METHOD);
  CHECK(a.lastArgumentCount == 0);

  VARIANT value;
  value.vt = VT_R8;
  value.dblVal = 2.5;
  object->SetPortList(value);
  REQUIRE(b.lastDoubles.size() == 1);
  CHECK(b.lastDoubles[0] == 2.5);

  a.Disconnect();
  FireWith(object, 1);
  CHECK(a.calls == 2);
  CHECK(b.calls == 3);
  b.Disconnect();
  object->Release();
}

// Sinks that disconnect, connect or release the source inside a call: the re-entrancy
// suite, through TidesPort's Calculated.

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

TEST_CASE("IProvideClassInfo2 names the default source interface") {
  ComApartment apartment;
  FrameTestObject* object = NewTestObject();
  IProvideClassInfo2* info = br::test::Query<IProvideClassInfo2>(object);
  GUID guid = {};
  CHECK(info->GetGUID(GUIDKIND_DEFAULT_SOURCE_DISP_IID, &guid) == S_OK);
  CHECK(IsEqualIID(guid, DIID__ITidesPortListEvents));
  CHECK(info->GetGUID(GUIDKIND_DEFAULT_SOURCE_DISP_IID + 1, &guid) == E_INVALIDARG);
  CHECK(info->GetGUID(GUIDKIND_DEFAULT_SOURCE_DISP_IID, nullptr) == E_POINTER);
  // This program has no type library, so the coclass type info is refused, not invented.
  ITypeInfo* type = reinterpret_cast<ITypeInfo*>(1);
  CHECK(FAILED(info->GetClassInfo(&type)));
  CHECK(type == nullptr);
  info->Release();
  object->Release();
}

TEST_CASE("class factory: lock rule, aggregation, creation failures") {
  ComApartment apartment;
  const LONG base = Module::LockCount();
  IClassFactory* factory = nullptr;
  REQUIRE(br::com::ClassFactory::Create(&br::com::CreateInstance<FrameTestObject>, &factory) == S_OK);
  CHECK(Module::LockCount() == base);  // the cache's own reference holds no lock

  factory->AddRef();  // a client: 1 -> 2
  CHECK(Module::LockCount() == base + 1);
  factory->AddRef();  // 2 -> 3: no second lock
  CHECK(Module::LockCount() == base + 1);
  factory->Release();
  factory->Release();  // back to 1
  CHECK(Module::LockCount() == base);

  CHECK(factory->LockServer(TRUE) == S_OK);
  CHECK(Module::LockCount() == base + 1);
  CHECK(factory->LockServer(FALSE) == S_OK);
  CHECK(Module::LockCount() == base);

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

TEST_CASE("texts: ANSI code page inside, BSTR at the boundary") {
  using namespace br::com;
  CHECK(AnsiFromBstr(nullptr).empty());
  BstrHolder empty(BstrFromAnsi(""));
  REQUIRE(empty.Get() != nullptr);
  CHECK(SysStringLen(empty.Get()) == 0);

  const std::string name = "Saint-Malo";
  BstrHolder text(BstrFromAnsi(name));
  CHECK(std::wstring(text.Get()) == L"Saint-Malo");
  CHECK(AnsiFromBstr(text.Get()) == name);

  // A character of the upper half goes through the code page both ways.
  const std::string accented = "Br\xE9st";  // e acute in the Western code pages
  if (GetACP() == 1252) {
    BstrHolder wide(BstrFromAnsi(accented));
    CHECK(std::wstring(wide.Get()) == L"Br\u00E9st");
    CHECK(AnsiFromBstr(wide.Get()) == accented);
  }
  // Embedded zeros survive.
  const std::string withZero("a\0b", 3);
  BstrHolder zero(BstrFromAnsi(withZero));
  CHECK(SysStringLen(zero.Get()) == 3);
  CHECK(AnsiFromBstr(zero.Get()) == withZero);
}
