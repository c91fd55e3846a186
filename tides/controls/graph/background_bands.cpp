#include "tides/controls/graph/background_bands.h"

namespace br::tides::graph {

namespace {

void AddInterval(std::vector<Band>& bands, const GraphGeometry& geometry, const TimeOfDay& from,
                 const TimeOfDay& to, int colour) {
  const int left = geometry.XOfTime(from.hour, from.minute);
  const int right = geometry.XOfTime(to.hour, to.minute);
  if (left <= right) {
    bands.push_back(Band{left, right, colour});
  } else {
    bands.push_back(Band{left, geometry.PlotRight(), colour});
    bands.push_back(Band{geometry.PlotLeft(), right, colour});
  }
}

bool IsPolarSummer(double latitude, int month) {
  const bool northernSummerMonths = month >= 5 && month <= 9;
  return (latitude > 0 && northernSummerMonths) || (latitude < 0 && !northernSummerMonths);
}

}  // namespace

std::vector<Band> BackgroundBands(const SunEvents& events, const GraphGeometry& geometry) {
  std::vector<Band> bands;
  const bool sun = events.sunrise && events.sunset;
  const bool noSun = !events.sunrise && !events.sunset;
  const bool twilight = events.twilightBegin && events.twilightEnd;
  const bool noTwilight = !events.twilightBegin && !events.twilightEnd;
  const Band wholePlot{geometry.PlotLeft(), geometry.PlotRight(), 0};

  if (sun && twilight) {
    AddInterval(bands, geometry, *events.twilightBegin, *events.twilightEnd, kTwilightColour);
    AddInterval(bands, geometry, *events.sunrise, *events.sunset, kDaylightColour);
  } else if (sun && noTwilight) {
    bands.push_back(Band{wholePlot.left, wholePlot.right, kTwilightColour});
    AddInterval(bands, geometry, *events.sunrise, *events.sunset, kDaylightColour);
  } else if (noSun && twilight) {
    AddInterval(bands, geometry, *events.twilightBegin, *events.twilightEnd, kTwilightColour);
  } else if (noSun && noTwilight) {
    if (events.latitude && events.month && IsPolarSummer(*events.latitude, *events.month)) {
      bands.push_back(Band{wholePlot.left, wholePlot.right, kDaylightColour});
    }
  }
  return bands;
}

}  // namespace br::tides::graph
