// The turned sum against the one-cosine-per-sample reference: the world set's days at many
// steps and dates bit for bit, the doubtful rounding, series the turning refuses; and the
// polynomial sine and cosine whose error the sum's bound counts on.
#include <doctest/doctest.h>

#include <array>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <limits>
#include <string>
#include <vector>

#include "tides/engine/harmonic_sum.h"
#include "tides/engine/prediction.h"
#include "tides/engine/sine_cosine.h"

using namespace br::tides;

namespace {

// The embedded world station set of the source tree (Windows programs see it through Z:).
std::string WorldFolder() {
  const char* root = std::getenv("BR_SOURCE_DIR");
  REQUIRE_MESSAGE(root != nullptr, "BR_SOURCE_DIR names the source tree");
  std::string folder = std::string(root) + "/data/world";
#ifdef _WIN32
  if (folder.front() == '/') folder = "Z:" + folder;
  for (char& c : folder) c = c == '/' ? '\\' : c;
#endif
  return folder;
}

struct Sums {
  std::vector<float> turned, reference;
  std::int32_t resummed = 0;
};

Sums SumBothWays(const HarmonicSeries& series, std::int32_t count) {
  Sums s;
  s.turned.assign(static_cast<std::size_t>(count), -1.0f);
  s.reference.assign(static_cast<std::size_t>(count), -2.0f);
  s.resummed = SumSeries(series, s.turned.data(), count);
  SumSeriesByCosine(series, s.reference.data(), count);
  return s;
}

bool SameBits(const std::vector<float>& a, const std::vector<float>& b) {
  return a.size() == b.size() && std::memcmp(a.data(), b.data(), a.size() * sizeof(float)) == 0;
}

HarmonicSeries Series(std::initializer_list<std::array<double, 3>> terms) {
  HarmonicSeries s;
  for (const auto& [amplitude, phase, advance] : terms) {
    const std::size_t j = static_cast<std::size_t>(s.terms++);
    s.amplitude[j] = amplitude;
    s.phase[j] = phase;
    s.advance[j] = advance;
  }
  return s;
}

}  // namespace

TEST_CASE("the world set: every sample of the turned sum is the reference's float") {
  REQUIRE(OpenTideFiles(WorldFolder().c_str()) == 0);
  const std::int32_t stations = StationCount();
  REQUIRE(stations > 3000);
  const CalendarDate dates[] = {{1971, 1, 1}, {2024, 6, 15}, {2037, 12, 31}};
  // The usual steps, odd ones, two-sample days, and the longest day a port takes (34,287
  // points: several re-anchored spans) at a few stations.
  const double steps[] = {0.1, 1.0, 0.25, 0.37, 7.3, 30.0};
  const double longestStep = 0.0007;

  double largest = 0.0;  // metres
  std::int64_t samples = 0, resummed = 0;
  StationHeader header;
  SunDay sun;
  for (std::int32_t i = 0; i < stations; i += 41) {
    StationIndexRecord key;
    REQUIRE(ReadStationIndexRecord(i, key));
    for (std::size_t d = 0; d < std::size(dates); ++d) {
      // Local midnights on both sides of UT, one with minutes.
      const std::int32_t offset = d == 0 ? -5 * 3600 : d == 1 ? 0 : 5 * 3600 + 1800;
      REQUIRE(PredictDay(key, header, dates[d], 1.0, nullptr, 0, sun, FixedOffsetLocalMidnight(offset)).stationFound);
      std::vector<double> dayStep(std::begin(steps), std::end(steps));
      if (i % 1025 == 0) dayStep.push_back(longestStep);
      for (double step : dayStep) {
        const Sums s = SumBothWays(DaySeries(step), DaySampleCount(step));
        for (std::size_t k = 0; k < s.turned.size(); ++k) {
          largest = std::fmax(largest, std::fabs(s.turned[k] * 0.01 - s.reference[k] * 0.01));
        }
        CHECK(SameBits(s.turned, s.reference));
        samples += static_cast<std::int64_t>(s.turned.size());
        resummed += s.resummed;
      }
    }
  }
  CloseTideFiles();
  MESSAGE(samples << " samples, largest difference " << largest << " m, " << resummed << " stretches resummed");
  CHECK(largest < 1e-9);
  CHECK(samples > 500000);
}

TEST_CASE("a rounding the bound cannot call is summed with the cosine") {
  // 1 + 2^-24 lies halfway between two floats: the turned cosine of the second term (exactly
  // 1 at sample 0) gives no margin on either side, so its first stretch must be resummed.
  const Sums tie = SumBothWays(Series({{1.0, 0.0, 0.0}, {0x1p-24, 0.0, 0.0}}), 25);
  CHECK(tie.resummed >= 1);
  CHECK(SameBits(tie.turned, tie.reference));
  CHECK(tie.turned[0] == 1.0f);  // the tie goes to the even float

  // Terms of no amplitude leave the sums as they are: no doubt near zero, a flat zero day.
  const Sums zero = SumBothWays(Series({{0.0, 1.0, 0.3}, {0.0, 2.0, 0.5}}), 97);
  CHECK((zero.resummed == 0 && SameBits(zero.turned, zero.reference) && zero.turned[96] == 0.0f));
  const Sums none = SumBothWays(HarmonicSeries{}, 5);
  CHECK((none.turned == std::vector<float>(5, 0.0f) && none.resummed == 0));
}

TEST_CASE("series the turning is not built for are summed by the reference") {
  const double nan = std::numeric_limits<double>::quiet_NaN(), inf = std::numeric_limits<double>::infinity();
  const HarmonicSeries refused[] = {
      Series({{100.0, 1.0, 0.05}, {nan, 0.5, 0.2}}),
      Series({{100.0, inf, 0.05}}),
      Series({{100.0, 1.0, -inf}}),
      Series({{100.0, 2e5, 0.05}}),   // a phase past the polynomial's reduction
      Series({{100.0, 1.0, 1e4}}),    // phases that reach it within the day
      Series({{1e300, 1.0, 0.05}}),  // sums past a float
  };
  for (const HarmonicSeries& series : refused) {
    const Sums s = SumBothWays(series, 25);
    CHECK((s.resummed == 0 && SameBits(s.turned, s.reference)));
  }
}

TEST_CASE("SineCosine stays within its stated error of the C runtime's") {
  double worst = 0.0;
  for (double x = -kSineCosineLimit; x <= kSineCosineLimit; x += 0.7311 + std::fabs(x) * 1e-4) {
    for (double y : {x, x * 1e-6, std::nextafter(x, 0.0)}) {
      double s = 0.0, c = 0.0;
      SineCosine(y, s, c);
      worst = std::fmax(worst, std::fmax(std::fabs(s - std::sin(y)), std::fabs(c - std::cos(y))));
    }
  }
  // Each side is within its bound of the true value; the C runtime within an ulp of it.
  CHECK(worst <= kSineCosineError + 0x1p-53);
  double s = 1.0, c = 0.0;
  SineCosine(0.0, s, c);
  CHECK((s == 0.0 && c == 1.0));  // the mean level's step turns by nothing, exactly
}
