#pragma once
// The COM-support exception: thrown by smart-pointer and string helpers when a
// platform call fails. mingw has no _com_error, so the library has its own.

#include <cstdint>

namespace br {

class cComError {
public:
  explicit cComError(std::int32_t hr) noexcept : hr_(hr) {}
  std::int32_t Error() const noexcept { return hr_; }

private:
  std::int32_t hr_;
};

}  // namespace br
