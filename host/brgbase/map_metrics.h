#pragma once
// The stand-in geodesy library's map-metrics block, as the stand-in chart host's hit test
// checks it: TMapMetrics__init writes the mark and the flags, TMapMetrics__clear zeroes
// the whole block. Both stand-ins include this; BR_Info only allocates the block.

#include <cstdint>
#include <cstring>

#include "GeoData.h"

namespace br::brgbase {

inline constexpr std::uint32_t kMapMetricsMark = 0x4D4D5442;  // "BTMM"

struct MapMetricsView {
  std::uint32_t mark;
  std::int32_t flags;
};

inline bool IsInitialisedMetrics(const GEO_MAP_METRICS* block) {
  if (block == nullptr) return false;
  MapMetricsView view;
  std::memcpy(&view, block->Data, sizeof(view));
  return view.mark == kMapMetricsMark;
}

}  // namespace br::brgbase
