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

namespace {

// What the arguments of a start instant give every constituent: a chart's stations are all
// predicted from the same instant, and each needs the same V, u and f of its rows. The
// values are those SetUpDay would compute; they are kept for the last instant only.
struct InstantArguments {
  double t0 = std::nan("");
  AstronomicalArguments arguments;
  AstronomicalAngles angles;
  double tau = 0.0;
  std::array<double, kConstituentCount> V{};
  std::array<bool, kConstituentCount> haveV{};
  ConstituentTable nodal{};
};

bool operator==(const AstronomicalArgument& a, const AstronomicalArgument& b) {
  return a.epochValue == b.epochValue && a.rate == b.rate;
}

bool operator==(const AstronomicalArguments& a, const AstronomicalArguments& b) {
  return a.s == b.s && a.h == b.h && a.p == b.p && a.N == b.N && a.p1 == b.p1;
}

InstantArguments& ArgumentsOfInstant(double t0, const AstronomicalArguments& arguments) {
  static InstantArguments cached;
  if (t0 == cached.t0 && arguments == cached.arguments) return cached;
  cached.t0 = t0;
  cached.arguments = arguments;
  cached.angles = ArgumentsAt(arguments, t0);
  // The epoch is a UT midnight, so t0 modulo 24 is the UT time of day of the start.
  double utHours = std::fmod(t0, 24.0);
  if (utHours < 0.0) utHours += 24.0;
  cached.tau = utHours * kSolarHourRate + cached.angles.h - cached.angles.s;
  cached.haveV.fill(false);
  cached.nodal = NodalCorrectionsOfEveryRow(cached.angles.N, cached.angles.p);
  return cached;
}

double EquilibriumArgument(const InstantArguments& instant, int number) {
  const AstronomicalAngles& a = instant.angles;
  const DoodsonRow& d = DoodsonTable[static_cast<std::size_t>(number)];
  return NormalizeAngle(d[0] * instant.tau + d[1] * a.s + d[2] * a.h + d[3] * a.p + d[4] * a.N + d[5] * a.p1 +
                        d[6] * (kPi / 2.0));
}

}  // namespace

void SetUpDay(double t0) {
  TideEngine& e = TheTideEngine();
  InstantArguments& instant = ArgumentsOfInstant(t0, e.arguments);
  for (std::int32_t j = 1; j < e.workingCount; ++j) {
    StationConstituent& w = e.working[static_cast<std::size_t>(j)];
    const std::size_t n = static_cast<std::size_t>(w.number);
    if (!instant.haveV[n]) {
      instant.V[n] = EquilibriumArgument(instant, w.number);
      instant.haveV[n] = true;
    }
    w.V = instant.V[n];
  }
  // The nodal corrections of the station's rows, as ApplyNodalCorrections writes them.
  for (std::int32_t j = 0; j < e.workingCount; ++j) {
    StationConstituent& w = e.working[static_cast<std::size_t>(j)];
    ConstituentTableEntry& c = e.constituents[static_cast<std::size_t>(w.number)];
    c.u = instant.nodal[static_cast<std::size_t>(w.number)].u;
    c.f = instant.nodal[static_cast<std::size_t>(w.number)].f;
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
