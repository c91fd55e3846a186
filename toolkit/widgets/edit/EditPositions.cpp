#include "toolkit/widgets/edit/EditPositions.h"

#include <algorithm>

#include "toolkit/widgets/edit/CoordText.h"
#include "toolkit/widgets/edit/edit_types.h"

namespace toolkit {

namespace {
bool isDigit(char c) { return c >= '0' && c <= '9'; }
}  // namespace

EditPositions::EditPositions(int type, std::string_view mask, std::string_view text)
    : type_(type),
      mask_(mask),
      text_(text),
      length_(static_cast<int>(std::min<size_t>(text.size(), 0x3FFFFFFF))),
      restricted_(type == kEditLatitude || type == kEditLongitude || type == kEditMonth ||
                  (type == kEditText && !mask.empty())) {
  if (type == kEditLatitude || type == kEditLongitude) coordinateRoles_ = CoordText::roles(mask);
}

bool EditPositions::editable(int position) const {
  if (!restricted_) return position >= 0 && position <= length_;
  if (position < 0 || position >= length_) return false;
  const size_t p = static_cast<size_t>(position);
  switch (type_) {
    case kEditText:
      if (p >= mask_.size()) return false;
      return mask_[p] == '9' || (p == 0 && mask_[p] == '-');
    case kEditLatitude:
    case kEditLongitude:
      return p < coordinateRoles_.size() && coordinateRoles_[p] != '\0';
    case kEditMonth:
      return isDigit(text_[p]);
    default:
      return false;
  }
}

char EditPositions::coordinateRole(int position) const {
  if (position < 0 || static_cast<size_t>(position) >= coordinateRoles_.size()) return '\0';
  return coordinateRoles_[static_cast<size_t>(position)];
}

int EditPositions::first() const { return nextAfter(-1); }

int EditPositions::last() const { return previousBefore(restricted_ ? length_ : length_ + 1); }

int EditPositions::nextAfter(int position) const {
  const int end = restricted_ ? length_ : length_ + 1;
  for (int p = std::max(position + 1, 0); p < end; ++p) {
    if (editable(p)) return p;
  }
  return -1;
}

int EditPositions::previousBefore(int position) const {
  const int end = restricted_ ? length_ : length_ + 1;
  for (int p = std::min(position - 1, end - 1); p >= 0; --p) {
    if (editable(p)) return p;
  }
  return -1;
}

int EditPositions::settle(int target, bool forward) const {
  if (!restricted_) return std::clamp(target, 0, length_);
  target = std::clamp(target, -1, length_);
  if (editable(target)) return target;
  int found = forward ? nextAfter(target) : previousBefore(target);
  if (found < 0) found = forward ? previousBefore(target) : nextAfter(target);
  return found < 0 ? 0 : found;
}

}  // namespace toolkit
