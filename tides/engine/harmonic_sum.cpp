#include "tides/engine/harmonic_sum.h"

#include <algorithm>
#include <cmath>
#include <cstring>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif

#include "tides/engine/sine_cosine.h"

namespace br::tides {

namespace {

constexpr int kLanes = 4;   // samples of one term turned side by side
constexpr int kChunk = 64;  // samples checked together, and summed again on doubt
constexpr int kSpan = 512;  // samples between true sines and cosines
static_assert(kSpan % kChunk == 0 && kChunk % kLanes == 0, "chunks hold whole lane groups");

// Two lanes in a vector of the GCC and clang extension (an SSE2 register: the arithmetic
// below is packed whatever the compiler makes of scalar code); four floats in another.
typedef double Doubles __attribute__((vector_size(2 * sizeof(double))));
typedef float Floats __attribute__((vector_size(4 * sizeof(float))));
static_assert(kLanes == 4, "the lanes fill two double vectors and one float vector");

// The float vector's conversions, which compilers do poorly from the generic types.
#if defined(__SSE2__)
inline void Widen(const float* p, Doubles& low, Doubles& high) {
  const __m128 f = _mm_loadu_ps(p);
  low = _mm_cvtps_pd(f);
  high = _mm_cvtps_pd(_mm_movehl_ps(f, f));
}
inline void Narrow(const Doubles& low, const Doubles& high, Floats& out) {
  out = _mm_movelh_ps(_mm_cvtpd_ps(low), _mm_cvtpd_ps(high));
}
#else
inline void Widen(const float* p, Doubles& low, Doubles& high) {
  low = Doubles{p[0], p[1]};
  high = Doubles{p[2], p[3]};
}
inline void Narrow(const Doubles& low, const Doubles& high, Floats& out) {
  out = Floats{static_cast<float>(low[0]), static_cast<float>(low[1]), static_cast<float>(high[0]),
               static_cast<float>(high[1])};
}
#endif

constexpr double kUnit = 0x1p-53;  // half a unit in the last place of 1

// What separates the turned cosine of sample i of a span from the reference's cosine, as
// parts of the amplitude:
//  - the turning: each step adds the error of the step's own sine and cosine and three
//    roundings per component (about 10 units; counted as 32), and the start adds one more;
//  - the reference's phase: each of its i additions rounds by at most half an ulp of the
//    largest phase of the span, and the turning follows the unrounded phases;
//  - the C runtime's cosine in the reference: within an ulp, counted as two.
constexpr double kTurnErrorPerStep = 32 * kUnit;
constexpr double kLibraryCosineError = 4 * kUnit;

// Sums beyond this size are left to the reference: the bounds assume nothing overflows.
constexpr double kLargestTotal = 1.0e30;

bool CanTurn(const HarmonicSeries& series, std::size_t terms, std::int32_t count) {
  double total = 0.0;
  for (std::size_t j = 0; j < terms; ++j) {
    const double a = series.amplitude[j], p = series.phase[j], d = series.advance[j];
    if (!(std::isfinite(a) && std::isfinite(p) && std::isfinite(d))) return false;
    // Every phase of the day must stay where SineCosine reduces exactly.
    if (!(std::fabs(p) + std::fabs(d) * count <= kSineCosineLimit)) return false;
    total += std::fabs(a);
  }
  return total <= kLargestTotal;
}

using TermValues = std::array<double, kConstituentCount>;

// The day's state of the sum, one array per quantity, indexed by term.
struct DaySum {
  const HarmonicSeries& series;
  std::size_t terms = 0;
  double sumBound = 0.0;           // no partial sum of any sample is larger
  TermValues turnCos[kLanes + 1];  // cos and sin of l steps, l = 0..kLanes
  TermValues turnSin[kLanes + 1];
  TermValues phase;                // the reference's phase at the span's first sample
  TermValues phaseCos, phaseSin;   // its cosine and sine
  std::int32_t resummed = 0;

