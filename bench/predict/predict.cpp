// Tide prediction benchmark: microseconds per station-day over a whole station folder (three
// days of every station) at steps of 0.1 h and 1 h, for the day's set-up (station read, sun
// events, arguments and nodal corrections), the sum with one cosine per term and sample
// (SumSeriesByCosine) and the turned sum (SumSeries, what PredictDay runs), against a memory
// floor: the same number of multiply-adds over the same arrays, with nothing else. Every
// measurement is the thread's processor time, the best of several rounds, the modes taken in
// alternating order.
//
// Build natively without sanitizers, in a tree of its own:
//   cmake -S . -B build/bench -G Ninja -DCMAKE_BUILD_TYPE=Release -DBR_SANITIZE=OFF
//   cmake --build build/bench --target predict && build/bench/bench/predict/predict [folder] [rounds]
// Under Wine (the Windows build of the same code):
//   WINEPREFIX=<dir>/wineprefix wine <dir>/win64/bench/predict/predict.exe <windows path>
// The folder defaults to data/world; when it cannot be opened a synthetic folder of 3000
// stations is written to a temporary folder and used instead. bench/predict/compare-neaps
// runs this and the same days in neaps (node) side by side.
#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <random>
#include <string>
#include <vector>

#include "tides/engine/prediction.h"

#ifdef _WIN32
#include <windows.h>
#else
#include <time.h>
#endif

using namespace br::tides;
namespace fs = std::filesystem;

namespace {

using Clock = std::chrono::steady_clock;

constexpr int kDays = 3;

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

// Everything one step's measurements run over.
struct Workload {
  std::vector<StationIndexRecord> keys;
  std::vector<StationHeader> headers;
  std::vector<HarmonicSeries> series;  // [day * stations + station], for the sums alone
  LocalMidnightFunction midnight = FixedOffsetLocalMidnight(0);
  double step = 0.1;
  std::int32_t count = 0;
  std::vector<float> samples, reference;
  std::vector<double> wave;  // the floor's stand-in for a term's values
  double sink = 0.0;         // keeps every result alive
  std::int64_t resummed = 0;
};

// The modes, each one pass over every station-day; seconds per pass are kept per mode.
struct Mode {
  const char* name;
  std::function<void(Workload&)> pass;
  double best = 1e300;
  int repeats = 0;  // passes per measurement, set by the first
};

void SetUpOnly(Workload& w) {
  StationHeader header;
  SunDay sun;
  for (int day = 0; day < kDays; ++day) {
    const CalendarDate date = DateOfRun(day);
    for (const StationIndexRecord& key : w.keys) {
      PredictDay(key, header, date, w.step, nullptr, 0, sun, w.midnight);
      w.sink += sun.zoneHours[kSunrise];
    }
  }
}

void StationReads(Workload& w) {
  StationHeader header;
  for (int day = 0; day < kDays; ++day) {
    for (const StationIndexRecord& key : w.keys) {
      FindStation(key, header);
      w.sink += header.zone;
    }
  }
}

void SunEvents(Workload& w) {
  for (int day = 0; day < kDays; ++day) {
    const CalendarDate date = DateOfRun(day);
    for (const StationHeader& h : w.headers) {
      w.sink += ComputeSunDay(date, h.latitude / 60.0, h.longitude / 60.0, h.zone).zoneHours[kSunset];
    }
  }
}

void CosineDays(Workload& w) {
  StationHeader header;
  SunDay sun;
  for (int day = 0; day < kDays; ++day) {
    const CalendarDate date = DateOfRun(day);
    for (const StationIndexRecord& key : w.keys) {
      PredictDay(key, header, date, w.step, nullptr, 0, sun, w.midnight);
      SumSeriesByCosine(DaySeries(w.step), w.samples.data(), w.count);
      w.sink += w.samples[0];
    }
  }
}

void TurnedDays(Workload& w) {
  StationHeader header;
  SunDay sun;
  for (int day = 0; day < kDays; ++day) {
    const CalendarDate date = DateOfRun(day);
    for (const StationIndexRecord& key : w.keys) {
      PredictDay(key, header, date, w.step, w.samples.data(), w.samples.size(), sun, w.midnight);
      w.sink += w.samples[0];
    }
  }
}

void TurnedSums(Workload& w) {
  for (const HarmonicSeries& s : w.series) {
    SumSeries(s, w.samples.data(), w.count);
    w.sink += w.samples[0];
  }
}

// One multiply-add per term and sample into the 32-bit sums, over the series' amplitudes
// and a sample-long array: what any loop that touches every term at every sample must do.
void MemoryFloor(Workload& w) {
  const std::size_t count = static_cast<std::size_t>(w.count);
  for (const HarmonicSeries& s : w.series) {
    float* out = w.samples.data();
    std::fill(out, out + count, 0.0f);
    for (std::size_t j = 0; j < static_cast<std::size_t>(s.terms); ++j) {
      const double a = s.amplitude[j];
      for (std::size_t k = 0; k < count; ++k) out[k] = static_cast<float>(out[k] + a * w.wave[k]);
    }
    w.sink += out[0];
  }
}

// The largest height difference between the turned and the cosine sums (published unit,
// metres for the world set) over every station-day of the workload.
double LargestDifference(Workload& w, std::int64_t& samples) {
  double largest = 0.0;
  for (const HarmonicSeries& s : w.series) {
    w.resummed += SumSeries(s, w.samples.data(), w.count);
    SumSeriesByCosine(s, w.reference.data(), w.count);
    for (std::int32_t k = 0; k < w.count; ++k) {
      largest = std::max(largest, std::fabs(w.samples[k] * 0.01 - w.reference[k] * 0.01));
    }
    samples += w.count;
  }
  return largest;
}

// The thread's processor time: on a machine shared with other work, wall time counts the
// waits for a processor too. Windows counts it in clock ticks (10 ms under Wine), so every
// measurement repeats its pass for at least kLeastSeconds.
double ThreadSeconds() {
#ifdef _WIN32
  FILETIME created, exited, kernel, user;
  if (!GetThreadTimes(GetCurrentThread(), &created, &exited, &kernel, &user)) return 0.0;
  const auto ticks = [](const FILETIME& t) {
    return static_cast<double>((static_cast<std::uint64_t>(t.dwHighDateTime) << 32) | t.dwLowDateTime);
  };
  return (ticks(kernel) + ticks(user)) * 1e-7;
#else
  timespec t{};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &t);
  return static_cast<double>(t.tv_sec) + 1e-9 * static_cast<double>(t.tv_nsec);
#endif
}

