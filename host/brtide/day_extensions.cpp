#include "host/brtide/DayExtension.h"

#include "host/brtide/day_picture.h"

namespace br::brtide {

// One line per extra output of "brtide day".
std::vector<std::unique_ptr<DayExtension>> MakeDayExtensions() {
  std::vector<std::unique_ptr<DayExtension>> extensions;
  extensions.push_back(std::make_unique<DayPictureOption>());  // --png FILE
  extensions.push_back(std::make_unique<PictureSizeOption>());  // --size WxH
  return extensions;
}

}  // namespace br::brtide
