// High and low waters to the minute from a finely sampled curve, as printed tide tables
// give them. Portable.
#pragma once

#include <vector>

namespace br::brtide {

struct TideTurn {
  double minutes = 0.0;  // after the curve's first sample
  double height = 0.0;   // metres
  bool high = false;
};

// Neighbouring turns closer in height than this are a flat top's rounding noise (the
// library's heights are 32-bit floats), not a high and a low water.
inline constexpr double kSmallestTurnMetres = 0.0005;

// Every turn of a curve sampled every stepMinutes minutes, in time order, highs and lows
// alternating: the sample where the curve turns (the middle of a flat run), placed and
// measured by the parabola through it and its two neighbours. The first and last samples
// are never turns: the curve must reach past both ends of the span a caller wants.
std::vector<TideTurn> FindTideTurns(const std::vector<double>& heights, double stepMinutes);

}  // namespace br::brtide