constexpr double kLeastSeconds = 0.25;

// Seconds of one pass, the pass repeated as often as the mode's first wall-clock run says.
double Seconds(Mode& mode, Workload& w) {
  if (mode.repeats == 0) {
    const auto t0 = Clock::now();
    mode.pass(w);
    const double wall = std::chrono::duration<double>(Clock::now() - t0).count();
    mode.repeats = std::max(1, static_cast<int>(std::ceil(kLeastSeconds / std::max(wall, 1e-6))));
  }
  const double t0 = ThreadSeconds();
  for (int r = 0; r < mode.repeats; ++r) mode.pass(w);
  return (ThreadSeconds() - t0) / mode.repeats;
}

}  // namespace

int main(int argc, char** argv) {
  std::string folder = argc > 1 ? argv[1] : "data/world";
  const int rounds = argc > 2 ? std::max(1, std::atoi(argv[2])) : 5;
  if (OpenTideFiles(folder.c_str()) != 0 || StationCount() == 0) {
    std::printf("predict: cannot open %s; using a synthetic folder\n", folder.c_str());
    folder = WriteSyntheticFolder().string();
    if (OpenTideFiles(folder.c_str()) != 0) {
      std::printf("predict: cannot open %s\n", folder.c_str());
      return 1;
    }
  }

  Workload w;
  const std::int32_t stations = StationCount();
  std::size_t terms = 0;
  for (std::int32_t i = 0; i < stations; ++i) {
    StationIndexRecord key;
    StationHeader header;
    if (!ReadStationIndexRecord(i, key) || !FindStation(key, header)) continue;
    w.keys.push_back(key);
    w.headers.push_back(header);
    terms += static_cast<std::size_t>(TheTideEngine().workingCount);
  }
  if (w.keys.empty()) {
    std::printf("predict: no station of %s can be loaded\n", folder.c_str());
    return 1;
  }
  const double stationDays = static_cast<double>(w.keys.size()) * kDays;
  std::printf("folder %s: %zu stations, %.1f terms per station, %d days each; processor time, best of %d rounds\n",
              folder.c_str(), w.keys.size(), static_cast<double>(terms) / w.keys.size(), kDays, rounds);

  const double steps[] = {0.1, 1.0};
  std::vector<Mode> results[2];
  double largest = 0.0;
  std::int64_t compared = 0;
  double resummedPerDay[2] = {};
  for (int s = 0; s < 2; ++s) {
    w.step = steps[s];
    w.count = DaySampleCount(w.step);
    w.samples.assign(static_cast<std::size_t>(w.count), 0.0f);
    w.reference.assign(static_cast<std::size_t>(w.count), 0.0f);
    w.wave.resize(static_cast<std::size_t>(w.count));
    for (std::size_t k = 0; k < w.wave.size(); ++k) w.wave[k] = std::cos(0.05 * static_cast<double>(k));
    w.series.clear();
    StationHeader header;
    SunDay sun;
    for (int day = 0; day < kDays; ++day) {
      for (const StationIndexRecord& key : w.keys) {
        PredictDay(key, header, DateOfRun(day), w.step, nullptr, 0, sun, w.midnight);
        w.series.push_back(DaySeries(w.step));
      }
    }
    w.resummed = 0;
    largest = std::max(largest, LargestDifference(w, compared));
    resummedPerDay[s] = static_cast<double>(w.resummed) / stationDays;

    std::vector<Mode>& modes = results[s];
    modes = {{"set-up", SetUpOnly},        {"station read", StationReads}, {"sun events", SunEvents},
             {"cosine days", CosineDays},  {"turned days", TurnedDays},    {"turned sums", TurnedSums},
             {"memory floor", MemoryFloor}};
    for (int r = 0; r < rounds; ++r) {
      for (std::size_t m = 0; m < modes.size(); ++m) {
        Mode& mode = modes[r % 2 == 0 ? m : modes.size() - 1 - m];
        mode.best = std::min(mode.best, Seconds(mode, w));
      }
    }
  }

  const auto us = [&](int s, int m) { return results[s][static_cast<std::size_t>(m)].best / stationDays * 1e6; };
  enum { kSetUp, kRead, kSun, kCosine, kTurned, kTurnedSums, kFloor };
  std::printf("\nmicroseconds per station-day          step 0.1 h   step 1 h\n");
  std::printf("  (samples per day)                    %10d %10d\n", DaySampleCount(0.1), DaySampleCount(1.0));
  const auto row = [&](const char* label, double a, double b) { std::printf("  %-36s %10.2f %10.2f\n", label, a, b); };
  row("day, per-sample cosine loop", us(0, kCosine), us(1, kCosine));
  row("day, turned loop (PredictDay)", us(0, kTurned), us(1, kTurned));
  row("  set-up", us(0, kSetUp), us(1, kSetUp));
  row("    station read", us(0, kRead), us(1, kRead));
  row("    sun events", us(0, kSun), us(1, kSun));
  row("    arguments, nodal corrections", us(0, kSetUp) - us(0, kRead) - us(0, kSun),
      us(1, kSetUp) - us(1, kRead) - us(1, kSun));
  row("  sums, per-sample cosine", us(0, kCosine) - us(0, kSetUp), us(1, kCosine) - us(1, kSetUp));
  row("  sums, turned", us(0, kTurnedSums), us(1, kTurnedSums));
  row("  memory floor (same multiply-adds)", us(0, kFloor), us(1, kFloor));
  row("set-up share of the turned day", us(0, kSetUp) / us(0, kTurned), us(1, kSetUp) / us(1, kTurned));
  row("turned sums / memory floor", us(0, kTurnedSums) / us(0, kFloor), us(1, kTurnedSums) / us(1, kFloor));
  row("cosine day / turned day", us(0, kCosine) / us(0, kTurned), us(1, kCosine) / us(1, kTurned));
  row("stretches resummed with the cosine", resummedPerDay[0], resummedPerDay[1]);
  std::printf("turned against cosine sums: largest height difference %.3g over %lld samples\n", largest,
              static_cast<long long>(compared));
  std::printf("(checksum %.6g)\n", w.sink);
  CloseTideFiles();
  return 0;
}
