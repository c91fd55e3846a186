#include <doctest/doctest.h>

#include <cmath>
#include <limits>
#include <string>

#include "frame/format/CoordFormat.h"
#include "frame/format/NumberFormat.h"

// The degree sign as the library writes it: one ANSI byte.
#define DEG "\xB0"

TEST_CASE("preset masks round once on the total and carry upwards") {
  CHECK(FormatCoord("DD" DEG "MM.mmm'$", COORD_LATITUDE, 12.5) == "12" DEG "30.000'N");
  CHECK(FormatCoord("DDD" DEG "MM'.mm $", COORD_LONGITUDE, -0.5) == "000" DEG "30'.00 W");
  CHECK(FormatCoord("DD" DEG "MM'.mm $", COORD_LATITUDE, 59.99999) == "60" DEG "00'.00 N");
  // 12 deg 00.99996 min: the rounding carries into the minutes.
  CHECK(FormatCoord("DD" DEG "MM.mmm'$", COORD_LATITUDE, 12.0166666) == "12" DEG "01.000'N");
  CHECK(FormatCoord("DDD" DEG "MM.mmm'$", COORD_LONGITUDE, -179.9999999) ==
        "180" DEG "00.000'W");
  CHECK(FormatCoord("DDD" DEG "MM.mmm'$", COORD_LONGITUDE, 4.0875) == "004" DEG "05.250'E");
  CHECK(FormatCoord("DD" DEG "MM'.mm $", COORD_LATITUDE, -33.123456) == "33" DEG "07'.41 S");
}

TEST_CASE("zero takes north and east, negative zero too") {
  CHECK(FormatCoord("DD" DEG "MM.mmm'$", COORD_LATITUDE, 0.0) == "00" DEG "00.000'N");
  CHECK(FormatCoord("DDD" DEG "MM.mmm'$", COORD_LONGITUDE, 0.0) == "000" DEG "00.000'E");
  CHECK(FormatCoord("DDD" DEG "MM.mmm'$", COORD_LONGITUDE, -0.0) == "000" DEG "00.000'E");
  CHECK((HemisphereLetter(COORD_LATITUDE, -1e-12) == 'S' && HemisphereLetter(COORD_LONGITUDE, -1e-12) == 'W'));
  CHECK(HemisphereLetter(5, 1.0) == '\0');
}

TEST_CASE("no mask, an empty mask, an unknown kind or a non-finite value give empty text") {
  CHECK((FormatCoord("DD" DEG "MM.mmm'$", 5, 12.5).empty() && FormatCoord("DD" DEG "MM.mmm'$", 8, 12.5).empty()));
  CHECK((FormatCoord("", COORD_LATITUDE, 12.5).empty() && FormatCoord(nullptr, COORD_LONGITUDE, 12.5).empty()));
  CHECK(FormatCoord("DD$", COORD_LATITUDE, std::nan("")).empty());
  CHECK(FormatCoord("DD$", COORD_LATITUDE, std::numeric_limits<double>::infinity()).empty());
}

TEST_CASE("general masks truncate every field") {
  CHECK(FormatCoord("DD-MM.mmm $", COORD_LATITUDE, 45.75) == "45-45.000 N");
  // 12 deg 15 min 30 s stored to seven decimals is 29.9999 s: truncated to 29.
  CHECK(FormatCoord("DD MM SS", COORD_LATITUDE, 12.2583333) == "12 15 29");
  CHECK(FormatCoord("DD MM SS.ss", COORD_LATITUDE, 12.2583333) == "12 15 29.99");
  CHECK(FormatCoord("DD.dddd$", COORD_LATITUDE, -45.75) == "45.7500S");
  CHECK(FormatCoord("DDD$", COORD_LONGITUDE, -123.999) == "123W");
}

