// Error information for automation clients (IErrorInfo through SetErrorInfo).
#pragma once

#include "frame/com/ClassIdentity.h"

#include <string>

namespace br::com {

// Leaves hr and description as the calling thread's error information, naming the
// class's dual interface and programmatic identifier as its source; returns hr.
HRESULT ReportErrorInfo(const ClassIdentity& cls, HRESULT hr, const std::wstring& description) noexcept;

}  // namespace br::com
