#include "toolkit/core/ToolkitWindows.h"

#include <commctrl.h>

#include <set>
#include <unordered_map>
#include <vector>

#include "toolkit/core/ComponentPeer.h"
#include "toolkit/core/cXComponent.h"

namespace toolkit {

namespace {

struct Entry {
  cXComponent* component;
  WNDPROC previous;  // null for the toolkit's own class
};

// Built on first use: nothing but the class records may run at load.
std::unordered_map<HWND, Entry>& table() {
  static std::unordered_map<HWND, Entry> windows;
  return windows;
}

std::set<int>& registeredKinds() {
  static std::set<int> kinds;
  return kinds;
}

thread_local cXComponent* t_creating = nullptr;

// Busy depth of this thread and the components waiting for it to fall to 0.
thread_local int t_busy = 0;
thread_local std::vector<std::unique_ptr<cXComponent>>* t_waiting = nullptr;

WNDPROC g_defaultProcedure = &DefWindowProcA;

LRESULT defaultProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  return g_defaultProcedure(hwnd, message, wParam, lParam);
}

Entry* find(HWND hwnd) {
  auto it = table().find(hwnd);
  return it == table().end() ? nullptr : &it->second;
}

}  // namespace

std::string ToolkitWindows::className(int peerKind) {
  return "Brine_AWTATL" + std::to_string(peerKind);
}

HINSTANCE ToolkitWindows::moduleInstance() {
  HMODULE module = nullptr;
  GetModuleHandleExA(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                     reinterpret_cast<LPCSTR>(&ToolkitWindows::windowProc), &module);
  return module;
}

bool ToolkitWindows::registerClass(int peerKind) {
  const std::string name = className(peerKind);
  HINSTANCE instance = moduleInstance();
  WNDCLASSEXA info{};
  info.cbSize = sizeof(info);
  if (GetClassInfoExA(instance, name.c_str(), &info)) {
    if (info.lpfnWndProc == &ToolkitWindows::windowProc) return true;
    // Left over from an earlier load of the module at another address.
    UnregisterClassA(name.c_str(), instance);
  }
  WNDCLASSEXA wc{};
  wc.cbSize = sizeof(wc);
  wc.style = CS_HREDRAW | CS_VREDRAW | CS_DBLCLKS;
  wc.lpfnWndProc = &ToolkitWindows::windowProc;
  wc.hInstance = instance;
  wc.hCursor = LoadCursor(nullptr, IDC_ARROW);
  wc.hbrBackground = reinterpret_cast<HBRUSH>(static_cast<INT_PTR>(COLOR_BTNFACE + 1));
  wc.lpszClassName = name.c_str();
  if (!RegisterClassExA(&wc)) return false;
  registeredKinds().insert(peerKind);
  return true;
}

void ToolkitWindows::unregisterClasses() {
  HINSTANCE instance = moduleInstance();
  for (int kind : registeredKinds()) UnregisterClassA(className(kind).c_str(), instance);
  registeredKinds().clear();
}

void ToolkitWindows::initCommonControls() {
  static bool done = false;
  if (done) return;
  INITCOMMONCONTROLSEX icc{};
  icc.dwSize = sizeof(icc);
  icc.dwICC = ICC_WIN95_CLASSES | ICC_STANDARD_CLASSES | ICC_TAB_CLASSES | ICC_TREEVIEW_CLASSES;
  done = InitCommonControlsEx(&icc) != FALSE;
}

void ToolkitWindows::enter(HWND hwnd, cXComponent* component, WNDPROC previous) {
  if (!hwnd || !component) return;
  table()[hwnd] = Entry{component, previous};
}

void ToolkitWindows::subclass(HWND hwnd, cXComponent* component) {
  if (!hwnd || !component || !IsWindow(hwnd)) return;
  if (Entry* known = find(hwnd)) {
    known->component = component;
    return;
  }
  WNDPROC current = reinterpret_cast<WNDPROC>(GetWindowLongPtrA(hwnd, GWLP_WNDPROC));
  WNDPROC previous = nullptr;
  if (current != &ToolkitWindows::windowProc) {
    previous = current;
    SetWindowLongPtrA(hwnd, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(&ToolkitWindows::windowProc));
  }
  enter(hwnd, component, previous);
}

