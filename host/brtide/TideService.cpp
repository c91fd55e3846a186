#include "host/brtide/TideService.h"

#include <oleauto.h>

#include <cstdio>

#include "host/brtide/clock_text.h"
#include "host/brtide/wide_text.h"

using Microsoft::WRL::ComPtr;

namespace br::brtide {

namespace {

constexpr wchar_t kDatabaseProgId[] = L"BR_Info.TidesDatabase";

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
  const std::wstring given = WideFromUtf8(folder);
  wchar_t full[MAX_PATH * 4];
  const DWORD length = GetFullPathNameW(given.c_str(), static_cast<DWORD>(sizeof full / sizeof full[0]), full, nullptr);
  const std::wstring path = length > 0 && length < sizeof full / sizeof full[0] ? std::wstring(full, length) : given;
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
  VariantOut list;
  if (Failed(database_->GetPorts(box.latMin, box.lonMin, box.latMax, box.lonMax, &list), "GetPorts", error)) {
    return false;
  }
  const VARIANT& value = list.Get();
  if (V_VT(&value) == VT_EMPTY) return true;
  if (V_VT(&value) != (VT_ARRAY | VT_UNKNOWN) || !V_ARRAY(&value) || SafeArrayGetDim(V_ARRAY(&value)) != 1) {
    error = "GetPorts returned an unexpected value";
    return false;
  }
  SAFEARRAY* array = V_ARRAY(&value);
  LONG lower = 0;
  LONG upper = -1;
  SafeArrayGetLBound(array, 1, &lower);
  SafeArrayGetUBound(array, 1, &upper);
  for (LONG i = lower; i <= upper; ++i) {
    IUnknown* element = nullptr;  // SafeArrayGetElement adds a reference
    if (Failed(SafeArrayGetElement(array, &i, &element), "reading the port list", error)) return false;
    PortRow row;
    const bool ok = ReadPortRow(element, row, error);
    if (element) element->Release();
    if (!ok) return false;
    rows.push_back(row);
  }

  std::vector<Position> stations;
  if (!StationPositions(stations, error)) return false;
  std::vector<Position> found;
  for (const PortRow& row : rows) found.push_back(row.position);
  const std::vector<long> numbers = MatchStationNumbers(stations, found);
  for (std::size_t k = 0; k < rows.size(); ++k) rows[k].number = numbers[k];
  return true;
}

ComPtr<ITidesPort> TideService::Port(long number, std::string& error) {
  ComPtr<ITidesPort> port;
  ComPtr<IUnknown> unknown;
  if (Failed(database_->GetPort(number, &unknown), "GetPort", error)) return port;
  if (!unknown) {
    error = "no station " + std::to_string(number) + " in \"" + folder_ + "\" (stations 0 to " +
            std::to_string(count_ - 1) + ")";
    return port;
  }
  if (FAILED(unknown.As(&port))) error = "GetPort returned an object that is not a TidesPort";
  return port;
}

bool TideService::CalculateDay(ITidesPort& port, const DayRequest& request, DayReport& day, std::string& error) {
  BstrOut name;
  if (Failed(port.get_PortName(&name), "PortName", error)) return false;
  day.name = name.Utf8();
  if (Failed(port.GetPortPos(&day.position.latitude, &day.position.longitude), "GetPortPos", error)) return false;
  day.askedNear = request.nearTo;
  day.computerOffsetMinutes = ComputerStandardOffsetMinutes();

  if (Failed(port.Calculate(request.step, DayCountOfDate(request.date)), "Calculate", error)) return false;
  long count = 0;
  if (Failed(port.get_NumPoints(&count), "NumPoints", error)) return false;
  if (count <= 0) {
    error = "no tide day for station " + std::to_string(day.station) + " \"" + day.name + "\" on " +
            IsoDate(request.date) + " (the station's data or its sun times cannot be had)";
    return false;
  }

  day.heights.assign(static_cast<std::size_t>(count), 0.0);
  for (long k = 0; k < count; ++k) {
    if (Failed(port.get_WavePoint(k, &day.heights[static_cast<std::size_t>(k)]), "WavePoint", error)) return false;
  }
  const HRESULT results[] = {
      port.get_PredictionDate(&day.predictionDate), port.get_Step(&day.step),
      port.get_TimeZone(&day.zone),                 port.get_MaxValueIndex(&day.maxIndex),
      port.get_MinValueIndex(&day.minIndex),        port.get_MaxValue(&day.maxValue),
      port.get_MinValue(&day.minValue),             port.get_BeginTwilight(&day.sun.beginTwilight),
      port.get_SunRise(&day.sun.sunrise),           port.get_SunSet(&day.sun.sunset),
      port.get_EndTwilight(&day.sun.endTwilight),
  };
  for (const HRESULT hr : results) {
    if (Failed(hr, "reading the calculated day", error)) return false;
  }
  if (day.maxIndex < 0 || day.maxIndex >= count || day.minIndex < 0 || day.minIndex >= count) {
    error = "the library gave an extreme outside the day";
    return false;
  }
  return true;
}

}  // namespace br::brtide
