#include "host/brtide/TideService.h"

#include <oleauto.h>

#include <algorithm>
#include <cmath>
#include <cstdio>

#include "host/brtide/clock_text.h"
#include "host/brtide/default_station_folder.h"
#include "host/brtide/wide_text.h"
#include "tides/engine/station_files.h"
#include "tides/engine/station_folder_check.h"

using Microsoft::WRL::ComPtr;

namespace br::brtide {

namespace {

constexpr wchar_t kDatabaseProgId[] = L"BR_Info.TidesDatabase";
constexpr int kMinutesPerDay = 1440;
// A turn is found from the samples around it: the curve reaches this far past each end
// of the span whose high and low waters are wanted.
constexpr int kTurnMarginMinutes = 120;
constexpr double kMinuteStep = 1.0 / 60.0;

std::string Hex(HRESULT hr) {
  char text[16];
  std::snprintf(text, sizeof text, "0x%08lX", static_cast<unsigned long>(hr));
  return text;
}

bool Failed(HRESULT hr, const char* what, std::string& error) {
  if (SUCCEEDED(hr)) return false;
  error = std::string(what) + " failed (" + Hex(hr) + ")";
  return true;
}

std::string Count(long n, const char* noun) { return std::to_string(n) + " " + noun + (n == 1 ? "" : "s"); }

int FloorDiv(int a, int b) { return a >= 0 ? a / b : -((-a + b - 1) / b); }

// Frees a BSTR out-value when it goes out of scope.
class BstrOut {
public:
  ~BstrOut() { SysFreeString(text_); }
  BSTR* operator&() { return &text_; }
  std::string Utf8() const { return Utf8FromWide(text_, SysStringLen(text_)); }

private:
  BSTR text_ = nullptr;
};

// Clears a VARIANT out-value when it goes out of scope.
class VariantOut {
public:
  VariantOut() { VariantInit(&value_); }
  ~VariantOut() { VariantClear(&value_); }
  VARIANT* operator&() { return &value_; }
  const VARIANT& Get() const { return value_; }

private:
  VARIANT value_;
};

bool ReadPortRow(IUnknown* element, PortRow& row, std::string& error) {
  ComPtr<ITidesPort> port;
  if (!element || FAILED(element->QueryInterface(IID_PPV_ARGS(&port)))) {
    error = "the library returned an element that is not a TidesPort";
    return false;
  }
  BstrOut name;
  if (Failed(port->get_PortName(&name), "PortName", error)) return false;
  if (Failed(port->GetPortPos(&row.position.latitude, &row.position.longitude), "GetPortPos", error)) return false;
  row.name = name.Utf8();
  return true;
}

// A whole file; false when it cannot be read (the library then says what is missing).
bool ReadWholeFile(const std::wstring& path, std::vector<std::uint8_t>& bytes) {
  const HANDLE file = CreateFileW(path.c_str(), GENERIC_READ, FILE_SHARE_READ, nullptr, OPEN_EXISTING,
                                  FILE_ATTRIBUTE_NORMAL, nullptr);
  if (file == INVALID_HANDLE_VALUE) return false;
  LARGE_INTEGER size{};
  bool ok = GetFileSizeEx(file, &size) && size.QuadPart < (1LL << 28);
  if (ok) {
    bytes.assign(static_cast<std::size_t>(size.QuadPart), 0);
    DWORD got = 0;
    ok = bytes.empty() || (ReadFile(file, bytes.data(), static_cast<DWORD>(bytes.size()), &got, nullptr) &&
                           got == bytes.size());
  }
  CloseHandle(file);
  return ok;
}

std::wstring FullPath(const std::wstring& path) {
  std::vector<wchar_t> full(32768);
  const DWORD length = GetFullPathNameW(path.c_str(), static_cast<DWORD>(full.size()), full.data(), nullptr);
  return length > 0 && length < full.size() ? std::wstring(full.data(), length) : path;
}

}  // namespace

int ComputerStandardOffsetMinutes() {
  TIME_ZONE_INFORMATION zone = {};
  if (GetTimeZoneInformation(&zone) == TIME_ZONE_ID_INVALID) return 0;
  return -static_cast<int>(zone.Bias + zone.StandardBias);  // universal time = local + bias
}

bool TideService::Create(std::string& error) {
  CLSID clsid;
  if (FAILED(CLSIDFromProgID(kDatabaseProgId, &clsid))) {
    error = "BR_Info.TidesDatabase is not registered (regsvr32 BR_Info.dll)";
    return false;
  }
  const HRESULT hr = CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_PPV_ARGS(&database_));
  return !Failed(hr, "creating BR_Info.TidesDatabase", error);
}

