#include "tides/controls/TidesPortList.h"

#include "frame/com/bstr_text.h"
#include "frame/control/OwnerHold.h"

namespace br::tides {

namespace {

constexpr DISPID kSelectChangedEvent = 1;

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

TidesPortList::~TidesPortList() { ClearPorts(); }

// ---- ITidesPortList

STDMETHODIMP TidesPortList::SetPortList(VARIANT portList) {
  br::control::OwnerHold hold(*static_cast<ITidesPortList*>(this));
  // The fill selects a row, which fires SelectChanged: the table stays until it is done.
  const toolkit::ToolkitWindows::Busy busy;
  Guard([&] {
    if (Panel()) Panel()->table().removeAllRows();
    ClearPorts();
    TakePorts(portList);
    if (Panel()) Fill();
    return S_OK;
  });
  return S_OK;
}

STDMETHODIMP TidesPortList::get_Selected(IUnknown** port) {
  if (!port) return E_POINTER;
  *port = nullptr;
  if (!Panel() || !Panel()->table().isValid()) return S_OK;
  toolkit::Table& table = Panel()->table();
  const int row = table.getCurrentRow();
  if (row < 0 || row >= table.getRowCount()) return S_OK;
  const int index = table.getUserData(0, row);
  if (index < 0 || static_cast<size_t>(index) >= ports_.size()) return S_OK;
  *port = br::com::ComRef<IUnknown>(ports_[index]).Detach();
  return S_OK;
}

void TidesPortList::ClearPorts() {
  std::vector<br::com::ComRef<IUnknown>> old;
  old.swap(ports_);  // a port's release may call back into us: the list is already empty
}

void TidesPortList::TakePorts(const VARIANT& portList) {
  if (portList.vt == VT_UNKNOWN) {
    if (portList.punkVal) ports_.emplace_back(portList.punkVal);
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
  for (LONG i = 0; i < count && elements; ++i) ports_.emplace_back(elements[i]);
  SafeArrayUnlock(array);
}

void TidesPortList::Fill() {
  toolkit::Table& table = Panel()->table();
  for (size_t i = 0; i < ports_.size(); ++i) {
    const auto port = ports_[i].Query<ITidesPort>(IID_ITidesPort);
    if (!port) continue;
    br::com::BstrHolder name;
    if (SUCCEEDED(port->get_PortName(name.Out()))) {
      table.appendRowText(0, br::com::AnsiFromBstr(name.Get()).c_str(), static_cast<int>(i));
    }
  }
  FitColumn();
  table.orderByColumn(0);
  if (table.getRowCount() > 0) table.selectRow(table.storedRowOf(0), true);
}

void TidesPortList::FitColumn() {
  toolkit::Table& table = Panel()->table();
  table.autoSizeColumn(0, -1);
  table.setDisplayWidth(table.getColumnWidth(0));
}

// ---- selection

void TidesPortList::PortRowSelected(int index) {
  if (index < 0 || static_cast<size_t>(index) >= ports_.size()) return;
  br::control::OwnerHold hold(*static_cast<ITidesPortList*>(this));
  const auto dispatch = ports_[index].Query<IDispatch>(IID_IDispatch);
  if (!dispatch) return;
  VARIANT argument;
  argument.vt = VT_DISPATCH;
  argument.pdispVal = dispatch.Get();
  DISPPARAMS parameters = {&argument, nullptr, 1, 0};
  FireEvent(kSelectChangedEvent, &parameters);
}

// ---- content

std::unique_ptr<toolkit::Container> TidesPortList::MakeContent() {
  return std::make_unique<TidesPortListPanel>(relay_);
}

void TidesPortList::ContentMade() {
  if (!ports_.empty()) Fill();
}

void TidesPortList::ContentGoing() {
  if (Panel()) Panel()->table().removeAllRows();
  ClearPorts();
}

void TidesPortList::FontChanged() { FitColumn(); }

toolkit::cXComponent* TidesPortList::FocusChild() { return Panel() ? &Panel()->table() : nullptr; }

}  // namespace br::tides
