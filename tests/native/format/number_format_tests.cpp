#include <doctest/doctest.h>

#include <cfloat>
#include <string>

#include "frame/format/NumberFormat.h"

TEST_CASE("the no-value marker shows as <None>") {
  CHECK((FormatNumber(DBL_MAX, 2) == "<None>" && FormatNumber(NO_VALUE, 0) == "<None>"));
  // Only the marker itself: its negative is an ordinary (huge) number.
  const std::string negative = FormatNumber(-NO_VALUE, 0);
  CHECK((negative.size() == 310 && negative.substr(0, 5) == "-1797"));
}

TEST_CASE("numbers are written with the given decimals") {
  CHECK((FormatNumber(2.5, 3) == "2.500" && FormatNumber(-1.26, 1) == "-1.3" && FormatNumber(1234.5678, 0) == "1235"));
  CHECK((FormatNumber(0.0, 2) == "0.00" && FormatNumber(3.75, -2) == "4"));
  const std::string many = FormatNumber(0.1, 60);
  CHECK((many.size() == 62 && many.substr(0, 20) == "0.100000000000000005"));
  // Absurd decimal counts are capped rather than allocating without limit.
  CHECK(FormatNumber(1.0, 1 << 30).size() == 1102);
}
