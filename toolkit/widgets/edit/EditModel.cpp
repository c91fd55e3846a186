#include "toolkit/widgets/edit/EditModel.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cmath>
#include <cstdio>
#include <cstdlib>

#include "frame/format/coord_format.h"
#include "toolkit/widgets/edit/CoordText.h"

namespace toolkit {

namespace {

bool isDigit(unsigned char c) { return c >= '0' && c <= '9'; }

unsigned char upper(unsigned char c) { return c >= 'a' && c <= 'z' ? c - ('a' - 'A') : c; }

// Coordinates beyond these would not fit their mask's degree field.
double clampCoordinate(int type, double value) {
  const double limit = type == kEditLatitude ? 90.0 : 180.0;
  return std::clamp(value, -limit, limit);
}

}  // namespace

EditModel::EditModel(int maxLength) : maxLength_(maxLength > 0 ? maxLength : 0) {}

// Configuration -----------------------------------------------------------------

void EditModel::fillFromMask() {
  text_.clear();
  for (size_t i = 0; i < mask_.size(); ++i) {
    const char m = mask_[i];
    if (m == '9') text_.push_back('0');
    else if (m == '-' && i == 0) text_.push_back(' ');
    else text_.push_back(m);
  }
}

bool EditModel::setEditType(int type, std::string_view mask) {
  switch (type) {
    case kEditText:
      mask_.assign(mask.data(), mask.size());
      if (!mask_.empty() && mask_.size() != text_.size()) fillFromMask();
      overwrite_ = !mask_.empty();
      noPaste_ = false;
      break;
    case kEditInteger:
    case kEditDecimal:
      mask_.clear();
      text_ = type == kEditInteger ? "0" : "0.0";
      overwrite_ = true;
      noPaste_ = false;
      break;
    case kEditLatitude:
    case kEditLongitude:
      mask_ = mask.empty() ? (type == kEditLatitude ? kDefaultLatitudeMask : kDefaultLongitudeMask)
                           : std::string(mask);
      text_ = br::FormatCoord(mask_.c_str(), type, 0.0);
      overwrite_ = true;
      noPaste_ = false;
      break;
    case kEditMonth:
      mask_ = mask.empty() ? kDefaultMonthPicture : std::string(mask);
      text_.clear();
      date_ = CivilDate{};
      overwrite_ = true;
      noPaste_ = true;
      break;
    default:
      return false;
  }
  type_ = type;
  if (isFree()) cutToMaxLength();
  caret_ = 0;
  selection_ = 0;
  normalize();
  changed();
  return true;
}

void EditModel::setText(std::string_view text) {
  const bool wasText = type_ == kEditText;
  type_ = kEditText;
  noPaste_ = false;
  text_.assign(text.data(), text.size());
  if (mask_.size() != text_.size()) mask_.clear();
  if (!wasText) overwrite_ = false;
  if (!mask_.empty()) overwrite_ = true;
  else cutToMaxLength();
  caret_ = 0;
  selection_ = 0;
  normalize();
  changed();
}

bool EditModel::setNumber(long long number) {
  if (type_ != kEditInteger) return false;
  text_ = std::to_string(number);
  cutToMaxLength();
  normalize();
  changed();
  return true;
}

bool EditModel::setValue(double value) {
  if (!std::isfinite(value)) return false;
  if (type_ == kEditDecimal) {
    const int needed = std::snprintf(nullptr, 0, "%.4f", value);
    if (needed <= 0) return false;
    std::string text(static_cast<size_t>(needed) + 1, '\0');
    std::snprintf(text.data(), text.size(), "%.4f", value);
    text.resize(static_cast<size_t>(needed));
    text_ = std::move(text);
  } else if (isCoordinate()) {
    text_ = br::FormatCoord(mask_.c_str(), type_, clampCoordinate(type_, value));
  } else {
    return false;
  }
  normalize();
  changed();
  return true;
}

bool EditModel::setDateText(std::string_view text, double platformDate) {
  if (type_ != kEditMonth) return false;
  CivilDate date;
  if (!MonthPicture::fromPlatformDate(platformDate, date)) return false;
  date_ = date;
  text_.assign(text.data(), text.size());
  normalize();
  changed();
  return true;
}

void EditModel::cutToMaxLength() {
  if (maxLength_ > 0 && text_.size() > static_cast<size_t>(maxLength_)) {
    text_.resize(static_cast<size_t>(maxLength_));
    changed();
  }
}

bool EditModel::setMaxLength(int maxLength) {
  if (maxLength < 0 || !isFree()) return false;
  maxLength_ = maxLength;
  cutToMaxLength();
  normalize();
  return true;
}

bool EditModel::setSelectionLength(int length) {
  if (type_ == kEditLatitude || type_ == kEditLongitude || type_ == kEditMonth) return false;
  selection_ = std::clamp(length, -caret_, this->length() - caret_);
  return true;
}

bool EditModel::setOverwrite(bool overwrite) {
  if (!isFree()) return false;
  overwrite_ = overwrite;
  return true;
}

void EditModel::setCaret(int position, int selectionLength) {
  caret_ = position;
  selection_ = selectionLength;
  normalize();
}

// Keeps the caret on a place it may rest on and the selection inside the text.
void EditModel::normalize() {
  const EditPositions places = positions();
  caret_ = places.settle(std::clamp(caret_, 0, length()), true);
  if (type_ == kEditLatitude || type_ == kEditLongitude || type_ == kEditMonth) {
    selection_ = 0;
  } else {
    selection_ = std::clamp(selection_, -caret_, length() - caret_);
  }
}

// Values --------------------------------------------------------------------------

int EditModel::getNumber() const {
  errno = 0;
  const long long value = std::strtoll(text_.c_str(), nullptr, 10);
  if (errno == ERANGE) return value < 0 ? INT_MIN : INT_MAX;
  return static_cast<int>(std::clamp<long long>(value, INT_MIN, INT_MAX));
}

double EditModel::getValue() const {
  switch (type_) {
    case kEditLatitude:
    case kEditLongitude:
      return CoordText::parse(mask_, type_, text_);
    case kEditMonth:
      return MonthPicture::toPlatformDate(MonthPicture::parse(mask_, text_, date_));
    default: {
      const double value = std::strtod(text_.c_str(), nullptr);
      return std::isfinite(value) ? value : 0.0;
    }
  }
}

// Typing --------------------------------------------------------------------------

bool EditModel::acceptsFree(unsigned char ch, int replaceFrom, int replaceCount) const {
  switch (type_) {
    case kEditInteger: return isDigit(ch);
    case kEditDecimal: {
      if (isDigit(ch)) return true;
      if (ch != '.') return false;
      // One '.' at most once the character is in: it may replace the one there.
      std::string rest = text_;
      rest.erase(static_cast<size_t>(replaceFrom), static_cast<size_t>(replaceCount));
      return rest.find('.') == std::string::npos;
    }
    default: return ch >= 0x20 && ch <= 0x7E;
  }
}

bool EditModel::acceptsAt(int position, unsigned char ch) const {
  const EditPositions places = positions();
  if (!places.editable(position)) return false;
  switch (type_) {
    case kEditText:
      if (mask_[static_cast<size_t>(position)] == '9') return isDigit(ch);
      return ch == '-' || ch == ' ';
    case kEditLatitude:
    case kEditLongitude:
      if (places.coordinateRole(position) == '$')
        return CoordText::hemispheres(type_).find(static_cast<char>(upper(ch))) != std::string_view::npos;
      return isDigit(ch);
    case kEditMonth:
      return isDigit(ch);
    default:
      return false;
  }
}

bool EditModel::typeChar(unsigned char ch) {
  return isFree() ? typeFree(ch) : typeRestricted(ch);
}

bool EditModel::typeFree(unsigned char ch) {
  const int replaceFrom = selection_ != 0 ? selectionStart() : caret_;
  const int replaceCount =
      selection_ != 0 ? std::abs(selection_) : (overwrite_ && caret_ < length() ? 1 : 0);
  if (!acceptsFree(ch, replaceFrom, replaceCount)) return false;
  const char c = static_cast<char>(ch);
  if (selection_ != 0) {
    const int start = selectionStart();
    text_.replace(static_cast<size_t>(start), static_cast<size_t>(std::abs(selection_)), 1, c);
    caret_ = start + 1;
    selection_ = 0;
  } else if (overwrite_ && caret_ < length()) {
    text_[static_cast<size_t>(caret_)] = c;
    ++caret_;
  } else {
    if (maxLength_ > 0 && length() >= maxLength_) return false;
    text_.insert(static_cast<size_t>(caret_), 1, c);
    ++caret_;
  }
  changed();
  return true;
}

bool EditModel::typeRestricted(unsigned char ch) {
  if (selection_ != 0) {
    caret_ = positions().settle(selectionStart(), true);
    selection_ = 0;
  }
  if (!acceptsAt(caret_, ch)) return false;
  text_[static_cast<size_t>(caret_)] =
      static_cast<char>(isCoordinate() ? upper(ch) : ch);
  const int next = positions().nextAfter(caret_);
  if (next >= 0) caret_ = next;
  changed();
  return true;
}

// Keys ------------------------------------------------------------------------------

void EditModel::moveCaret(int target, bool forward, bool extend) {
  const int fixed = anchor();
  const EditPositions places = positions();
  int position;
  if (places.restricted()) {
    // Nothing further that way: back to position 0 (normalize then settles on the first
    // place when 0 itself cannot be typed over).
    position = 0;
    if (target >= 0 && target < length()) {
      const int found = places.editable(target) ? target
                        : forward ? places.nextAfter(target) : places.previousBefore(target);
      if (found >= 0) position = found;
    }
  } else {
    position = std::clamp(target, 0, length());
  }
  caret_ = position;
  selection_ = extend ? fixed - caret_ : 0;
  normalize();
}

void EditModel::placeCaret(int index, bool extend) {
  const EditPositions places = positions();
  const int fixed = anchor();
  index = std::clamp(index, 0, length());
  if (places.restricted()) {
    // The nearest place the caret may rest on, ahead first.
    const int ahead = places.editable(index) ? index : places.nextAfter(index);
    const int behind = places.previousBefore(index);
    if (ahead < 0) caret_ = behind < 0 ? 0 : behind;
    else if (behind < 0 || ahead - index <= index - behind) caret_ = ahead;
    else caret_ = behind;
  } else {
    caret_ = index;
  }
  selection_ = extend && isFree() ? fixed - caret_ : 0;
  normalize();
}

void EditModel::selectAll() {
  if (type_ == kEditLatitude || type_ == kEditLongitude || type_ == kEditMonth) return;
  const EditPositions places = positions();
  if (places.restricted()) {
    const int first = places.first(), last = places.last();
    if (first < 0) return;
    caret_ = first;  // the caret stays on a place it may rest on
    selection_ = last + 1 - first;
    return;
  }
  caret_ = length();
  selection_ = -length();
}

void EditModel::eraseSelection() {
  if (selection_ == 0) return;
  const int start = selectionStart(), end = selectionEnd();
  if (isFree()) {
    text_.erase(static_cast<size_t>(start), static_cast<size_t>(end - start));
  } else {
    const EditPositions places = positions();
    for (int p = start; p < end; ++p) {
      if (places.editable(p)) resetAt(p);
    }
  }
  caret_ = start;
  selection_ = 0;
  normalize();
  changed();
}

void EditModel::resetAt(int position) {
  const EditPositions places = positions();
  if (!places.editable(position)) return;
  char& c = text_[static_cast<size_t>(position)];
  if (type_ == kEditText) {
    c = mask_[static_cast<size_t>(position)] == '9' ? '0' : ' ';
  } else if (isCoordinate()) {
    if (places.coordinateRole(position) != '$') c = '0';  // the hemisphere is never blank
  }
}

bool EditModel::removeOne(bool backwards) {
  if (type_ == kEditMonth) return true;  // dates keep every digit
  if (!isFree()) {
    resetAt(caret_);
    changed();
    return true;
  }
  if (selection_ != 0) {
    eraseSelection();
    return true;
  }
  if (backwards) {
    if (caret_ == 0) return true;
    text_.erase(static_cast<size_t>(caret_ - 1), 1);
    --caret_;
  } else {
    if (caret_ >= length()) return true;
    text_.erase(static_cast<size_t>(caret_), 1);
  }
  changed();
  return true;
}

bool EditModel::copy(EditClipboard& clipboard) const {
  if (selection_ == 0) return clipboard.put(text_);
  const int start = selectionStart();
  return clipboard.put(text_.substr(static_cast<size_t>(start), static_cast<size_t>(std::abs(selection_))));
}

bool EditModel::cut(EditClipboard& clipboard) {
  if (type_ == kEditLatitude || type_ == kEditLongitude || type_ == kEditMonth) return false;
  if (selection_ == 0) return false;
  if (!copy(clipboard)) return false;
  eraseSelection();
  return true;
}

void EditModel::paste(const std::string& text) {
  if (noPaste_) return;
  if (isFree()) {
    eraseSelection();
    for (unsigned char ch : text) {
      if (!acceptsFree(ch, caret_, 0)) continue;
      if (maxLength_ > 0 && length() >= maxLength_) break;
      text_.insert(static_cast<size_t>(caret_), 1, static_cast<char>(ch));
      ++caret_;
    }
    changed();
    return;
  }
  // Restricted fields take the characters one by one where they fit.
  for (unsigned char ch : text) {
    if (!acceptsAt(caret_, ch)) continue;
    const int before = caret_;
    typeRestricted(ch);
    if (caret_ == before) break;  // the last place is filled
  }
}

bool EditModel::pressKey(EditKey key, bool shift, bool ctrl, EditClipboard& clipboard) {
  const bool selectable = !(type_ == kEditLatitude || type_ == kEditLongitude || type_ == kEditMonth);
  const bool extend = shift && selectable;
  const EditPositions places = positions();
  switch (key) {
    case EditKey::Left: moveCaret(caret_ - 1, false, extend); return true;
    case EditKey::Right: moveCaret(caret_ + 1, true, extend); return true;
    case EditKey::Home: {
      const int first = places.restricted() ? std::max(places.first(), 0) : 0;
      moveCaret(first, true, extend);
      return true;
    }
    case EditKey::End: {
      const int last = places.restricted() ? std::max(places.last(), 0) : length();
      moveCaret(last, false, extend);
      return true;
    }
    case EditKey::Backspace: return removeOne(true);
    case EditKey::Delete:
      if (shift) {
        cut(clipboard);
        return true;
      }
      return removeOne(false);
    case EditKey::Insert:
      if (ctrl) copy(clipboard);
      else if (shift) paste(clipboard.get());
      else if (isFree()) overwrite_ = !overwrite_;
      return true;
    case EditKey::LetterA:
      if (!ctrl) return false;
      selectAll();
      return true;
    case EditKey::LetterC:
      if (!ctrl) return false;
      copy(clipboard);
      return true;
    case EditKey::LetterV:
      if (!ctrl) return false;
      paste(clipboard.get());
      return true;
    case EditKey::LetterX:
      if (!ctrl) return false;
      cut(clipboard);
      return true;
    default:
      return false;
  }
}

}  // namespace toolkit
