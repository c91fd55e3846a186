#include "tides/controls/TidesPortList.h"

#include "frame/com/bstr_text.h"
#include "frame/control/OwnerHold.h"
#include "toolkit/core/Palette.h"
#include "toolkit/core/ToolkitWindows.h"

namespace br::tides {

namespace {

constexpr DISPID kSelectChangedEvent = 1;

bool IsForwardedKey(WPARAM key) {
  switch (key) {
    case VK_RETURN:
    case VK_ESCAPE:
    case VK_PRIOR:
    case VK_NEXT:
    case VK_END:
    case VK_HOME:
    case VK_LEFT:
    case VK_UP:
    case VK_RIGHT:
    case VK_DOWN:
      return true;
    default:
      return false;
  }
}

}  // namespace

const br::com::ClassIdentity TidesPortList::kClass = {&CLSID_TidesPortList, &IID_ITidesPortList,
                                                      &DIID__ITidesPortListEvents, L"TidesPortList"};

const TidesPortList::Entry TidesPortList::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_ITidesPortList, Self},
    {&IID_IDispatch, Self},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {nullptr, nullptr},
};

TidesPortList::TidesPortList() = default;

TidesPortList::~TidesPortList() {
  DestroyContent();
  ClearPorts();
}

// ---- ITidesPortList

STDMETHODIMP TidesPortList::SetPortList(VARIANT portList) {
  br::control::OwnerHold hold(*static_cast<ITidesPortList*>(this));
  // The fill selects a row, which fires SelectChanged: the table stays until it is done.
  const toolkit::ToolkitWindows::Busy busy;
  Guard([&] {
    if (panel_) panel_->table().removeAllRows();
    ClearPorts();
    TakePorts(portList);
    if (panel_) Fill();
    return S_OK;
  });
  return S_OK;
}

STDMETHODIMP TidesPortList::get_Selected(IUnknown** port) {
  if (!port) return E_POINTER;
  *port = nullptr;
  if (!panel_ || !panel_->table().isValid()) return S_OK;
  toolkit::Table& table = panel_->table();
  const int row = table.getCurrentRow();
  if (row < 0 || row >= table.getRowCount()) return S_OK;
  const int index = table.getUserData(0, row);
  if (index < 0 || static_cast<size_t>(index) >= ports_.size() || !ports_[index]) return S_OK;
  *port = ports_[index];
  (*port)->AddRef();
  return S_OK;
}

void TidesPortList::ClearPorts() {
  std::vector<IUnknown*> old;
  old.swap(ports_);  // a port's release may call back into us: the list is already empty
  for (IUnknown* port : old) {
    if (port) port->Release();
  }
}

void TidesPortList::TakePorts(const VARIANT& portList) {
  if (portList.vt == VT_UNKNOWN) {
    if (portList.punkVal) {
      portList.punkVal->AddRef();
      ports_.push_back(portList.punkVal);
    }
    return;
  }
  if (portList.vt != (VT_ARRAY | VT_UNKNOWN) || !portList.parray) return;
  SAFEARRAY* array = portList.parray;
  // The elements are interface pointers: anything else would be read as pointers.
  if (SafeArrayGetDim(array) < 1 || SafeArrayGetElemsize(array) != sizeof(IUnknown*)) return;
  LONG lower = 0, upper = -1;
  if (FAILED(SafeArrayGetLBound(array, 1, &lower)) || FAILED(SafeArrayGetUBound(array, 1, &upper))) return;
  // Never more than the array holds: with an empty dimension elsewhere it holds nothing,
  // however many elements the first dimension names.
  unsigned long long held = 1;
  for (USHORT d = 0; d < array->cDims; ++d) held *= array->rgsabound[d].cElements;
  if (FAILED(SafeArrayLock(array))) return;
  IUnknown** elements = static_cast<IUnknown**>(array->pvData);
  LONG count = upper >= lower ? upper - lower + 1 : 0;
  if (static_cast<unsigned long long>(count) > held) count = static_cast<LONG>(held);
  ports_.reserve(static_cast<size_t>(count));
  for (LONG i = 0; i < count && elements; ++i) {
    IUnknown* port = elements[i];
    if (port) port->AddRef();
    ports_.push_back(port);
  }
  SafeArrayUnlock(array);
}

void TidesPortList::Fill() {
  toolkit::Table& table = panel_->table();
  for (size_t i = 0; i < ports_.size(); ++i) {
    if (!ports_[i]) continue;
    ITidesPort* port = nullptr;
    if (FAILED(ports_[i]->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port))) || !port) continue;
    BSTR name = nullptr;
    if (SUCCEEDED(port->get_PortName(&name))) {
      table.appendRowText(0, br::com::AnsiFromBstr(name).c_str(), static_cast<int>(i));
    }
    SysFreeString(name);
    port->Release();
  }
  table.autoSizeColumn(0, -1);
  table.setDisplayWidth(table.getColumnWidth(0));
  table.orderByColumn(0);
  if (table.getRowCount() > 0) table.selectRow(table.storedRowOf(0), true);
}

