#include "frame/geo/dataset_header.h"

#include <cstring>

namespace br::geo {

namespace {

// Field offsets and sizes of the record.
constexpr std::size_t kScale = 16, kLevel = 20, kEdition = 24, kUpdate = 26;
constexpr std::size_t kUpdateDate = 28, kIssueDate = 36, kAgency = 48, kSourceAgency = 52;
constexpr std::size_t kSourceId = 60, kSourceIdSize = 252;
constexpr std::size_t kStatus = 312;
constexpr std::size_t kFileName = 316, kFileNameSize = 256;
constexpr std::size_t kUsage = 572, kIdentity = 576;

// Little-endian, whatever the machine.
template <typename T>
std::optional<T> Number(const unsigned char* data, std::size_t size, std::size_t offset) {
  if (data == nullptr || offset > size || size - offset < sizeof(T)) {
    return std::nullopt;
  }
  std::uint64_t value = 0;
  for (std::size_t i = sizeof(T); i-- > 0;) {
    value = (value << 8) | data[offset + i];
  }
  return static_cast<T>(value);
}

}  // namespace

std::optional<std::string> BoundedText(const unsigned char* data, std::size_t size,
                                       std::size_t offset, std::size_t fieldSize) {
  if (data == nullptr || offset >= size) {
    return std::nullopt;
  }
  const std::size_t available = size - offset < fieldSize ? size - offset : fieldSize;
  const unsigned char* begin = data + offset;
  const void* zero = std::memchr(begin, 0, available);
  const std::size_t length =
      zero ? static_cast<std::size_t>(static_cast<const unsigned char*>(zero) - begin) : available;
  return std::string(reinterpret_cast<const char*>(begin), length);
}

DataSetHeader ParseDataSetHeader(const unsigned char* data, std::size_t size) {
  DataSetHeader header;
  header.scale = Number<std::uint32_t>(data, size, kScale);
  header.level = Number<std::int32_t>(data, size, kLevel);
  header.edition = Number<std::uint16_t>(data, size, kEdition);
  header.update = Number<std::uint16_t>(data, size, kUpdate);
  header.updateDate = Number<std::uint64_t>(data, size, kUpdateDate);
  header.issueDate = Number<std::uint64_t>(data, size, kIssueDate);
  header.agency = Number<std::uint32_t>(data, size, kAgency);
  header.sourceAgency = Number<std::uint32_t>(data, size, kSourceAgency);
  header.sourceId = BoundedText(data, size, kSourceId, kSourceIdSize);
  header.status = Number<std::uint8_t>(data, size, kStatus);
  header.fileName = BoundedText(data, size, kFileName, kFileNameSize);
  header.usage = Number<std::uint32_t>(data, size, kUsage);
  if (data != nullptr && size >= kIdentity + 16) {
    std::array<unsigned char, 16> identity;
    std::memcpy(identity.data(), data + kIdentity, identity.size());
    header.identity = identity;
  }
  return header;
}

}  // namespace br::geo
