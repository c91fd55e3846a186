#include <doctest/doctest.h>

#include "toolkit/table/logic/cell_mask.h"

using namespace toolkit::table;

TEST_CASE("masks that fit their cell kind are used as formats") {
  CHECK(formatDoubleCell("%.2f", 3.14159) == "3.14");
  CHECK(formatDoubleCell("", 3.14159) == "3.14159");
  CHECK(formatDoubleCell("%8.3e m", 1234.5) == "1.234e+03 m");
  CHECK(formatLongCell("%05d", 42) == "00042");
  CHECK(formatLongCell("", -12) == "-12");
  CHECK(formatTextCell("[%s]", "Brest") == "[Brest]");
  CHECK(formatTextCell("", "plain") == "plain");
  CHECK(formatDoubleCell("%.1f %%", 12.25) == "12.2 %");  // %% is a literal
}

TEST_CASE("masks that do not fit their kind show the plain value") {
  // Conversions of another kind, more than one conversion (even of the right kind), arguments printf
  // would read that are not there, a write through %n, length modifiers that change the argument's
  // size, damaged masks.
  for (const char* mask : {"%s", "%d", "%f %f", "%.*f", "%Lf"}) CHECK_MESSAGE(formatDoubleCell(mask, 2.5) == "2.5", mask);
  for (const char* mask : {"%f", "%s", "%*d", "%n", "%lld", "%ld", "50%", "%", "%5"})
    CHECK_MESSAGE(formatLongCell(mask, 9) == "9", mask);
  for (const char* mask : {"%d", "%f", "%s%s", "%ls"}) CHECK_MESSAGE(formatTextCell(mask, "abc") == "abc", mask);
}

TEST_CASE("field widths beyond any cell are refused") {
  CHECK_FALSE(maskFitsArgument("%99999d", MaskArgument::Long));
  CHECK_FALSE(maskFitsArgument("%.99999999999999999999f", MaskArgument::Double));
  CHECK(formatLongCell("%2147483647d", 1) == "1");
  CHECK(formatLongCell("%20d", 1).size() == 20);
}

TEST_CASE("embedded zero bytes make a mask unusable") {
  const std::string mask("%s\0%d", 5);
  CHECK_FALSE(maskFitsArgument(mask, MaskArgument::Text));
  CHECK(formatTextCell(mask, "t") == "t");
}
