// The reference the high and low waters are checked against: the turns of a curve sampled
// every few seconds, each at its own highest or lowest sample, found without any fitting.
#pragma once

#include <cmath>
#include <vector>

#include "host/brtide/tide_turns.h"

namespace br::brtide::test {

struct SampledTurn {
  double minutes;
  double height;
  bool high;
};

// Where the curve changes direction (equal samples carry the direction on). A turn back
// within kSmallestTurnMetres is a flat top's rounding noise: both go.
inline std::vector<SampledTurn> SampledTurns(const std::vector<double>& h, double stepMinutes) {
  std::vector<SampledTurn> turns;
  int direction = 0;
  std::size_t top = 0;
  for (std::size_t k = 1; k < h.size(); ++k) {
    if (h[k] == h[k - 1]) continue;
    const int now = h[k] > h[k - 1] ? 1 : -1;
    if (direction != 0 && now != direction) {
      if (!turns.empty() && std::fabs(turns.back().height - h[top]) < kSmallestTurnMetres) {
        turns.pop_back();
      } else {
        turns.push_back({static_cast<double>(top) * stepMinutes, h[top], direction > 0});
      }
    }
    direction = now;
    top = k;
  }
  return turns;
}

}  // namespace br::brtide::test
