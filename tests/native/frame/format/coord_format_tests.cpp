// Worked values of the coordinate masks; the coord_masks fuzz harness judges the shape of
// every general mask's text (digits per place, literals, the hemisphere letter).
#include <doctest/doctest.h>

#include <cmath>
#include <string>

#include "frame/format/coord_format.h"
#include "frame/format/number_format.h"

using namespace br;

// The degree sign as the library writes it: one ANSI byte.
#define DEG "\xB0"

TEST_CASE("preset masks round once on the total and carry upwards; general masks truncate every field") {
  const struct { const char* mask; int kind; double value; const char* text; } rows[] = {{"DD" DEG "MM.mmm'$", COORD_LATITUDE, 12.5, "12" DEG "30.000'N"},
              {"DDD" DEG "MM'.mm $", COORD_LONGITUDE, -0.5, "000" DEG "30'.00 W"},
              {"DD" DEG "MM'.mm $", COORD_LATITUDE, 59.99999, "60" DEG "00'.00 N"},
              {"DD" DEG "MM.mmm'$", COORD_LATITUDE, 12.0166666, "12" DEG "01.000'N"},  // carries into the minutes
              {"DDD" DEG "MM.mmm'$", COORD_LONGITUDE, -0.0, "000" DEG "00.000'E"},
              {"DDD" DEG "MM.mmm'$", COORD_LATITUDE, -1.5, "001" DEG "30.000'S"},  // known by its text; kind gives the letter
              // In other letter case a preset takes the general path: truncated, "dd" the degree's decimals.
              {"dd" DEG "MM.mmm'$", COORD_LATITUDE, 12.999999, "99" DEG "59.999'N"},
              {"DD MM SS.ss", COORD_LATITUDE, 12.2583333, "12 15 29.99"},  // 29.9999 s stored
              {"DD.dddd$", COORD_LATITUDE, -45.75, "45.7500S"},
              {"DDD$", COORD_LONGITUDE, -123.999, "123W"},
              // Field widths: padding, and cut from the left.
              {"DDDD", COORD_LATITUDE, 45.75, "0045"},
              {"D", COORD_LATITUDE, 45.75, "4"},
              // Far-away values: the no-value marker has 309 whole digits.
              {"DDD$", COORD_LATITUDE, NO_VALUE, "179N"},
              {"DD MM SS.sss $", COORD_LONGITUDE, -NO_VALUE, "17 00 00.000 W"},
              // Beyond exact integer totals the preset splits the whole degrees off first.
              {"DDD" DEG "MM'.mm $", COORD_LONGITUDE, 2e12 + 0.5, "2000000000000" DEG "30'.00 E"}};
  for (const auto& r : rows) CHECK_MESSAGE(FormatCoord(r.mask, r.kind, r.value) == r.text, r.mask, " ", r.value);
  const std::string huge = FormatCoord("DD" DEG "MM.mmm'$", COORD_LATITUDE, NO_VALUE);
  CHECK((huge.size() == 100 && huge.substr(0, 4) == "1797"));  // the preset path's cap
  CHECK((HemisphereLetter(COORD_LATITUDE, -1e-12) == 'S' && HemisphereLetter(COORD_LONGITUDE, -1e-12) == 'W'));
  // No mask, an empty mask, an unknown kind or a non-finite value give empty text.
  CHECK((FormatCoord("DD" DEG "MM.mmm'$", 5, 12.5).empty() && HemisphereLetter(5, 1.0) == '\0'));
  CHECK((FormatCoord("", COORD_LATITUDE, 12.5).empty() && FormatCoord(nullptr, COORD_LONGITUDE, 12.5).empty()));
  CHECK((FormatCoord("DD$", COORD_LATITUDE, std::nan("")).empty() && FormatCoord("DD$", COORD_LATITUDE, INFINITY).empty()));
}

TEST_CASE("chart-panel degree-minute formats truncate the thousandths") {
  CHECK((FormatLatitudeDM(12.5) == "12" DEG " 30'.000 N" && FormatLongitudeDM(-4.0875) == "004" DEG " 05'.250 W"));
  CHECK((FormatLongitudeDM(179.9999999) == "179" DEG " 59'.999 E" && FormatLatitudeDM(std::nan("")).empty()));
}
