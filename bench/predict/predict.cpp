// Tide prediction benchmark: days per second over a whole station folder at steps of 0.1 h
// and 1 h, against a floor loop that evaluates only the same cosines and additions.
//
// Build natively without sanitizers, in a tree of its own:
//   cmake -S . -B build-bench -G Ninja -DCMAKE_BUILD_TYPE=Release -DBR_SANITIZE=OFF
//   cmake --build build-bench --target predict && build-bench/bench/predict/predict [folder]
// Under Wine (the Windows build of the same code):
//   WINEPREFIX=<dir>/wineprefix wine <dir>/win64/bench/predict/predict.exe <windows path>
// The folder defaults to data/world; when it cannot be opened a synthetic folder of 3000
// stations is written to a temporary folder and used instead.
#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <random>
#include <string>
#include <vector>

#include "tides/engine/prediction.h"

using namespace br::tides;
namespace fs = std::filesystem;

namespace {

using Clock = std::chrono::steady_clock;

double Seconds(Clock::duration d) { return std::chrono::duration<double>(d).count(); }

void AppendBytes(std::vector<std::uint8_t>& out, const std::uint8_t* b, std::size_t n) { out.insert(out.end(), b, b + n); }

bool WriteFile(const fs::path& path, const std::vector<std::uint8_t>& bytes) {
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  return static_cast<bool>(out);
}

// A folder of stations shaped like a real harmonic set: the mean level and 36 constituents.
fs::path WriteSyntheticFolder() {
  const fs::path folder = fs::temp_directory_path() / "br_predict_bench";
  fs::create_directories(folder);
  std::mt19937 rng(12345u);
  std::uniform_int_distribution<int> phase(0, 3599), amplitude(0, 2000), number(1, 68);
  std::vector<std::uint8_t> data, numbers;
  std::vector<StationIndexRecord> index;
  for (int i = 0; i < 3000; ++i) {
    StationIndexRecord r;
    r.station = static_cast<std::uint16_t>(i);
    r.latitude = static_cast<std::int16_t>(-4000 + (i * 37) % 8000);
    r.longitude = static_cast<std::int16_t>(-10000 + (i * 61) % 20000);
    r.offset = static_cast<std::uint32_t>(data.size());
    index.push_back(r);
    StationHeader h;
    SetStationName(h, "Synthetic " + std::to_string(i));
    h.latitude = r.latitude;
    h.longitude = r.longitude;
    h.zone = static_cast<std::int8_t>(-(r.longitude / 900));
    h.constituentCount = 37;
    const auto hb = EncodeStationHeader(h);
    AppendBytes(data, hb.data(), hb.size());
    for (int j = 0; j < 37; ++j) {
      ConstituentRecord c{static_cast<std::int16_t>(j == 0 ? 0 : number(rng)), static_cast<std::uint16_t>(phase(rng)),
                          static_cast<std::uint16_t>(amplitude(rng))};
      const auto cb = EncodeConstituentRecord(c);
      AppendBytes(data, cb.data(), cb.size());
    }
    const auto ib = EncodeStationIndexRecord(r);
    AppendBytes(numbers, ib.data(), ib.size());
  }
  std::sort(index.begin(), index.end(),
            [](const StationIndexRecord& a, const StationIndexRecord& b) { return StationKey(a) < StationKey(b); });
  std::vector<std::uint8_t> coordinates;
  for (const StationIndexRecord& r : index) {
    const auto ib = EncodeStationIndexRecord(r);
    AppendBytes(coordinates, ib.data(), ib.size());
  }
  WriteFile(folder / kStationIndexFileName, numbers);
  WriteFile(folder / kCoordinateIndexFileName, coordinates);
  WriteFile(folder / kStationDataFileName, data);
  return folder;
}

struct FloorTerm {
  double phase, advance;  // advance: per hour in the table, per step in the loop
};
using StationTerms = std::vector<FloorTerm>;  // the same number of terms the engine sums

CalendarDate DateOfRun(int day) {
  static const std::int64_t start = DaysFromCivil({2024, 1, 1});
  // Walk the days through the calendar arithmetic: day counts back to year, month, day.
  std::int64_t z = start + day + 719468;
  const std::int64_t era = (z >= 0 ? z : z - 146096) / 146097;
  const std::int64_t doe = z - era * 146097;
  const std::int64_t yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
  const std::int64_t doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
  const std::int64_t mp = (5 * doy + 2) / 153;
  const std::int64_t d = doy - (153 * mp + 2) / 5 + 1;
  const std::int64_t m = mp < 10 ? mp + 3 : mp - 9;
  const std::int64_t y = yoe + era * 400 + (m <= 2 ? 1 : 0);
  return CalendarDate{static_cast<std::int16_t>(y), static_cast<std::uint8_t>(m), static_cast<std::uint8_t>(d)};
}

struct RunResult {
  double seconds = 0.0;
  double cosines = 0.0;
  double checksum = 0.0;
};

RunResult RunEngine(const std::vector<StationIndexRecord>& keys, double step, int days, std::vector<float>& samples,
                    const LocalMidnightFunction& midnight) {
  RunResult r;
  StationHeader header;
  SunDay sun;
  const auto t0 = Clock::now();
  for (int day = 0; day < days; ++day) {
    const CalendarDate date = DateOfRun(day);
    for (const StationIndexRecord& key : keys) {
      const DayPrediction d = PredictDay(key, header, date, step, samples.data(), samples.size(), sun, midnight);
      r.cosines += static_cast<double>(d.sampleCount) * TheTideEngine().workingCount;
      r.checksum += samples[0];
    }
  }
  r.seconds = Seconds(Clock::now() - t0);
  return r;
}

// The same count of cosines and additions, and nothing else.
RunResult RunFloor(const std::vector<StationTerms>& stations, double step, int days, std::vector<float>& samples) {
  const std::int32_t count = DaySampleCount(step);
  RunResult r;
  const auto t0 = Clock::now();
  for (int day = 0; day < days; ++day) {
    for (const StationTerms& s : stations) {
      const std::size_t n = s.size();
      FloorTerm day[kConstituentCount];
      for (std::size_t j = 0; j < n; ++j) day[j] = {s[j].phase, s[j].advance * step};
      for (std::int32_t k = 0; k < count; ++k) {
        double sum = 0.0;
        for (std::size_t j = 0; j < n; ++j) {
          sum += std::cos(day[j].phase);
          day[j].phase += day[j].advance;
        }
        samples[static_cast<std::size_t>(k)] = static_cast<float>(sum);
      }
      r.cosines += static_cast<double>(count) * static_cast<double>(n);
      r.checksum += samples[0];
    }
  }
  r.seconds = Seconds(Clock::now() - t0);
  return r;
}

}  // namespace

