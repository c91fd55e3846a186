#include "toolkit/access/ComponentAccessible.h"

#include <new>

#include "toolkit/base/class_records.h"
#include "toolkit/core/cXComponent.h"
#include "toolkit/core/system_library.h"
#include "toolkit/widgets/Button.h"

namespace toolkit {

namespace {

struct Oleacc {
  LRESULT(WINAPI* lresultFromObject)(REFIID, WPARAM, LPUNKNOWN) = nullptr;
  HRESULT(WINAPI* objectFromWindow)(HWND, DWORD, REFIID, void**) = nullptr;
};

// Loaded once and kept: clients may hold objects that oleacc marshalled.
const Oleacc& oleacc() {
  static const Oleacc loaded = [] {
    Oleacc functions;
    if (HMODULE module = LoadSystemLibrary(L"oleacc.dll")) {
      functions.lresultFromObject = reinterpret_cast<decltype(functions.lresultFromObject)>(
          reinterpret_cast<void*>(GetProcAddress(module, "LresultFromObject")));
      functions.objectFromWindow = reinterpret_cast<decltype(functions.objectFromWindow)>(
          reinterpret_cast<void*>(GetProcAddress(module, "AccessibleObjectFromWindow")));
    }
    return functions;
  }();
  return loaded;
}

// Clients pass child ids as VT_I4; some script bridges send VT_INT or VT_I2.
bool childIdOf(const VARIANT& child, LONG& id) {
  switch (child.vt) {
    case VT_I4: id = child.lVal; return true;
    case VT_INT: id = child.intVal; return true;
    case VT_I2: id = child.iVal; return true;
    default: return false;
  }
}

void setLong(VARIANT* out, LONG value) {
  out->vt = VT_I4;
  out->lVal = value;
}

LONG g_liveObjects = 0;

}  // namespace

ComponentAccessible::Counted::Counted() noexcept { InterlockedIncrement(&g_liveObjects); }

ComponentAccessible::Counted::~Counted() { InterlockedDecrement(&g_liveObjects); }

LONG ComponentAccessible::liveObjects() noexcept { return InterlockedCompareExchange(&g_liveObjects, 0, 0); }

ComponentAccessible::ComponentAccessible(cXComponent& component) : component_(&component) {}

ComponentAccessible::~ComponentAccessible() = default;

LRESULT ComponentAccessible::toLresult(WPARAM wParam) {
  const Oleacc& functions = oleacc();
  if (!functions.lresultFromObject) return E_NOTIMPL;
  return functions.lresultFromObject(__uuidof(IAccessible), wParam, static_cast<IAccessible*>(this));
}

template <typename Answer>
HRESULT ComponentAccessible::forChild(const VARIANT& child, Answer&& answer) {
  if (!component_) return CO_E_OBJNOTCONNECTED;
  LONG id = 0;
  try {
    if (!childIdOf(child, id) || id < 0 || id > childCount()) return E_INVALIDARG;
    return answer(id);
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  } catch (...) {
    return E_FAIL;
  }
}

HRESULT ComponentAccessible::textAnswer(const std::string& text, BSTR* out, HRESULT whenEmpty) {
  *out = nullptr;
  if (text.empty()) return whenEmpty;
  // The library's texts are in the ANSI code page.
  const int length = MultiByteToWideChar(CP_ACP, 0, text.data(), static_cast<int>(text.size()), nullptr, 0);
  if (length <= 0) return E_FAIL;
  BSTR wide = SysAllocStringLen(nullptr, static_cast<UINT>(length));
  if (!wide) return E_OUTOFMEMORY;
  MultiByteToWideChar(CP_ACP, 0, text.data(), static_cast<int>(text.size()), wide, length);
  *out = wide;
  return S_OK;
}

HRESULT ComponentAccessible::textAnswer(const std::wstring& text, BSTR* out, HRESULT whenEmpty) {
  *out = nullptr;
  if (text.empty()) return whenEmpty;
  *out = SysAllocStringLen(text.data(), static_cast<UINT>(text.size()));
  return *out ? S_OK : E_OUTOFMEMORY;
}

namespace {
std::wstring WidenAnsi(const std::string& text) {
  if (text.empty()) return std::wstring();
  const int length = MultiByteToWideChar(CP_ACP, 0, text.data(), static_cast<int>(text.size()), nullptr, 0);
  if (length <= 0) return std::wstring();
  std::wstring wide(static_cast<std::size_t>(length), L'\0');
  MultiByteToWideChar(CP_ACP, 0, text.data(), static_cast<int>(text.size()), wide.data(), length);
  return wide;
}
}  // namespace

std::wstring ComponentAccessible::wideNameOf(LONG child) const { return WidenAnsi(nameOf(child)); }

bool ComponentAccessible::wideValueOf(LONG child, std::wstring& value) const {
  std::string text;
  if (!valueOf(child, text)) return false;
  value = WidenAnsi(text);
  return true;
}

// ---- IUnknown and IDispatch

HRESULT ComponentAccessible::QueryInterface(REFIID iid, void** object) {
  if (!object) return E_POINTER;
  if (iid == IID_IUnknown || iid == IID_IDispatch || iid == __uuidof(IAccessible)) {
    *object = static_cast<IAccessible*>(this);
    AddRef();
    return S_OK;
  }
  *object = nullptr;
  return E_NOINTERFACE;
}

ULONG ComponentAccessible::AddRef() { return static_cast<ULONG>(InterlockedIncrement(&references_)); }

ULONG ComponentAccessible::Release() {
  const LONG left = InterlockedDecrement(&references_);
  if (left == 0) delete this;
  return static_cast<ULONG>(left);
}

HRESULT ComponentAccessible::GetTypeInfoCount(UINT* count) {
  if (!count) return E_POINTER;
  *count = 0;
  return S_OK;
}

HRESULT ComponentAccessible::GetTypeInfo(UINT, LCID, ITypeInfo** info) {
  if (info) *info = nullptr;
  return E_NOTIMPL;
}

HRESULT ComponentAccessible::GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) { return E_NOTIMPL; }

