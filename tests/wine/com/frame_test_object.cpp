#include "tests/wine/com/frame_test_object.h"

#include <stdexcept>

namespace br::test {

// {6B0E9F1C-5C1B-4C39-9E77-3D2A0F1B7A10}
static const CLSID CLSID_FrameTestObject = {0x6b0e9f1c, 0x5c1b, 0x4c39, {0x9e, 0x77, 0x3d, 0x2a, 0x0f, 0x1b, 0x7a, 0x10}};

const br::com::ClassIdentity FrameTestObject::kClass = {&CLSID_FrameTestObject, &IID_ITidesPortList,
                                                        &DIID__ITidesPortListEvents, L"FrameTestObject"};

const FrameTestObject::Entry FrameTestObject::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_ITidesPortList, Self},
    {&IID_IDispatch, Self},
    {&IID_IConnectionPointContainer, ConnectionPoints},
    {&IID_IProvideClassInfo, ClassInfo},
    {&IID_IProvideClassInfo2, ClassInfo},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {nullptr, nullptr},
};

HRESULT FrameTestObject::finalConstructResult = S_OK;
bool FrameTestObject::throwInConstructor = false;
long FrameTestObject::live = 0;

FrameTestObject::FrameTestObject() {
  if (throwInConstructor) throw std::bad_alloc();
  ++live;
}

FrameTestObject::~FrameTestObject() { --live; }

STDMETHODIMP FrameTestObject::SetPortList(VARIANT) { return E_NOTIMPL; }

STDMETHODIMP FrameTestObject::get_Selected(IUnknown** out) {
  return Guard([&]() -> HRESULT {
    switch (thrown) {
      case Throw::ComError: throw cComError(E_ABORT);
      case Throw::ComSuccess: throw cComError(S_FALSE);
      case Throw::LibraryError: throw cErr(0xE0040001u);
      case Throw::Line: throw 123;
      case Throw::BadAlloc: throw std::bad_alloc();
      case Throw::StdException: throw std::runtime_error("station block cut short");
      case Throw::Other: throw 2.5;
      case Throw::Nothing: break;
    }
    if (out) *out = nullptr;
    return S_OK;
  });
}

}  // namespace br::test
