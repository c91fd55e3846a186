#include "inspector/rules/FillLimits.h"

namespace br::inspector {

bool FillLimits::Enter(const Id& id) {
  if (path_.count(id) != 0) return false;
  if (items_ >= kMaxItems) return Refuse(Cut::kItems), false;
  if (depth_ >= kMaxDepth) return Refuse(Cut::kDepth), false;
  path_.insert(id);
  ++depth_;
  ++items_;
  return true;
}

void FillLimits::Leave(const Id& id) {
  if (path_.erase(id) != 0 && depth_ > 0) --depth_;
}

void FillLimits::Refuse(Cut cut) {
  if (firstCut_ == Cut::kNone) firstCut_ = cut;
  ++cuts_;
}

}  // namespace br::inspector
