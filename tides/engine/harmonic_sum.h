// A day's harmonic series summed into its samples.
//
// The samples are defined by one cosine per term and sample: sample k is the sum of the
// terms in order, kept in a 32-bit float after each term, and each term's phase advances by
// adding its step once per sample. SumSeriesByCosine is that definition, word for word;
// SumSeries gives the same floats, bit for bit, with a few multiply-adds per term and
// sample instead of a cosine.
#pragma once

#include <array>
#include <cstdint>

#include "tides/engine/station_files.h"

namespace br::tides {

// The terms of a day in summing order: term j adds amplitude[j] x cos(its phase) to every
// sample, its phase starting at phase[j] and growing by advance[j] from sample to sample.
struct HarmonicSeries {
  std::int32_t terms = 0;
  std::array<double, kConstituentCount> amplitude{};  // internal height unit
  std::array<double, kConstituentCount> phase{};      // radians, at sample 0
  std::array<double, kConstituentCount> advance{};    // radians per sample
};

// One cosine per term and sample: the reference SumSeries is held to.
void SumSeriesByCosine(const HarmonicSeries& series, float* samples, std::int32_t count);

// The same samples as SumSeriesByCosine. Each term turns a unit vector by its step (four or
// eight consecutive samples side by side, each lane turned by as many steps at a time) from
// a true sine and cosine every 512 samples; every float rounding is checked against a bound
// on how far the turned cosine can be from the reference's, and where the bound cannot tell
// which float the reference gets, that term's 64 samples are summed again with the cosine.
// Returns how many times that happened. Series that are not finite, or whose phases run
// beyond what the turning is built for, are summed by SumSeriesByCosine.
std::int32_t SumSeries(const HarmonicSeries& series, float* samples, std::int32_t count);

}  // namespace br::tides
