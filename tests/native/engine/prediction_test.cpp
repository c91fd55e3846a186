#include <doctest/doctest.h>

#include <climits>
#include <cmath>
#include <limits>
#include <vector>

#include "station_folder.h"
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
  const std::int32_t count = DaySampleCount(step);
  d.samples.assign(count > 0 ? static_cast<std::size_t>(count) : 0, 0.0f);
  d.result = PredictDay(key, d.header, date, step, d.samples.data(), d.samples.size(), d.sun,
                        FixedOffsetLocalMidnight(offsetSeconds));
  return d;
}

// A station that exercises every kind of nodal rule.
const std::vector<ConstituentRecord> kRichStation = {
    {0, 0, 2500},   {29, 1200, 1800}, {36, 1600, 600}, {25, 1000, 350}, {38, 1650, 170},
    {15, 700, 400}, {8, 600, 300},    {3, 200, 40},    {5, 300, 60},    {52, 500, 90},
    {56, 800, 50},  {42, 100, 30},    {33, 2500, 45},  {10, 3000, 20},  {1, 1000, 70}};

}  // namespace

TEST_CASE("constituent speeds") {
  ResetConstituents();
  const auto& c = TheTideEngine().constituents;
  CHECK(c[kM2].speed * kDeg == doctest::Approx(28.984104).epsilon(1e-9));
  CHECK(c[kK1].speed * kDeg == doctest::Approx(15.041069).epsilon(1e-9));
  CHECK(c[kS2].speed * kDeg == doctest::Approx(30.0).epsilon(1e-12));
  CHECK((c[kMeanLevel].speed == 0.0 && c[kMeanLevel].f == 1.0));
  // Rows 43 and 44 are the same constituent under two numbers.
  CHECK(DoodsonTable[43] == DoodsonTable[44]);
  CHECK(c[43].speed == c[44].speed);
}

TEST_CASE("sample counts by step") {
  const struct {
    double step;
    std::int32_t count;
  } rows[] = {{1.0, 25}, {0.1, 241}, {24.0, 2}, {30.0, 2}, {48.0, 1}, {-20.0, 1}};
  for (const auto& r : rows) CHECK(DaySampleCount(r.step) == r.count);
  for (double step : {0.0, -1.0, std::numeric_limits<double>::quiet_NaN()}) CHECK(DaySampleCount(step) < 1);
  CHECK(DaySampleCount(1e-12) == INT32_MIN);

  OpenFolder folder({Station(10, 10)});
  SUBCASE("steps without samples write none") {
    float sample = 7.0f;
    StationHeader h;
    SunDay sun;
    const DayPrediction d =
        PredictDay(Key(10, 10), h, {2000, 1, 1}, 0.0, &sample, 1, sun, FixedOffsetLocalMidnight(0));
    CHECK(d.stationFound);
    CHECK(d.sampleCount == 0);
    CHECK(sample == 7.0f);
  }
  SUBCASE("a buffer shorter than the day is filled and no further") {
    std::vector<float> buffer(12, -5.0f);
    StationHeader h;
    SunDay sun;
    const DayPrediction d =
        PredictDay(Key(10, 10), h, {2000, 1, 1}, 1.0, buffer.data(), 10, sun, FixedOffsetLocalMidnight(0));
    CHECK(d.sampleCount == 10);
    CHECK(buffer[9] == doctest::Approx(123.4));
    CHECK(buffer[10] == -5.0f);
  }
}

TEST_CASE("mean level only: 123.4 everywhere") {
  OpenFolder folder({Station(10, 10)});
  const Day d = Predict(Key(10, 10), {1996, 7, 14}, 0.25);
  REQUIRE(d.result.sampleCount == 97);
  for (float s : d.samples) CHECK(s == doctest::Approx(123.4).epsilon(1e-6));
}

TEST_CASE("station not found: reported apart from the count, nothing written") {
  OpenFolder folder({Station(10, 10)});
  std::vector<float> samples(25, 42.0f);
  StationHeader h;
  SetStationName(h, "before");
  SunDay sun;
  sun.zoneHours[1] = 99.0;
  const DayPrediction d =
      PredictDay(Key(10, 11), h, {2000, 1, 1}, 1.0, samples.data(), samples.size(), sun, FixedOffsetLocalMidnight(0));
  CHECK_FALSE(d.stationFound);
  CHECK((d.sampleCount == 0 && StationName(h) == "before" && sun.zoneHours[1] == 99.0));
  for (float s : samples) CHECK(s == 42.0f);
}

