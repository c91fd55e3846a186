// The TW_FORMATTEXT check: the value-label format a host hands the tide graph.
//
// One input is the format text. Checked beyond "no crash": every format the check accepts
// is one the C library itself reads as taking exactly one double (glibc's own format
// parser is the judge), and writing any double with it stays within the size the width
// and precision limits allow; a refused format labels with the default.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>

#include "fuzz/common/fuzz_check.h"
#include "tides/controls/graph/label_format.h"

using namespace br::tides::graph;

namespace {

using L = std::numeric_limits<double>;
const double kValues[] = {0.0, -0.0, -1.5, 123456.789, L::quiet_NaN(), L::infinity(),
                          -L::infinity(), L::max(), -L::max(), L::denorm_min()};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string format(reinterpret_cast<const char*>(data), size);
  const bool accepted = IsValueLabelFormat(format);
  if (accepted) {
    FUZZ_CHECK(format.find('\0') == std::string::npos);
    FUZZ_CHECK(br::fuzz::FormatArguments(format) == std::vector<int>{PA_DOUBLE});
  }
  // The widest label: the format's own text, a field of at most 999, and the longest
  // fixed-point double (309 digits, sign and point) with at most 999 decimals.
  const std::size_t limit = format.size() + 999 + 311 + 999;
  for (const double value : kValues) {
    const std::string label = FormatValueLabel(format, value);
    FUZZ_CHECK(label.size() <= limit);
    if (!accepted) FUZZ_CHECK(label == br::fuzz::Print(kDefaultLabelFormat, value));
  }
  return 0;
}
