// The TW_FORMATTEXT check: the value-label format a host hands the tide graph.
//
// One input is the format text. Checked beyond "no crash": every format the check accepts
// is one the C library itself reads as taking exactly one double (glibc's own format
// parser is the judge), and writing any double with it stays within the size the width
// and precision limits allow; a refused format labels with the default.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <limits>
#include <printf.h>
#include <string>

#include "fuzz/common/fuzz_check.h"
#include "tides/controls/graph/label_format.h"

using namespace br::tides::graph;

namespace {

const double kValues[] = {0.0,
                          -0.0,
                          -1.5,
                          123456.789,
                          std::numeric_limits<double>::quiet_NaN(),
                          std::numeric_limits<double>::infinity(),
                          -std::numeric_limits<double>::infinity(),
                          std::numeric_limits<double>::max(),
                          -std::numeric_limits<double>::max(),
                          std::numeric_limits<double>::denorm_min()};

// What glibc reads from the format: true when it takes exactly one plain double.
bool TakesOneDouble(const std::string& format) {
  int types[4] = {};
  const std::size_t count = parse_printf_format(format.c_str(), 4, types);
  return count == 1 && types[0] == PA_DOUBLE;
}

std::string Print(const char* format, double value) {
  const int length = std::snprintf(nullptr, 0, format, value);
  if (length <= 0) return std::string();
  std::string text(static_cast<std::size_t>(length) + 1, '\0');
  std::snprintf(text.data(), text.size(), format, value);
  text.resize(static_cast<std::size_t>(length));
  return text;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string format(reinterpret_cast<const char*>(data), size);
  const bool accepted = IsValueLabelFormat(format);
  if (accepted) {
    FUZZ_CHECK(format.find('\0') == std::string::npos);
    FUZZ_CHECK(TakesOneDouble(format));
  }
  // The widest label: the format's own text, a field of at most 999, and the longest
  // fixed-point double (309 digits, sign and point) with at most 999 decimals.
  const std::size_t limit = format.size() + 999 + 311 + 999;
  for (const double value : kValues) {
    const std::string label = FormatValueLabel(format, value);
    FUZZ_CHECK(label.size() <= limit);
    if (!accepted) FUZZ_CHECK(label == Print(kDefaultLabelFormat, value));
  }
  return 0;
}
