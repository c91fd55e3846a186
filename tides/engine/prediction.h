// One day of tide heights for one station by harmonic synthesis.
//
// Heights are in the engine's internal unit: ten times the published unit (the station
// files' amplitudes are thousandths of the published unit, the engine keeps them x 0.1).
// Station phases are Greenwich phase lags, so sample k is the tide at the given local
// standard midnight + k x step on any computer, whatever its time zone.
#pragma once

#include <cstddef>
#include <cstdint>

#include "tides/engine/calendar.h"
#include "tides/engine/harmonic_sum.h"
#include "tides/engine/station_files.h"
#include "tides/engine/sun_events.h"
#include "tides/engine/TideEngine.h"

namespace br::tides {

// Samples of a day at step hours: trunc(24 / step + 0.49) + 1 (step 1: 25, 00:00 through
// 24:00). Below 1 means no samples: steps from about -16.1 up to 0, NaN, and steps so small
// that the count leaves 32 bits (given as INT32_MIN). A step below about -16.1 gives 1.
std::int32_t DaySampleCount(double step);

// The most points a day is given: one a second. A finer step says nothing more about the
// tide and would only cost time and memory (a step of 1e-7 hour asks for 240 million
// points: minutes of work and a gigabyte), so the objects refuse it like any bad step, and
// the graph draws no day of more points from a port of any make.
inline constexpr std::int32_t kMaxDayPoints = 24 * 3600 + 1;

// Start of the day in hours since the prediction epoch, from its local-midnight instant.
double StartHours(std::int64_t localMidnightSeconds);

// The arguments of the loaded station at t0 hours after the epoch: writes V of working
// records 1..count-1 (record 0, the mean level, keeps V = 0), the nodal corrections of the
// station's rows into the table, and copies u and f into the records. The mean lunar time
// includes the mean solar hour angle at t0 (15 degrees per hour since the UT midnight
// before it). The values of the last t0 are kept for every row, so the stations of one
// start instant (a chart's stations on one date) share one computation.
void SetUpDay(double t0);

// The loaded station's series for samples step hours apart: per working record, in order,
// amplitude H x f, phase V + u - g and advance step x speed. The records are not changed.
HarmonicSeries DaySeries(double step);

// Sums the loaded station's series into count samples step hours apart, the sum kept in a
// 32-bit float after each term, each argument advanced by step x speed per sample
// (SumSeries over DaySeries). The working records keep the day's starting V.
void SynthesizeSamples(double step, float* samples, std::int32_t count);

struct DayPrediction {
  bool stationFound = false;
  std::int32_t sampleCount = 0;  // samples written
};

// Loads the station whose StationKey equals key's, computes its sun events for date (in
// the station's zone time) and the tide heights of the date from the local standard
// midnight that toLocalMidnight gives (UT midnight when it is empty), at step hours.
// Writes min(DaySampleCount(step), capacity) samples. When the station is not found,
// returns stationFound false and writes nothing: header, samples and sun stay as they were.
DayPrediction PredictDay(const StationIndexRecord& key, StationHeader& header, const CalendarDate& date,
                         double step, float* samples, std::size_t capacity, SunDay& sun,
                         const LocalMidnightFunction& toLocalMidnight);

}  // namespace br::tides
