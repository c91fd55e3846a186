// cPictureBox: the picture window. A modeless top-level window (from the library's empty
// dialog template 206, or a plain window of the same style where the template cannot be
// had) with the current picture in its own XPICREPView over a right-aligned Close button.
//
// Its placement is the one value the library writes: the client rectangle in screen
// coordinates under HKCU\SOFTWARE\Brine\BR_Info\PictureBox ("left", "top", "right",
// "bottom"), written on every move and resize. Shown with a stored placement, the window
// goes there with the size its contents want; without one it is centred on the active
// window. It is never larger than the work area. Closing hides it and tells the owner.
#pragma once

#include "BR_Info.h"

#include <windows.h>

#include <functional>
#include <memory>
#include <string>

namespace br::picture {

class cPictureBox {
public:
  // closed: called when the user closes the window (it is hidden, not destroyed).
  cPictureBox(HWND owner, std::function<void()> closed);
  ~cPictureBox();
  cPictureBox(const cPictureBox&) = delete;
  cPictureBox& operator=(const cPictureBox&) = delete;

  // Shows the picture at 100% with the default shading and shows the window; false (and
  // nothing shown) when the view cannot be had.
  bool ShowPicture(const std::wstring& path);
  void Hide();
  // Lets go of the picture (and of its file).
  void RemovePicture();
  HWND Window() const { return window_; }
  // The hosted view (one reference for the caller), or null.
  IXPICREPView* View() const;
  // What the contents want: the view's extent plus room for both scroll bars (100 x 100
  // when the view cannot tell), the button row, gaps and insets.
  SIZE PreferredClientSize() const;

private:
  class Content;
  static INT_PTR CALLBACK DialogProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
  static LRESULT CALLBACK WindowProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
  bool OnMessage(UINT message, WPARAM wParam, LPARAM lParam);
  void Place();
  void StorePlacement() const;
  void LayOut();

  HWND window_ = nullptr;
  std::function<void()> closed_;
  std::unique_ptr<Content> content_;
  bool placed_ = false;   // positioned once since it was made
  bool placing_ = false;  // our own moves while showing: stored once at the end
};

}  // namespace br::picture
