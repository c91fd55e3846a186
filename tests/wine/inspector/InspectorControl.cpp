#include "tests/wine/inspector/InspectorControl.h"

#include <doctest/doctest.h>

namespace br::test {

namespace {

HWND FindByClass(HWND parent, const char* name) {
  for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    char found[64] = {};
    GetClassNameA(child, found, sizeof found);
    if (lstrcmpiA(found, name) == 0) return child;
    if (HWND deeper = FindByClass(child, name)) return deeper;
  }
  return nullptr;
}

}  // namespace

// ---- the sink

bool SelectSink::Connect(IUnknown* source) {
  ComRef<IConnectionPointContainer> container;
  if (FAILED(source->QueryInterface(IID_IConnectionPointContainer, container.OutVoid()))) return false;
  if (FAILED(container->FindConnectionPoint(DIID__IXObjectInspectorEvents, point_.Out()))) return false;
  return SUCCEEDED(point_->Advise(this, &cookie_));
}

void SelectSink::Disconnect() {
  const ComRef<IConnectionPoint> point = std::move(point_);
  if (point) point->Unadvise(cookie_);
}

STDMETHODIMP SelectSink::QueryInterface(REFIID riid, void** out) {
  const bool ours = IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) ||
                    IsEqualIID(riid, DIID__IXObjectInspectorEvents);
  *out = ours ? static_cast<IDispatch*>(this) : nullptr;
  return ours ? S_OK : E_NOINTERFACE;
}

STDMETHODIMP SelectSink::Invoke(DISPID id, REFIID, LCID, WORD, DISPPARAMS* params, VARIANT*, EXCEPINFO*, UINT*) {
  SelectEvent event;
  if (id == 1 && params && params->cArgs == 3) {
    const VARIANT& guid = params->rgvarg[2];
    if (guid.vt == VT_BSTR && guid.bstrVal) event.guid.assign(guid.bstrVal, SysStringLen(guid.bstrVal));
    const VARIANT& owner = params->rgvarg[1];
    if (owner.vt == (VT_BYREF | VT_VARIANT) && owner.pvarVal) {
      event.ownerType = owner.pvarVal->vt;
      if (owner.pvarVal->vt == VT_UNKNOWN) event.owner = ComRef<IUnknown>(owner.pvarVal->punkVal);
    }
    if (params->rgvarg[0].vt == VT_I4) event.doubleClick = params->rgvarg[0].lVal;
  }
  events.push_back(event);
  if (onCall) onCall();
  return S_OK;
}

// ---- the control

InspectorControl::InspectorControl(const DllUnderTest& dll) {
  REQUIRE(dll.Create(CLSID_XObjectInspector, inspector_.Out()) == S_OK);
  REQUIRE(sink.Connect(inspector_.Get()));
}

void InspectorControl::Host() {
  host_ = AtlHost::MakeWindow(600, 400);
  REQUIRE(host_ != nullptr);
  REQUIRE(atl_.Attach(inspector_.Get(), host_, site_.Out()) == S_OK);
  REQUIRE(Query<IOleWindow>(inspector_.Get())->GetWindow(&window_) == S_OK);
  REQUIRE((tree_ = FindByClass(window_, "SysTreeView32")) != nullptr);
}

std::vector<TreeItem> InspectorControl::Items() const {
  std::vector<TreeItem> items;
  std::function<void(HTREEITEM, int)> walk = [&](HTREEITEM item, int depth) {
    for (; item; item = TreeView_GetNextSibling(tree_, item)) {
      wchar_t text[512] = {};
      TVITEMW data{};
      data.mask = TVIF_TEXT | TVIF_IMAGE | TVIF_SELECTEDIMAGE | TVIF_PARAM | TVIF_HANDLE;
      data.hItem = item;
      data.pszText = text;
      data.cchTextMax = 512;
      REQUIRE(SendMessageW(tree_, TVM_GETITEMW, 0, reinterpret_cast<LPARAM>(&data)));
      items.push_back(TreeItem{text, data.iImage, data.iSelectedImage, data.lParam, depth});
      walk(TreeView_GetChild(tree_, item), depth + 1);
    }
  };
  walk(TreeView_GetRoot(tree_), 0);
  return items;
}

std::vector<std::wstring> InspectorControl::RootTexts() const {
  std::vector<std::wstring> texts;
  for (const TreeItem& item : Items())
    if (item.depth == 0) texts.push_back(item.text);
  return texts;
}

HTREEITEM InspectorControl::ItemWithData(LPARAM wanted) const {
  HTREEITEM found = nullptr;
  std::function<void(HTREEITEM)> walk = [&](HTREEITEM item) {
    for (; item && !found; item = TreeView_GetNextSibling(tree_, item)) {
      TVITEMW data{};
      data.mask = TVIF_PARAM | TVIF_HANDLE;
      data.hItem = item;
      SendMessageW(tree_, TVM_GETITEMW, 0, reinterpret_cast<LPARAM>(&data));
      if (data.lParam == wanted) found = item;
      walk(TreeView_GetChild(tree_, item));
    }
  };
  walk(TreeView_GetRoot(tree_));
  return found;
}

LPARAM InspectorControl::SelectedData() const {
  HTREEITEM item = TreeView_GetSelection(tree_);
  if (!item) return -99;
  TVITEMW data{};
  data.mask = TVIF_PARAM | TVIF_HANDLE;
  data.hItem = item;
  SendMessageW(tree_, TVM_GETITEMW, 0, reinterpret_cast<LPARAM>(&data));
  return data.lParam;
}

void InspectorControl::Select(HTREEITEM item) const {
  REQUIRE(item != nullptr);
  TreeView_SelectItem(tree_, item);
}

void InspectorControl::DoubleClick() const {
  NMHDR header{tree_, static_cast<UINT_PTR>(GetDlgCtrlID(tree_)), static_cast<UINT>(NM_DBLCLK)};
  SendMessageW(GetParent(tree_), WM_NOTIFY, header.idFrom, reinterpret_cast<LPARAM>(&header));
}

void InspectorControl::Close() {
  sink.Disconnect();
  if (host_) DestroyWindow(host_);
  host_ = window_ = tree_ = nullptr;
  site_.Reset();
  inspector_.Reset();
}

}  // namespace br::test
