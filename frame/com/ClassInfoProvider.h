#pragma once

#include "frame/com/ClassIdentity.h"
#include "frame/com/Companion.h"

namespace br::com {

// IProvideClassInfo2: the class's coclass type info and its default source interface.
class ClassInfoProvider final : public Companion<IProvideClassInfo2> {
public:
  ClassInfoProvider(IUnknown& owner, const ClassIdentity& cls) noexcept : Companion(owner), class_(cls) {}

  STDMETHODIMP GetClassInfo(ITypeInfo** out) override;
  STDMETHODIMP GetGUID(DWORD kind, GUID* out) override;

private:
  const ClassIdentity& class_;
};

}  // namespace br::com
