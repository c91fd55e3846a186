// Event combinations beside the Wine port suite's day with all four sun times.
#include "tides/controls/graph/background_bands.h"

#include <doctest/doctest.h>

#include <array>
#include <vector>

using namespace br::tides::graph;

TEST_CASE("twilight band, then daylight over it, from the events there are; else polar day or night") {
  SunEvents noTwilight, noRiseSet, noSunset, overMidnight, polar;
  noTwilight.sunrise = noSunset.sunrise = TimeOfDay{6, 0};
  noTwilight.sunset = TimeOfDay{18, 0};
  noRiseSet.twilightBegin = noSunset.twilightBegin = TimeOfDay{5, 30};
  noRiseSet.twilightEnd = noSunset.twilightEnd = TimeOfDay{18, 30};
  overMidnight.twilightBegin = TimeOfDay{20, 0};  // through midnight to 02:00: at both ends of the plot
  overMidnight.twilightEnd = TimeOfDay{2, 0};
  polar.latitude = 78.2;
  polar.month = 6;
  const struct {
    SunEvents events;
    std::vector<std::array<int, 3>> bands;  // left, right, colour on a 300 x 200 plot inside margins of 8
  } cases[] = {{noTwilight, {{8, 292, kTwilightColour}, {79, 221, kDaylightColour}}},  // twilight over the whole plot
               {noRiseSet, {{73, 226, kTwilightColour}}},
               {noSunset, {}},  // any other combination leaves the night
               {overMidnight, {{8 + 236, 292, kTwilightColour}, {8, 8 + 23, kTwilightColour}}},
               {polar, {{8, 292, kDaylightColour}}}};
  const GraphGeometry plot(Rect{0, 0, 300, 200}, 8, 8);
  for (const auto& c : cases) {
    const std::vector<Band> bands = BackgroundBands(c.events, plot);
    REQUIRE(bands.size() == c.bands.size());
    for (std::size_t i = 0; i < bands.size(); ++i)
      CHECK((bands[i].left == c.bands[i][0] && bands[i].right == c.bands[i][1] && bands[i].colour == c.bands[i][2]));
  }
  // Without events: day in the polar summer of either hemisphere, else (or with no month read) night.
  for (const auto& [latitude, month] : {std::pair{78.2, 12}, {-70.0, 12}, {0.0, 12}, {78.2, 0}}) {
    polar.latitude = latitude;
    polar.month = month ? std::optional<int>(month) : std::nullopt;
    CHECK(BackgroundBands(polar, plot).size() == (latitude == -70.0 ? 1u : 0u));
  }
}
