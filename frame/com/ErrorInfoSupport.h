#pragma once

#include "frame/com/ClassIdentity.h"
#include "frame/com/Companion.h"

namespace br::com {

// ISupportErrorInfo: the class's dual interface leaves error information on failure.
class ErrorInfoSupport final : public Companion<ISupportErrorInfo> {
public:
  ErrorInfoSupport(IUnknown& owner, const ClassIdentity& cls) noexcept : Companion(owner), class_(cls) {}

  STDMETHODIMP InterfaceSupportsErrorInfo(REFIID riid) override;

private:
  const ClassIdentity& class_;
};

}  // namespace br::com
