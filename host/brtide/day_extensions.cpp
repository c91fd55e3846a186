#include "host/brtide/day_extension.h"

namespace br::brtide {

// One line per extra output of "brtide day".
std::vector<std::unique_ptr<DayExtension>> MakeDayExtensions() {
  std::vector<std::unique_ptr<DayExtension>> extensions;
  return extensions;
}

}  // namespace br::brtide
