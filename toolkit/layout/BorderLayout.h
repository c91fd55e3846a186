#pragma once
// Five regions: "North", "South", "West", "East" and "Center" (compared ignoring case).

#include "toolkit/layout/Layout.h"

namespace toolkit {

// Region codes of Container::layoutBorderRegion.
enum BorderRegion : std::int32_t {
  kRegionWest = 1,
  kRegionEast = 2,
  kRegionNorth = 16,
  kRegionSouth = 32,
  kRegionCenter = 68,
};

class BorderLayout : public Layout {
public:
  explicit BorderLayout(std::int32_t hgap = 0, std::int32_t vgap = 0, bool centerAtPreferredSize = false);
  const ClassRecord* getClassRecord() const override;
};

// The region name a code stands for ("North", ...), or null for an unknown code.
const char* borderRegionName(std::int32_t region);

}  // namespace toolkit