TEST_CASE("an M2-only station starts at V = 0") {
  OpenFolder folder({Station(10, 10, {{29, 300, 1000}})});
  const Day d = Predict(Key(10, 10), {2003, 5, 17}, 1.0);
  const TideEngine& e = TheTideEngine();
  REQUIRE(e.workingCount == 1);
  CHECK(e.working[0].V == 0.0);
  const double expected = 100.0 * e.working[0].f * std::cos(e.working[0].u - 30.0 / kDeg);
  CHECK(d.samples[0] == doctest::Approx(expected).epsilon(1e-6));
}

TEST_CASE("nodal corrections for N = 0") {
  ResetConstituents();
  auto& table = TheTideEngine().constituents;
  for (auto& c : table) c.used = 1;
  ApplyNodalCorrections(0.0, 1.0);
  CHECK(table[kM2].u == 0.0);
  const double fM2 = 0.9669, fK2 = 1.3177, fO1 = 1.1827;
  const struct {
    int row;
    double f;
  } base[] = {{kM2, fM2}, {kK1, 1.1128}, {kO1, fO1}, {kK2, fK2}, {kJ1, 1.0129 + 0.1676 - 0.017 + 0.0016}, {kMf, 1.457}};
  for (const auto& r : base) CHECK(table[static_cast<std::size_t>(r.row)].f == doctest::Approx(r.f).epsilon(1e-12));
  // Derived rows keep the table's powers of fM2, not the count of M2 in the angle (52 is M4).
  const struct {
    int row;
    double f;
  } derived[] = {{52, fM2}, {47, fM2 * fM2 * fK2}, {46, fM2 * fO1}, {kM3, std::pow(fM2, 1.5)}};
  for (const auto& r : derived) CHECK(table[static_cast<std::size_t>(r.row)].f == doctest::Approx(r.f));
  CHECK(table[6].f == table[kO1].f);    // Q1 as O1
  CHECK(table[11].f == table[kJ1].f);   // chi1 as J1
  CHECK(table[25].f == table[kM2].f);   // N2 as M2
  const double c = 0.9137 - 0.03569;
  CHECK(table[kMm].f == doctest::Approx((c * c - 1.0 / 3.0) / 0.5021).epsilon(1e-4));
  // Rows without a rule.
  for (int n : {1, 2, 12, 13, 14, 16, 17, 24, 28, 30, 35, 36, 37})
    CHECK((table[static_cast<std::size_t>(n)].f == 1.0 && table[static_cast<std::size_t>(n)].u == 0.0));
}

TEST_CASE("nodal angles combine the base constituents") {
  ResetConstituents();
  auto& table = TheTideEngine().constituents;
  for (auto& c : table) c.used = 1;
  const double N = 1.2, p = 0.4;
  ApplyNodalCorrections(N, p);
  const double uM2 = table[kM2].u, uK2 = table[kK2].u, uO1 = table[kO1].u, uK1 = table[kK1].u;
  CHECK(uM2 == doctest::Approx(NormalizeAngle(-2.14 * std::sin(N) / kDeg)));
  const std::pair<int, double> combined[] = {
      {20, 2 * uM2 - uK2}, {45, uM2 + uK1}, {46, 2 * uM2 - uO1}, {58, 4 * uM2 - uK2}, {64, 3 * uM2}};
  for (const auto& [row, u] : combined) CHECK(table[static_cast<std::size_t>(row)].u == doctest::Approx(NormalizeAngle(u)));
  CHECK(table[kMSf].u == doctest::Approx(-uM2));
  for (int n = 0; n < kConstituentCount; ++n) {
    if (n == kMSf || n == kM1 || n == kL2) continue;  // their rules give signed angles
    CHECK((table[static_cast<std::size_t>(n)].u >= 0.0 && table[static_cast<std::size_t>(n)].u < kTwoPi));
  }
  const double y = std::sin(p) + 0.2 * std::sin(p - N), x = 2 * (std::cos(p) + 0.2 * std::cos(p - N));
  CHECK(table[kM1].u == doctest::Approx(std::atan2(y, x)));
  CHECK(table[kM1].f == doctest::Approx(std::hypot(x, y)));
}

