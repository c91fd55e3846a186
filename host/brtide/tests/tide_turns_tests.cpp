// High and low waters from the 1-minute curve, against the engine's own curve sampled
// every 10 seconds over world stations of every kind of tide.
#include <doctest/doctest.h>

#include <cmath>
#include <cstdlib>
#include <string>
#include <vector>

#include "host/brtide/tests/sampled_turns.h"
#include "host/brtide/tide_turns.h"
#include "tides/engine/prediction.h"

using namespace br::brtide;
using br::brtide::test::SampledTurn;
using br::brtide::test::SampledTurns;
namespace bt = br::tides;

namespace {

// A day of the station at key in metres, from 00:00 UT at a step of stepMinutes.
std::vector<double> Day(const bt::StationIndexRecord& key, bt::CalendarDate date, double stepMinutes) {
  const double step = stepMinutes / 60.0;
  std::vector<float> samples(static_cast<std::size_t>(bt::DaySampleCount(step)));
  bt::StationHeader header;
  bt::SunDay sun;
  const bt::DayPrediction day =
      bt::PredictDay(key, header, date, step, samples.data(), samples.size(), sun, bt::FixedOffsetLocalMidnight(0));
  REQUIRE(day.stationFound);
  std::vector<double> metres;
  for (float s : samples) metres.push_back(s * 0.01);  // the engine's unit is the centimetre
  return metres;
}

}  // namespace

TEST_CASE("turns of made-up curves: placed between samples, flat runs, rounding noise and the ends") {
  // 2 + cos of a 12.4-hour wave sampled every minute: highs at 0 and 744 minutes, a low at 372.
  std::vector<double> wave;
  for (int m = -30; m <= 800; ++m) wave.push_back(2.0 + std::cos(2.0 * 3.14159265358979 * m / 744.0));
  const std::vector<TideTurn> turns = FindTideTurns(wave, 1.0);
  REQUIRE(turns.size() == 3);
  CHECK((turns[0].high && !turns[1].high && turns[2].high));
  CHECK(turns[0].minutes == doctest::Approx(30.0).epsilon(1e-4));
  CHECK(turns[1].minutes == doctest::Approx(30.0 + 372.0).epsilon(1e-4));
  CHECK(turns[1].height == doctest::Approx(1.0).epsilon(1e-6));

  // A flat top turns in its middle; a wiggle of 0.2 mm on the way down is no turn; a curve
  // that only falls has none, not even at its ends.
  CHECK(FindTideTurns({1.0, 2.0, 3.0, 3.0, 3.0, 3.0, 2.0}, 10.0).front().minutes == doctest::Approx(35.0));
  const std::vector<TideTurn> one = FindTideTurns({1.0, 2.0, 3.0, 2.5, 2.0, 2.0002, 1.9, 1.0}, 1.0);
  REQUIRE(one.size() == 1);
  // The parabola through 2, 3, 2.5: its vertex a sixth of a step after the sample.
  CHECK((one[0].high && one[0].minutes == doctest::Approx(2.0 + 1.0 / 6.0) && one[0].height == doctest::Approx(3.0 + 1.0 / 48.0)));
  CHECK(FindTideTurns({5.0, 4.0, 3.0, 2.0}, 1.0).empty());
}

TEST_CASE("world stations: every high and low water within a minute and a centimetre of the 10-second curve") {
  const char* root = std::getenv("BR_SOURCE_DIR");
  REQUIRE(root != nullptr);
  REQUIRE(bt::OpenTideFiles((std::string(root) + "/data/world").c_str()) == 0);
  const bt::CalendarDate dates[] = {{2026, 3, 19}, {2026, 6, 21}};
  double worstMinutes = 0.0, worstMetres = 0.0;
  int compared = 0, stations = 0;
  for (std::int32_t station = 0; station < bt::StationCount(); station += 61) {
    bt::StationIndexRecord key;
    REQUIRE(bt::ReadStationIndexRecord(station, key));
    ++stations;
    for (const bt::CalendarDate& date : dates) {
      // The day with its neighbours every minute, as brtide reads it from a port.
      std::vector<double> minutes;
      for (int d = -1; d <= 1; ++d) {
        bt::CalendarDate day = date;
        day.day = static_cast<std::uint8_t>(day.day + d);
        std::vector<double> part = Day(key, day, 1.0);
        if (d < 1) part.pop_back();  // 24:00 is the next day's 00:00
        minutes.insert(minutes.end(), part.begin(), part.end());
      }
      std::vector<TideTurn> found;
      for (const TideTurn& t : FindTideTurns(minutes, 1.0))
        if (t.minutes >= 1440.0 && t.minutes < 2880.0) found.push_back({t.minutes - 1440.0, t.height, t.high});

      // The reference: the day every 10 seconds. Each of its turns has one of those found
      // within a minute, and each found has one of its; near the day's ends a turn may
      // belong to the day before or after.
      const std::vector<SampledTurn> reference = SampledTurns(Day(key, date, 10.0 / 60.0), 10.0 / 60.0);
      CAPTURE(station);
      for (const SampledTurn& r : reference) {
        if (r.minutes < 2.0 || r.minutes > 1438.0) continue;
        const TideTurn* match = nullptr;
        for (const TideTurn& t : found)
          if (t.high == r.high && (!match || std::fabs(t.minutes - r.minutes) < std::fabs(match->minutes - r.minutes))) match = &t;
        CAPTURE(r.minutes);
        REQUIRE(match != nullptr);
        CHECK(std::fabs(match->minutes - r.minutes) <= 1.0);
        CHECK(std::fabs(match->height - r.height) <= 0.01);
        worstMinutes = std::max(worstMinutes, std::fabs(match->minutes - r.minutes));
        worstMetres = std::max(worstMetres, std::fabs(match->height - r.height));
        ++compared;
      }
      for (const TideTurn& t : found) {
        if (t.minutes < 3.0 || t.minutes > 1437.0) continue;
        bool matched = false;
        for (const SampledTurn& r : reference) matched = matched || (r.high == t.high && std::fabs(r.minutes - t.minutes) <= 1.0);
        CAPTURE(t.minutes);
        CHECK(matched);
      }
    }
  }
  bt::CloseTideFiles();
  MESSAGE(compared << " high and low waters at " << stations << " stations; largest differences " << worstMinutes * 60.0
                   << " s and " << worstMetres * 1000.0 << " mm");
  CHECK(compared > 300);
}
