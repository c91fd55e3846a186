#include "tides/engine/harmonic_sum.h"

#include <algorithm>
#include <cmath>
#include <cstring>

#if defined(__SSE2__)
#include <emmintrin.h>
#endif
#if defined(__x86_64__) && !defined(_WIN32) && defined(__GNUC__)
#include <immintrin.h>
#endif

#include "tides/engine/sine_cosine.h"

namespace br::tides {

namespace {

constexpr int kChunk = 64;  // samples checked together, and summed again on doubt
constexpr int kSpan = 512;  // samples between true sines and cosines
constexpr int kMostLanes = 8;
static_assert(kSpan % kChunk == 0 && kChunk % kMostLanes == 0, "chunks hold whole lane groups");

// The samples of one term turned side by side, in two vectors of the GCC and clang
// extension so that the loop runs in packed instructions whatever the compiler makes of
// scalar code. Each policy gives the vector type and the float conversions.

// Four lanes in two SSE2 registers (the baseline of x86-64; a target without SSE2, such as
// the 32-bit Windows build, takes the generic conversions).
struct FourLanes {
  static constexpr int kCount = 4;
  typedef double Doubles __attribute__((vector_size(2 * sizeof(double))));
  typedef float Floats __attribute__((vector_size(4 * sizeof(float))));
#if defined(__SSE2__)
  // Compilers convert the generic pair types poorly: the SSE2 conversions directly.
  static void Widen(const float* p, Doubles (&out)[2]) {
    const __m128 f = _mm_loadu_ps(p);
    out[0] = _mm_cvtps_pd(f);
    out[1] = _mm_cvtps_pd(_mm_movehl_ps(f, f));
  }
  static void Narrow(const Doubles& low, const Doubles& high, Floats& out) {
    out = _mm_movelh_ps(_mm_cvtpd_ps(low), _mm_cvtpd_ps(high));
  }
#else
  static void Widen(const float* p, Doubles (&out)[2]) {
    out[0] = Doubles{p[0], p[1]};
    out[1] = Doubles{p[2], p[3]};
  }
  static void Narrow(const Doubles& low, const Doubles& high, Floats& out) {
    out = Floats{static_cast<float>(low[0]), static_cast<float>(low[1]), static_cast<float>(high[0]),
                 static_cast<float>(high[1])};
  }
#endif
  // Both halves rounded to floats, stored; high - low added to the spread.
  static void Round(const Doubles (&sum)[2], double tolerance, float* out, Floats& spread) {
    Floats low, high;
    Narrow(sum[0] - tolerance, sum[1] - tolerance, low);
    Narrow(sum[0] + tolerance, sum[1] + tolerance, high);
    std::memcpy(out, &low, sizeof low);
    spread += high - low;
  }
};

// Eight lanes in two AVX registers, for processors that have them (native builds only: the
// Windows compiler does not keep the stack aligned for AVX spills).
#if defined(__x86_64__) && !defined(_WIN32) && defined(__GNUC__)
#define BR_HARMONIC_SUM_AVX 1
struct EightLanes {
  static constexpr int kCount = 8;
  typedef double Doubles __attribute__((vector_size(4 * sizeof(double))));
  typedef float Floats __attribute__((vector_size(4 * sizeof(float))));
  __attribute__((target("avx"))) static void Widen(const float* p, Doubles (&out)[2]) {
    out[0] = _mm256_cvtps_pd(_mm_loadu_ps(p));
    out[1] = _mm256_cvtps_pd(_mm_loadu_ps(p + 4));
  }
  static void Round(const Doubles (&sum)[2], double tolerance, float* out, Floats& spread) {
    for (int v = 0; v < 2; ++v) {
      const Floats low = __builtin_convertvector(sum[v] - tolerance, Floats);
      const Floats high = __builtin_convertvector(sum[v] + tolerance, Floats);
      std::memcpy(out + 4 * v, &low, sizeof low);
      spread += high - low;
    }
  }
};
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

// Whether the turning can take the series: every amplitude, phase and step finite, every
// phase of the day (and the turns of up to kMostLanes steps) where SineCosine reduces
// exactly, and the sums far from overflowing (given their bound, the sum of the sizes).
bool CanTurn(const HarmonicSeries& series, std::size_t terms, std::int32_t count, double sumOfSizes) {
  // Comparisons with NaN fail, so they refuse it too; no early exit, so that it vectorises.
  const double steps = std::max(count, kMostLanes);
  int refused = 0;
  for (std::size_t j = 0; j < terms; ++j) {
    const double reach = std::fabs(series.phase[j]) + std::fabs(series.advance[j]) * steps;
    refused |= !(reach <= kSineCosineLimit);
  }
  return refused == 0 && sumOfSizes <= kLargestTotal;
}

using TermValues = std::array<double, kConstituentCount>;

// The day's state of the sum, one array per quantity, indexed by term.
struct DaySum {
  const HarmonicSeries& series;
  std::size_t terms = 0;
  double sumBound = 0.0;               // no partial sum of any sample is larger
  TermValues turnCos[kMostLanes + 1];  // cos and sin of l steps, l = 0..kMostLanes
  TermValues turnSin[kMostLanes + 1];
  TermValues phase;                    // the reference's phase at the span's first sample
  TermValues phaseCos, phaseSin;       // its cosine and sine
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
template <typename Lanes>
inline void AddTerm(DaySum& day, std::size_t j, const float* prev, float* cur, int length) {
  using Doubles = typename Lanes::Doubles;
  constexpr int kLanes = Lanes::kCount, kWidth = kLanes / 2;
  const double amplitude = day.series.amplitude[j];
  const double size = std::fabs(amplitude);
  const double reach = std::fabs(day.phase[j]) + std::fabs(day.series.advance[j]) * length;
  // How far sample i's double sum may lie from the reference's: size x (turning, phase
  // rounding, library cosine, the product's roundings) plus the two sums' roundings. The
  // check takes twice that, which also covers the roundings of the check itself.
  const double perSample = 2.0 * size * (kTurnErrorPerStep + reach * kUnit);
  const double atStart = 2.0 * (size * (kTurnErrorPerStep + kSineCosineError + kLibraryCosineError + 2 * kUnit) +
                                2.0 * day.sumBound * kUnit);

  // Lane l holds samples l, l + kLanes, l + 2 kLanes, ... of the span: the first half of
  // the lanes in the first vector, the rest in the second.
  Doubles laneCos[2], laneSin[2];
  for (int l = 0; l < kLanes; ++l) {
    laneCos[l / kWidth][l % kWidth] = day.phaseCos[j] * day.turnCos[l][j] - day.phaseSin[j] * day.turnSin[l][j];
    laneSin[l / kWidth][l % kWidth] = day.phaseSin[j] * day.turnCos[l][j] + day.phaseCos[j] * day.turnSin[l][j];
  }
  const double jumpCos = day.turnCos[kLanes][j], jumpSin = day.turnSin[kLanes][j];

  for (int first = 0; first < length; first += kChunk) {
    const int last = std::min(length, first + kChunk);
    const double tolerance = atStart + perSample * last;
    // high - low is 0 where both ends round to one float, else positive: their total says
    // whether any rounding of the chunk is in doubt.
    typename Lanes::Floats spread = {};
    // Whole lane groups: the last may run past length into the span's padding.
    for (int k = first; k < last; k += kLanes) {
      Doubles sum[2];
      Lanes::Widen(prev + k, sum);
      for (int v = 0; v < 2; ++v) sum[v] += amplitude * laneCos[v];
      Lanes::Round(sum, tolerance, cur + k, spread);
      for (int v = 0; v < 2; ++v) {
        const Doubles c = laneCos[v] * jumpCos - laneSin[v] * jumpSin;
        laneSin[v] = laneSin[v] * jumpCos + laneCos[v] * jumpSin;
        laneCos[v] = c;
      }
    }
    float doubt = 0.0f;
    for (int l = 0; l < 4; ++l) doubt += spread[l];
    // A rounding too close to call: the reference's cosines decide these samples.
    if (doubt != 0.0f) {
      AddTermByCosine(day, j, prev, cur, first, last);
      ++day.resummed;
    }
  }
}

// The terms of one span summed with the lanes' policy; returns the buffer of the sums.
template <typename Lanes>
inline float* AddTerms(DaySum& day, float* prev, float* cur, int length) {
  for (std::size_t j = 0; j < day.terms; ++j) {
    // A term of no amplitude adds a zero, which leaves every float as it is (the sum is
    // never -0). Skipped, it cannot fall on a rounding too close to call near 0.
    if (day.series.amplitude[j] == 0.0) continue;
    AddTerm<Lanes>(day, j, prev, cur, length);
    std::swap(prev, cur);
  }
  return prev;
}

float* AddTermsInFourLanes(DaySum& day, float* prev, float* cur, int length) {
  return AddTerms<FourLanes>(day, prev, cur, length);
}

#if defined(BR_HARMONIC_SUM_AVX)
// The same code compiled for AVX, everything it calls inlined so that it is too.
__attribute__((target("avx"), flatten)) float* AddTermsInEightLanes(DaySum& day, float* prev, float* cur,
                                                                     int length) {
  return AddTerms<EightLanes>(day, prev, cur, length);
}

bool HasAvx() {
  static const bool has = __builtin_cpu_supports("avx");
  return has;
}
#endif

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
  // The amplitudes' sizes add up to a bound on every partial sum (NaN or infinite if one
  // is); each float rounding of a partial sum adds at most 2^-24 of it, and 69 of them stay
  // far below the margin.
  double sumOfSizes = 0.0;
  for (std::size_t j = 0; j < terms; ++j) sumOfSizes += std::fabs(series.amplitude[j]);
  if (!CanTurn(series, terms, count, sumOfSizes)) {
    SumSeriesByCosine(series, samples, count);
    return 0;
  }