bool TideService::Open(const std::string& folder, std::string& error) {
  std::wstring given = WideFromUtf8(folder);
  if (given.empty()) {
    given = DefaultStationFolder();
    if (given.empty()) {
      error = "no --folder given and no data\\world folder beside brtide or above it";
      return false;
    }
  }
  const std::wstring path = FullPath(given);
  folder_ = Utf8FromWide(path);

  const DWORD attributes = GetFileAttributesW(path.c_str());
  if (attributes == INVALID_FILE_ATTRIBUTES) {
    error = "no folder \"" + folder_ + "\"";
    return false;
  }
  if (!(attributes & FILE_ATTRIBUTE_DIRECTORY)) {
    error = "\"" + folder_ + "\" is a file, not a station folder";
    return false;
  }
  // The check's rules first: a damaged station would give numbers that look right.
  br::tides::StationFolderBytes bytes;
  const std::wstring base = path + L"\\";
  if (ReadWholeFile(base + L"td_num.ntx", bytes.stationIndex) && ReadWholeFile(base + L"td_crd.ntx", bytes.coordinateIndex) &&
      ReadWholeFile(base + L"td_pnt.dat", bytes.stationData)) {
    const std::vector<std::string> problems = br::tides::CheckStationFolder(bytes);
    if (!problems.empty()) {
      const long station = br::tides::ProblemStation(problems.front());
      error = (station >= 0 ? "station " + std::to_string(station) + " of \"" + folder_ + "\" is damaged: "
                            : "\"" + folder_ + "\" is damaged: ") +
              problems.front();
      if (problems.size() > 1) error += " (" + Count(static_cast<long>(problems.size()) - 1, "more problem") + "; tidefiles check lists them)";
      return false;
    }
  }
  BSTR name = SysAllocStringLen(path.data(), static_cast<UINT>(path.size()));
  if (!name) {
    error = "out of memory";
    return false;
  }
  const HRESULT hr = database_->Initialize(name);
  SysFreeString(name);
  if (FAILED(hr)) {
    error = "\"" + folder_ + "\" is not a tide station folder (td_num.ntx, td_crd.ntx and td_pnt.dat, readable)";
    return false;
  }
  return !Failed(database_->get_NumPorts(&count_), "NumPorts", error);
}

bool TideService::StationPositions(std::vector<Position>& positions, std::string& error) {
  positions.assign(static_cast<std::size_t>(count_), Position());
  for (long i = 0; i < count_; ++i) {
    Position& p = positions[static_cast<std::size_t>(i)];
    if (Failed(database_->GetPortInfo(i, &p.latitude, &p.longitude, nullptr), "GetPortInfo", error)) return false;
  }
  return true;
}

bool TideService::PortsInBox(const Box& box, std::vector<PortRow>& rows, std::string& error) {
  rows.clear();
  // The library swaps a west edge east of the east edge: a box across the 180th meridian
  // is asked for as its two halves (the limits lie past +-180, the bounds are strict).
  std::vector<Box> parts = {box};
  if (CrossesDateLine(box)) parts = {{box.latMin, box.lonMin, box.latMax, 181.0}, {box.latMin, -181.0, box.latMax, box.lonMax}};
  std::vector<Position> stations;
  if (!StationPositions(stations, error)) return false;
  for (const Box& part : parts) {
    VariantOut list;
    if (Failed(database_->GetPorts(part.latMin, part.lonMin, part.latMax, part.lonMax, &list), "GetPorts", error)) return false;
    const VARIANT& value = list.Get();
    if (V_VT(&value) == VT_EMPTY) continue;
    if (V_VT(&value) != (VT_ARRAY | VT_UNKNOWN) || !V_ARRAY(&value) || SafeArrayGetDim(V_ARRAY(&value)) != 1) {
      error = "GetPorts returned an unexpected value";
      return false;
    }
    SAFEARRAY* array = V_ARRAY(&value);
    LONG lower = 0;
    LONG upper = -1;
    SafeArrayGetLBound(array, 1, &lower);
    SafeArrayGetUBound(array, 1, &upper);
    std::vector<PortRow> found;
    for (LONG i = lower; i <= upper; ++i) {
      IUnknown* element = nullptr;  // SafeArrayGetElement adds a reference
      if (Failed(SafeArrayGetElement(array, &i, &element), "reading the port list", error)) return false;
      PortRow row;
      const bool ok = ReadPortRow(element, row, error);
      if (element) element->Release();
      if (!ok) return false;
      found.push_back(row);
    }
    std::vector<Position> positions;
    for (const PortRow& row : found) positions.push_back(row.position);
    const std::vector<long> numbers = MatchStationNumbers(stations, positions);
    for (std::size_t k = 0; k < found.size(); ++k) found[k].number = numbers[k];
    rows.insert(rows.end(), found.begin(), found.end());
  }
  std::stable_sort(rows.begin(), rows.end(), [](const PortRow& a, const PortRow& b) { return a.number < b.number; });
  return true;
}

