#pragma once
// The dataset header record that a host hands back as an array of bytes. Each field is
// read only when the bytes reach its end, and a text only up to the end of its field, so
// a short or damaged record gives missing fields, never a read past the data.

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>

namespace br::geo {

struct DataSetHeader {
  std::optional<std::uint32_t> scale;          // compilation scale
  std::optional<std::int32_t> level;
  std::optional<std::uint16_t> edition;
  std::optional<std::uint16_t> update;
  std::optional<std::uint64_t> updateDate;     // file time: 100 ns since 1601
  std::optional<std::uint64_t> issueDate;      // file time
  std::optional<std::uint32_t> agency;         // producing agency code
  std::optional<std::uint32_t> sourceAgency;   // source producing agency code
  std::optional<std::string> sourceId;         // source identification code
  std::optional<std::uint8_t> status;          // bit 0 terminated, bit 1 new edition available
  std::optional<std::string> fileName;         // dataset file name (a library's name)
  std::optional<std::uint32_t> usage;          // intended usage
  std::optional<std::array<unsigned char, 16>> identity;
};

inline constexpr std::uint8_t kHeaderStatusTerminated = 0x01;
inline constexpr std::uint8_t kHeaderStatusNewEdition = 0x02;

// Bytes of a record that holds every field.
inline constexpr std::size_t kDataSetHeaderSize = 592;

DataSetHeader ParseDataSetHeader(const unsigned char* data, std::size_t size);

// A zero-terminated text field of fieldSize bytes at offset: the bytes up to the first
// zero, the field's end or the data's end, whichever comes first; none when the data
// ends before the field begins.
std::optional<std::string> BoundedText(const unsigned char* data, std::size_t size,
                                       std::size_t offset, std::size_t fieldSize);

}  // namespace br::geo
