#include "tides/engine/TideEngine.h"

#include <cmath>

namespace br::tides {

const std::array<DoodsonRow, kConstituentCount> DoodsonTable = {{
    {0, 0, 0, 0, 0, 0, 0},     // 0  mean level
    {0, 0, 1, 0, 0, 0, 0},     // 1  Sa
    {0, 0, 2, 0, 0, 0, 0},     // 2  Ssa
    {0, 1, 0, -1, 0, 0, 0},    // 3  Mm
    {0, 2, -2, 0, 0, 0, 0},    // 4  MSf
    {0, 2, 0, 0, 0, 0, 0},     // 5  Mf
    {1, -2, 0, 1, 0, 0, -1},   // 6  Q1
    {1, -2, 2, -1, 0, 0, -1},  // 7  rho1
    {1, -1, 0, 0, 0, 0, -1},   // 8  O1
    {1, -1, 2, 0, 0, 0, 1},    // 9  tau1
    {1, 0, 0, 0, 0, 0, 1},     // 10 M1
    {1, 0, 2, -1, 0, 0, 1},    // 11 chi1
    {1, 1, -3, 0, 0, 1, -1},   // 12 pi1
    {1, 1, -2, 0, 0, 0, -1},   // 13 P1
    {1, 1, -1, 0, 0, 0, 2},    // 14 S1
    {1, 1, 0, 0, 0, 0, 1},     // 15 K1
    {1, 1, 1, 0, 0, -1, 1},    // 16 psi1
    {1, 1, 2, 0, 0, 0, 1},     // 17 phi1
    {1, 2, -2, 1, 0, 0, 1},    // 18 theta1
    {1, 2, 0, -1, 0, 0, 1},    // 19 J1
    {2, -2, 0, 0, 0, 0, 0},    // 20
    {2, -2, 0, 2, 0, 0, 0},    // 21 2N2
    {2, -2, 2, 0, 0, 0, 0},    // 22 mu2
    {2, -1, -2, 1, 0, 0, 0},   // 23
    {2, -1, -1, 1, 0, 1, 0},   // 24
    {2, -1, 0, 1, 0, 0, 0},    // 25 N2
    {2, -1, 2, -1, 0, 0, 0},   // 26 nu2
    {2, 0, -2, 0, 0, 0, 2},    // 27
    {2, 0, -1, 0, 0, 0, 0},    // 28
    {2, 0, 0, 0, 0, 0, 0},     // 29 M2
    {2, 0, 1, 0, 0, 0, 0},     // 30
    {2, 0, 2, 0, 0, 0, 0},     // 31
    {2, 1, -2, 1, 0, 0, 2},    // 32 lambda2
    {2, 1, 0, -1, 0, 0, 2},    // 33 L2
    {2, 2, -4, 0, 0, 0, 0},    // 34
    {2, 2, -3, 0, 0, 1, 0},    // 35 T2
    {2, 2, -2, 0, 0, 0, 0},    // 36 S2
    {2, 2, -1, 0, 0, -1, 2},   // 37 R2
    {2, 2, 0, 0, 0, 0, 0},     // 38 K2
    {3, -2, 0, 1, 0, 0, -1},   // 39
    {3, -1, 0, 0, 0, 0, -1},   // 40 MO3
    {3, -1, 2, 0, 0, 0, 1},    // 41
    {3, 0, 0, 0, 0, 0, 2},     // 42 M3
    {3, 1, -2, 0, 0, 0, -1},   // 43
    {3, 1, -2, 0, 0, 0, -1},   // 44
    {3, 1, 0, 0, 0, 0, 1},     // 45 MK3
    {3, 2, 0, -1, 0, 0, 1},    // 46
    {4, -2, 0, 0, 0, 0, 0},    // 47
    {4, -2, 2, 0, 0, 0, 0},    // 48
    {4, -1, 0, 1, 0, 0, 0},    // 49 MN4
    {4, -1, 2, -1, 0, 0, 0},   // 50
    {4, 0, -2, 0, 0, 0, 0},    // 51
    {4, 0, 0, 0, 0, 0, 0},     // 52 M4
    {4, 0, 2, 0, 0, 0, 0},     // 53
    {4, 1, -2, 1, 0, 0, 0},    // 54
    {4, 1, 0, -1, 0, 0, 0},    // 55
    {4, 2, -2, 0, 0, 0, 0},    // 56 MS4
    {4, 2, 0, 0, 0, 0, 0},     // 57 MK4
    {6, -2, 0, 0, 0, 0, 0},    // 58
    {6, -2, 2, 0, 0, 0, 0},    // 59
    {6, -1, -2, 1, 0, 0, 0},   // 60
    {6, -1, 0, 1, 0, 0, 0},    // 61 2MN6
    {6, -1, 2, -1, 0, 0, 0},   // 62
    {6, 0, -2, 0, 0, 0, 0},    // 63
    {6, 0, 0, 0, 0, 0, 0},     // 64 M6
    {6, 1, -2, 1, 0, 0, 0},    // 65
    {6, 1, 0, -1, 0, 0, 0},    // 66
    {6, 2, -2, 0, 0, 0, 0},    // 67 2MS6
    {6, 2, 0, 0, 0, 0, 0},     // 68 2MK6
}};

TideEngine& TheTideEngine() {
  static TideEngine engine;
  return engine;
}

namespace {
AstronomicalArgument Degrees(double epochValue, double rate) {
  return {epochValue * kDegreesToRadians, rate * kDegreesToRadians};
}

AstronomicalArguments EpochArguments() {
  AstronomicalArguments a;
  a.s = Degrees(41.01, 0.549017);
  a.h = Degrees(279.94, 0.041069);
  a.p = Degrees(280.54, 0.004642);
  a.N = Degrees(202.44, -0.002206);
  a.p1 = Degrees(282.87, 0.000002);
  return a;
}

// 2pi in two parts of 25 significant bits: n times either is exact for n below 2^20.
constexpr double kTwoPiHigh = 0x1.921fb5p+2;
constexpr double kTwoPiLow = 0x1.110b46p-24;
static_assert(kTwoPiHigh + kTwoPiLow == kTwoPi, "the parts add up to 2pi exactly");
constexpr double kSplitTurnsLimit = 0x1p20 * kTwoPi;

// x - n 2pi for 0 <= x < kSplitTurnsLimit and whole n >= 0. x and n x kTwoPiHigh are both
// multiples of ulp(x), so the first difference is exact; the second is exact whenever the
// true result is representable, as fmod's remainder always is. For an n one too large the
// result is still negative.
double LessTurns(double x, double n) { return (x - n * kTwoPiHigh) - n * kTwoPiLow; }
}  // namespace

double NormalizeAngle(double x) {
  if (!std::isfinite(x)) return x;  // a non-finite angle would never leave the loop
  // Far-off dates give arguments of many turns: cut them down before stepping by whole turns.
  if (x < -1024.0 * kTwoPi) x = std::fmod(x, kTwoPi);
  while (x < 0.0) x += kTwoPi;
  if (x < kTwoPi) return x;
  if (!(x < kSplitTurnsLimit)) return std::fmod(x, kTwoPi);
  // fmod(x, 2pi) bit for bit, without the C runtime's loop over the quotient's bits (a day's
  // set-up reduces one argument per constituent). The rounded quotient is never below the
  // true one's whole part, and at most one above it.
  const double n = static_cast<double>(static_cast<std::int32_t>(x / kTwoPi));
  const double r = LessTurns(x, n);
  return r < 0.0 ? LessTurns(x, n - 1.0) : r;
}

double ConstituentSpeed(const DoodsonRow& d, const AstronomicalArguments& a) {
  const double tau = kSolarHourRate - a.s.rate + a.h.rate;
  return d[0] * tau + d[1] * a.s.rate + d[2] * a.h.rate + d[3] * a.p.rate + d[4] * a.N.rate +
         d[5] * a.p1.rate;
}

void ResetConstituents() {
  // The speeds follow from the fixed rates alone: worked out once, copied at every reset.
  static const std::array<double, kConstituentCount> speeds = [] {
    const AstronomicalArguments a = EpochArguments();
    std::array<double, kConstituentCount> v{};
    for (int n = 1; n < kConstituentCount; ++n) v[n] = ConstituentSpeed(DoodsonTable[n], a);
    return v;
  }();
  TideEngine& e = TheTideEngine();
  e.arguments = EpochArguments();
  for (int n = 0; n < kConstituentCount; ++n) {
    ConstituentTableEntry& c = e.constituents[n];
    c.speed = speeds[n];
    c.u = 0.0;
    c.f = 1.0;
  }
}

AstronomicalAngles ArgumentsAt(const AstronomicalArguments& a, double t) {
  AstronomicalAngles v;
  v.s = NormalizeAngle(a.s.rate * t + a.s.epochValue);
  v.h = NormalizeAngle(a.h.rate * t + a.h.epochValue);
  v.p = NormalizeAngle(a.p.rate * t + a.p.epochValue);
  v.N = NormalizeAngle(a.N.rate * t + a.N.epochValue);
  v.p1 = NormalizeAngle(a.p1.rate * t + a.p1.epochValue);
  return v;
}

}  // namespace br::tides