long TideService::ChooseStation(const StationChoice& choice, std::string& error) {
  if (choice.port) {
    if (*choice.port < count_) return *choice.port;
    error = "no station " + std::to_string(*choice.port) + " in \"" + folder_ + "\" (" +
            (count_ > 0 ? "station numbers 0 to " + std::to_string(count_ - 1) : std::string("it has no station")) + ")";
    return -1;
  }
  std::vector<Position> stations;
  if (!StationPositions(stations, error)) return -1;
  const long nearest = NearestStation(stations, *choice.nearTo);
  if (nearest < 0) error = "\"" + folder_ + "\" has no station";
  return nearest;
}

ComPtr<ITidesPort> TideService::Port(long number, std::string& error) {
  ComPtr<ITidesPort> port;
  ComPtr<IUnknown> unknown;
  if (Failed(database_->GetPort(number, &unknown), "GetPort", error)) return port;
  if (!unknown) {
    error = "no station " + std::to_string(number) + " in \"" + folder_ + "\" (station numbers 0 to " +
            std::to_string(count_ - 1) + ")";
    return port;
  }
  if (FAILED(unknown.As(&port))) error = "GetPort returned an object that is not a TidesPort";
  return port;
}

bool TideService::ReadStation(ITidesPort& port, std::string& name, Position& position, std::string& error) {
  BstrOut text;
  if (Failed(port.get_PortName(&text), "PortName", error)) return false;
  name = text.Utf8();
  return !Failed(port.GetPortPos(&position.latitude, &position.longitude), "GetPortPos", error);
}

bool TideService::ReadZone(ITidesPort& port, const br::tides::CalendarDate& date, long& zone, std::string& error) {
  if (Failed(port.Calculate(24.0, DayCountOfDate(date)), "Calculate", error)) return false;
  long count = 0;
  if (Failed(port.get_NumPoints(&count), "NumPoints", error)) return false;
  if (count <= 0) {
    error = "no tide day on " + IsoDate(date) + " (the station's data or its sun times cannot be had)";
    return false;
  }
  return !Failed(port.get_TimeZone(&zone), "TimeZone", error);
}

bool TideService::ReadMinuteCurve(ITidesPort& port, const br::tides::CalendarDate& date, int firstDay, int lastDay,
                                  MinuteCurve& curve, std::string& error) {
  curve = MinuteCurve{};
  curve.firstDay = firstDay;
  for (int d = firstDay; d <= lastDay; ++d) {
    if (Failed(port.Calculate(kMinuteStep, DayCountOfDate(date) + d), "Calculate", error)) return false;
    long count = 0;
    if (Failed(port.get_NumPoints(&count), "NumPoints", error)) return false;
    if (count != kMinutesPerDay + 1) {
      error = "no tide day on " + IsoDate(DateOfDayCount(static_cast<std::int64_t>(DayCountOfDate(date)) + d)) +
              " (the station's data or its sun times cannot be had)";
      return false;
    }
    // Each day's 24:00 is the next day's 00:00: only the last day keeps it.
    const long kept = d == lastDay ? count : count - 1;
    for (long k = 0; k < kept; ++k) {
      double height = 0.0;
      if (Failed(port.get_WavePoint(k, &height), "WavePoint", error)) return false;
      curve.heights.push_back(height);
    }
    SunTimes& sun = curve.sun[d];
    const HRESULT results[] = {port.get_BeginTwilight(&sun.beginTwilight), port.get_SunRise(&sun.sunrise),
                               port.get_SunSet(&sun.sunset), port.get_EndTwilight(&sun.endTwilight)};
    for (const HRESULT hr : results) {
      if (Failed(hr, "reading the sun times", error)) return false;
    }
  }
  return true;
}

