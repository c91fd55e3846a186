#include "toolkit/layout/BorderLayout.h"

#include "toolkit/base/class_records.h"

namespace toolkit {

BorderLayout::BorderLayout(std::int32_t h, std::int32_t v, bool centerAtPreferred) {
  mode = kSplitStacked;  // made with 16; the algorithms never read it
  hgap = h;
  vgap = v;
  centerAtPreferredSize = centerAtPreferred ? 1 : 0;
}

const ClassRecord* BorderLayout::getClassRecord() const { return &records::BorderLayout; }

const char* borderRegionName(std::int32_t region) {
  switch (region) {
    case kRegionWest: return "West";
    case kRegionEast: return "East";
    case kRegionNorth: return "North";
    case kRegionSouth: return "South";
    case kRegionCenter: return "Center";
    default: return nullptr;
  }
}

}  // namespace toolkit
