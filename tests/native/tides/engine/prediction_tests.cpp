// Flat levels, unknown stations, days past 32767 points, odd dates and the points of odd steps:
// the Wine port suites.
#include <doctest/doctest.h>

#include <array>
#include <cmath>
#include <vector>

#include "tests/common/station_writer.h"
#include "tides/engine/nodal_corrections.h"
#include "tides/engine/prediction.h"

using namespace br::tides;
using namespace br::tides::testing;

namespace {

constexpr double kDeg = 180.0 / kPi;

// One open folder for a test case, closed at its end.
struct OpenFolder {
  TempFolder tmp;
  Closer closer;
  explicit OpenFolder(const std::vector<TestStation>& stations) {
    WriteStationFolder(tmp.path(), stations);
    REQUIRE(OpenTideFiles(tmp.str().c_str()) == 0);
  }
};

struct Day {
  DayPrediction result;
  StationHeader header;
  SunDay sun;
  std::vector<float> samples;
};

Day Predict(const StationIndexRecord& key, CalendarDate date, double step, std::int32_t offsetSeconds = 0) {
  Day d;
  d.samples.assign(static_cast<std::size_t>(DaySampleCount(step)), 0.0f);
  d.result = PredictDay(key, d.header, date, step, d.samples.data(), d.samples.size(), d.sun,
                        FixedOffsetLocalMidnight(offsetSeconds));
  return d;
}

}  // namespace

TEST_CASE("nodal corrections: factors at N = 0, angles that combine the base constituents") {
  ResetConstituents();
  auto& table = TheTideEngine().constituents;
  for (auto& c : table) c.used = 1;
  const auto f = [&](int row) { return table[static_cast<std::size_t>(row)].f; };
  const auto u = [&](int row) { return table[static_cast<std::size_t>(row)].u; };
  ApplyNodalCorrections(0.0, 1.0);
  const double fM2 = 0.9669, fK2 = 1.3177, fO1 = 1.1827, c = 0.9137 - 0.03569;
  const std::pair<int, double> base[] = {
      {kM2, fM2}, {kK1, 1.1128}, {kO1, fO1}, {kK2, fK2}, {kJ1, 1.0129 + 0.1676 - 0.017 + 0.0016}, {kMf, 1.457}};
  for (const auto& [row, value] : base) CHECK(f(row) == doctest::Approx(value).epsilon(1e-12));
  // Derived rows keep the table's powers of fM2, not the count of M2 in the angle (52 is M4).
  const std::pair<int, double> derived[] = {{52, fM2}, {47, fM2 * fM2 * fK2}, {46, fM2 * fO1}, {kM3, std::pow(fM2, 1.5)}};
  for (const auto& [row, value] : derived) CHECK(f(row) == doctest::Approx(value));
  CHECK(f(kMm) == doctest::Approx((c * c - 1.0 / 3.0) / 0.5021).epsilon(1e-4));
  for (int n : {1, 2, 30}) CHECK((f(n) == 1.0 && u(n) == 0.0));  // rows without a rule

  const double N = 1.2, p = 0.4;
  ApplyNodalCorrections(N, p);
  const double uM2 = u(kM2), uK2 = u(kK2), uO1 = u(kO1), uK1 = u(kK1);
  const std::pair<int, double> combined[] = {
      {20, 2 * uM2 - uK2}, {45, uM2 + uK1}, {46, 2 * uM2 - uO1}, {58, 4 * uM2 - uK2}, {64, 3 * uM2}};
  for (const auto& [row, value] : combined) CHECK(u(row) == doctest::Approx(NormalizeAngle(value)));
  CHECK(u(kMSf) == doctest::Approx(-uM2));
  const double y = std::sin(p) + 0.2 * std::sin(p - N), x = 2 * (std::cos(p) + 0.2 * std::cos(p - N));
  CHECK((u(kM1) == doctest::Approx(std::atan2(y, x)) && f(kM1) == doctest::Approx(std::hypot(x, y))));
}

TEST_CASE("NormalizeAngle: the remainder of whole turns, bit for bit what fmod gives") {
  const auto byFmod = [](double x) {
    if (x < -1024.0 * kTwoPi) x = std::fmod(x, kTwoPi);
    while (x < 0.0) x += kTwoPi;
    return std::fmod(x, kTwoPi);
  };
  std::vector<double> angles = {0.0, -0.0, kTwoPi, -1e-300, 6.5e6, 1e12, -1e5, 41.01 * kPi / 180.0};
  // Either side of whole turns, where a quotient rounded the wrong way would show.
  for (int n = -3; n < 40000; n += n < 40 ? 1 : 997) {
    double above = n * kTwoPi, below = above;
    for (int u = 0; u < 8; ++u) {
      angles.push_back(above = std::nextafter(above, 1e300));
      angles.push_back(below = std::nextafter(below, -1e300));
    }
  }
  for (double x = 0.5; x < 1e7; x = x * 1.37 + 0.91) angles.insert(angles.end(), {x, -x});
  int differ = 0;
  for (double x : angles) differ += NormalizeAngle(x) != byFmod(x);
  CHECK(differ == 0);
}

