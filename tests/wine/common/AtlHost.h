// Wine's ATL control host (atl.dll), loaded by name, and a plain top-level window to host
// controls in.
#pragma once

#include <windows.h>
#include <unknwn.h>

namespace br::test {

class AtlHost {
public:
  AtlHost();  // loads atl.dll; REQUIREs its entry points
  ~AtlHost() { FreeLibrary(module_); }
  AtlHost(const AtlHost&) = delete;
  AtlHost& operator=(const AtlHost&) = delete;

  // A visible borderless window whose client area is width x height.
  static HWND MakeWindow(int width, int height);

  BOOL WinInit() const { return winInit_(); }
  HRESULT Attach(IUnknown* control, HWND window, IUnknown** container) const {
    return attach_(control, window, container);
  }

private:
  HMODULE module_ = nullptr;
  BOOL(WINAPI* winInit_)() = nullptr;
  HRESULT(WINAPI* attach_)(IUnknown*, HWND, IUnknown**) = nullptr;
};

}  // namespace br::test
