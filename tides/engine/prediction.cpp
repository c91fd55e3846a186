#include "tides/engine/prediction.h"

#include <climits>
#include <cmath>

#include "tides/engine/nodal_corrections.h"

namespace br::tides {

std::int32_t DaySampleCount(double step) {
  const double q = 24.0 / step + 0.49;
  // The quotient as a 32-bit number; one that does not fit reads as the most negative.
  if (!(q > -2147483649.0 && q < 2147483647.0)) return INT32_MIN;
  return static_cast<std::int32_t>(q) + 1;
}

double StartHours(std::int64_t localMidnightSeconds) {
  return static_cast<double>(localMidnightSeconds - kPredictionEpochSeconds) / 3600.0;
}

void SetUpDay(double t0) {
  TideEngine& e = TheTideEngine();
  const AstronomicalAngles a = ArgumentsAt(e.arguments, t0);
  // The epoch is a UT midnight, so t0 modulo 24 is the UT time of day of the start.
  double utHours = std::fmod(t0, 24.0);
  if (utHours < 0.0) utHours += 24.0;
  const double tau = utHours * kSolarHourRate + a.h - a.s;

  for (std::int32_t j = 1; j < e.workingCount; ++j) {
    StationConstituent& w = e.working[static_cast<std::size_t>(j)];
    const DoodsonRow& d = DoodsonTable[static_cast<std::size_t>(w.number)];
    w.V = NormalizeAngle(d[0] * tau + d[1] * a.s + d[2] * a.h + d[3] * a.p + d[4] * a.N + d[5] * a.p1 +
                         d[6] * (kPi / 2.0));
  }
  ApplyNodalCorrections(a.N, a.p);
  for (std::int32_t j = 0; j < e.workingCount; ++j) {
    StationConstituent& w = e.working[static_cast<std::size_t>(j)];
    const ConstituentTableEntry& c = e.constituents[static_cast<std::size_t>(w.number)];
    w.u = c.u;
    w.f = c.f;
  }
}

HarmonicSeries DaySeries(double step) {
  const TideEngine& e = TheTideEngine();
  HarmonicSeries series;
  series.terms = e.workingCount;
  for (std::size_t j = 0; j < static_cast<std::size_t>(e.workingCount); ++j) {
    const StationConstituent& w = e.working[j];
    series.amplitude[j] = w.H * w.f;
    series.phase[j] = w.V + w.u - w.g;
    series.advance[j] = step * e.constituents[static_cast<std::size_t>(w.number)].speed;
  }
  return series;
}

void SynthesizeSamples(double step, float* samples, std::int32_t count) {
  SumSeries(DaySeries(step), samples, count);
}

DayPrediction PredictDay(const StationIndexRecord& key, StationHeader& header, const CalendarDate& date,
                         double step, float* samples, std::size_t capacity, SunDay& sun,
                         const LocalMidnightFunction& toLocalMidnight) {
  DayPrediction result;
  ResetConstituents();
  StationHeader found;
  if (!FindStation(key, found)) return result;
  result.stationFound = true;
  header = found;

  sun = ComputeSunDay(date, found.latitude / 60.0, found.longitude / 60.0, found.zone);

  const std::int32_t count = DaySampleCount(step);
  // Without a conversion the day starts at UT midnight.
  const std::int64_t midnight = toLocalMidnight ? toLocalMidnight(date) : DaysFromCivil(date) * 86400;
  SetUpDay(StartHours(midnight));
  if (count < 1 || samples == nullptr) return result;
  const std::size_t wanted = static_cast<std::size_t>(count);
  result.sampleCount = static_cast<std::int32_t>(wanted < capacity ? wanted : capacity);
  SynthesizeSamples(step, samples, result.sampleCount);
  return result;
}

}  // namespace br::tides