HRESULT ComponentAccessible::Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) {
  return E_NOTIMPL;
}

// ---- IAccessible

HRESULT ComponentAccessible::get_accParent(IDispatch** parent) {
  if (!parent) return E_POINTER;
  *parent = nullptr;
  if (!component_) return CO_E_OBJNOTCONNECTED;
  // The client area's parent is the window object of the same window.
  const Oleacc& functions = oleacc();
  HWND window = component_->getHandle();
  if (!functions.objectFromWindow || !window) return S_FALSE;
  return functions.objectFromWindow(window, static_cast<DWORD>(OBJID_WINDOW), IID_IDispatch,
                                    reinterpret_cast<void**>(parent));
}

HRESULT ComponentAccessible::get_accChildCount(LONG* count) {
  if (!count) return E_POINTER;
  *count = 0;
  if (!component_) return CO_E_OBJNOTCONNECTED;
  *count = childCount();
  return S_OK;
}

HRESULT ComponentAccessible::get_accChild(VARIANT child, IDispatch** object) {
  if (!object) return E_POINTER;
  *object = nullptr;
  return forChild(child, [&](LONG id) -> HRESULT {
    // Rows and the like are simple elements, not objects of their own.
    if (id != CHILDID_SELF) return S_FALSE;
    return QueryInterface(IID_IDispatch, reinterpret_cast<void**>(object));
  });
}

HRESULT ComponentAccessible::get_accName(VARIANT child, BSTR* name) {
  if (!name) return E_POINTER;
  *name = nullptr;
  return forChild(child, [&](LONG id) { return textAnswer(wideNameOf(id), name, S_FALSE); });
}

