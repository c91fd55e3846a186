#pragma once
// The maker's geodesy library, BRGBASE.dll, which lies outside ours: datum names, the
// normalised angle unit and the map-metrics block a host's hit test takes. It is loaded
// at first use and only by full path from known folders (next to the module that holds
// this code, normally BR_Info.dll, or next to the host program), never from the current
// folder or the search path, so a planted file cannot run inside the host; and never as
// a static import, so a missing file stops nothing else. Without it datum names are
// empty, angles unknown and no hit test runs.

#include <windows.h>

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "GeoData.h"

namespace br::geo {

class GeodesyLibrary {
public:
  static constexpr const wchar_t* FILE_NAME = L"BRGBASE.dll";

  // Looks in each folder in turn; folders that are not absolute paths are skipped.
  explicit GeodesyLibrary(const std::vector<std::wstring>& folders);
  ~GeodesyLibrary();
  GeodesyLibrary(const GeodesyLibrary&) = delete;
  GeodesyLibrary& operator=(const GeodesyLibrary&) = delete;

  bool Loaded() const { return module_ != nullptr; }
  // The full path it was loaded from, empty when it was not.
  const std::wstring& Path() const { return path_; }

  // GetGeodeticDatumTypeName: the horizontal datum's name, empty when unknown.
  std::string DatumName(long code) const;
  // nrm2deg: the normalised angle unit (a 32-bit number) in degrees.
  std::optional<double> Degrees(long normalised) const;
  // Runs hitTest with a block made by TMapMetrics__init(block, 0) and cleared by
  // TMapMetrics__clear afterwards, also when hitTest throws. False, with hitTest not run,
  // without the library.
  bool WithMapMetrics(const std::function<void(GEO_MAP_METRICS* metrics)>& hitTest) const;

  // The folder of the module holding this code, and the host program's folder.
  static std::vector<std::wstring> KnownFolders();
  // The process-wide library over KnownFolders, loaded at first call.
  static const GeodesyLibrary& Shared();
  // Unloads the shared library (the module is about to go); the next Shared loads anew.
  static void ReleaseShared();

private:
  using DatumNameFunction = long(WINAPI*)(long code, char* buffer, long size);
  using DegreesFunction = double(WINAPI*)(long normalised);
  using InitFunction = void(WINAPI*)(GEO_MAP_METRICS* block, long flags);
  using ClearFunction = void(WINAPI*)(GEO_MAP_METRICS* block);

  HMODULE module_ = nullptr;
  std::wstring path_;
  DatumNameFunction datumName_ = nullptr;
  DegreesFunction degrees_ = nullptr;
  InitFunction init_ = nullptr;
  ClearFunction clear_ = nullptr;
};

}  // namespace br::geo
