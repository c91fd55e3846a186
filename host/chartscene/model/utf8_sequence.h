#pragma once
// One UTF-8 sequence, checked as the scene reader and the catalogue's text conversion
// both need it: no overlong forms, no surrogates, nothing past U+10FFFF.

#include <cstddef>
#include <cstdint>

namespace br::chartscene {

// The length (1 to 4) of the valid sequence that starts text, with its code point in
// code; 0 when the bytes there are no valid UTF-8 (or size is 0).
std::size_t Utf8SequenceAt(const char* text, std::size_t size, std::uint32_t& code);

}  // namespace br::chartscene
