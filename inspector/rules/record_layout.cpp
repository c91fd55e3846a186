#include "inspector/rules/record_layout.h"

#include <limits>

namespace br::inspector {

std::size_t RecordCount(std::size_t elementSize, std::size_t elementCount, std::size_t recordSize) {
  if (recordSize == 0 || elementSize == 0 || elementCount == 0) return 0;
  if (elementCount > std::numeric_limits<std::size_t>::max() / elementSize) return 0;
  const std::size_t bytes = elementSize * elementCount;
  if (bytes % 4 != 0) return 0;
  if (elementSize == 1) return bytes / recordSize;
  if (elementSize == recordSize) return elementCount;
  return 0;
}

bool IsRecordWord(long long word, std::size_t recordCount) {
  if (word == kHeaderWord) return recordCount > 0;
  return word >= 1 && static_cast<unsigned long long>(word) < recordCount;
}

std::size_t RecordOfWord(long long word) { return word == kHeaderWord ? 0 : static_cast<std::size_t>(word); }

}  // namespace br::inspector