// ---- selection

void TidesPortList::PortRowSelected(int index) {
  if (index < 0 || static_cast<size_t>(index) >= ports_.size() || !ports_[index]) return;
  br::control::OwnerHold hold(*static_cast<ITidesPortList*>(this));
  IDispatch* dispatch = nullptr;
  if (FAILED(ports_[index]->QueryInterface(IID_IDispatch, reinterpret_cast<void**>(&dispatch))) || !dispatch) return;
  VARIANT argument;
  argument.vt = VT_DISPATCH;
  argument.pdispVal = dispatch;
  DISPPARAMS parameters = {&argument, nullptr, 1, 0};
  FireEvent(kSelectChangedEvent, &parameters);
  dispatch->Release();
}

// ---- window

void TidesPortList::BuildContent(HWND window) {
  SetWindowLongPtrW(window, GWL_STYLE, GetWindowLongPtrW(window, GWL_STYLE) | WS_CLIPCHILDREN | WS_CLIPSIBLINGS);
  auto panel = std::make_unique<TidesPortListPanel>(relay_);
  if (!panel->create(window)) return;
  panel_ = std::move(panel);
  LayOut(window);  // Window() is not set yet while the window is being made
  if (!ports_.empty()) Fill();
}

void TidesPortList::DestroyContent() {
  if (!panel_) return;
  panel_->table().removeAllRows();
  // The window may go from inside a selection the table is still delivering (a host that
  // closes on SelectChanged): the table is deleted once that call has returned.
  toolkit::ToolkitWindows::deleteWhenIdle(std::move(panel_));
}

void TidesPortList::LayOut(HWND window) {
  if (!panel_ || !window) return;
  RECT client{};
  GetClientRect(window, &client);
  panel_->setBounds(0, 0, client.right, client.bottom, true, true);
  panel_->doLayout();
}

bool TidesPortList::OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM, LRESULT& result) {
  switch (message) {
    case WM_CREATE:
      BuildContent(window);
      return false;
    case WM_DESTROY:
      DestroyContent();
      ClearPorts();
      return false;
    case WM_SIZE:
      LayOut(window);
      result = 0;
      return true;
    case WM_ERASEBKGND: {
      RECT client{};
      GetClientRect(window, &client);
      if (const HDC dc = reinterpret_cast<HDC>(wParam)) {
        toolkit::Palette::fill(dc, client, TidesPortListPanel::kPaletteBackground);
      }
      result = 1;
      return true;
    }
    default:
      return false;
  }
}

void TidesPortList::Paint(HDC dc, const RECT& client) {
  toolkit::Palette::fill(dc, client, TidesPortListPanel::kPaletteBackground);
  if (!panel_) return;
  // A picture of the table where its window stands (view object draws, prints).
  const HWND window = Window();
  toolkit::Table& table = panel_->table();
  if (!window || !table.isValid()) return;
  RECT tableRect = table.getWindowRect();
  MapWindowPoints(HWND_DESKTOP, window, reinterpret_cast<POINT*>(&tableRect), 2);
  POINT origin{};
  GetViewportOrgEx(dc, &origin);
  const int saved = SaveDC(dc);
  SetViewportOrgEx(dc, origin.x + client.left + tableRect.left, origin.y + client.top + tableRect.top, nullptr);
  IntersectClipRect(dc, 0, 0, tableRect.right - tableRect.left, tableRect.bottom - tableRect.top);
  table.paint(dc);
  RestoreDC(dc, saved);
}

HRESULT TidesPortList::SetPalette(const VARIANT& palette) {
  toolkit::Palette::replace(palette);
  if (panel_) panel_->repaintAll();
  if (const HWND window = Window()) InvalidateRect(window, nullptr, TRUE);
  Repaint();
  return S_OK;
}

HRESULT TidesPortList::SetFont(IFont* font) {
  if (!panel_) return S_OK;
  panel_->setFontObject(font);
  toolkit::Table& table = panel_->table();
  table.autoSizeColumn(0, -1);
  table.setDisplayWidth(table.getColumnWidth(0));
  LayOut(Window());
  if (const HWND window = Window()) InvalidateRect(window, nullptr, TRUE);
  return S_OK;
}

HRESULT TidesPortList::TranslateAccelerator(MSG* message) {
  if (!message || (message->message != WM_KEYDOWN && message->message != WM_KEYUP)) return S_FALSE;
  if (!IsForwardedKey(message->wParam)) return S_FALSE;
  const HWND focus = GetFocus();
  if (!focus) return S_FALSE;
  SendMessageW(focus, message->message, message->wParam, message->lParam);
  return S_OK;
}

}  // namespace br::tides
