// What every harness needs besides its target: a check that stops the run the way a
// sanitizer does, and a reader that splits one fuzz input into parts.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string_view>

namespace br::fuzz {

[[noreturn]] inline void Fail(const char* condition, const char* file, int line) {
  std::fprintf(stderr, "%s:%d: fuzz check failed: %s\n", file, line, condition);
  std::abort();
}

// Takes bytes from the front of an input; past the end it gives zeros and empty parts,
// so every input, however short, is a valid one.
class InputReader {
 public:
  InputReader(const std::uint8_t* data, std::size_t size) : data_(data), size_(size) {}

  std::uint8_t U8() { return used_ < size_ ? data_[used_++] : 0; }
  std::uint16_t U16() {
    const unsigned low = U8();
    const unsigned high = U8();
    return static_cast<std::uint16_t>(low | (high << 8));
  }
  std::uint64_t U64() {
    std::uint64_t v = 0;
    for (int i = 0; i < 8; ++i) v |= static_cast<std::uint64_t>(U8()) << (8 * i);
    return v;
  }
  // Up to n bytes (fewer when the input runs out).
  std::string_view Bytes(std::size_t n) {
    const std::size_t take = n < Remaining() ? n : Remaining();
    const std::string_view part(reinterpret_cast<const char*>(data_) + used_, take);
    used_ += take;
    return part;
  }
  // Bytes up to (not including) the next zero byte, which is consumed.
  std::string_view UntilZero() {
    std::size_t end = used_;
    while (end < size_ && data_[end] != 0) ++end;
    const std::string_view part(reinterpret_cast<const char*>(data_) + used_, end - used_);
    used_ = end < size_ ? end + 1 : end;
    return part;
  }
  std::string_view Rest() { return Bytes(Remaining()); }
  std::size_t Remaining() const { return size_ - used_; }

 private:
  const std::uint8_t* data_;
  std::size_t size_;
  std::size_t used_ = 0;
};

}  // namespace br::fuzz

#define FUZZ_CHECK(condition) \
  do {                        \
    if (!(condition)) ::br::fuzz::Fail(#condition, __FILE__, __LINE__); \
  } while (0)
