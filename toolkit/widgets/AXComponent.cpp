#include "toolkit/widgets/AXComponent.h"

#include "toolkit/base/class_records.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/core/system_library.h"

namespace toolkit {

namespace {

using AtlAxWinInitFn = BOOL(WINAPI*)();
using AtlAxGetControlFn = HRESULT(WINAPI*)(HWND, IUnknown**);

struct AtlLibrary {
  HMODULE module = nullptr;
  AtlAxGetControlFn getControl = nullptr;
  bool ready = false;
};

// atl.dll stays loaded once its class is registered: the class points into it.
AtlLibrary& atl() {
  static AtlLibrary library;
  static bool tried = false;
  if (tried) return library;
  tried = true;
  for (const wchar_t* name : {L"atl.dll", L"atl100.dll"}) {
    library.module = LoadSystemLibrary(name);
    if (library.module) break;
  }
  if (!library.module) return library;
  auto init = reinterpret_cast<AtlAxWinInitFn>(
      reinterpret_cast<void*>(GetProcAddress(library.module, "AtlAxWinInit")));
  library.getControl = reinterpret_cast<AtlAxGetControlFn>(
      reinterpret_cast<void*>(GetProcAddress(library.module, "AtlAxGetControl")));
  library.ready = init && library.getControl && init();
  return library;
}

}  // namespace

AXComponent::AXComponent() = default;

AXComponent::~AXComponent() { release(); }

const ClassRecord* AXComponent::getClassRecord() const { return &records::AXComponent; }

bool AXComponent::hostingAvailable() { return atl().ready; }

bool AXComponent::create(HWND parentHwnd) {
  if (!cXComponent::create(parentHwnd)) return false;
  if (classId_ != CLSID_NULL && !hostWindow()) {
    release();  // a window made again: what was hosted went with the old one
    host();
  }
  return true;
}

bool AXComponent::create(const CLSID& classId) {
  classId_ = classId;
  release();
  if (!isValid()) return false;
  return host();
}

void AXComponent::release() {
  if (control_) {
    control_->Release();
    control_ = nullptr;
  }
  // The hosting window lets go of the control when it goes.
  if (host_ && IsWindow(host_)) DestroyWindow(host_);
  host_ = nullptr;
}

bool AXComponent::host() {
  if (!hostingAvailable() || classId_ == CLSID_NULL) return false;
  wchar_t wide[40] = {};
  if (!StringFromGUID2(classId_, wide, 40)) return false;
  char text[40] = {};
  WideCharToMultiByte(CP_ACP, 0, wide, -1, text, static_cast<int>(sizeof(text)), nullptr, nullptr);
  const RECT client = getClientRect();
  // The hosting window makes the control from its title at creation.
  host_ = CreateWindowExA(0, kHostClass, text, WS_CHILD | WS_VISIBLE | WS_CLIPCHILDREN | WS_CLIPSIBLINGS, 0, 0,
                          client.right - client.left, client.bottom - client.top, peer_->hwnd(), nullptr,
                          ToolkitWindows::moduleInstance(), nullptr);
  if (!host_) return false;
  IUnknown* control = nullptr;
  if (FAILED(atl().getControl(host_, &control)) || !control) {
    DestroyWindow(host_);
    host_ = nullptr;
    return false;
  }
  control_ = control;
  return true;
}

HRESULT AXComponent::getControl(REFIID iid, void** object) const {
  if (!object) return E_POINTER;
  *object = nullptr;
  if (!control_) return E_FAIL;
  return control_->QueryInterface(iid, object);
}

HWND AXComponent::hostWindow() const { return host_ && IsWindow(host_) ? host_ : nullptr; }

void AXComponent::fitHost() {
  HWND hostWindow = this->hostWindow();
  if (!hostWindow || !isValid()) return;
  const RECT client = getClientRect();
  MoveWindow(hostWindow, 0, 0, client.right - client.left, client.bottom - client.top, TRUE);
}

void AXComponent::validate() { fitHost(); }

int AXComponent::onResized(ToolkitEvent& event) {
  if (event.source == this && isValid() && event.hwnd == peer_->hwnd()) fitHost();
  return 0;
}

}  // namespace toolkit