TEST_CASE("a station's arguments do not depend on the station set up before it on the same instant") {
  // The second station's rows are partly the first's and partly not (Mm, M1, L2, MK3: rules
  // that run only for used rows).
  OpenFolder folder({Station(0, 0, {{0, 0, 100}, {kM2, 100, 900}, {kK1, 200, 300}, {kO1, 300, 200}}),
                     Station(60, 60, {{0, 0, 100}, {kM2, 150, 800}, {kMm, 10, 30}, {kM1, 20, 20}, {kL2, 30, 40},
                                      {45, 40, 10}, {kS2, 50, 300}})});
  const auto records = [](const StationIndexRecord& key, CalendarDate date) {
    Predict(key, date, 1.0);
    const TideEngine& e = TheTideEngine();
    std::vector<std::array<double, 3>> out;
    for (std::int32_t j = 0; j < e.workingCount; ++j) {
      const StationConstituent& w = e.working[static_cast<std::size_t>(j)];
      out.push_back({w.V, w.u, w.f});
    }
    return out;
  };
  const CalendarDate date{2011, 8, 9};
  const auto alone = records(Key(60, 60), date);
  records(Key(0, 0), date);
  CHECK(records(Key(60, 60), date) == alone);
  records(Key(0, 0), {2011, 8, 10});
  CHECK(records(Key(60, 60), date) == alone);
  // The rows' values are those ApplyNodalCorrections gives a station that uses them.
  const TideEngine& e = TheTideEngine();
  ConstituentTable applied = e.constituents;
  const AstronomicalAngles a = ArgumentsAt(e.arguments, StartHours(DaysFromCivil(date) * 86400));
  ApplyNodalCorrections(a.N, a.p);
  for (std::int32_t j = 0; j < e.workingCount; ++j) {
    const auto n = static_cast<std::size_t>(e.working[static_cast<std::size_t>(j)].number);
    CHECK((applied[n].u == TheTideEngine().constituents[n].u && applied[n].f == TheTideEngine().constituents[n].f));
  }
}

TEST_CASE("the worked day: M2 at 1996-01-01 on a UTC computer") {
  OpenFolder folder({Station(0, 0, {{0, 0, 0}, {kM2, 0, 1000}})});
  const Day d = Predict(Key(0, 0), {1996, 1, 1}, 1.0);
  REQUIRE(d.result.sampleCount == 25);
  const TideEngine& e = TheTideEngine();
  CHECK(e.working[1].V * kDeg == doctest::Approx(117.86).epsilon(1e-6));
  CHECK(e.working[1].u * kDeg == doctest::Approx(0.8169).epsilon(1e-4));
  CHECK(e.working[1].f == doctest::Approx(1.03862).epsilon(1e-5));
  const double published[4] = {-0.4984, -0.8775, -1.0368, -0.9364};
  for (int k = 0; k < 4; ++k) CHECK(d.samples[static_cast<std::size_t>(k)] * 0.01 == doctest::Approx(published[k]).epsilon(2e-4));
  std::size_t lo = 0, hi = 0;
  for (std::size_t k = 1; k < d.samples.size(); ++k) {
    if (d.samples[k] < d.samples[lo]) lo = k;
    if (d.samples[k] > d.samples[hi]) hi = k;
  }
  CHECK((lo == 2 && hi == 21));
  CHECK(d.samples[hi] * 0.01 == doctest::Approx(1.0301).epsilon(2e-4));
}

TEST_CASE("the day starts at the computer's local standard midnight: a UTC-5 day is the UTC one from 05:00 UT") {
  // A station that exercises every kind of nodal rule.
  OpenFolder folder({Station(2903, -269, {{0, 0, 2500}, {29, 1200, 1800}, {36, 1600, 600}, {25, 1000, 350}, {38, 1650, 170},
      {15, 700, 400}, {8, 600, 300}, {3, 200, 40}, {5, 300, 60}, {52, 500, 90}, {56, 800, 50}, {42, 100, 30},
      {33, 2500, 45}, {10, 3000, 20}, {1, 1000, 70}})});
  const StationIndexRecord key = Key(2903, -269);
  const CalendarDate date{2004, 3, 10};
  const Day local = Predict(key, date, 1.0, -5 * 3600), utc = Predict(key, date, 1.0, 0);
  const Day utcNext = Predict(key, {2004, 3, 11}, 1.0, 0);
  REQUIRE(local.result.sampleCount == 25);
  for (std::size_t k = 0; k < 25; ++k) {
    const float reference = k + 5 < 25 ? utc.samples[k + 5] : utcNext.samples[k + 5 - 24];
    CHECK(std::fabs(local.samples[k] * 0.01 - reference * 0.01) < 1e-3);
  }
  // Without the hour angle the curve would be the UT day's: make sure it is not.
  CHECK(std::fabs(local.samples[0] - utc.samples[0]) > 10.0f);
  // No conversion given: the UT day.
  std::vector<float> plain(25);
  StationHeader h;
  SunDay sun;
  PredictDay(key, h, date, 1.0, plain.data(), plain.size(), sun, LocalMidnightFunction{});
  CHECK(plain == utc.samples);
}
