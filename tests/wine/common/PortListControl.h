// A TidesPortList made from the built DLL for the list suites: the names of the ports its
// SelectChanged events carry, in order, and the control hosted in Wine's ATL host.
#pragma once

#include "tests/wine/common/AtlHost.h"
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/EventSink.h"

#include <string>
#include <vector>

namespace br::test {

class PortListControl {
public:
  explicit PortListControl(const DllUnderTest& dll);  // REQUIREs the list and its connection
  ~PortListControl() { Close(); }
  PortListControl(const PortListControl&) = delete;
  PortListControl& operator=(const PortListControl&) = delete;

  ITidesPortList* operator->() const { return list_.Get(); }
  ITidesPortList* Get() const { return list_.Get(); }

  EventSink sink{DIID__ITidesPortListEvents};
  const std::vector<std::wstring>& Names() const { return sink.portNames; }

  // Hands the list an array of the items (VT_ARRAY | VT_UNKNOWN), destroyed afterwards.
  HRESULT SetPorts(const std::vector<IUnknown*>& items);
  // The name of the Selected port (empty for none).
  std::wstring Selected() const;

  // Attaches the list to host (a window of AtlHost::MakeWindow, destroyed by Close) and
  // REQUIREs its window and its table laid out over it.
  void Host(HWND host);
  HWND HostWindow() const { return host_; }
  HWND Window() const { return window_; }  // the control's own window
  HWND Table() const { return table_; }    // the table's window inside it
  IUnknown* Site() const { return site_.Get(); }

  // Disconnects the sink, destroys the host and lets the list go. Idempotent.
  void Close();

private:
  AtlHost atl_;
  ComRef<ITidesPortList> list_;
  HWND host_ = nullptr;
  ComRef<IUnknown> site_;
  HWND window_ = nullptr;
  HWND table_ = nullptr;
};

}  // namespace br::test
