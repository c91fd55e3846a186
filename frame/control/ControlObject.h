// Base of every control of the library: an automation object (DispatchObject) with the
// control frame's faces. A control derives from ControlObject<Control, IControl>, lists
// its own interfaces in kInterfaces (IUnknown, its dual interface, IDispatch and any
// private ones), and overrides Paint and whichever hooks it needs:
//
//   class MyControl final : public br::control::ControlObject<MyControl, IMyControl> {
//   protected:
//     void Paint(HDC dc, const RECT& client) override;
//   };
//
// The frame answers the container interfaces (IOleObject, IViewObjectEx, ...),
// IEmbeddedControl, IProvideClassInfo(2) and, for a class with events,
// IConnectionPointContainer. See docs/control-frame.md.
#pragma once

#include "frame/com/DispatchObject.h"
#include "frame/control/ControlCore.h"

#include "toolkit/core/Palette.h"

namespace br::control {

template <class Derived, class Dual>
class ControlObject : public br::com::DispatchObject<Derived, Dual> {
  using Base = br::com::DispatchObject<Derived, Dual>;

public:
  static constexpr long kPreferredWidth = 300;
  static constexpr long kPreferredHeight = 200;

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    const HRESULT hr = Base::QueryInterface(riid, out);
    if (hr != E_NOINTERFACE) return hr;
    IUnknown* face = nullptr;
    if (IsEqualIID(riid, IID_IProvideClassInfo) || IsEqualIID(riid, IID_IProvideClassInfo2)) {
      face = Base::ClassInfo(static_cast<Derived&>(*this));
    } else if (IsEqualIID(riid, IID_IConnectionPointContainer) && Derived::kClass.events) {
      face = Base::ConnectionPoints(static_cast<Derived&>(*this));
    } else {
      return core_.QueryInterface(riid, out);
    }
    face->AddRef();
    *out = face;
    return S_OK;
  }

protected:
  ControlObject() : hooks_(*this), core_(*static_cast<Dual*>(this), Derived::kClass, hooks_) {}

  // ---- hooks a control overrides
  virtual void Paint(HDC dc, const RECT& client) = 0;
  virtual bool OnMessage(HWND, UINT, WPARAM, LPARAM, LRESULT&) { return false; }
  // The control's window got the focus: a control with child windows hands it on to the
  // one that takes the keys. By default the focus stays on the control's window.
  virtual bool PassFocus() { return false; }
  // IEmbeddedControl slot 1: a valid array replaces the shared palette; the control
  // repaints either way.
  virtual HRESULT SetPalette(const VARIANT& palette) {
    toolkit::Palette::replace(palette);
    Repaint();
    return S_OK;
  }
  // IEmbeddedControl slot 3.
  virtual HRESULT SetFont(IFont*) { return S_OK; }
  // IEmbeddedControl slot 4.
  virtual HRESULT GetPreferredSize(long* width, long* height) {
    if (!width || !height) return E_POINTER;
    *width = kPreferredWidth;
    *height = kPreferredHeight;
    return S_OK;
  }
  virtual HRESULT TranslateAccelerator(MSG*) { return S_FALSE; }

  // ---- what the frame offers the control
  ControlCore& Control() noexcept { return core_; }
  HWND Window() const noexcept { return core_.Window(); }
  void Repaint() noexcept { core_.Repaint(); }

private:
  class Hooks final : public ControlHooks {
  public:
    explicit Hooks(ControlObject& control) noexcept : control_(control) {}
    void Paint(HDC dc, const RECT& client) override { control_.Paint(dc, client); }
    bool OnMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result) override {
      return control_.OnMessage(window, message, wParam, lParam, result);
    }
    bool PassFocus() override { return control_.PassFocus(); }
    HRESULT SetPalette(const VARIANT& palette) override { return control_.SetPalette(palette); }
    HRESULT SetFont(IFont* font) override { return control_.SetFont(font); }
    HRESULT GetPreferredSize(long* width, long* height) override {
      return control_.GetPreferredSize(width, height);
    }
    HRESULT TranslateAccelerator(MSG* message) override { return control_.TranslateAccelerator(message); }

  private:
    ControlObject& control_;
  };

  Hooks hooks_;
  ControlCore core_;
};

}  // namespace br::control
