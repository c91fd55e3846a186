// XObjectInspector hosted in Wine's ATL host for the suites: its tree read through the
// tree view's own messages, and a sink that keeps every SelectObject's arguments.
#pragma once

#include "tests/wine/common/AtlHost.h"
#include "tests/wine/common/DllUnderTest.h"

#include "GeoData.h"

#include <commctrl.h>

#include <functional>
#include <string>
#include <vector>

namespace br::test {

struct SelectEvent {
  std::wstring guid;
  VARTYPE ownerType = VT_EMPTY;  // of the VARIANT pOwner points to
  ComRef<IUnknown> owner;
  long doubleClick = -1;
};

class SelectSink final : public IDispatch {
public:
  bool Connect(IUnknown* source);
  void Disconnect();
  std::vector<SelectEvent> events;
  std::function<void()> onCall;  // runs inside the event, after it is noted

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override { return 2; }
  STDMETHODIMP_(ULONG) Release() override { return 1; }
  STDMETHODIMP GetTypeInfoCount(UINT* count) override { return *count = 0, S_OK; }
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID id, REFIID, LCID, WORD, DISPPARAMS* params, VARIANT*, EXCEPINFO*, UINT*) override;

private:
  ComRef<IConnectionPoint> point_;
  DWORD cookie_ = 0;
};

struct TreeItem {
  std::wstring text;
  int icon = -1;
  int selectedIcon = -1;
  LPARAM data = 0;
  int depth = 0;
};

class InspectorControl {
public:
  explicit InspectorControl(const DllUnderTest& dll);  // REQUIREs the control and its sink
  ~InspectorControl() { Close(); }
  InspectorControl(const InspectorControl&) = delete;
  InspectorControl& operator=(const InspectorControl&) = delete;

  IXObjectInspector* operator->() const { return inspector_.Get(); }
  IXObjectInspector* Get() const { return inspector_.Get(); }

  // Hosts the control in a new window and finds its tree view (REQUIREd).
  void Host();
  HWND Window() const { return window_; }
  HWND Tree() const { return tree_; }

  // Every item in tree order (depth first).
  std::vector<TreeItem> Items() const;
  std::vector<std::wstring> RootTexts() const;
  HTREEITEM ItemWithData(LPARAM data) const;
  // The selected item's data, or -99 when none is selected.
  LPARAM SelectedData() const;
  void Select(HTREEITEM item) const;
  void DoubleClick() const;  // the tree's double-click notification on the selected item

  void Close();
  SelectSink sink;

private:
  AtlHost atl_;
  ComRef<IXObjectInspector> inspector_;
  HWND host_ = nullptr;
  HWND window_ = nullptr;
  HWND tree_ = nullptr;
  ComRef<IUnknown> site_;
};

}  // namespace br::test
