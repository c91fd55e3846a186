#include "host/brtide/tide_turns.h"

#include <algorithm>
#include <cmath>

namespace br::brtide {

namespace {

// The vertex of the parabola through three samples a step apart, as an offset in steps
// from the middle one (within half a step) and its height.
void Refine(double before, double at, double after, double& offset, double& height) {
  const double bend = before - 2.0 * at + after;
  offset = 0.0;
  height = at;
  if (bend == 0.0) return;
  offset = std::clamp(0.5 * (before - after) / bend, -0.5, 0.5);
  height = at - 0.25 * (before - after) * offset;
}

// A turn as the samples show it: the sample (or flat run) where the curve turns.
struct SampledTurn {
  std::size_t first = 0;  // first and last sample of the run at the turn
  std::size_t last = 0;
  double height = 0.0;
  bool high = false;
};

// Removes neighbouring turns whose samples differ by less than kSmallestTurnMetres, the
// closest pair first; highs and lows keep alternating.
void DropNoise(std::vector<SampledTurn>& turns) {
  for (;;) {
    std::size_t closest = turns.size();
    double smallest = kSmallestTurnMetres;
    for (std::size_t i = 0; i + 1 < turns.size(); ++i) {
      const double rise = std::fabs(turns[i + 1].height - turns[i].height);
      if (rise < smallest) {
        smallest = rise;
        closest = i;
      }
    }
    if (closest == turns.size()) return;
    turns.erase(turns.begin() + static_cast<std::ptrdiff_t>(closest),
                turns.begin() + static_cast<std::ptrdiff_t>(closest + 2));
  }
}

}  // namespace

std::vector<TideTurn> FindTideTurns(const std::vector<double>& heights, double stepMinutes) {
  // 1. The samples where the direction of the curve changes.
  std::vector<SampledTurn> sampled;
  int direction = 0;        // of the last step that changed the height
  std::size_t runTop = 0;   // the sample that step reached; a flat run goes on from it
  for (std::size_t k = 1; k < heights.size(); ++k) {
    const double change = heights[k] - heights[k - 1];
    if (change == 0.0) continue;
    const int now = change > 0 ? 1 : -1;
    if (direction != 0 && now != direction) sampled.push_back({runTop, k - 1, heights[runTop], direction > 0});
    direction = now;
    runTop = k;
  }
  // 2. Rounding noise out.
  DropNoise(sampled);
  // 3. Each turn placed between the samples: the parabola's vertex at a single sample,
  // the middle of a flat run.
  std::vector<TideTurn> turns;
  for (const SampledTurn& s : sampled) {
    TideTurn turn;
    turn.high = s.high;
    if (s.first == s.last) {
      double offset = 0.0;
      Refine(heights[s.first - 1], heights[s.first], heights[s.first + 1], offset, turn.height);
      turn.minutes = (static_cast<double>(s.first) + offset) * stepMinutes;
    } else {
      turn.height = s.height;
      turn.minutes = (static_cast<double>(s.first) + static_cast<double>(s.last)) / 2.0 * stepMinutes;
    }
    turns.push_back(turn);
  }
  return turns;
}

}  // namespace br::brtide