cXComponent* ToolkitWindows::componentOf(HWND hwnd) {
  Entry* entry = find(hwnd);
  return entry ? entry->component : nullptr;
}

WNDPROC ToolkitWindows::previousProcOf(HWND hwnd) {
  Entry* entry = find(hwnd);
  return entry ? entry->previous : nullptr;
}

size_t ToolkitWindows::windowCount() { return table().size(); }

WNDPROC ToolkitWindows::setDefaultProcedure(WNDPROC procedure) {
  WNDPROC previous = g_defaultProcedure;
  g_defaultProcedure = procedure ? procedure : &DefWindowProcA;
  return previous;
}

ToolkitWindows::Busy::Busy() { ++t_busy; }

ToolkitWindows::Busy::~Busy() {
  if (--t_busy > 0) return;
  // Deleting may run window procedures again (their windows go): those stay busy, and
  // whatever they hand over is deleted in the next pass.
  while (t_waiting) {
    std::unique_ptr<std::vector<std::unique_ptr<cXComponent>>> batch(t_waiting);
    t_waiting = nullptr;
    ++t_busy;
    batch.reset();
    --t_busy;
  }
}

void ToolkitWindows::deleteWhenIdle(std::unique_ptr<cXComponent> component) {
  if (!component) return;
  if (t_busy == 0) return;  // nothing of it is on the stack: it goes now
  if (!t_waiting) t_waiting = new std::vector<std::unique_ptr<cXComponent>>();
  t_waiting->push_back(std::move(component));
}

ToolkitWindows::Creating::Creating(cXComponent* component) : previous_(t_creating) {
  t_creating = component;
}

ToolkitWindows::Creating::~Creating() { t_creating = previous_; }

LRESULT CALLBACK ToolkitWindows::windowProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  const Busy busy;
  Entry* entry = find(hwnd);
  if (!entry) {
    // A window of the toolkit's class being made right now: enter it at its
    // first message so that WM_CREATE becomes an event too.
    if (!t_creating) return defaultProc(hwnd, message, wParam, lParam);
    cXComponent* component = t_creating;
    t_creating = nullptr;
    enter(hwnd, component, nullptr);
    if (component->peer()) component->peer()->setHwnd(hwnd);
    entry = find(hwnd);
  }

  if (message == WM_NCDESTROY) {
    const Entry gone = *entry;
    if (gone.previous) SetWindowLongPtrA(hwnd, GWLP_WNDPROC, reinterpret_cast<LONG_PTR>(gone.previous));
    table().erase(hwnd);
    if (ComponentPeer* peer = gone.component->peer()) peer->windowGone(hwnd);
    // A native control frees its own data on WM_NCDESTROY, so it must see it.
    if (gone.previous) return CallWindowProcA(gone.previous, hwnd, message, wParam, lParam);
    return defaultProc(hwnd, message, wParam, lParam);
  }

  ComponentPeer* peer = entry->component->peer();
  if (!peer) return defaultProc(hwnd, message, wParam, lParam);
  LRESULT result = 0;
  const bool consumed = peer->handleMessage(hwnd, message, wParam, lParam, result);
  if (consumed && (message == WM_GETFONT || message == WM_GETOBJECT)) return result;

  // Handlers may have destroyed the window, or the component with it.
  entry = find(hwnd);
  if (!entry) return IsWindow(hwnd) ? defaultProc(hwnd, message, wParam, lParam) : 0;
  const WNDPROC previous = entry->previous;

  if (consumed) {
    switch (message) {
      case WM_KEYDOWN:
      case WM_KEYUP:
      case WM_CHAR:
        // The key is spent: the default processing sees no key at all.
        wParam = 0;
        break;
      case WM_ERASEBKGND:
      case WM_SETCURSOR:
      case WM_DRAWITEM:
      case WM_MEASUREITEM:
      case WM_NOTIFY:
        return 1;
      case WM_MOUSEWHEEL:
        return 0;
      default:
        break;
    }
    return defaultProc(hwnd, message, wParam, lParam);
  }
  if (previous && previous != &ToolkitWindows::windowProc)
    return CallWindowProcA(previous, hwnd, message, wParam, lParam);
  return defaultProc(hwnd, message, wParam, lParam);
}

}  // namespace toolkit
