// Formatter texts split into name and value, values cleaned for display, magnetic
// variation written with its hemisphere, and the order of a chart object's attributes.
#include <doctest/doctest.h>

#include <cfloat>
#include <cmath>
#include <limits>

#include "inspector/format/attribute_text.h"

using namespace br::inspector;

TEST_CASE("a formatter text splits at its first number sign or equals sign") {
  const auto plain = SplitAttributeText("Colour=red");
  REQUIRE(plain);
  CHECK(plain->name == "Colour");
  CHECK(plain->value == "red");

  const auto hash = SplitAttributeText("Information#see=notes");
  REQUIRE(hash);
  CHECK(hash->name == "Information");
  CHECK(hash->value == "see=notes");

  const auto empty = SplitAttributeText("=x");
  REQUIRE(empty);
  CHECK(empty->name.empty());  // the panel drops it: a row needs both

  CHECK_FALSE(SplitAttributeText("no separator"));
  CHECK_FALSE(SplitAttributeText("Name="));
  CHECK_FALSE(SplitAttributeText(""));
}

TEST_CASE("bars and break tags of any case become line breaks") {
  CHECK(CleanAttributeValue("red|green") == "red\rgreen");
  CHECK(CleanAttributeValue("one<BR>two<br>three<Br>") == "one\rtwo\rthree\r");
  CHECK(CleanAttributeValue("a<b>c<br") == "a<b>c<br");  // unfinished tags stay
  CHECK(CleanAttributeValue("||") == "\r\r");
  CHECK(CleanAttributeValue("") == "");
}

TEST_CASE("magnetic variation: hemisphere letter, whole degrees within 32 bits, no value") {
  CHECK(MagneticVariationText(-3.5) == std::string("3.50\xB0W"));
  CHECK(MagneticVariationText(2.0) == std::string("2\xB0" "E"));
  CHECK(MagneticVariationText(0.0) == std::string("0\xB0 "));
  CHECK(MagneticVariationText(-0.25) == std::string("0.25\xB0W"));
  CHECK(MagneticVariationText(2147483647.0) == std::string("2147483647\xB0" "E"));
  // Whole but past the 32-bit range: printed as a double, never through "%d".
  CHECK(MagneticVariationText(4294967296.0) == std::string("4294967296.00\xB0" "E"));
  const auto widest = MagneticVariationText(-1.0e308);
  REQUIRE(widest);
  CHECK(widest->size() > 300);
  CHECK(widest->substr(widest->size() - 2) == "\xB0W");
  CHECK_FALSE(MagneticVariationText(DBL_MAX));
  CHECK_FALSE(MagneticVariationText(std::numeric_limits<double>::quiet_NaN()));
  CHECK_FALSE(MagneticVariationText(-std::numeric_limits<double>::infinity()));
}

TEST_CASE("an information text with a hexadecimal reference is hidden, other codes never") {
  CHECK(IsHiddenInformation(102, "ref 0x1F"));
  CHECK_FALSE(IsHiddenInformation(102, "0X1F"));
  CHECK_FALSE(IsHiddenInformation(101, "0x1F"));
  CHECK_FALSE(IsHiddenInformation(102, "plain"));
}

TEST_CASE("chart attributes: the name first, information second for informed objects") {
  using Codes = std::vector<long>;
  CHECK(OrderChartAttributeCodes({75, 102, 116, 9}, false) == Codes{116, 75, 102, 9});
  CHECK(OrderChartAttributeCodes({75, 102, 116, 9}, true) == Codes{116, 102, 75, 9});
  CHECK(OrderChartAttributeCodes({116, 75, 102}, true) == Codes{116, 102, 75});
  CHECK(OrderChartAttributeCodes({102, 75}, true) == Codes{102, 75});
  CHECK(OrderChartAttributeCodes({3, 2, 1}, true) == Codes{3, 2, 1});
  CHECK(OrderChartAttributeCodes({}, true).empty());
}
