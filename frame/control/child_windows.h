// A picture of a window's child windows, for controls made of child windows: a parent's
// WM_PRINT does not draw its children everywhere (not under Wine), so a control that is
// drawn from outside (IViewObject::Draw, WM_PRINTCLIENT, PrintWindow) composes them itself.
#pragma once

#include <windows.h>

namespace br::control {

// Paints the visible child windows of window, and theirs, into dc, whose logical (0, 0)
// stands for the top-left corner of window's client area. Each child is clipped to its
// parent's client area and painted over the windows below it: toolkit components through
// their own painting (after their background), other windows through WM_PRINT. dc is
// left as it was.
void PaintChildWindows(HWND window, HDC dc);

}  // namespace br::control