  // Once a day: the turn of 0 to kMostLanes steps of every term, each loop over all terms.
  DaySum day(series);
  day.terms = terms;
  for (std::size_t j = 0; j < terms; ++j) {
    day.turnCos[0][j] = 1.0;
    day.turnSin[0][j] = 0.0;
    SineCosine(series.advance[j], day.turnSin[1][j], day.turnCos[1][j]);
  }
  for (std::size_t j = 0; j < terms; ++j) {
    const double stepCos = day.turnCos[1][j], stepSin = day.turnSin[1][j];
    double c = stepCos, s = stepSin;
    for (int l = 2; l <= kMostLanes; ++l) {
      const double turned = c * stepCos - s * stepSin;
      s = s * stepCos + c * stepSin;
      c = turned;
      day.turnCos[l][j] = c;
      day.turnSin[l][j] = s;
    }
  }
  day.sumBound = sumOfSizes * 1.001;
  day.phase = series.phase;

  float spanA[kSpan], spanB[kSpan];
  for (std::int32_t start = 0; start < count; start += kSpan) {
    const int length = static_cast<int>(std::min<std::int32_t>(kSpan, count - start));
    const int padded = (length + kMostLanes - 1) / kMostLanes * kMostLanes;
    for (std::size_t j = 0; j < terms; ++j) SineCosine(day.phase[j], day.phaseSin[j], day.phaseCos[j]);

    std::fill(spanA, spanA + padded, 0.0f);
#if defined(BR_HARMONIC_SUM_AVX)
    const float* sums = HasAvx() ? AddTermsInEightLanes(day, spanA, spanB, length)
                                 : AddTermsInFourLanes(day, spanA, spanB, length);
#else
    const float* sums = AddTermsInFourLanes(day, spanA, spanB, length);
#endif
    std::copy(sums, sums + length, samples + start);

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
