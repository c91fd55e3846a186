#pragma once
// How many object records an array handed to SetInfo/AddInfo holds. A record is an owner
// pointer followed by a 16-byte identity, so its size follows the pointer size: 24 bytes
// on 64-bit Windows, 20 on 32-bit. Arrays come as bytes or as whole records.

#include <cstddef>

namespace br::inspector {

// Records in `elementCount` elements of `elementSize` bytes each, for records of
// `recordSize` bytes: byte elements hold their byte size / recordSize records, elements
// of exactly a record hold one each, anything else holds none. The byte size must be
// non-zero and a multiple of 4, else none.
std::size_t RecordCount(std::size_t elementSize, std::size_t elementCount, std::size_t recordSize);

// What a tree item's data word may name: -2 (the header item, record 0) or a record of
// 1 .. recordCount - 1. Anything else came from an item being torn down or from outside.
bool IsRecordWord(long long word, std::size_t recordCount);

// The record a data word names (-2 is record 0); only for words IsRecordWord accepts.
std::size_t RecordOfWord(long long word);

inline constexpr long long kHeaderWord = -2;

}  // namespace br::inspector
