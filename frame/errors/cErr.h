#pragma once
// The library's exception object: one 32-bit error code, copied by value.
// Portable on purpose, so code that builds natively can throw it too.

#include <cstdint>

namespace br {

// Codes thrown by the low-level file, registry and array routines.
enum : std::uint32_t {
  BR_ERR_REG_NO_KEY = 0xE0030002u,       // registry value queried without an open key
  BR_ERR_FILE_OPEN = 0xE0040001u,        // file cannot be opened, or its size cannot be read
  BR_ERR_FILE_READ = 0xE0040003u,        // reading from an open file failed
  BR_ERR_SEARCH_ARGS = 0xE0040007u,      // directory search without a folder or a pattern
  BR_ERR_FILE_MISSING = 0xE0040008u,     // named file does not exist, or is a folder
  BR_ERR_OUT_OF_MEMORY = 0x8007000Eu,    // growable array could not get more elements
};

class cErr {
public:
  explicit cErr(std::uint32_t code) noexcept : code_(code) {}
  std::uint32_t code() const noexcept { return code_; }

private:
  std::uint32_t code_;
};

}  // namespace br
