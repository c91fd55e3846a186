#include "inspector/rules/record_search.h"

namespace br::inspector {

std::optional<std::size_t> FindRememberedRecord(std::size_t count, const std::function<bool(std::size_t)>& matches) {
  for (std::size_t i = 1; i < count; ++i)
    if (matches(i)) return i;
  if (count > 1 && matches(0)) return 1;
  return std::nullopt;
}

}  // namespace br::inspector
