#include <doctest/doctest.h>

#include <cfloat>
#include <string>

#include "frame/format/number_format.h"

using namespace br;

TEST_CASE("numbers are written with the given decimals; only the no-value marker itself shows as <None>") {
  CHECK((FormatNumber(DBL_MAX, 2) == "<None>" && FormatNumber(NO_VALUE, 0) == "<None>"));
  const std::string negative = FormatNumber(-NO_VALUE, 0);  // only the marker itself
  CHECK((negative.size() == 310 && negative.substr(0, 5) == "-1797"));
  CHECK((FormatNumber(2.5, 3) == "2.500" && FormatNumber(-1.26, 1) == "-1.3"));
  // A negative count is printf's: as if no precision were given, six decimals.
  CHECK((FormatNumber(3.75, -2) == "3.750000" && FormatNumber(-0.5, -1) == "-0.500000"));
  // Absurd decimal counts are capped rather than allocating without limit.
  CHECK(FormatNumber(1.0, 1 << 30).size() == 1102);
}
