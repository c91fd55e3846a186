// The state and behaviour that every control of the library shares: the client site,
// in-place activation with a window of the control's own, the extent, repainting, and
// the interface faces (IOleObject, IViewObjectEx, ...) that containers talk to.
//
// A control does not use this class directly: it derives from ControlObject (see
// ControlObject.h), which owns one ControlCore and forwards the hooks.
#pragma once

#include "frame/com/ClassIdentity.h"
#include "frame/com/ComRef.h"
#include "frame/control/ControlHooks.h"
#include "frame/control/DataObjectFace.h"
#include "frame/control/EmbeddedControlFace.h"
#include "frame/control/InPlaceActiveObjectFace.h"
#include "frame/control/InPlaceObjectFace.h"
#include "frame/control/OleControlFace.h"
#include "frame/control/OleObjectFace.h"
#include "frame/control/PersistStorageFace.h"
#include "frame/control/PersistStreamFace.h"
#include "frame/control/PropertyPagesFace.h"
#include "frame/control/QuickActivateFace.h"
#include "frame/control/ViewObjectFace.h"

namespace br::control {

class ControlCore {
public:
  // OLEMISC flags of every control: recompose on resize, can't link inside, inside-out,
  // activate when visible, set client site first.
  static constexpr DWORD kMiscStatus = 131473;

  ControlCore(IUnknown& owner, const br::com::ClassIdentity& cls, ControlHooks& hooks);
  ~ControlCore();
  ControlCore(const ControlCore&) = delete;
  ControlCore& operator=(const ControlCore&) = delete;

  // The frame's faces: E_NOINTERFACE for an interface that is not one of them.
  HRESULT QueryInterface(REFIID riid, void** out);

  IUnknown& Owner() const noexcept { return owner_; }
  const br::com::ClassIdentity& Class() const noexcept { return class_; }
  ControlHooks& Hooks() const noexcept { return hooks_; }

  // ---- window and picture
  HWND Window() const noexcept { return window_; }
  // Repaints: invalidates the window (with erase) when there is one, and tells the view
  // and data advise sinks that the picture changed.
  void Repaint() noexcept;
  // Paints the control into dc at bounds (logical units of dc), leaving dc as it was;
  // what the control's painting throws becomes the HRESULT.
  HRESULT DrawInto(HDC dc, const RECT& bounds);
  // The frame's window procedure part: the control's hooks first, then paint, print,
  // erase and focus handling.
  LRESULT WindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
  // The window is gone (WM_NCDESTROY).
  void WindowDestroyed(HWND window) noexcept;
  // The control is being destroyed: from here on its window reaches none of its hooks (a
  // control whose destructor destroys child windows calls this first, as the focus and
  // other messages those windows' end sends to the control's window must not reach it).
  void Retire() noexcept { hooksLive_ = false; }

  // ---- client site and activation
  HRESULT SetClientSite(IOleClientSite* site);
  IOleClientSite* ClientSite() const noexcept { return site_.Get(); }
  HRESULT DoVerb(LONG verb, IOleClientSite* activeSite);
  HRESULT InPlaceActivate(bool uiActivate);
  HRESULT UIDeactivate();
  HRESULT InPlaceDeactivate();
  HRESULT SetObjectRects(const RECT* position, const RECT* clip);
  HRESULT Close(DWORD saveOption);
  bool InPlaceActive() const noexcept { return static_cast<bool>(inPlaceSite_); }
  bool UIActive() const noexcept { return uiActive_; }

  // ---- keyboard focus
  // The focus is on the control's window or on a window inside it.
  bool HoldsFocus() const noexcept;
  // Tab (Shift+Tab) out of the control: the container's control site is asked first
  // (IOleControlSite::TranslateAccelerator), then the focus goes to the next (previous)
  // tab stop of the top-level window after the control's window.
  void LeaveFocus(bool backwards);

  // ---- extent (himetric) and saved state; the first extent is the preferred size
  SIZEL Extent() noexcept;
  void SetExtent(const SIZEL& extent) noexcept;
  SIZE ExtentInPixels() noexcept;
  bool Dirty() const noexcept { return dirty_; }
  void SetDirty(bool dirty) noexcept { dirty_ = dirty; }

  // ---- OLE advise sinks of IOleObject
  HRESULT Advise(IAdviseSink* sink, DWORD* connection);
  HRESULT Unadvise(DWORD connection);
  HRESULT EnumAdvise(IEnumSTATDATA** advise);

  InPlaceActiveObjectFace& ActiveObject() noexcept { return activeObject_; }

private:
  void ReleaseUiWindows() noexcept;

  IUnknown& owner_;
  const br::com::ClassIdentity& class_;
  ControlHooks& hooks_;
  // Cleared first on destruction, so that a window outliving the control's own parts
  // never calls into them.
  bool hooksLive_ = true;

  br::com::ComRef<IOleClientSite> site_;
  br::com::ComRef<IOleInPlaceSite> inPlaceSite_;  // held while in-place active
  bool siteIsEx_ = false;                         // inPlaceSite_ answers IOleInPlaceSiteEx
  br::com::ComRef<IOleInPlaceFrame> frame_;       // held while UI-active
  br::com::ComRef<IOleInPlaceUIWindow> document_; // held while UI-active
  bool uiActive_ = false;
  HWND window_ = nullptr;
  SIZEL extent_{};
  bool extentKnown_ = false;
  bool dirty_ = false;
  br::com::ComRef<IOleAdviseHolder> adviseHolder_;

  OleObjectFace oleObject_;
  InPlaceObjectFace inPlaceObject_;
  InPlaceActiveObjectFace activeObject_;
  OleControlFace oleControl_;
  ViewObjectFace viewObject_;
  PersistStreamFace persistStream_;
  PersistStorageFace persistStorage_;
  QuickActivateFace quickActivate_;
  PropertyPagesFace propertyPages_;
  DataObjectFace dataObject_;
  EmbeddedControlFace embeddedControl_;
};

}  // namespace br::control
