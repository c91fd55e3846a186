#pragma once
// Base of the layout parameter objects. A layout only holds parameters; the
// container that owns it runs the arithmetic (LayoutEngine). Each class uses the
// fields listed for it and leaves the others 0.

#include <cstdint>

#include "toolkit/base/Object.h"

namespace toolkit {

// Alignment and mode values shared by the layouts.
enum : std::int32_t {
  kAlignRight = 2,        // FlowLayout rows
  kAlignCenter = 68,      // FlowLayout rows; GridLayout: rows share the height equally
  kSplitSideBySide = 1,   // SplitterLayout
  kSplitStacked = 16,     // SplitterLayout; also what a BorderLayout is made with
};

class Layout : public Object {
public:
  const ClassRecord* getClassRecord() const override;
  ~Layout() override;

  std::int32_t usePreferredWidth = 0;     // FlowLayout: each child keeps its own width
  std::int32_t mode = 0;                  // alignment or orientation, per class
  std::int32_t hgap = 0;                  // pixels
  std::int32_t vgap = 0;                  // pixels
  std::int32_t rows = 0;                  // GridLayout; 0 counts as 1
  std::int32_t columns = 0;               // GridLayout; 0 counts as 1
  std::int32_t splitNumerator = 0;        // SplitterLayout: first pane's share ...
  std::int32_t splitDenominator = 0;      // ... of the extent
  std::int32_t centerAtPreferredSize = 0; // BorderLayout: a lone Center child keeps its size

protected:
  Layout() = default;
};

}  // namespace toolkit
