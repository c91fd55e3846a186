#include "tides/engine/nodal_corrections.h"

#include <cmath>

#include "tides/engine/TideEngine.h"

namespace br::tides {

namespace {

struct NodalPolynomial {
  int number;
  bool always;
  double a1, a2, a3;      // u = (a1 sin N + a2 sin 2N + a3 sin 3N) degrees
  double f0, b1, b2, b3;  // f = f0 + b1 cos N + b2 cos 2N + b3 cos 3N
};

// The M2 factor's 1.004 is kept as published: the engine's reference numbers rest on it.
constexpr NodalPolynomial kPolynomials[] = {
    {kMf, false, -23.7, 2.7, -0.4, 1.043, 0.414, 0.0, 0.0},
    {kO1, true, 10.8, -1.34, 0.19, 1.0089, 0.1871, -0.0147, 0.0014},
    {kK1, true, -8.86, 0.68, -0.07, 1.006, 0.115, -0.0088, 0.0006},
    {kJ1, true, -12.94, 1.34, -0.19, 1.0129, 0.1676, -0.017, 0.0016},
    {kM2, true, -2.14, 0.0, 0.0, 1.004, -0.0373, 0.0002, 0.0},
    {kK2, true, -17.74, 0.68, -0.04, 1.0246, 0.2863, 0.0083, -0.0015},
};

// Rows whose values derive from O1, K1, K2 and M2. uM2 counts how many uM2 the angle adds,
// fM2 the power of fM2 in the factor; other names the one constituent added (+1) or taken
// off (-1) in both angle and factor.
struct DerivedRule {
  int number;
  int uM2;    // multiple of uM2 in u (negative: -uM2)
  int fM2;    // power of fM2 in f
  int other;  // kO1, kK1, kK2 or -1 for none
  int otherSign;
};

constexpr DerivedRule kDerived[] = {
    {kMSf, -1, 1, -1, 0},
    {20, 2, 1, kK2, -1},
    {23, 1, 1, kK2, -1},
    {31, 1, 1, kK2, +1},
    {34, 0, 0, kK2, -1},
    {39, 1, 1, kO1, +1},
    {40, 1, 1, kO1, +1},
    {41, 2, 1, -1, 0},
    {45, 1, 1, kK1, +1},
    {46, 2, 1, kO1, -1},
    {47, 3, 2, kK2, -1},
    {48, 3, 2, -1, 0},
    {49, 2, 1, -1, 0},
    {50, 2, 1, -1, 0},
    {51, 2, 1, kK2, -1},
    {52, 2, 1, -1, 0},
    {53, 2, 1, kK2, +1},
    {55, 2, 3, -1, 0},
    {57, 1, 1, kK2, +1},
    {58, 4, 3, kK2, -1},
    {59, 4, 3, -1, 0},
    {60, 3, 2, kK2, -1},
    {61, 3, 2, -1, 0},
    {62, 3, 2, -1, 0},
    {63, 3, 2, kK2, -1},
    {64, 3, 2, -1, 0},
    {65, 2, 1, -1, 0},
    {66, 3, 4, -1, 0},
    {67, 2, 1, -1, 0},
    {68, 2, 1, kK2, +1},
};

// Rows that take another constituent's u and f unchanged.
struct CopyRule {
  int number;
  int source;
};

constexpr CopyRule kCopies[] = {
    {6, kO1},  {7, kO1},  {9, kO1},  {27, kO1}, {11, kJ1}, {18, kJ1}, {21, kM2}, {22, kM2},
    {25, kM2}, {26, kM2}, {32, kM2}, {43, kM2}, {44, kM2}, {54, kM2}, {56, kM2},
};

// Every rule that applies to the table's used rows, and the five that always run.
void CorrectTable(ConstituentTable& table, double N, double p) {
  auto used = [&](int n) { return table[static_cast<std::size_t>(n)].used != 0; };

  const double sinN = std::sin(N), sin2N = std::sin(2.0 * N), sin3N = std::sin(3.0 * N);
  const double cosN = std::cos(N), cos2N = std::cos(2.0 * N), cos3N = std::cos(3.0 * N);
  for (const NodalPolynomial& r : kPolynomials) {
    if (!r.always && !used(r.number)) continue;
    ConstituentTableEntry& c = table[static_cast<std::size_t>(r.number)];
    c.u = NormalizeAngle((r.a1 * sinN + r.a2 * sin2N + r.a3 * sin3N) * kDegreesToRadians);
    c.f = r.f0 + r.b1 * cosN + r.b2 * cos2N + r.b3 * cos3N;
  }

  const double uM2 = table[kM2].u;
  const double fM2 = table[kM2].f;

  if (used(kMm)) {
    const double c = 0.9137 - 0.03569 * cosN;
    table[kMm].u = 0.0;
    table[kMm].f = (c * c - 1.0 / 3.0) * 1.9916351324437362;  // divided by 0.5021
  }
  if (used(kM1)) {
    const double y = std::sin(p) + 0.2 * std::sin(p - N);
    const double x = 2.0 * (std::cos(p) + 0.2 * std::cos(p - N));
    table[kM1].u = std::atan2(y, x);
    table[kM1].f = x / std::cos(table[kM1].u);
  }
  if (used(kL2)) {
    const double y = -0.2505 * std::sin(2.0 * p) - 0.1102 * std::sin(2.0 * p - N) -
                     0.0156 * std::sin(2.0 * p - 2.0 * N) - 0.037 * std::sin(N);
    const double x = 1.0 - 0.2505 * std::cos(2.0 * p) - 0.1102 * std::cos(2.0 * p - N) -
                     0.0156 * std::cos(2.0 * p - 2.0 * N) - 0.037 * std::cos(N);
    table[kL2].u = std::atan2(y, x);
    table[kL2].f = x / std::cos(table[kL2].u);
  }
  if (used(kM3)) {
    const double root = std::sqrt(fM2);
    table[kM3].u = NormalizeAngle(-3.21 * sinN * kDegreesToRadians);
    table[kM3].f = root * root * root;
  }

  // Multiples of uM2, each reduced; index k holds k * uM2.
  double multiple[5];
  multiple[0] = 0.0;
  multiple[1] = uM2;
  for (int k = 2; k <= 4; ++k) multiple[k] = NormalizeAngle(multiple[k - 1] + uM2);

  for (const DerivedRule& r : kDerived) {
    if (!used(r.number)) continue;
    double u = r.uM2 < 0 ? -uM2 : multiple[r.uM2];
    double f = 1.0;
    for (int k = 0; k < r.fM2; ++k) f *= fM2;
    if (r.other >= 0) {
      const ConstituentTableEntry& o = table[static_cast<std::size_t>(r.other)];
      u = NormalizeAngle(u + r.otherSign * o.u);
      f *= o.f;
    }
    table[static_cast<std::size_t>(r.number)].u = u;
    table[static_cast<std::size_t>(r.number)].f = f;
  }

  for (const CopyRule& r : kCopies) {
    if (!used(r.number)) continue;
    table[static_cast<std::size_t>(r.number)].u = table[static_cast<std::size_t>(r.source)].u;
    table[static_cast<std::size_t>(r.number)].f = table[static_cast<std::size_t>(r.source)].f;
  }
}

}  // namespace

void ApplyNodalCorrections(double N, double p) { CorrectTable(TheTideEngine().constituents, N, p); }

ConstituentTable NodalCorrectionsOfEveryRow(double N, double p) {
  ConstituentTable table{};
  for (ConstituentTableEntry& c : table) c.used = 1;
  CorrectTable(table, N, p);
  return table;
}

}  // namespace br::tides
