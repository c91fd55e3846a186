// What every harness needs besides its target: a check that stops the run the way a
// sanitizer does, a reader that splits one fuzz input into parts, a scratch folder, and
// glibc's own reading of a printf format.
#pragma once

#include <printf.h>
#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <string_view>
#include <system_error>
#include <vector>

namespace br::fuzz {

[[noreturn]] inline void Fail(const char* condition, const char* file, int line) {
  std::fprintf(stderr, "%s:%d: fuzz check failed: %s\n", file, line, condition);
  std::abort();
}

}  // namespace br::fuzz

#define FUZZ_CHECK(condition) \
  do {                        \
    if (!(condition)) ::br::fuzz::Fail(#condition, __FILE__, __LINE__); \
  } while (0)

namespace br::fuzz {

// Takes bytes from the front of an input; past the end it gives zeros and empty parts,
// so every input, however short, is a valid one.
class InputReader {
 public:
  InputReader(const std::uint8_t* data, std::size_t size) : data_(data), size_(size) {}

  std::uint8_t U8() { return used_ < size_ ? data_[used_++] : 0; }
  std::uint16_t U16() {
    const unsigned low = U8();
    return static_cast<std::uint16_t>(low | (U8() << 8));
  }
  std::uint64_t U64() {
    std::uint64_t v = 0;
    for (int i = 0; i < 8; ++i) v |= static_cast<std::uint64_t>(U8()) << (8 * i);
    return v;
  }
  // Up to n bytes (fewer when the input runs out).
  std::string_view Bytes(std::size_t n) {
    const std::string_view part(reinterpret_cast<const char*>(data_) + used_, n < Remaining() ? n : Remaining());
    used_ += part.size();
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

// One scratch folder per process (made on first use under TMPDIR or /tmp), removed at exit.
inline const std::filesystem::path& ScratchFolder() {
  static std::filesystem::path folder;
  if (folder.empty()) {
    const char* base = std::getenv("TMPDIR");
    std::string pattern = std::string(base && *base ? base : "/tmp") + "/br-fuzz-XXXXXX";
    FUZZ_CHECK(mkdtemp(pattern.data()) != nullptr);
    folder = pattern;
    std::atexit([] {
      std::error_code ignored;
      std::filesystem::remove_all(folder, ignored);
    });
  }
  return folder;
}

// Writes bytes as the file name inside the scratch folder, replacing it.
inline void WriteScratchFile(const char* name, std::string_view bytes) {
  std::FILE* f = std::fopen((ScratchFolder() / name).c_str(), "wb");
  FUZZ_CHECK(f != nullptr);
  if (!bytes.empty()) FUZZ_CHECK(std::fwrite(bytes.data(), 1, bytes.size(), f) == bytes.size());
  FUZZ_CHECK(std::fclose(f) == 0);
}

// The argument types glibc's own format parser reads from a printf format (the first four).
inline std::vector<int> FormatArguments(const std::string& format) {
  int types[4] = {};
  const std::size_t count = parse_printf_format(format.c_str(), 4, types);
  return std::vector<int>(types, types + (count < 4 ? count : 4));
}

// The C library's own text for one double.
inline std::string Print(const char* format, double value) {
  const int length = std::snprintf(nullptr, 0, format, value);
  if (length <= 0) return std::string();
  std::string text(static_cast<std::size_t>(length) + 1, '\0');
  std::snprintf(text.data(), text.size(), format, value);
  text.resize(static_cast<std::size_t>(length));
  return text;
}

}  // namespace br::fuzz