bool TideService::CalculateDay(ITidesPort& port, const DayRequest& request, DayReport& day, std::string& error) {
  if (!ReadStation(port, day.name, day.position, error)) return false;
  day.askedNear = request.station.nearTo;
  day.stationTime = request.stationTime;
  const double date = DayCountOfDate(request.date);

  // 1. The day at the asked step, in the port's clock: points, zone, date and sun.
  if (Failed(port.Calculate(request.step, date), "Calculate", error)) return false;
  long count = 0;
  if (Failed(port.get_NumPoints(&count), "NumPoints", error)) return false;
  if (count <= 0) {
    error = "no tide day for station " + std::to_string(day.station) + " \"" + day.name + "\" on " +
            IsoDate(request.date) + " (the station's data or its sun times cannot be had)";
    return false;
  }
  std::vector<double> points(static_cast<std::size_t>(count), 0.0);
  for (long k = 0; k < count; ++k) {
    if (Failed(port.get_WavePoint(k, &points[static_cast<std::size_t>(k)]), "WavePoint", error)) return false;
  }
  const HRESULT results[] = {
      port.get_PredictionDate(&day.predictionDate), port.get_Step(&day.step), port.get_TimeZone(&day.zone),
      port.get_BeginTwilight(&day.sun.beginTwilight), port.get_SunRise(&day.sun.sunrise),
      port.get_SunSet(&day.sun.sunset), port.get_EndTwilight(&day.sun.endTwilight),
  };
  for (const HRESULT hr : results) {
    if (Failed(hr, "reading the calculated day", error)) return false;
  }

  // 2. The clock: the port's (the computer's standard time) or the station's. The
  // station's midnight lies shift minutes after the computer's.
  const int computer = ComputerStandardOffsetMinutes();
  const int station = static_cast<int>(-day.zone * 60);
  day.clockOffsetMinutes = request.stationTime ? station : computer;
  const int shift = request.stationTime ? computer - station : 0;
  const int stepMinutes = static_cast<int>(std::lround(request.step * 60.0));
  const int span = std::max(kMinutesPerDay, request.stationTime ? stepMinutes * static_cast<int>(count - 1) : 0);

  // 3. The curve every minute around the day: high and low waters, and station-time points.
  MinuteCurve curve;
  const int firstDay = FloorDiv(shift - kTurnMarginMinutes, kMinutesPerDay);
  const int lastDay = FloorDiv(shift + span + kTurnMarginMinutes, kMinutesPerDay);
  if (!ReadMinuteCurve(port, request.date, firstDay, lastDay, curve, error)) return false;
  const int start = shift - firstDay * kMinutesPerDay;  // the day's midnight in the curve
  day.tides.clear();
  for (const TideTurn& turn : FindTideTurns(curve.heights, 1.0)) {
    const double minutes = turn.minutes - start;
    if (minutes >= 0.0 && minutes < kMinutesPerDay) day.tides.push_back({minutes, turn.height, turn.high});
  }
  if (request.stationTime) {
    day.heights.clear();
    for (long k = 0; k < count; ++k) day.heights.push_back(curve.heights[static_cast<std::size_t>(start + k * stepMinutes)]);
  } else {
    day.heights = points;
  }

  // 4. The port holds the asked day again, for the outputs that read it.
  if (Failed(port.Calculate(request.step, date), "Calculate", error)) return false;
  return true;
}

bool TideService::CalculateDays(ITidesPort& port, const DaysRequest& request, DaysReport& table, std::string& error) {
  if (!ReadStation(port, table.name, table.position, error)) return false;
  table.askedNear = request.station.nearTo;
  table.stationTime = request.stationTime;
  if (!ReadZone(port, request.from, table.zone, error)) return false;
  const int computer = ComputerStandardOffsetMinutes();
  const int station = static_cast<int>(-table.zone * 60);
  table.clockOffsetMinutes = request.stationTime ? station : computer;
  const int shift = request.stationTime ? computer - station : 0;
  const int days = static_cast<int>(request.days);

  MinuteCurve curve;
  const int firstDay = std::min(0, FloorDiv(shift - kTurnMarginMinutes, kMinutesPerDay));
  const int lastDay = std::max(days - 1, FloorDiv(shift + days * kMinutesPerDay + kTurnMarginMinutes, kMinutesPerDay));
  if (!ReadMinuteCurve(port, request.from, firstDay, lastDay, curve, error)) return false;
  const double from = DayCountOfDate(request.from);
  table.days.assign(static_cast<std::size_t>(days), TableDay());
  for (int d = 0; d < days; ++d) {
    table.days[static_cast<std::size_t>(d)].date = from + d;
    table.days[static_cast<std::size_t>(d)].sun = curve.sun[d];
  }
  const int start = shift - firstDay * kMinutesPerDay;
  for (const TideTurn& turn : FindTideTurns(curve.heights, 1.0)) {
    const double minutes = turn.minutes - start;
    const int d = static_cast<int>(std::floor(minutes / kMinutesPerDay));
    if (d < 0 || d >= days) continue;
    table.days[static_cast<std::size_t>(d)].tides.push_back({minutes - d * kMinutesPerDay, turn.height, turn.high});
  }
  return true;
}

}  // namespace br::brtide
