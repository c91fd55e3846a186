// Wine's ATL control host (atl.dll), loaded by name, and a plain top-level window to host
// controls in.
#pragma once

#include <windows.h>
#include <unknwn.h>

namespace br::test {

class AtlHost {
public:
  AtlHost();  // loads atl.dll; REQUIREs its entry points
  ~AtlHost();
  AtlHost(const AtlHost&) = delete;
  AtlHost& operator=(const AtlHost&) = delete;

  // A visible borderless window whose client area is width x height.
  static HWND MakeWindow(int width, int height);

  BOOL WinInit() const { return winInit_(); }
  HRESULT Attach(IUnknown* control, HWND window, IUnknown** container) const {
    return attach_(control, window, container);
  }
  HRESULT CreateEx(const wchar_t* name, HWND window, IUnknown** container, IUnknown** control) const {
    return createEx_(name, window, nullptr, container, control, IID_NULL, nullptr);
  }

private:
  using WinInitEntry = BOOL(WINAPI*)();
  using AttachEntry = HRESULT(WINAPI*)(IUnknown*, HWND, IUnknown**);
  using CreateExEntry = HRESULT(WINAPI*)(LPCOLESTR, HWND, IStream*, IUnknown**, IUnknown**, REFIID, IUnknown*);

  HMODULE module_ = nullptr;
  WinInitEntry winInit_ = nullptr;
  AttachEntry attach_ = nullptr;
  CreateExEntry createEx_ = nullptr;
};

}  // namespace br::test
