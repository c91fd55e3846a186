// The window class of the controls' own windows: its procedure hands every message to
// the ControlCore the window was made for.
#pragma once

#include <windows.h>

namespace br::control {

class ControlCore;

class ControlWindow {
public:
  // Window class name of the controls' windows.
  static constexpr const wchar_t* kClassName = L"BR_Info_Control";

  // A visible child window of parent at position, a tab stop, serving core; null on failure.
  static HWND Create(ControlCore& core, HWND parent, const RECT& position);

private:
  static bool RegisterOnce();
  static LRESULT CALLBACK Procedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
};

}  // namespace br::control
