#pragma once
// The toolkit's own failure, thrown as the library's cErr.

#include <cstdint>

#include "frame/errors/cErr.h"

namespace toolkit {

// A window was to be created under a parent that is not a window.
constexpr std::uint32_t kErrorBadParentWindow = 0xE0050001u;

[[noreturn]] inline void throwBadParentWindow() { throw br::cErr(kErrorBadParentWindow); }

}  // namespace toolkit
