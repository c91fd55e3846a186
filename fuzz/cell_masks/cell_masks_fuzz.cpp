// Table column masks: the printf formats a host gives the text, long and double columns.
//
// One input: u8 choice (the cell kind and the value), then the mask. Checked beyond "no
// crash": a mask the check lets through for a kind is one the C library itself reads as
// taking at most one argument, of that kind's type (glibc's own format parser is the
// judge); a cell text never exceeds the longest cell; an unfit mask shows the plain value.
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>

#include "fuzz/common/fuzz_check.h"
#include "toolkit/table/logic/cell_mask.h"

using namespace toolkit::table;

namespace {

constexpr std::size_t kLongestCell = 4096;

const double kDoubles[] = {0.0, -2.5, 3.14159, std::numeric_limits<double>::quiet_NaN(),
                           std::numeric_limits<double>::infinity(), std::numeric_limits<double>::max(),
                           -std::numeric_limits<double>::denorm_min(), 1e-300};
const int kLongs[] = {0, -1, 42, std::numeric_limits<int>::max(), std::numeric_limits<int>::min(), 255, 65536, 7};
const char* const kTexts[] = {"", "Newlyn", "a longer text with %s and %n inside", "\xB0\xFF", "x", "99", "-", " "};

// The types glibc reads from the mask: at most one argument, of a type the kind passes.
bool ReadsAsKind(const std::string& mask, MaskArgument kind) {
  const std::vector<int> types = br::fuzz::FormatArguments(mask);
  if (types.size() != 1) return types.empty();
  switch (kind) {
    case MaskArgument::Text: return types[0] == PA_STRING;
    // char and short arguments are promoted to int on the way in: one int is read.
    case MaskArgument::Long: return types[0] == PA_INT || types[0] == (PA_INT | PA_FLAG_SHORT) || types[0] == PA_CHAR;
    case MaskArgument::Double: return types[0] == PA_DOUBLE;
  }
  return false;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const std::uint8_t choice = data[0];
  const std::string mask(reinterpret_cast<const char*>(data) + 1, size - 1);

  for (const MaskArgument kind : {MaskArgument::Text, MaskArgument::Long, MaskArgument::Double}) {
    if (maskFitsArgument(mask, kind)) {
      FUZZ_CHECK(mask.find('\0') == std::string::npos);
      FUZZ_CHECK(ReadsAsKind(mask, kind));
    }
  }

  const std::string text = kTexts[choice & 7];
  const int number = kLongs[(choice >> 3) & 7];
  const double value = kDoubles[(choice >> 5) & 7];
  const std::string textCell = formatTextCell(mask, text);
  const std::string longCell = formatLongCell(mask, number);
  const std::string doubleCell = formatDoubleCell(mask, value);
  FUZZ_CHECK(textCell.size() <= std::max(kLongestCell, text.size()));
  FUZZ_CHECK(longCell.size() <= kLongestCell);
  FUZZ_CHECK(doubleCell.size() <= kLongestCell);
  if (mask.empty() || !maskFitsArgument(mask, MaskArgument::Text)) FUZZ_CHECK(textCell == text);
  if (mask.empty() || !maskFitsArgument(mask, MaskArgument::Long)) FUZZ_CHECK(longCell == std::to_string(number));
  if (mask.empty() || !maskFitsArgument(mask, MaskArgument::Double)) FUZZ_CHECK(doubleCell == br::fuzz::Print("%g", value));
  return 0;
}
