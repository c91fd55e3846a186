#include "tides/objects/TidesDatabase.h"

#include "frame/com/bstr_text.h"
#include "frame/com/ClassFactory.h"
#include "tides/engine/station_files.h"
#include "tides/objects/TidesPort.h"

#include <string>
#include <utility>
#include <vector>

namespace br::tides {

const br::com::ClassIdentity TidesDatabase::kClass = {&CLSID_TidesDatabase, &IID_ITidesDatabase,
                                                      &DIID__ITidesDatabaseEvents, L"TidesDatabase"};

const TidesDatabase::Entry TidesDatabase::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_ITidesDatabase, Self},
    {&IID_IDispatch, Self},
    {&IID_IConnectionPointContainer, ConnectionPoints},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {nullptr, nullptr},
};

namespace {

constexpr double kDegreesPerMinute = 0.016666666666666666;

// The station files are opened once per process, by the first successful Initialize;
// every TidesDatabase then sees that folder.
bool gFilesOpen = false;

bool InRange(long index) { return index >= 0 && index < StationCount(); }

// Name of the station at a position, or an empty text when the coordinate index has none.
std::wstring StationNameAt(std::int16_t latitude, std::int16_t longitude) {
  StationIndexRecord key;
  key.latitude = latitude;
  key.longitude = longitude;
  StationHeader header;
  if (!FindStation(key, header)) return std::wstring();
  return br::com::WideFromAnsi(StationName(header));
}

}  // namespace

void TidesDatabase::CloseStationFiles() noexcept {
  if (gFilesOpen) {
    CloseTideFiles();
    gFilesOpen = false;
  }
}

STDMETHODIMP TidesDatabase::Initialize(BSTR folder) {
  return Guard([&] {
    initialised_ = false;
    if (!gFilesOpen) {
      // A later folder is ignored once the files are open, even a bad one.
      if (folder) {
        const std::string path = br::com::AnsiFromBstr(folder);
        gFilesOpen = OpenTideFiles(path.c_str()) == 0;
      } else {
        gFilesOpen = OpenTideFiles(nullptr) == 0;
      }
    }
    initialised_ = gFilesOpen;
    return initialised_ ? S_OK : Error(E_INVALIDARG, L"The tide station folder cannot be opened.");
  });
}

STDMETHODIMP TidesDatabase::get_NumPorts(long* count) {
  if (!initialised_) return E_ACCESSDENIED;
  if (!count) return E_POINTER;
  *count = StationCount();
  return S_OK;
}

STDMETHODIMP TidesDatabase::GetPortInfo(long index, double* latitude, double* longitude, BSTR* name) {
  if (!initialised_) return E_ACCESSDENIED;
  if (!latitude || !longitude) return E_POINTER;
  StationIndexRecord record;
  if (!InRange(index) || !ReadStationIndexRecord(index, record)) return E_INVALIDARG;
  *latitude = record.latitude * kDegreesPerMinute;
  *longitude = record.longitude * kDegreesPerMinute;
  if (!name) return S_OK;
  return Guard([&] {
    *name = nullptr;
    *name = br::com::BstrFromWide(StationNameAt(record.latitude, record.longitude));
    return S_OK;
  });
}

STDMETHODIMP TidesDatabase::GetPort(long index, IUnknown** port) {
  if (!initialised_) return E_ACCESSDENIED;
  if (!port) return E_POINTER;
  *port = nullptr;
  StationIndexRecord record;
  if (!InRange(index) || !ReadStationIndexRecord(index, record)) return S_OK;
  return Guard([&] {
    const std::wstring name = StationNameAt(record.latitude, record.longitude);
    TidesPort* created = nullptr;
    const HRESULT hr = br::com::NewObject(&created);
    if (FAILED(hr)) return static_cast<HRESULT>(E_OUTOFMEMORY);
    created->Attach(name, record.latitude, record.longitude);
    *port = static_cast<ITidesPort*>(created);  // the caller takes NewObject's reference
    return S_OK;
  });
}

STDMETHODIMP TidesDatabase::GetPorts(double latMin, double lonMin, double latMax, double lonMax, VARIANT* ports) {
  if (!initialised_) return E_ACCESSDENIED;
  if (!ports) return E_POINTER;
  VariantInit(ports);
  if (lonMin > lonMax) std::swap(lonMin, lonMax);
  if (latMin > latMax) std::swap(latMin, latMax);

  std::vector<IUnknown*> found;
  auto releaseFound = [&found] {
    for (IUnknown* p : found) p->Release();
    found.clear();
  };
  const HRESULT hr = Guard([&] {
    const long count = StationCount();
    found.reserve(static_cast<std::size_t>(count));  // so that appending never throws
    for (long i = 0; i < count; ++i) {
      StationIndexRecord record;
      if (!ReadStationIndexRecord(i, record)) continue;
      const double latitude = record.latitude * kDegreesPerMinute;
      const double longitude = record.longitude * kDegreesPerMinute;
      if (!(latMin < latitude && latitude < latMax && lonMin < longitude && longitude < lonMax)) continue;
      IUnknown* port = nullptr;
      const HRESULT got = GetPort(i, &port);  // through the object's own interface
      if (FAILED(got)) return got;
      if (!port) continue;
      found.push_back(port);
    }
    if (found.empty()) return S_OK;  // VT_EMPTY: nothing inside the box

    SAFEARRAY* array = SafeArrayCreateVector(VT_UNKNOWN, 0, static_cast<ULONG>(found.size()));
    if (!array) return static_cast<HRESULT>(E_OUTOFMEMORY);
    IUnknown** elements = nullptr;
    HRESULT result = SafeArrayAccessData(array, reinterpret_cast<void**>(&elements));
    if (FAILED(result)) {
      SafeArrayDestroy(array);
      return result;
    }
    for (std::size_t k = 0; k < found.size(); ++k) elements[k] = found[k];  // references move in
    found.clear();
    SafeArrayUnaccessData(array);
    V_VT(ports) = VT_ARRAY | VT_UNKNOWN;
    V_ARRAY(ports) = array;
    return S_OK;
  });
  releaseFound();
  return hr;
}

}  // namespace br::tides
