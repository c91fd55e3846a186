// Times TidesPort::Calculate for 0.1-hour days through COM, early bound (the vtable) and
// late bound (IDispatch::Invoke, as scripts call it), against PredictDay of the engine
// linked here for the same stations and days: microseconds per call and the engine's share.
// Processor time of the thread, best of alternating rounds.
//   port_bench FOLDER [STATIONS (default every station)] [ROUNDS (default 5)]
#include "BR_Info.h"
#include "bench/common/tides_database_opener.h"

#include <windows.h>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <string>
#include <vector>

#include "tides/engine/prediction.h"

namespace {

using Clock = std::chrono::steady_clock;

constexpr double kStep = 0.1;
constexpr double kFirstDay = 45292.0;  // 2024-01-01 as a day-count date
constexpr int kDays = 3;
constexpr DISPID kCalculateId = 3;

int Fail(const char* message) {
  std::fprintf(stderr, "port_bench: %s\n", message);
  return 1;
}

double ThreadSeconds() {
  FILETIME created, exited, kernel, user;
  if (!GetThreadTimes(GetCurrentThread(), &created, &exited, &kernel, &user)) return 0.0;
  const auto ticks = [](const FILETIME& t) {
    return static_cast<double>((static_cast<std::uint64_t>(t.dwHighDateTime) << 32) | t.dwLowDateTime);
  };
  return (ticks(kernel) + ticks(user)) * 1e-7;
}

// One pass over every port and day; a measurement repeats it for at least a quarter second
// of processor time (the thread clock ticks every 10 ms under Wine).
struct Mode {
  const char* name;
  std::function<void()> pass;
  double best = 1e300;
  int repeats = 0;

  void Measure() {
    if (repeats == 0) {
      const auto t0 = Clock::now();
      pass();
      const double wall = std::chrono::duration<double>(Clock::now() - t0).count();
      repeats = std::max(1, static_cast<int>(std::ceil(0.25 / std::max(wall, 1e-6))));
    }
    const double t0 = ThreadSeconds();
    for (int r = 0; r < repeats; ++r) pass();
    best = std::min(best, (ThreadSeconds() - t0) / repeats);
  }
};

int Run(const wchar_t* folder, int wanted, int rounds) {
  const char* failure = "";
  ITidesDatabase* database = br::bench::OpenTidesDatabase(folder, failure);
  if (!database) return Fail(failure);
  long stations = 0;
  if (FAILED(database->get_NumPorts(&stations)) || stations < 1) {
    return Fail("the folder holds no station");
  }

  // The ports, spread over the folder, and the same stations for the engine.
  const long count = wanted > 0 ? std::min<long>(wanted, stations) : stations;
  std::vector<ITidesPort*> ports;
  std::vector<br::tides::StationIndexRecord> keys;
  std::string narrow(folder, folder + wcslen(folder));
  if (br::tides::OpenTideFiles(narrow.c_str()) != 0) return Fail("the engine cannot open the folder");
  for (long i = 0; i < count; ++i) {
    const long index = static_cast<long>(static_cast<long long>(i) * stations / count);
    IUnknown* unknown = nullptr;
    ITidesPort* port = nullptr;
    br::tides::StationIndexRecord key;
    if (FAILED(database->GetPort(index, &unknown)) || !unknown ||
        FAILED(unknown->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port))) ||
        !br::tides::ReadStationIndexRecord(index, key)) {
      return Fail("a port cannot be had");
    }
    unknown->Release();
    ports.push_back(port);
    keys.push_back(key);
  }

  TIME_ZONE_INFORMATION zone = {};
  LONG bias = 0;
  if (GetTimeZoneInformation(&zone) != TIME_ZONE_ID_INVALID) bias = zone.Bias + zone.StandardBias;
  const br::tides::LocalMidnightFunction midnight = br::tides::FixedOffsetLocalMidnight(-60 * bias);
  std::vector<float> samples(static_cast<std::size_t>(br::tides::DaySampleCount(kStep)));
  long points = 0;
  double sink = 0.0;

  std::vector<Mode> modes = {
      {"Calculate, early bound",
       [&] {
         for (int d = 0; d < kDays; ++d) {
           for (ITidesPort* p : ports) p->Calculate(kStep, kFirstDay + d);
         }
       }},
      {"Calculate, late bound (Invoke)",
       [&] {
         for (int d = 0; d < kDays; ++d) {
           for (ITidesPort* p : ports) {
             VARIANTARG args[2];  // in reverse order: PredictDate, Step
             VariantInit(&args[0]);
             VariantInit(&args[1]);
             args[0].vt = VT_R8;
             args[0].dblVal = kFirstDay + d;
             args[1].vt = VT_R8;
             args[1].dblVal = kStep;
             DISPPARAMS params = {args, nullptr, 2, 0};
             p->Invoke(kCalculateId, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &params, nullptr, nullptr,
                       nullptr);
           }
         }
       }},
      {"engine PredictDay",
       [&] {
         br::tides::StationHeader header;
         br::tides::SunDay sun;
         for (int d = 0; d < kDays; ++d) {
           const br::tides::CalendarDate date{2024, 1, static_cast<std::uint8_t>(1 + d)};
           for (const br::tides::StationIndexRecord& key : keys) {
             br::tides::PredictDay(key, header, date, kStep, samples.data(), samples.size(), sun, midnight);
             sink += samples[0];
           }
         }
       }},
  };
  for (int r = 0; r < rounds; ++r) {
    for (std::size_t m = 0; m < modes.size(); ++m) modes[r % 2 == 0 ? m : modes.size() - 1 - m].Measure();
  }
  ports.front()->get_NumPoints(&points);

  const double calls = static_cast<double>(ports.size()) * kDays;
  std::printf("%zu ports, %d days each, step %.1f h (%ld points); processor time, best of %d rounds\n",
              ports.size(), kDays, kStep, points, rounds);
  const double engine = modes[2].best / calls * 1e6;
  for (const Mode& m : modes) {
    const double us = m.best / calls * 1e6;
    std::printf("  %-32s %8.2f us per call  (engine share %3.0f%%)\n", m.name, us, 100.0 * engine / us);
  }
  std::printf("(checksum %.6g)\n", sink);
  for (ITidesPort* p : ports) p->Release();
  database->Release();
  br::tides::CloseTideFiles();
  return 0;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  if (argc < 2) return Fail("usage: port_bench FOLDER [STATIONS] [ROUNDS]");
  const int stations = argc > 2 ? _wtoi(argv[2]) : 0;
  const int rounds = argc > 3 ? std::max(1, _wtoi(argv[3])) : 5;
  if (FAILED(CoInitialize(nullptr))) return Fail("COM cannot start");
  const int status = Run(argv[1], stations, rounds);
  CoUninitialize();
  return status;
}
