// Base of the controls whose picture is a tree of toolkit components (TidesPortList, the
// object inspector, the contours and picture views). The control's window holds one root
// Container, made with the window and laid out over its client area; the base erases,
// paints, prints, recolours and re-fonts it, composes its child windows into pictures
// drawn from outside, hands the keyboard focus to the control's focus child and lets the
// root go when the window goes.
//
//   class MyView final : public br::control::ToolkitControl<MyView, IMyView> {
//   protected:
//     std::unique_ptr<toolkit::Container> MakeContent() override { return std::make_unique<MyPanel>(*this); }
//     toolkit::cXComponent* FocusChild() override { return &panel()->tree(); }
//   };
//
// See docs/control-frame.md.
#pragma once

#include "frame/control/ControlObject.h"
#include "frame/control/child_windows.h"

#include "toolkit/core/Container.h"
#include "toolkit/core/Palette.h"
#include "toolkit/core/ToolkitWindows.h"

#include <memory>

namespace br::control {

template <class Derived, class Dual>
class ToolkitControl : public ControlObject<Derived, Dual> {
  using Base = ControlObject<Derived, Dual>;

public:
  // Palette colour of the control's background where the content does not cover it.
  static constexpr int kPaletteBackground = 7;

protected:
  ToolkitControl() = default;
  ~ToolkitControl() override {
    // The content's windows going may send the control's window messages (the focus
    // falling back to it): the control is past answering them.
    this->Control().Retire();
    DiscardContent();
  }

  // ---- what a toolkit control gives
  // The root of its tree, made each time the control's window is made.
  virtual std::unique_ptr<toolkit::Container> MakeContent() = 0;
  // The content has its window and is laid out (while the control's window is being
  // made: Window() is still null).
  virtual void ContentMade() {}
  // The control's window is going; the content (if it was made) goes right after.
  virtual void ContentGoing() {}
  // The content has a new font, before it is laid out again.
  virtual void FontChanged() {}
  // The component that takes the keys when the control's window gets the focus; null
  // leaves the focus on the control's window.
  virtual toolkit::cXComponent* FocusChild() { return nullptr; }

  // ---- what the base offers
  // The root, null while the control has no window.
  toolkit::Container* Content() const noexcept { return content_.get(); }
  void LayOut() { LayOutIn(this->Window()); }

  // ---- the control frame's hooks
  // The background, then the content's windows where they stand.
  void Paint(HDC dc, const RECT& client) override {
    toolkit::Palette::fill(dc, client, kPaletteBackground);
    const HWND window = this->Window();
    if (content_ && window) PaintChildWindows(window, dc);
  }

  // A control that handles messages of its own passes the others on to this one.
  bool OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override {
    switch (message) {
      case WM_CREATE:
        BuildContent(window);
        return false;
      case WM_DESTROY:
        ContentGoing();
        DiscardContent();
        return false;
      case WM_SIZE:
        LayOutIn(window);
        result = 0;
        return true;
      case WM_ERASEBKGND:
        if (const HDC dc = reinterpret_cast<HDC>(wParam)) {
          RECT client{};
          GetClientRect(window, &client);
          toolkit::Palette::fill(dc, client, kPaletteBackground);
        }
        result = 1;
        return true;
      case WM_PRINT:
        // WM_PRINTCLIENT pictures the children already: the default must not add them again.
        result = DefWindowProcW(window, message, wParam, lParam & ~static_cast<LPARAM>(PRF_CHILDREN));
        return true;
      default:
        return false;
    }
  }

  HRESULT SetPalette(const VARIANT& palette) override {
    toolkit::Palette::replace(palette);
    if (content_) content_->repaintAll();
    if (const HWND window = this->Window()) InvalidateRect(window, nullptr, TRUE);
    this->Repaint();
    return S_OK;
  }

  HRESULT SetFont(IFont* font) override {
    if (!content_) return S_OK;
    content_->setFontObject(font);
    FontChanged();
    LayOut();
    if (const HWND window = this->Window()) InvalidateRect(window, nullptr, TRUE);
    return S_OK;
  }

  bool PassFocus() override {
    toolkit::cXComponent* child = content_ ? FocusChild() : nullptr;
    if (!child || !child->isValid()) return false;
    child->requestFocus();
    return true;
  }

  // Keys that hosts would otherwise take for themselves (navigation, Enter, Esc, Tab) go
  // to the window inside the control that has the focus, handed to the focus child first
  // when the control's own window has it. Keys while the focus is elsewhere are not ours.
  HRESULT TranslateAccelerator(MSG* message) override {
    if (!message || (message->message != WM_KEYDOWN && message->message != WM_KEYUP)) return S_FALSE;
    if (!IsControlKey(message->wParam)) return S_FALSE;
    const HWND window = this->Window();
    if (!this->Control().HoldsFocus()) return S_FALSE;
    if (GetFocus() == window && !PassFocus()) return S_FALSE;
    const HWND focus = GetFocus();
    if (!focus || focus == window || !IsChild(window, focus)) return S_FALSE;
    SendMessageW(focus, message->message, message->wParam, message->lParam);
    return S_OK;
  }

private:
  static bool IsControlKey(WPARAM key) {
    switch (key) {
      case VK_RETURN:
      case VK_ESCAPE:
      case VK_TAB:
      case VK_PRIOR:
      case VK_NEXT:
      case VK_END:
      case VK_HOME:
      case VK_LEFT:
      case VK_UP:
      case VK_RIGHT:
      case VK_DOWN:
        return true;
      default:
        return false;
    }
  }

  void BuildContent(HWND window) {
    std::unique_ptr<toolkit::Container> content = MakeContent();
    if (!content || !content->create(window)) return;
    content_ = std::move(content);
    LayOutIn(window);
    ContentMade();
  }

  // The window may go from inside a call the content is still delivering (a host that
  // closes on an event): the content is deleted once that call has returned.
  void DiscardContent() { toolkit::ToolkitWindows::deleteWhenIdle(std::move(content_)); }

  void LayOutIn(HWND window) {
    if (!content_ || !window) return;
    RECT client{};
    GetClientRect(window, &client);
    content_->setBounds(0, 0, client.right, client.bottom, true, true);
    content_->doLayout();
  }

  std::unique_ptr<toolkit::Container> content_;
};

}  // namespace br::control
