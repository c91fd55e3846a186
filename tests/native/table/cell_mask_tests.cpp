#include <doctest/doctest.h>

#include "toolkit/table/logic/CellMask.h"

using namespace toolkit::table;

TEST_CASE("masks that fit their cell kind are used as formats") {
  CHECK(formatDoubleCell("%.2f", 3.14159) == "3.14");
  CHECK(formatDoubleCell("", 3.14159) == "3.14159");
  CHECK(formatDoubleCell("%8.3e m", 1234.5) == "1.234e+03 m");
  CHECK(formatDoubleCell("%lf", 0.5) == "0.500000");
  CHECK(formatLongCell("%05d", 42) == "00042");
  CHECK(formatLongCell("#%x", 255) == "#ff");
  CHECK(formatLongCell("%hd", 7) == "7");
  CHECK(formatLongCell("", -12) == "-12");
  CHECK(formatTextCell("[%s]", "Brest") == "[Brest]");
  CHECK(formatTextCell("%-6s|", "ab") == "ab    |");
  CHECK(formatTextCell("", "plain") == "plain");
}

TEST_CASE("a mask without conversions prints itself, %% is a literal") {
  CHECK(formatLongCell("none", 3) == "none");
  CHECK(formatDoubleCell("%.1f %%", 12.25) == "12.2 %");
  CHECK(maskFitsArgument("100%%", MaskArgument::Text));
}

TEST_CASE("masks that do not fit their kind show the plain value") {
  // A conversion of another kind.
  CHECK(formatDoubleCell("%s", 2.5) == "2.5");
  CHECK(formatDoubleCell("%d", 2.5) == "2.5");
  CHECK(formatLongCell("%f", 9) == "9");
  CHECK(formatLongCell("%s", 9) == "9");
  CHECK(formatTextCell("%d", "abc") == "abc");
  CHECK(formatTextCell("%f", "abc") == "abc");
  // More than one conversion, even of the right kind.
  CHECK(formatTextCell("%s%s", "x") == "x");
  CHECK(formatDoubleCell("%f %f", 1.0) == "1");
  // Arguments printf would read that are not there, or a write through %n.
  CHECK(formatLongCell("%*d", 4) == "4");
  CHECK(formatDoubleCell("%.*f", 1.5) == "1.5");
  CHECK(formatLongCell("%n", 1) == "1");
  // Length modifiers that change the argument's size.
  CHECK(formatLongCell("%lld", 5) == "5");
  CHECK(formatLongCell("%ld", 5) == "5");
  CHECK(formatDoubleCell("%Lf", 5.0) == "5");
  CHECK(formatTextCell("%ls", "wide") == "wide");
  // Damaged masks.
  CHECK(formatLongCell("50%", 50) == "50");
  CHECK(formatLongCell("%", 1) == "1");
  CHECK(formatLongCell("%5", 1) == "1");
}

TEST_CASE("field widths beyond any cell are refused") {
  CHECK_FALSE(maskFitsArgument("%99999d", MaskArgument::Long));
  CHECK_FALSE(maskFitsArgument("%.99999999999999999999f", MaskArgument::Double));
  CHECK(formatLongCell("%2147483647d", 1) == "1");
  CHECK(maskFitsArgument("%4096d", MaskArgument::Long));
  CHECK(formatLongCell("%20d", 1).size() == 20);
}

TEST_CASE("embedded zero bytes make a mask unusable") {
  const std::string mask("%s\0%d", 5);
  CHECK_FALSE(maskFitsArgument(mask, MaskArgument::Text));
  CHECK(formatTextCell(mask, "t") == "t");
}
