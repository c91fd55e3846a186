#pragma once
// Two (at most three) panes side by side or stacked; the first takes
// splitNumerator / splitDenominator of the extent.

#include "toolkit/layout/Layout.h"

namespace toolkit {

class SplitterLayout : public Layout {
public:
  // orientation: kSplitSideBySide or kSplitStacked. The split starts unset (0 / 0):
  // the owner sets it, or lets Container::initializeSplit measure it; until then
  // the panes share the extent equally.
  explicit SplitterLayout(std::int32_t orientation = kSplitSideBySide, std::int32_t gap = 0);
  const ClassRecord* getClassRecord() const override;

  bool isStacked() const { return mode == kSplitStacked; }
};

}  // namespace toolkit
