// The tide graph's background: night (the plot's own colour), twilight and daylight
// bands from the day's sun events. Portable.
#pragma once

#include "tides/controls/graph/GraphGeometry.h"

#include <optional>
#include <vector>

namespace br::tides::graph {

// Palette indices of the graph.
inline constexpr int kFrameColour = 7;      // frame fill and grid lines
inline constexpr int kNightColour = 17;     // plot background
inline constexpr int kTwilightColour = 12;
inline constexpr int kDaylightColour = 5;
inline constexpr int kCurveColour = 10;

struct TimeOfDay {
  int hour = 0;
  int minute = 0;
};

// The day's sun events (absent when the port has none or its time cannot be read), with
// the port's latitude and the month for days without any event.
struct SunEvents {
  std::optional<TimeOfDay> twilightBegin;
  std::optional<TimeOfDay> sunrise;
  std::optional<TimeOfDay> sunset;
  std::optional<TimeOfDay> twilightEnd;
  std::optional<double> latitude;
  std::optional<int> month;
};

// A filled rectangle across the plot's height from left to right (exclusive).
struct Band {
  int left = 0;
  int right = 0;
  int colour = 0;
};

// The bands to paint over the night plot, in painting order:
//  - all four events: twilight from its begin to its end, then daylight from rise to set;
//  - rise and set only: twilight over the whole plot, then daylight from rise to set;
//  - both twilights only: twilight from its begin to its end;
//  - no event: daylight over the whole plot in a polar summer (latitude north and
//    months 5..9, or south and the other months), else nothing;
//  - any other combination: nothing.
// An event interval that ends before it begins runs over midnight: it is painted from its
// begin to the plot's right and from the plot's left to its end.
std::vector<Band> BackgroundBands(const SunEvents& events, const GraphGeometry& geometry);

}  // namespace br::tides::graph