  explicit DaySum(const HarmonicSeries& s) : series(s) {}
};

// Samples [from, to) of the span, term j, the reference's way.
void AddTermByCosine(const DaySum& day, std::size_t j, const float* prev, float* cur, int from, int to) {
  const double amplitude = day.series.amplitude[j];
  const double advance = day.series.advance[j];
  double phase = day.phase[j];
  for (int i = 0; i < from; ++i) phase += advance;
  for (int k = from; k < to; ++k) {
    cur[k] = static_cast<float>(prev[k] + amplitude * std::cos(phase));
    phase += advance;
  }
}

// Adds term j to the first length samples of a span: cur = prev + term, rounded to floats.
void AddTerm(DaySum& day, std::size_t j, const float* prev, float* cur, int length) {
  const double amplitude = day.series.amplitude[j];
  const double size = std::fabs(amplitude);
  const double reach = std::fabs(day.phase[j]) + std::fabs(day.series.advance[j]) * length;
  // How far sample i's double sum may lie from the reference's: size x (turning, phase
  // rounding, library cosine, the product's roundings) plus the two sums' roundings. The
  // check takes twice that, which also covers the roundings of the check itself.
  const double perSample = 2.0 * size * (kTurnErrorPerStep + reach * kUnit);
  const double atStart = 2.0 * (size * (kTurnErrorPerStep + kSineCosineError + kLibraryCosineError + 2 * kUnit) +
                                2.0 * day.sumBound * kUnit);

  // Lane l holds samples l, l + kLanes, l + 2 kLanes, ... of the span: lanes 0 and 1 in
  // the first vector, 2 and 3 in the second.
  double startCos[kLanes], startSin[kLanes];
  for (int l = 0; l < kLanes; ++l) {
    startCos[l] = day.phaseCos[j] * day.turnCos[l][j] - day.phaseSin[j] * day.turnSin[l][j];
    startSin[l] = day.phaseSin[j] * day.turnCos[l][j] + day.phaseCos[j] * day.turnSin[l][j];
  }
  Doubles cos0 = {startCos[0], startCos[1]}, cos1 = {startCos[2], startCos[3]};
  Doubles sin0 = {startSin[0], startSin[1]}, sin1 = {startSin[2], startSin[3]};
  const double jumpCos = day.turnCos[kLanes][j], jumpSin = day.turnSin[kLanes][j];

  for (int first = 0; first < length; first += kChunk) {
    const int last = std::min(length, first + kChunk);
    const double tolerance = atStart + perSample * last;
    // high - low is 0 where both ends round to one float, else positive: their total says
    // whether any rounding of the chunk is in doubt.
    Floats spread = {};
    // Whole lane groups: the last may run past length into the span's padding.
    for (int k = first; k < last; k += kLanes) {
      Doubles before0, before1;
      Widen(prev + k, before0, before1);
      const Doubles sum0 = before0 + amplitude * cos0;
      const Doubles sum1 = before1 + amplitude * cos1;
      Floats low, high;
      Narrow(sum0 - tolerance, sum1 - tolerance, low);
      Narrow(sum0 + tolerance, sum1 + tolerance, high);
      std::memcpy(cur + k, &low, sizeof low);
      spread += high - low;
      const Doubles c0 = cos0 * jumpCos - sin0 * jumpSin;
      const Doubles c1 = cos1 * jumpCos - sin1 * jumpSin;
      sin0 = sin0 * jumpCos + cos0 * jumpSin;
      sin1 = sin1 * jumpCos + cos1 * jumpSin;
      cos0 = c0;
      cos1 = c1;
    }
    float doubt = 0.0f;
    for (int l = 0; l < kLanes; ++l) doubt += spread[l];
    // A rounding too close to call: the reference's cosines decide these samples.
    if (doubt != 0.0f) {
      AddTermByCosine(day, j, prev, cur, first, last);
      ++day.resummed;
    }
  }
}

}  // namespace

void SumSeriesByCosine(const HarmonicSeries& series, float* samples, std::int32_t count) {
  const std::int32_t terms = std::clamp(series.terms, 0, kConstituentCount);
  std::array<double, kConstituentCount> phase = series.phase;
  for (std::int32_t k = 0; k < count; ++k) {
    float sum = 0.0f;
    for (std::int32_t j = 0; j < terms; ++j) {
      const std::size_t t = static_cast<std::size_t>(j);
      sum = static_cast<float>(sum + series.amplitude[t] * std::cos(phase[t]));
      phase[t] += series.advance[t];
    }
    samples[k] = sum;
  }
}

std::int32_t SumSeries(const HarmonicSeries& series, float* samples, std::int32_t count) {
  if (count <= 0) return 0;
  const std::size_t terms = static_cast<std::size_t>(std::clamp(series.terms, 0, kConstituentCount));
  if (!CanTurn(series, terms, count)) {
    SumSeriesByCosine(series, samples, count);
    return 0;
  }

  // Once a day: the turn of 0 to kLanes steps of every term, each loop over all terms.
  DaySum day(series);
  day.terms = terms;
  for (std::size_t j = 0; j < terms; ++j) {
    day.turnCos[0][j] = 1.0;
    day.turnSin[0][j] = 0.0;
    SineCosine(series.advance[j], day.turnSin[1][j], day.turnCos[1][j]);
  }
  for (int l = 2; l <= kLanes; ++l) {
    for (std::size_t j = 0; j < terms; ++j) {
      const double c = day.turnCos[l - 1][j], s = day.turnSin[l - 1][j];
      day.turnCos[l][j] = c * day.turnCos[1][j] - s * day.turnSin[1][j];
      day.turnSin[l][j] = s * day.turnCos[1][j] + c * day.turnSin[1][j];
    }
  }
  double total = 0.0;
  for (std::size_t j = 0; j < terms; ++j) total += std::fabs(series.amplitude[j]);
  // Each float rounding of a partial sum adds at most 2^-24 of it; 69 of them stay far
  // below this margin.
  day.sumBound = total * 1.001;
  day.phase = series.phase;

  float spanA[kSpan], spanB[kSpan];
  for (std::int32_t start = 0; start < count; start += kSpan) {
    const int length = static_cast<int>(std::min<std::int32_t>(kSpan, count - start));
    const int padded = (length + kLanes - 1) / kLanes * kLanes;
    for (std::size_t j = 0; j < terms; ++j) SineCosine(day.phase[j], day.phaseSin[j], day.phaseCos[j]);

    float* prev = spanA;
    float* cur = spanB;
    std::fill(prev, prev + padded, 0.0f);
    for (std::size_t j = 0; j < terms; ++j) {
      // A term of no amplitude adds a zero, which leaves every float as it is (the sum is
      // never -0). Skipped, it cannot fall on a rounding too close to call near 0.
      if (series.amplitude[j] == 0.0) continue;
      AddTerm(day, j, prev, cur, length);
      std::swap(prev, cur);
    }
    std::copy(prev, prev + length, samples + start);

    // The next span starts from the reference's own phases, added up sample by sample.
    if (count - start > kSpan) {
      for (int i = 0; i < length; ++i) {
        for (std::size_t j = 0; j < terms; ++j) day.phase[j] += series.advance[j];
      }
    }
  }
  return day.resummed;
}

}  // namespace br::tides