int main(int argc, char** argv) {
  std::string folder = argc > 1 ? argv[1] : "data/world";
  if (OpenTideFiles(folder.c_str()) != 0 || StationCount() == 0) {
    std::printf("predict: cannot open %s; using a synthetic folder\n", folder.c_str());
    folder = WriteSyntheticFolder().string();
    if (OpenTideFiles(folder.c_str()) != 0) {
      std::printf("predict: cannot open %s\n", folder.c_str());
      return 1;
    }
  }
  const LocalMidnightFunction midnight = FixedOffsetLocalMidnight(0);

  // Stations the engine can load, and the terms of each for the floor loop.
  std::vector<StationIndexRecord> keys;
  std::vector<StationTerms> terms;
  std::size_t totalTerms = 0;
  const std::int32_t stations = StationCount();
  for (std::int32_t i = 0; i < stations; ++i) {
    StationIndexRecord key;
    StationHeader header;
    if (!ReadStationIndexRecord(i, key) || !FindStation(key, header)) continue;
    keys.push_back(key);
    StationTerms t;
    const TideEngine& e = TheTideEngine();
    for (std::int32_t j = 0; j < e.workingCount; ++j) {
      const StationConstituent& w = e.working[static_cast<std::size_t>(j)];
      t.push_back({w.g, e.constituents[static_cast<std::size_t>(w.number)].speed});
    }
    totalTerms += t.size();
    terms.push_back(std::move(t));
  }
  if (keys.empty()) {
    std::printf("predict: no station of %s can be loaded\n", folder.c_str());
    return 1;
  }
  std::printf("folder %s: %zu stations, %.1f terms per station\n", folder.c_str(), keys.size(),
              static_cast<double>(totalTerms) / keys.size());

  std::vector<float> samples(static_cast<std::size_t>(DaySampleCount(0.1)));
  for (double step : {0.1, 1.0}) {
    const std::int32_t count = DaySampleCount(step);
    // Aim at about a second per measurement; at least one day of every station.
    const double perDay = static_cast<double>(totalTerms) * count * 12e-9;
    const int days = std::max(1, static_cast<int>(1.0 / std::max(perDay, 1e-9)));
    RunEngine(keys, step, 1, samples, midnight);  // warm the file cache
    const RunResult engine = RunEngine(keys, step, days, samples, midnight);
    const RunResult floor = RunFloor(terms, step, days, samples);
    const double stationDays = static_cast<double>(days) * keys.size();
    std::printf("step %.1f h: %d samples, %.0f station-days\n", step, count, stationDays);
    std::printf("  engine %12.0f days/s  %7.2f ns per term\n", stationDays / engine.seconds,
                engine.seconds / engine.cosines * 1e9);
    std::printf("  floor  %12.0f days/s  %7.2f ns per term\n", stationDays / floor.seconds,
                floor.seconds / floor.cosines * 1e9);
    std::printf("  engine / floor time: %.2f  (checksums %.3g %.3g)\n", engine.seconds / floor.seconds,
                engine.checksum, floor.checksum);
  }

  // One 0.1-hour day per station, best of three; the median over stations.
  std::vector<double> perStation;
  StationHeader header;
  SunDay sun;
  for (const StationIndexRecord& key : keys) {
    double best = 1e9;
    for (int rep = 0; rep < 3; ++rep) {
      const auto t0 = Clock::now();
      PredictDay(key, header, {2024, 6, 15}, 0.1, samples.data(), samples.size(), sun, midnight);
      best = std::min(best, Seconds(Clock::now() - t0));
    }
    perStation.push_back(best);
  }
  std::nth_element(perStation.begin(), perStation.begin() + perStation.size() / 2, perStation.end());
  std::printf("median station: %.1f us per 0.1-hour day\n", perStation[perStation.size() / 2] * 1e6);
  CloseTideFiles();
  return 0;
}
