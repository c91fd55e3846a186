#include "toolkit/table/logic/RowOrder.h"

#include <algorithm>
#include <cmath>
#include <numeric>

namespace toolkit::table {

namespace {

unsigned char lower(unsigned char c) { return (c >= 'A' && c <= 'Z') ? static_cast<unsigned char>(c + 32) : c; }

int compareNoCase(const std::string& a, const std::string& b) {
  const size_t n = std::min(a.size(), b.size());
  for (size_t i = 0; i < n; ++i) {
    const unsigned char x = lower(static_cast<unsigned char>(a[i]));
    const unsigned char y = lower(static_cast<unsigned char>(b[i]));
    if (x != y) return x < y ? -1 : 1;
  }
  return a.size() == b.size() ? 0 : (a.size() < b.size() ? -1 : 1);
}

}  // namespace

void RowOrder::orderByText(const std::vector<std::string>& keys) {
  displayToStored_.resize(keys.size());
  std::iota(displayToStored_.begin(), displayToStored_.end(), 0);
  std::stable_sort(displayToStored_.begin(), displayToStored_.end(), [&](int a, int b) {
    const int byCase = compareNoCase(keys[a], keys[b]);
    if (byCase != 0) return byCase < 0;
    return keys[a] < keys[b];
  });
  invert();
}

void RowOrder::orderByNumber(const std::vector<double>& keys) {
  displayToStored_.resize(keys.size());
  std::iota(displayToStored_.begin(), displayToStored_.end(), 0);
  // NaN sorts last, so the order stays a strict weak one.
  std::stable_sort(displayToStored_.begin(), displayToStored_.end(), [&](int a, int b) {
    const double x = keys[a], y = keys[b];
    if (std::isnan(x) || std::isnan(y)) return !std::isnan(x) && std::isnan(y);
    return x < y;
  });
  invert();
}

void RowOrder::clear() {
  displayToStored_.clear();
  storedToDisplay_.clear();
}

void RowOrder::invert() {
  storedToDisplay_.assign(displayToStored_.size(), 0);
  for (size_t d = 0; d < displayToStored_.size(); ++d) storedToDisplay_[displayToStored_[d]] = static_cast<int>(d);
}

int RowOrder::toStored(int displayRow) const {
  if (displayRow < 0 || displayRow >= static_cast<int>(displayToStored_.size())) return displayRow;
  return displayToStored_[displayRow];
}

int RowOrder::toDisplay(int storedRow) const {
  if (storedRow < 0 || storedRow >= static_cast<int>(storedToDisplay_.size())) return storedRow;
  return storedToDisplay_[storedRow];
}

bool textMatches(const std::string& cell, const std::string& text, bool anywhere, bool caseSensitive) {
  auto same = [caseSensitive](char a, char b) {
    return caseSensitive ? a == b : lower(static_cast<unsigned char>(a)) == lower(static_cast<unsigned char>(b));
  };
  if (!anywhere) return cell.size() == text.size() && std::equal(cell.begin(), cell.end(), text.begin(), same);
  return std::search(cell.begin(), cell.end(), text.begin(), text.end(), same) != cell.end();
}

}  // namespace toolkit::table