TEST_CASE("Mm, Mf, M1, L2 and M3 are corrected only when the station uses them") {
  OpenFolder folder({Station(10, 10, {{0, 0, 100}, {29, 0, 1000}}), Station(20, 20, kRichStation)});
  const auto& table = TheTideEngine().constituents;
  Predict(Key(10, 10), {2001, 2, 3}, 1.0);
  for (int n : std::initializer_list<int>{kMm, kMf, kM1, kL2, kM3, 52, 56})
    CHECK((table[static_cast<std::size_t>(n)].f == 1.0 && table[static_cast<std::size_t>(n)].u == 0.0));
  // The always-corrected ones are there for derived rows to read.
  for (int n : {kO1, kK1, kJ1, kM2, kK2}) CHECK(table[static_cast<std::size_t>(n)].f != 1.0);

  Predict(Key(20, 20), {2001, 2, 3}, 1.0);
  for (int n : {kMm, kMf, kM1, kL2, kM3}) CHECK(table[static_cast<std::size_t>(n)].f != 1.0);
  CHECK((table[52].f == table[kM2].f && table[56].f == table[kM2].f));
  // The working records carry their constituent's values.
  const TideEngine& e = TheTideEngine();
  for (std::int32_t j = 0; j < e.workingCount; ++j) {
    const auto& w = e.working[static_cast<std::size_t>(j)];
    CHECK((w.f == table[static_cast<std::size_t>(w.number)].f && w.u == table[static_cast<std::size_t>(w.number)].u));
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

TEST_CASE("the day starts at the computer's local standard midnight on any time zone") {
  OpenFolder folder({Station(2903, -269, kRichStation)});
  const StationIndexRecord key = Key(2903, -269);

  SUBCASE("a UTC-5 day equals the UTC heights from 05:00 UT") {
    const CalendarDate date{2004, 3, 10};
    const Day local = Predict(key, date, 1.0, -5 * 3600);
    const Day utc = Predict(key, date, 1.0, 0);
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
  SUBCASE("a UTC+5:30 day starts at 18:30 UT the day before") {
    const Day local = Predict(key, {2010, 8, 1}, 0.5, 5 * 3600 + 1800);
    const Day before = Predict(key, {2010, 7, 31}, 0.5, 0);
    const Day same = Predict(key, {2010, 8, 1}, 0.5, 0);
    for (std::size_t k = 0; k < 49; ++k) {
      const std::size_t i = k + 37;
      const float reference = i < 49 ? before.samples[i] : same.samples[i - 48];
      CHECK(std::fabs(local.samples[k] * 0.01 - reference * 0.01) < 1e-3);
    }
  }
  SUBCASE("dates outside 1970-2037 join on at midnight like any other") {
    const CalendarDate days[][2] = {
        {{1900, 2, 28}, {1900, 3, 1}}, {{1969, 12, 31}, {1970, 1, 1}}, {{2037, 12, 31}, {2038, 1, 1}}};
    for (const auto& [date, next] : days) {
      const Day today = Predict(key, date, 0.5, -3 * 3600);
      const Day tomorrow = Predict(key, next, 0.5, -3 * 3600);
      INFO("year ", date.year);
      CHECK(std::fabs(today.samples.back() - tomorrow.samples.front()) < 0.05f);
      // The one-second-before-1970 instant would put 1900 far from its own day.
      CHECK(std::fabs(today.samples[0] - today.samples[1]) < 100.0f);
    }
  }
}

TEST_CASE("days of more than 32767 points are computed to the end") {
  OpenFolder folder({Station(0, 0, {{0, 0, 500}, {kM2, 900, 1000}})});
  const double step = 0.0007;
  const std::int32_t count = DaySampleCount(step);
  REQUIRE(count == 34287);
  std::vector<float> samples(static_cast<std::size_t>(count), 0.0f);
  StationHeader h;
  SunDay sun;
  const DayPrediction d = PredictDay(Key(0, 0), h, {2000, 1, 1}, step, samples.data(), samples.size(), sun,
                                     FixedOffsetLocalMidnight(0));
  REQUIRE(d.sampleCount == count);
  const TideEngine& e = TheTideEngine();
  const auto& m2 = e.working[1];
  const double speed = e.constituents[kM2].speed;
  for (std::size_t k : {std::size_t{0}, std::size_t{32766}, std::size_t{32767}, std::size_t{32768},
                        static_cast<std::size_t>(count - 1)}) {
    const double expected = 50.0 + 100.0 * m2.f * std::cos(m2.V + k * step * speed + m2.u - m2.g);
    CHECK(samples[k] == doctest::Approx(expected).epsilon(1e-4));
  }
}
