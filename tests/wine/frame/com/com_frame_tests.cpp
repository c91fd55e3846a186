// The COM frame's method boundary on a class identity of its own (connection points,
// interfaces and class objects: on the real classes in the module suite).
#include "frame/com/guard.h"
#include "BR_Info.h"

#include <doctest/doctest.h>

#include <stdexcept>
#include <string>

// {6B0E9F1C-5C1B-4C39-9E77-3D2A0F1B7A10}
const CLSID kTestClass = {0x6b0e9f1c, 0x5c1b, 0x4c39, {0x9e, 0x77, 0x3d, 0x2a, 0x0f, 0x1b, 0x7a, 0x10}};
const br::com::ClassIdentity kClass = {&kTestClass, &IID_ITidesPortList, &DIID__ITidesPortListEvents,
                                       L"FrameTestObject"};

TEST_CASE("the method boundary turns every thrown value into an HRESULT with error information") {
  CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
  struct Case {
    void (*body)();
    HRESULT expected;
    const wchar_t* description;
  };
  const Case cases[] = {
      {[] { throw br::cComError(E_ABORT); }, E_ABORT, L"COM error 0x80004004"},
      {[] { throw br::cComError(S_FALSE); }, E_FAIL, L"COM error 0x80004005"},  // a success code is no failure
      {[] { throw br::cErr(0xE0040001u); }, E_FAIL, L"BR_Info error 0xE0040001"},
      {[] { throw 123; }, E_FAIL, L"failed at line 123"},
      {[] { throw std::bad_alloc(); }, E_OUTOFMEMORY, nullptr},
      {[] { throw std::runtime_error("station block cut short"); }, E_FAIL, L"station block cut short"},
      {[] { throw 2.5; }, E_FAIL, L"unexpected failure"},
      {[] {}, S_OK, nullptr},
  };
  for (const Case& c : cases) {
    SetErrorInfo(0, nullptr);
    CHECK(br::com::Guarded(kClass, [&]() -> HRESULT { c.body(); return S_OK; }) == c.expected);
    IErrorInfo* info = nullptr;
    const HRESULT got = GetErrorInfo(0, &info);
    if (!c.description) {
      CHECK(got == S_FALSE);
      continue;
    }
    REQUIRE(got == S_OK);
    BSTR description = nullptr, source = nullptr;
    GUID guid = {};
    info->GetDescription(&description);
    info->GetSource(&source);
    info->GetGUID(&guid);
    CHECK(std::wstring(description) == c.description);
    CHECK(std::wstring(source) == L"BR_Info.FrameTestObject");
    CHECK(IsEqualIID(guid, IID_ITidesPortList));
    SysFreeString(description);
    SysFreeString(source);
    info->Release();
  }
  CoUninitialize();
}
