#pragma once
// Rows and columns of cells; columns may be given widths in percent.

#include <string_view>

#include "toolkit/layout/Layout.h"

namespace toolkit {

class GridLayout : public Layout {
public:
  static constexpr int kMaxColumnPercents = 20;

  // `percentages`: column widths in percent, e.g. "25;75" or "35,65" (see
  // parsePercentages); null or empty leaves every column an equal share.
  GridLayout(std::int32_t rows, std::int32_t columns, std::int32_t hgap = 0, std::int32_t vgap = 0,
             const char* percentages = nullptr, std::int32_t mode = 0);
  const ClassRecord* getClassRecord() const override;

  // Splits at blanks, commas and semicolons; each token's leading decimal digits
  // give one column's percent (0 without digits). At most 20 tokens are read;
  // columns without a token keep 0 (an equal share).
  void parsePercentages(std::string_view text);

  std::int32_t columnPercent[kMaxColumnPercents] = {};
};

}  // namespace toolkit
