// The caret places and the default masks' read-back are checked through the edit (edit_types,
// edit_model); here the read-back of other masks and of date pictures.
#include <doctest/doctest.h>

#include "frame/format/CoordFormat.h"
#include "toolkit/widgets/edit/CoordText.h"
#include "toolkit/widgets/edit/EditTypes.h"
#include "toolkit/widgets/edit/MonthPicture.h"

using namespace toolkit;

TEST_CASE("coordinate text read back by its mask") {
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
