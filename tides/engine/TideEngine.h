// The engine's process-wide tables: the Doodson numbers of the 69 constituents, the
// constituent table (speeds and nodal values of the current prediction), the astronomical
// arguments, and the working records of the station loaded by FindStation.
#pragma once

#include <array>
#include <cstdint>

#include "tides/engine/station_files.h"

namespace br::tides {

inline constexpr double kPi = 3.14159265358979323846;
inline constexpr double kTwoPi = 2.0 * kPi;
inline constexpr double kDegreesToRadians = kPi / 180.0;
// Mean solar hour angle rate: 15 degrees per hour.
inline constexpr double kSolarHourRate = 0.2617993877991494;

// Constituent numbers whose own values other rows' nodal rules read.
enum ConstituentNumber : int {
  kMeanLevel = 0,
  kMm = 3,
  kMSf = 4,
  kMf = 5,
  kO1 = 8,
  kM1 = 10,
  kK1 = 15,
  kJ1 = 19,
  kM2 = 29,
  kL2 = 33,
  kS2 = 36,
  kK2 = 38,
  kM3 = 42,
};

// Multipliers d1..d6 of tau, s, h, p, N, p1 and d7, the count of quarter turns of a fixed
// phase. Rows 43 and 44 are the same and both stay: station files name rows by number.
using DoodsonRow = std::array<std::int8_t, 7>;
extern const std::array<DoodsonRow, kConstituentCount> DoodsonTable;

struct ConstituentTableEntry {
  std::int32_t used = 0;  // 1 when the loaded station has a record for it
  double speed = 0.0;     // radians per hour
  double u = 0.0;         // nodal angle, radians
  double f = 1.0;         // nodal factor
};

// One constituent of the loaded station.
struct StationConstituent {
  double V = 0.0;  // running astronomical argument, radians
  double u = 0.0;
  double f = 0.0;
  double g = 0.0;  // Greenwich phase lag, radians
  double H = 0.0;  // amplitude, internal height unit (file value x 0.1)
  std::int16_t number = 0;
};

// An angle's value at the prediction epoch (1996-01-01 00:00 UT) and its rate, radians and
// radians per hour.
struct AstronomicalArgument {
  double epochValue = 0.0;
  double rate = 0.0;
};

struct AstronomicalArguments {
  AstronomicalArgument s;   // mean longitude of the moon
  AstronomicalArgument h;   // mean longitude of the sun
  AstronomicalArgument p;   // longitude of the moon's perigee
  AstronomicalArgument N;   // longitude of the moon's ascending node
  AstronomicalArgument p1;  // longitude of the sun's perigee
};

// The arguments' values at one instant, radians in [0, 2pi).
struct AstronomicalAngles {
  double s = 0.0, h = 0.0, p = 0.0, N = 0.0, p1 = 0.0;
};

using ConstituentTable = std::array<ConstituentTableEntry, kConstituentCount>;

struct TideEngine {
  AstronomicalArguments arguments;
  ConstituentTable constituents{};
  std::array<StationConstituent, kConstituentCount> working{};
  std::int32_t workingCount = 0;
};

// The one engine of the process.
TideEngine& TheTideEngine();

// Seconds from 1970-01-01 00:00 UT to the prediction epoch 1996-01-01 00:00 UT.
inline constexpr std::int64_t kPredictionEpochSeconds = 820454400;

// Sets the astronomical arguments and every constituent's speed, with u = 0 and f = 1.
// The used flags are left as they are.
void ResetConstituents();

// x reduced to [0, 2pi).
double NormalizeAngle(double x);

// Speed of a Doodson row in radians per hour for the given hourly rates.
double ConstituentSpeed(const DoodsonRow& row, const AstronomicalArguments& a);

// The arguments at t hours after the epoch.
AstronomicalAngles ArgumentsAt(const AstronomicalArguments& a, double t);

}  // namespace br::tides
