#include "tides/controls/graph/background_bands.h"

#include <doctest/doctest.h>

#include <array>
#include <vector>

using namespace br::tides::graph;

namespace {

GraphGeometry Plain() { return GraphGeometry(Rect{0, 0, 300, 200}, 8, 8); }

SunEvents AllFour() {
  SunEvents e;
  e.twilightBegin = TimeOfDay{5, 30};
  e.sunrise = TimeOfDay{6, 0};
  e.sunset = TimeOfDay{18, 0};
  e.twilightEnd = TimeOfDay{18, 30};
  return e;
}

void CheckBand(const Band& band, int left, int right, int colour) {
  CHECK((band.left == left && band.right == right && band.colour == colour));
}

}  // namespace

TEST_CASE("twilight band, then daylight over it, each from the events there are") {
  SunEvents noTwilight = AllFour(), noRiseSet = AllFour();
  noTwilight.twilightBegin.reset();
  noTwilight.twilightEnd.reset();
  noRiseSet.sunrise.reset();
  noRiseSet.sunset.reset();
  // All four: 05:30 .. 18:30 and 06:00 .. 18:00. Without twilight: twilight over the whole plot.
  const struct {
    SunEvents events;
    std::vector<std::array<int, 3>> bands;  // left, right, colour
  } cases[] = {{AllFour(), {{8 + 65, 8 + 218, kTwilightColour}, {8 + 71, 8 + 213, kDaylightColour}}},
               {noTwilight, {{8, 292, kTwilightColour}, {79, 221, kDaylightColour}}},
               {noRiseSet, {{73, 226, kTwilightColour}}}};
  for (const auto& c : cases) {
    const std::vector<Band> bands = BackgroundBands(c.events, Plain());
    REQUIRE(bands.size() == c.bands.size());
    for (std::size_t i = 0; i < bands.size(); ++i) CheckBand(bands[i], c.bands[i][0], c.bands[i][1], c.bands[i][2]);
  }
}

TEST_CASE("no sun event: daylight all day in the polar summer, else night") {
  SunEvents e;
  e.latitude = 78.2;
  e.month = 6;
  std::vector<Band> bands = BackgroundBands(e, Plain());
  REQUIRE(bands.size() == 1);
  CheckBand(bands[0], 8, 292, kDaylightColour);
  const std::pair<double, int> days[] = {{78.2, 12}, {-70.0, 12}, {-70.0, 7}, {0.0, 12}, {78.2, 0}};  // month 0: unread
  const std::size_t bandCount[] = {0, 1, 0, 0, 0};
  for (int i = 0; i < 5; ++i) {
    e.latitude = days[i].first;
    e.month = days[i].second;
    if (!days[i].second) e.month.reset();
    CHECK(BackgroundBands(e, Plain()).size() == bandCount[i]);
  }
}

TEST_CASE("any other combination leaves the night") {
  SunEvents noSunset = AllFour(), noTwilightEnd = AllFour();
  noSunset.sunset.reset();
  noTwilightEnd.twilightEnd.reset();
  CHECK((BackgroundBands(noSunset, Plain()).empty() && BackgroundBands(noTwilightEnd, Plain()).empty()));
}

TEST_CASE("an interval over midnight is painted at both ends of the plot") {
  SunEvents e;
  e.twilightBegin = TimeOfDay{20, 0};  // twilight from 20:00 through midnight to 02:00
  e.twilightEnd = TimeOfDay{2, 0};
  const std::vector<Band> bands = BackgroundBands(e, Plain());
  REQUIRE(bands.size() == 2);
  CheckBand(bands[0], 8 + 236, 292, kTwilightColour);
  CheckBand(bands[1], 8, 8 + 23, kTwilightColour);
}
