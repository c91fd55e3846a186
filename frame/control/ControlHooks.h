// What a control gives the control frame: its picture, its window's messages and its
// answers to IEmbeddedControl. ControlObject implements these with overridable defaults.
#pragma once

#include <windows.h>
#include <ocidl.h>
#include <olectl.h>

namespace br::control {

class ControlHooks {
public:
  virtual ~ControlHooks() = default;

  // Paints the whole control into dc; client is the control's rectangle with its
  // top-left corner at (0, 0) of dc's logical coordinates.
  virtual void Paint(HDC dc, const RECT& client) = 0;
  // A message to the control's window, before the frame's own handling. Answers true
  // (and the result) when the control took it.
  virtual bool OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) = 0;
  // The control's own window has the keyboard focus: hands it on to the child window that
  // takes the keys. False when the control has none (the focus stays where it is).
  virtual bool PassFocus() = 0;

  // IEmbeddedControl slots 1, 3 and 4.
  virtual HRESULT SetPalette(const VARIANT& palette) = 0;
  virtual HRESULT SetFont(IFont* font) = 0;
  virtual HRESULT GetPreferredSize(long* width, long* height) = 0;

  // IOleInPlaceActiveObject::TranslateAccelerator: S_OK when the control used the message.
  virtual HRESULT TranslateAccelerator(MSG* message) = 0;
};

}  // namespace br::control
