#include "tests/wine/common/PortListControl.h"

#include <doctest/doctest.h>

namespace br::test {

namespace {

HWND FindByClass(HWND parent, const char* name) {
  for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    char found[64] = {};
    GetClassNameA(child, found, sizeof found);
    if (std::string(found) == name) return child;
    if (HWND deeper = FindByClass(child, name)) return deeper;
  }
  return nullptr;
}

}  // namespace

PortListControl::PortListControl(const DllUnderTest& dll) {
  REQUIRE(dll.Create(CLSID_TidesPortList, list_.Out()) == S_OK);
  sink.recordPortNames = true;
  REQUIRE(sink.Connect(list_.Get()));
}

HRESULT PortListControl::SetPorts(const std::vector<IUnknown*>& items) {
  VARIANT v;
  v.vt = VT_ARRAY | VT_UNKNOWN;
  v.parray = SafeArrayCreateVector(VT_UNKNOWN, 0, static_cast<ULONG>(items.size()));
  for (LONG i = 0; i < static_cast<LONG>(items.size()); ++i) SafeArrayPutElement(v.parray, &i, items[i]);
  const HRESULT hr = list_->SetPortList(v);
  SafeArrayDestroy(v.parray);
  return hr;
}

std::wstring PortListControl::Selected() const {
  ComRef<IUnknown> port;
  REQUIRE(list_->get_Selected(port.Out()) == S_OK);
  return PortName(port.Get());
}

void PortListControl::Host(HWND host) {
  REQUIRE(host != nullptr);
  host_ = host;
  REQUIRE(atl_.Attach(list_.Get(), host, site_.Out()) == S_OK);
  REQUIRE(Query<IOleWindow>(list_.Get())->GetWindow(&window_) == S_OK);
  REQUIRE((table_ = FindByClass(window_, "Brine_AWTATL44")) != nullptr);
  RECT table{}, control{};
  GetClientRect(table_, &table);
  GetClientRect(window_, &control);
  CHECK(table.bottom > control.bottom * 3 / 4);  // laid out over the control as the window is made
}

void PortListControl::Close() {
  sink.Disconnect();
  if (host_) DestroyWindow(host_);
  host_ = window_ = table_ = nullptr;
  site_.Reset();
  list_.Reset();
}

}  // namespace br::test
