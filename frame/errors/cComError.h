#pragma once
// The COM-support exception: thrown by smart-pointer and string helpers when a
// platform call fails. mingw has no _com_error, so the library has its own.

#include <cstdint>

class cComError {
public:
  explicit cComError(std::int32_t hr) noexcept : m_hr(hr) {}
  std::int32_t Error() const noexcept { return m_hr; }

private:
  std::int32_t m_hr;
};
