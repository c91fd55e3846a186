// The chart host's side that BR_Info talks to: the stand-in host's scene (ChartScene.Scene)
// loaded with the same file that brchart draws, its projection, and the hit test of its
// objects with a map-metrics block made by the geodesy library (BRGBASE.dll).
#pragma once

#include <windows.h>

#include <string>
#include <vector>

#include "GeoData.h"

namespace br::brchart {

class SceneClient {
public:
  SceneClient() = default;
  ~SceneClient();
  SceneClient(const SceneClient&) = delete;
  SceneClient& operator=(const SceneClient&) = delete;

  // Makes the scene object, loads the file and takes the named projection. False with a
  // one-line message (the host is not registered, the file is refused, no such projection,
  // no geodesy library).
  bool Open(const std::string& scenePath, const std::string& projection, std::string& error);
  bool IsOpen() const { return scene_ != nullptr && projection_ != nullptr; }

  // The names (of `candidates`) whose objects the host reports inside the pixel rectangle,
  // in the order given. A failing hit test counts as a miss.
  std::vector<std::string> HitTest(const std::vector<std::string>& candidates, const RECT& pixels);
  // The host's object of that scene name (one reference for the caller), or null.
  IGeoObject* Object(const std::string& name);
  // The dataset of that id (one reference for the caller), or null.
  IUnknown* DataSet(const std::string& id);
  // The projection Open took (one reference for the caller), or null.
  IUnknown* ProjectionObject();
  // Display components by scene name (one reference for the caller), or null.
  IUnknown* PresParams(const std::string& name);
  IUnknown* ColorMap(const std::string& name);
  // Object records (VT_ARRAY|VT_UI1) of comma-separated scene names, for SetInfo; the
  // host keeps their owners alive until its next Load. False when it refuses them.
  bool ObjectRecords(const std::string& names, VARIANT& records);
  // The logical palette handle the host keeps for that palette, or 0.
  long Palette(const std::string& name);

private:
  HRESULT Call(DISPID id, WORD flags, VARIANT* arguments, UINT count, VARIANT* result);
  IUnknown* Named(DISPID id, const std::string& name);

  IDispatch* scene_ = nullptr;
  IGeoProjection* projection_ = nullptr;
  HMODULE geodesy_ = nullptr;
  GEO_MAP_METRICS metrics_{};
};

}  // namespace br::brchart
