#include "frame/control/ControlWindow.h"

#include "frame/com/Module.h"
#include "frame/control/ControlCore.h"

namespace br::control {

bool ControlWindow::RegisterOnce() {
  const HINSTANCE instance = br::com::Module::Instance();
  WNDCLASSEXW info{};
  info.cbSize = sizeof(info);
  if (GetClassInfoExW(instance, kClassName, &info)) {
    if (info.lpfnWndProc == &ControlWindow::Procedure) return true;
    // Left by an earlier load of the library at another address.
    UnregisterClassW(kClassName, instance);
  }
  WNDCLASSEXW wc{};
  wc.cbSize = sizeof(wc);
  wc.style = CS_HREDRAW | CS_VREDRAW | CS_DBLCLKS;
  wc.lpfnWndProc = &ControlWindow::Procedure;
  wc.hInstance = instance;
  wc.hCursor = LoadCursor(nullptr, IDC_ARROW);
  wc.lpszClassName = kClassName;
  return RegisterClassExW(&wc) != 0;
}

HWND ControlWindow::Create(ControlCore& core, HWND parent, const RECT& position) {
  if (!RegisterOnce()) return nullptr;
  // A tab stop of the container: its dialog-style tabbing reaches the control, whose
  // window hands the focus on to its focus child.
  return CreateWindowExW(0, kClassName, L"", WS_CHILD | WS_VISIBLE | WS_CLIPCHILDREN | WS_CLIPSIBLINGS | WS_TABSTOP,
                         position.left, position.top, position.right - position.left,
                         position.bottom - position.top, parent, nullptr, br::com::Module::Instance(), &core);
}

LRESULT CALLBACK ControlWindow::Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_NCCREATE) {
    const auto* create = reinterpret_cast<const CREATESTRUCTW*>(lParam);
    SetWindowLongPtrW(window, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(create->lpCreateParams));
  }
  auto* core = reinterpret_cast<ControlCore*>(GetWindowLongPtrW(window, GWLP_USERDATA));
  if (!core) return DefWindowProcW(window, message, wParam, lParam);
  if (message == WM_NCDESTROY) {
    SetWindowLongPtrW(window, GWLP_USERDATA, 0);
    core->WindowDestroyed(window);
    return DefWindowProcW(window, message, wParam, lParam);
  }
  return core->WindowMessage(window, message, wParam, lParam);
}

}  // namespace br::control