HRESULT ComponentAccessible::get_accValue(VARIANT child, BSTR* value) {
  if (!value) return E_POINTER;
  *value = nullptr;
  return forChild(child, [&](LONG id) -> HRESULT {
    std::wstring text;
    if (!wideValueOf(id, text)) return DISP_E_MEMBERNOTFOUND;
    if (text.empty()) {
      *value = SysAllocString(L"");
      return *value ? S_OK : E_OUTOFMEMORY;
    }
    return textAnswer(text, value, S_OK);
  });
}

HRESULT ComponentAccessible::get_accDescription(VARIANT child, BSTR* description) {
  if (!description) return E_POINTER;
  *description = nullptr;
  return forChild(child, [](LONG) { return DISP_E_MEMBERNOTFOUND; });
}

HRESULT ComponentAccessible::get_accRole(VARIANT child, VARIANT* role) {
  if (!role) return E_POINTER;
  VariantInit(role);
  return forChild(child, [&](LONG id) {
    setLong(role, roleOf(id));
    return S_OK;
  });
}

HRESULT ComponentAccessible::get_accState(VARIANT child, VARIANT* state) {
  if (!state) return E_POINTER;
  VariantInit(state);
  return forChild(child, [&](LONG id) {
    setLong(state, stateOf(id));
    return S_OK;
  });
}

HRESULT ComponentAccessible::get_accHelp(VARIANT child, BSTR* help) {
  if (!help) return E_POINTER;
  *help = nullptr;
  return forChild(child, [](LONG) { return DISP_E_MEMBERNOTFOUND; });
}

HRESULT ComponentAccessible::get_accHelpTopic(BSTR* helpFile, VARIANT child, LONG* topic) {
  if (!helpFile || !topic) return E_POINTER;
  *helpFile = nullptr;
  *topic = 0;
  return forChild(child, [](LONG) { return DISP_E_MEMBERNOTFOUND; });
}

HRESULT ComponentAccessible::get_accKeyboardShortcut(VARIANT child, BSTR* shortcut) {
  if (!shortcut) return E_POINTER;
  *shortcut = nullptr;
  return forChild(child, [](LONG) { return DISP_E_MEMBERNOTFOUND; });
}

HRESULT ComponentAccessible::get_accFocus(VARIANT* child) {
  if (!child) return E_POINTER;
  VariantInit(child);
  if (!component_) return CO_E_OBJNOTCONNECTED;
  const LONG focused = focusedChild();
  if (focused < 0) return S_FALSE;
  setLong(child, focused);
  return S_OK;
}

HRESULT ComponentAccessible::get_accSelection(VARIANT* children) {
  if (!children) return E_POINTER;
  VariantInit(children);
  if (!component_) return CO_E_OBJNOTCONNECTED;
  try {
    return selectionOf(*children);
  } catch (...) {
    VariantInit(children);
    return E_OUTOFMEMORY;
  }
}

HRESULT ComponentAccessible::get_accDefaultAction(VARIANT child, BSTR* action) {
  if (!action) return E_POINTER;
  *action = nullptr;
  return forChild(child, [](LONG) { return DISP_E_MEMBERNOTFOUND; });
}

HRESULT ComponentAccessible::accSelect(LONG flags, VARIANT child) {
  return forChild(child, [&](LONG id) { return select(flags, id); });
}

HRESULT ComponentAccessible::accLocation(LONG* left, LONG* top, LONG* width, LONG* height, VARIANT child) {
  if (!left || !top || !width || !height) return E_POINTER;
  *left = *top = *width = *height = 0;
  return forChild(child, [&](LONG id) {
    const RECT rect = screenRectOf(id);
    *left = rect.left;
    *top = rect.top;
    *width = rect.right - rect.left;
    *height = rect.bottom - rect.top;
    return S_OK;
  });
}

HRESULT ComponentAccessible::accNavigate(LONG direction, VARIANT start, VARIANT* end) {
  if (!end) return E_POINTER;
  VariantInit(end);
  return forChild(start, [&](LONG id) -> HRESULT {
    const LONG next = neighbour(id, direction);
    if (next <= 0) return S_FALSE;
    setLong(end, next);
    return S_OK;
  });
}

