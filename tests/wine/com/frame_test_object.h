// A class built on the frame for its own tests: ITidesPortList as its dual interface, a test
// CLSID, and switches that make construction or get_Selected fail.
#pragma once

#include "frame/com/dispatch_object.h"

#include "BR_Info.h"

namespace br::test {

class FrameTestObject final : public br::com::DispatchObject<FrameTestObject, ITidesPortList> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  // What the next objects do.
  static HRESULT finalConstructResult;
  static bool throwInConstructor;
  static long live;  // objects alive

  FrameTestObject();
  ~FrameTestObject() override;
  HRESULT FinalConstruct() override { return finalConstructResult; }

  STDMETHODIMP SetPortList(VARIANT value) override;  // not used: E_NOTIMPL
  // get_Selected: throws what `thrown` names (0 none: S_OK with null).
  STDMETHODIMP get_Selected(IUnknown** out) override;

  enum class Throw { Nothing, ComError, LibraryError, Line, BadAlloc, StdException, Other, ComSuccess };
  Throw thrown = Throw::Nothing;
};

}  // namespace br::test
