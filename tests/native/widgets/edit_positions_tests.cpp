#include <doctest/doctest.h>

#include "frame/format/CoordFormat.h"
#include "toolkit/widgets/edit/CoordText.h"
#include "toolkit/widgets/edit/EditTypes.h"
#include "toolkit/widgets/edit/EditPositions.h"
#include "toolkit/widgets/edit/MonthPicture.h"

using namespace toolkit;

TEST_CASE("caret places of free, masked, coordinate and date fields") {
  SUBCASE("free text: every place from 0 to the length") {
    EditPositions places(kEditText, "", "abc");
    CHECK_FALSE(places.restricted());
    CHECK((places.editable(0) && places.editable(3) && !places.editable(4)));
    CHECK(places.settle(9, true) == 3);
  }
  SUBCASE("masked text: the 9s and a '-' at position 0 only") {
    EditPositions places(kEditText, "-99-99", " 12-34");
    CHECK((places.restricted() && places.editable(0) && places.editable(1)));
    CHECK_FALSE(places.editable(3));  // a '-' elsewhere is a copied character
    CHECK((places.first() == 0 && places.last() == 5 && places.nextAfter(2) == 4 && places.previousBefore(4) == 2));
    CHECK((places.settle(3, true) == 4 && places.settle(3, false) == 2));
  }
  SUBCASE("coordinates: the mask letters") {
    const std::string text = FormatCoord(kDefaultLatitudeMask, kEditLatitude, -12.5);
    EditPositions places(kEditLatitude, kDefaultLatitudeMask, text);
    for (int at = 0; at <= 10; ++at) CHECK(places.editable(at) == (at != 2 && at != 5 && at != 9));  // ° . '
    CHECK((places.coordinateRole(10) == '$' && places.coordinateRole(6) == 'm' && places.last() == 10));
  }
  SUBCASE("dates: the digits of the text") {
    EditPositions places(kEditMonth, "MM-yyyy", "05-2024");
    CHECK((places.editable(1) && !places.editable(2) && places.nextAfter(1) == 3));
  }
  SUBCASE("a restricted field without any such place settles on 0") {
    EditPositions places(kEditText, "ab", "ab");
    CHECK((places.first() == -1 && places.settle(1, true) == 0));
  }
}

TEST_CASE("coordinate text read back by its mask") {
  SUBCASE("the default masks") {
    CHECK(CoordText::parse(kDefaultLatitudeMask, kEditLatitude, "12\xB0" "30.000'S") == doctest::Approx(-12.5));
    CHECK(CoordText::parse(kDefaultLongitudeMask, kEditLongitude, "004\xB0" "05.250'W") ==
          doctest::Approx(-4.0875));
    CHECK(CoordText::parse(kDefaultLatitudeMask, kEditLatitude, "00\xB0" "00.000'N") == 0.0);
  }
  SUBCASE("round trip through FormatCoord for several masks") {
    const char* masks[] = {kDefaultLatitudeMask, "DD\xB0MM'.mm $", "DD MM SS.ss $", "DD.dddd$"};
    for (const char* mask : masks) {
      for (double v : {-89.25, -12.5, 0.0, 7.75, 45.5}) {
        const std::string text = FormatCoord(mask, kEditLatitude, v);
        CAPTURE(text);
        CHECK(CoordText::parse(mask, kEditLatitude, text) == doctest::Approx(v).epsilon(1e-4));
      }
    }
  }
  SUBCASE("a run of '$' stands for one letter") {
    CHECK(CoordText::roles("$$DD") == std::string("$DD"));
    CHECK(CoordText::parse("$$DD", kEditLatitude, "S12") == -12.0);
  }
  SUBCASE("short or blank texts count the missing places as 0") {
    CHECK(CoordText::parse(kDefaultLatitudeMask, kEditLatitude, "1") == 1.0);
    CHECK(CoordText::parse(kDefaultLatitudeMask, kEditLatitude, "") == 0.0);
    CHECK(CoordText::parse(kDefaultLatitudeMask, 5, "12\xB0" "30.000'S") == 0.0);
  }
}

TEST_CASE("dates read back by their picture") {
  const CivilDate base{2020, 3, 31};
  SUBCASE("month and year keep the day of the base, clamped into the month") {
    const CivilDate d = MonthPicture::parse("MM-yyyy", "02-2024", base);
    CHECK((d.year == 2024 && d.month == 2 && d.day == 29));
  }
  SUBCASE("day, names, quoted literals and two-digit years") {
    CivilDate d = MonthPicture::parse("dd.MM.yyyy", "07.11.1998", base);
    CHECK((d.year == 1998 && d.month == 11 && d.day == 7));
    d = MonthPicture::parse("ddd d MMMM yy", "Tue 5 March 24", base);
    CHECK((d.year == 2024 && d.month == 3 && d.day == 5));
    d = MonthPicture::parse("'month' M y", "month 9 31", base);
    CHECK((d.year == 1931 && d.month == 9));
  }
  SUBCASE("out of range fields are clamped") {
    const CivilDate d = MonthPicture::parse("MM-yyyy", "15-0000", base);
    CHECK((d.month == 12 && d.year == 100));
  }
  SUBCASE("platform dates") {
    CHECK(MonthPicture::toPlatformDate(CivilDate{1899, 12, 30}) == 0.0);
    CHECK(MonthPicture::toPlatformDate(CivilDate{2024, 1, 1}) == 45292.0);
    CivilDate d;
    REQUIRE(MonthPicture::fromPlatformDate(45292.75, d));
    CHECK((d.year == 2024 && d.month == 1 && d.day == 1));
    REQUIRE(MonthPicture::fromPlatformDate(-1.5, d));
    CHECK((d.year == 1899 && d.month == 12 && d.day == 29));
    CHECK_FALSE(MonthPicture::fromPlatformDate(1e300, d));
  }
}