TEST_CASE("a preset mask in other letter case takes the general path") {
  // The preset would round 12.999999 up to 13 deg; the general path truncates,
  // and "dd" is now decimals of the degree.
  CHECK(FormatCoord("DD" DEG "MM.mmm'$", COORD_LATITUDE, 12.999999) == "13" DEG "00.000'N");
  CHECK(FormatCoord("dd" DEG "MM.mmm'$", COORD_LATITUDE, 12.999999) == "99" DEG "59.999'N");
  // A preset mask is known by its text alone; the kind chooses the letter.
  CHECK(FormatCoord("DDD" DEG "MM.mmm'$", COORD_LATITUDE, -1.5) == "001" DEG "30.000'S");
}

TEST_CASE("field widths: padding, leftmost cut for D, M and S, one hemisphere letter") {
  const struct {
    const char* mask;
    int kind;
    double value;
    const char* text;
  } rows[] = {{"DDDD", COORD_LATITUDE, 45.75, "0045"}, {"D", COORD_LATITUDE, 45.75, "4"},
              {"M", COORD_LATITUDE, 45.75, "4"},       {"S", COORD_LATITUDE, 12.2583333, "2"},
              {"$$$", COORD_LONGITUDE, 1.0, "E"},      {"d", COORD_LATITUDE, 0.96, "9"},
              {"mmmmmm", COORD_LATITUDE, 0.5, "000000"}, {"x/D y", COORD_LATITUDE, 7.0, "x/7 y"}};
  for (const auto& r : rows) CHECK_MESSAGE(FormatCoord(r.mask, r.kind, r.value) == r.text, r.mask);
}

TEST_CASE("the general path survives wide fields and far-away values") {
  const std::string wide(500, 'd');
  const std::string text = FormatCoord(wide.c_str(), COORD_LATITUDE, 0.5);
  REQUIRE(text.size() == 500);
  CHECK(text == "5" + std::string(499, '0'));
  CHECK(FormatCoord("DD.dddddddddddddddddddd", COORD_LATITUDE, 1.25) ==
        "01.25000000000000000000");

  const std::string degrees = FormatCoord("DDDDDDDDDDDDDDDDDDDDDDDDD", COORD_LATITUDE, 1e20);
  CHECK(degrees == "0000100000000000000000000");
  // The no-value marker has 309 whole digits; a three-wide field keeps "179".
  CHECK(FormatCoord("DDD$", COORD_LATITUDE, NO_VALUE) == "179N");
  CHECK(FormatCoord("DD MM SS.sss $", COORD_LONGITUDE, -NO_VALUE) == "17 00 00.000 W");
}

TEST_CASE("the preset path caps far-away values at 100 characters") {
  const std::string huge = FormatCoord("DD" DEG "MM.mmm'$", COORD_LATITUDE, NO_VALUE);
  CHECK((huge.size() == 100 && huge.substr(0, 4) == "1797"));
  // Beyond exact integer totals the whole degrees are split off first.
  CHECK(FormatCoord("DDD" DEG "MM'.mm $", COORD_LONGITUDE, 2e12 + 0.5) ==
        "2000000000000" DEG "30'.00 E");
  CHECK(FormatCoord("DDD" DEG "MM'.mm $", COORD_LONGITUDE, 1e11 + 0.75) ==
        "100000000000" DEG "45'.00 E");
}

TEST_CASE("chart-panel degree-minute formats truncate the thousandths") {
  CHECK(FormatLatitudeDM(12.5) == "12" DEG " 30'.000 N");
  CHECK(FormatLatitudeDM(-33.99999) == "33" DEG " 59'.999 S");
  CHECK(FormatLongitudeDM(-4.0875) == "004" DEG " 05'.250 W");
  CHECK(FormatLongitudeDM(0.0) == "000" DEG " 00'.000 E");
  CHECK(FormatLongitudeDM(179.9999999) == "179" DEG " 59'.999 E");
  CHECK(FormatLatitudeDM(std::nan("")).empty());
}
