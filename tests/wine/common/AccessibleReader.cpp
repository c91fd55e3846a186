#include "tests/wine/common/AccessibleReader.h"

namespace br::test {

namespace {

std::vector<WinEventLog::Event>& Recorded() {
  static std::vector<WinEventLog::Event> events;
  return events;
}

void CALLBACK Record(HWINEVENTHOOK, DWORD event, HWND window, LONG object, LONG child, DWORD, DWORD) {
  Recorded().push_back({event, window, object, child});
}

std::wstring Taken(BSTR text) {
  std::wstring value = text ? std::wstring(text, SysStringLen(text)) : std::wstring();
  SysFreeString(text);
  return value;
}

}  // namespace

VARIANT ChildId(long child) {
  VARIANT id;
  VariantInit(&id);
  id.vt = VT_I4;
  id.lVal = child;
  return id;
}

// __uuidof, not liboleacc's IID_IAccessible: that one resolves to garbage when linked statically.
AccessibleReader::AccessibleReader(HWND window) {
  if (FAILED(AccessibleObjectFromWindow(window, static_cast<DWORD>(OBJID_CLIENT), __uuidof(IAccessible),
                                        reinterpret_cast<void**>(&object_))))
    object_ = nullptr;
}

AccessibleReader::~AccessibleReader() {
  if (object_) object_->Release();
}

long AccessibleReader::ChildCount() const {
  LONG count = 0;
  return object_ && object_->get_accChildCount(&count) == S_OK ? count : -1;
}

std::wstring AccessibleReader::Name(long child) const {
  BSTR name = nullptr;
  if (!object_ || FAILED(object_->get_accName(ChildId(child), &name))) return L"<failed>";
  return Taken(name);
}

std::wstring AccessibleReader::Value(long child) const {
  BSTR value = nullptr;
  if (!object_ || FAILED(object_->get_accValue(ChildId(child), &value))) return L"<failed>";
  return Taken(value);
}

long AccessibleReader::Role(long child) const {
  VARIANT role;
  VariantInit(&role);
  if (!object_ || object_->get_accRole(ChildId(child), &role) != S_OK || role.vt != VT_I4) return -1;
  return role.lVal;
}

long AccessibleReader::State(long child) const {
  VARIANT state;
  VariantInit(&state);
  if (!object_ || object_->get_accState(ChildId(child), &state) != S_OK || state.vt != VT_I4) return -1;
  return state.lVal;
}

std::vector<std::wstring> AccessibleReader::ChildNames() const {
  std::vector<std::wstring> names;
  const long count = ChildCount();
  if (count <= 0) return names;
  std::vector<VARIANT> children(static_cast<size_t>(count));
  LONG obtained = 0;
  if (FAILED(AccessibleChildren(object_, 0, count, children.data(), &obtained))) return names;
  for (LONG i = 0; i < obtained; ++i) {
    if (children[i].vt == VT_I4) names.push_back(Name(children[i].lVal));
    else names.push_back(L"<object>");
    VariantClear(&children[i]);
  }
  return names;
}

std::vector<long> AccessibleReader::Selection() const {
  std::vector<long> ids;
  VARIANT selection;
  VariantInit(&selection);
  if (!object_ || object_->get_accSelection(&selection) != S_OK) return ids;
  if (selection.vt == VT_I4) ids.push_back(selection.lVal);
  IEnumVARIANT* all = nullptr;
  if (selection.vt == VT_UNKNOWN &&
      selection.punkVal->QueryInterface(IID_IEnumVARIANT, reinterpret_cast<void**>(&all)) == S_OK) {
    VARIANT one;
    ULONG fetched = 0;
    while (all->Next(1, &one, &fetched) == S_OK && fetched == 1) {
      if (one.vt == VT_I4) ids.push_back(one.lVal);
      VariantClear(&one);
    }
    all->Release();
  }
  VariantClear(&selection);
  return ids;
}

long AccessibleReader::Focus() const {
  VARIANT focus;
  VariantInit(&focus);
  if (!object_ || object_->get_accFocus(&focus) != S_OK || focus.vt != VT_I4) return -1;
  return focus.lVal;
}

WinEventLog::WinEventLog(DWORD first, DWORD last) {
  Recorded().clear();
  hook_ = SetWinEventHook(first, last, nullptr, &Record, GetCurrentProcessId(), 0, WINEVENT_OUTOFCONTEXT);
}

WinEventLog::~WinEventLog() {
  if (hook_) UnhookWinEvent(hook_);
  Recorded().clear();
}

std::vector<WinEventLog::Event> WinEventLog::For(HWND window) {
  MSG message;
  while (PeekMessageA(&message, nullptr, 0, 0, PM_REMOVE)) DispatchMessageA(&message);
  std::vector<Event> events;
  for (const Event& event : Recorded()) {
    if (event.window == window) events.push_back(event);
  }
  return events;
}

void WinEventLog::Clear() {
  MSG message;
  while (PeekMessageA(&message, nullptr, 0, 0, PM_REMOVE)) DispatchMessageA(&message);
  Recorded().clear();
}

}  // namespace br::test