HRESULT ComponentAccessible::accHitTest(LONG x, LONG y, VARIANT* child) {
  if (!child) return E_POINTER;
  VariantInit(child);
  if (!component_) return CO_E_OBJNOTCONNECTED;
  const RECT window = component_->getWindowRect();
  POINT point{x, y};
  if (!PtInRect(&window, point)) return S_FALSE;
  ScreenToClient(component_->getHandle(), &point);
  setLong(child, childAt(point));
  return S_OK;
}

HRESULT ComponentAccessible::accDoDefaultAction(VARIANT child) {
  return forChild(child, [](LONG) { return DISP_E_MEMBERNOTFOUND; });
}

HRESULT ComponentAccessible::put_accName(VARIANT, BSTR) { return E_NOTIMPL; }

HRESULT ComponentAccessible::put_accValue(VARIANT, BSTR) { return E_NOTIMPL; }

// ---- what the self-drawn leaves tell

LONG ComponentAccessible::childCount() const { return 0; }

// Labels and buttons are named by their text; an edit's text is its value.
std::string ComponentAccessible::nameOf(LONG) const {
  if (isKindOf(component_, &records::cXEdit2)) return std::string();
  return component_->storedText();
}

bool ComponentAccessible::valueOf(LONG, std::string& value) const {
  if (!isKindOf(component_, &records::cXEdit2)) return false;
  value = component_->getText();
  return true;
}

LONG ComponentAccessible::roleOf(LONG) const {
  if (isKindOf(component_, &records::Button)) {
    switch (static_cast<const Button*>(component_)->kind) {
      case Button::kToggle: return ROLE_SYSTEM_CHECKBUTTON;
      case Button::kRadio: return ROLE_SYSTEM_RADIOBUTTON;
      default: return ROLE_SYSTEM_PUSHBUTTON;
    }
  }
  if (isKindOf(component_, &records::cXEdit2)) return ROLE_SYSTEM_TEXT;
  return ROLE_SYSTEM_STATICTEXT;
}

LONG ComponentAccessible::stateOf(LONG) const {
  LONG state = windowState();
  if (isKindOf(component_, &records::Button)) {
    const Button* button = static_cast<const Button*>(component_);
    state |= STATE_SYSTEM_FOCUSABLE;
    // A pressed toggle is checked; a pressed push button is held down.
    if (button->isPressed()) state |= button->kind == Button::kPush ? STATE_SYSTEM_PRESSED : STATE_SYSTEM_CHECKED;
  } else if (isKindOf(component_, &records::cXEdit2)) {
    state |= STATE_SYSTEM_FOCUSABLE;
  } else {
    state |= STATE_SYSTEM_READONLY;
  }
  return state;
}

RECT ComponentAccessible::screenRectOf(LONG) const { return component_->getWindowRect(); }

LONG ComponentAccessible::childAt(POINT) const { return CHILDID_SELF; }

LONG ComponentAccessible::focusedChild() const { return hasFocus() ? CHILDID_SELF : -1; }

HRESULT ComponentAccessible::selectionOf(VARIANT&) const { return S_FALSE; }

HRESULT ComponentAccessible::select(LONG, LONG) { return DISP_E_MEMBERNOTFOUND; }

LONG ComponentAccessible::neighbour(LONG, LONG) const { return 0; }

bool ComponentAccessible::hasFocus() const {
  HWND window = component_->getHandle();
  return window && GetFocus() == window;
}

LONG ComponentAccessible::windowState() const {
  LONG state = 0;
  if (!component_->isVisible()) state |= STATE_SYSTEM_INVISIBLE;
  if (!component_->isEnabled()) state |= STATE_SYSTEM_UNAVAILABLE;
  if (hasFocus()) state |= STATE_SYSTEM_FOCUSED;
  return state;
}

}  // namespace toolkit
