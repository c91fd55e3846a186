// The stand-in chart host's scriptable scene object (ChartScene.Scene, registered in the
// suite's prefix) called from C++ through IDispatch: load a scene file, take its components.
#pragma once

#include <windows.h>
#include <oleauto.h>

#include <string>

#include "frame/com/ComRef.h"

namespace br::test {

class SceneClient {
public:
  SceneClient();  // REQUIREs the scene object

  // S_OK when the file was taken; a refused file keeps the scene loaded before.
  HRESULT Load(const std::wstring& path);
  // Why the last Load failed.
  std::wstring LastError();
  // The scene's component of that kind ("DataSet", "Projection", "Object", ...) and name,
  // one reference for the caller; REQUIREd.
  br::com::ComRef<IUnknown> Component(const wchar_t* kind, const wchar_t* name);
  // The scene's logical palette of that name, as the 32-bit number a host passes; the scene
  // keeps it. REQUIREd.
  long Palette(const wchar_t* name);

  // The sample scene: data/harbour/harbour.json of the source tree (BR_SOURCE_DIR).
  static std::wstring SamplePath();

private:
  HRESULT Call(const wchar_t* method, const wchar_t* text, VARIANT& result);

  br::com::ComRef<IDispatch> scene_;
};

}  // namespace br::test
