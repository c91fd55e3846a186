#pragma once
// The table widget's row order: with a sort column set, a permutation maps each
// display row to its stored row and back. Without one, both are the identity.
// Portable.

#include <string>
#include <vector>

namespace toolkit::table {

class RowOrder {
public:
  // Orders `count` rows by texts (case ignored, then as stored) or by numbers;
  // equal keys keep their stored order.
  void orderByText(const std::vector<std::string>& keys);
  void orderByNumber(const std::vector<double>& keys);
  void clear();  // back to stored order
  bool active() const { return !displayToStored_.empty(); }

  // Rows outside the permutation map to themselves, so that rows added after
  // ordering still have a place until the next ordering.
  int toStored(int displayRow) const;
  int toDisplay(int storedRow) const;

private:
  void invert();

  std::vector<int> displayToStored_;
  std::vector<int> storedToDisplay_;
};

// Whether a cell's text holds `text`: the whole of it, or anywhere with `anywhere`.
bool textMatches(const std::string& cell, const std::string& text, bool anywhere, bool caseSensitive);

}  // namespace toolkit::table
