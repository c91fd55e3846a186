// A control made from the built DLL and in-place active in Wine's ATL host (atl.dll,
// AtlAxAttachControl) inside a top-level window, and pictures of it drawn through
// IViewObject::Draw into a 32-bit DIB section (windows have no pixels under the null
// display driver).
#pragma once

#include "tests/wine/common/dll_under_test.h"

#include <windows.h>
#include <ocidl.h>

#include <cstdint>

namespace br::test {

class HostedControl {
public:
  HostedControl(const DllUnderTest& dll, const CLSID& clsid, int width = 300, int height = 200);
  ~HostedControl();
  HostedControl(const HostedControl&) = delete;
  HostedControl& operator=(const HostedControl&) = delete;

  IUnknown* Control() const { return control_; }  // borrowed; null after Close
  HWND Host() const { return host_; }
  HWND Window() const { return window_; }          // the control's own window
  // A new reference to one of the control's interfaces (REQUIREd to exist).
  template <class I>
  I* Query() const {
    I* out = nullptr;
    QueryOrFail(__uuidof(I), reinterpret_cast<void**>(&out));
    return out;
  }
  // Destroys the host window (the host lets the control go) and releases the test's
  // references. Idempotent.
  void Close();
  // Gives up the test's own reference to the control, leaving the host's.
  void DropReference();

private:
  void QueryOrFail(const IID& iid, void** out) const;
  HMODULE atl_ = nullptr;
  HWND host_ = nullptr;
  HWND window_ = nullptr;
  IUnknown* control_ = nullptr;
  IUnknown* site_ = nullptr;
};

// A top-down 32-bit DIB section in a memory DC.
class Picture {
public:
  Picture(int width, int height);
  ~Picture();
  Picture(const Picture&) = delete;
  Picture& operator=(const Picture&) = delete;
  HDC Dc() const { return dc_; }
  COLORREF At(int x, int y) const;  // 0x00BBGGRR; 0xFFFFFFFF outside
  // Draws the control over the whole picture through IViewObject::Draw.
  HRESULT Draw(IUnknown* control) const;

private:
  int width_, height_;
  HDC dc_ = nullptr;
  HBITMAP bitmap_ = nullptr;
  HGDIOBJ old_ = nullptr;
  std::uint32_t* bits_ = nullptr;
};

}  // namespace br::test
