#include <doctest/doctest.h>

#include "host/brtide/value_parsers.h"

using namespace br::brtide;

TEST_CASE("dates must be real days written as YYYY-MM-DD") {
  const auto d = ParseIsoDate("2024-02-29");
  REQUIRE(d);
  CHECK((d->year == 2024 && d->month == 2 && d->day == 29));
  CHECK(ParseIsoDate("2000-02-29"));
  for (const char* bad : {"2023-02-29", "1900-02-29", "2024-13-01", "2024-00-10", "2024-04-31", "2024-4-01",
                          "24-04-01", "2024/04/01", "2024-04-01x", "", "0099-01-01", "abcd-ef-gh"}) {
    CAPTURE(bad);
    CHECK_FALSE(ParseIsoDate(bad));
  }
}

TEST_CASE("numbers take the whole text and nothing that is not finite") {
  CHECK((*ParseNumber("-4.5") == -4.5 && *ParseNumber("+12") == 12.0 && *ParseNumber("1e1") == 10.0));
  for (const char* bad : {"", "+", "4.5.1", " 4", "4 ", "nan", "inf", "1e999", "++1", "0x10"}) {
    CAPTURE(bad);
    CHECK_FALSE(ParseNumber(bad));
  }
}

TEST_CASE("coordinates accept a sign or a hemisphere letter within range") {
  CHECK((*ParseLatitude("48.38N") == 48.38 && *ParseLatitude("33.5s") == -33.5 && *ParseLatitude("-90") == -90.0));
  CHECK((*ParseLongitude("4.5W") == -4.5 && *ParseLongitude("180") == 180.0 && *ParseLongitude("151.2E") == 151.2));
  // Refused: beyond the pole, a longitude letter on a latitude, sign and letter together.
  for (const char* bad : {"90.01", "4.5W", "-4.5N"}) CHECK_FALSE(ParseLatitude(bad));
  for (const char* bad : {"-180.5", "E"}) CHECK_FALSE(ParseLongitude(bad));
}

TEST_CASE("steps run from a thousandth of an hour to a day") {
  CHECK((*ParseStep("1") == 1.0 && *ParseStep("0.001") == 0.001 && *ParseStep("24") == 24.0));
  for (const char* bad : {"0", "-1", "0.0009", "24.5", "x"}) {
    CAPTURE(bad);
    CHECK_FALSE(ParseStep(bad));
  }
}

TEST_CASE("station numbers are whole numbers a signed 16-bit index can hold") {
  CHECK((*ParseStationNumber("0") == 0 && *ParseStationNumber("1491") == 1491 && *ParseStationNumber("32766") == 32766));
  for (const char* bad : {"-1", "32767", "1.5", "", "12a", "123456"}) {
    CAPTURE(bad);
    CHECK_FALSE(ParseStationNumber(bad));
  }
}
