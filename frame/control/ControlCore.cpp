#include "frame/control/ControlCore.h"

#include "frame/com/guard.h"
#include "frame/control/ControlWindow.h"
#include "frame/control/himetric.h"
#include "frame/control/OwnerHold.h"

namespace br::control {

namespace {

// IOleControlSite::TranslateAccelerator's modifier for Shift (KEYMOD_SHIFT, which mingw's
// headers lack).
constexpr DWORD kKeyModifierShift = 0x1;

SIZE ScreenPixelsPerInch() noexcept {
  SIZE ppi{96, 96};
  if (HDC screen = GetDC(nullptr)) {
    ppi.cx = GetDeviceCaps(screen, LOGPIXELSX);
    ppi.cy = GetDeviceCaps(screen, LOGPIXELSY);
    ReleaseDC(nullptr, screen);
  }
  return ppi;
}

}  // namespace

ControlCore::ControlCore(IUnknown& owner, const br::com::ClassIdentity& cls, ControlHooks& hooks)
    : owner_(owner),
      class_(cls),
      hooks_(hooks),
      oleObject_(owner, *this),
      inPlaceObject_(owner, *this),
      activeObject_(owner, *this),
      oleControl_(owner),
      viewObject_(owner, *this),
      persistStream_(owner, *this),
      persistStorage_(owner, *this),
      quickActivate_(owner, *this),
      propertyPages_(owner),
      dataObject_(owner, *this),
      embeddedControl_(owner, *this) {}

ControlCore::~ControlCore() {
  // The control's own parts are gone already: nothing may reach them from here on, and
  // the container is not called back from inside a destructor.
  Retire();
  if (window_ && IsWindow(window_)) DestroyWindow(window_);
  window_ = nullptr;
  ReleaseUiWindows();
  inPlaceSite_.Reset();
  site_.Reset();
  adviseHolder_.Reset();
}

HRESULT ControlCore::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  *out = nullptr;
  IUnknown* face = nullptr;
  if (IsEqualIID(riid, IID_IOleObject)) {
    face = &oleObject_;
  } else if (IsEqualIID(riid, IID_IOleInPlaceObjectWindowless) || IsEqualIID(riid, IID_IOleInPlaceObject) ||
             IsEqualIID(riid, IID_IOleWindow)) {
    face = &inPlaceObject_;
  } else if (IsEqualIID(riid, IID_IOleInPlaceActiveObject)) {
    face = &activeObject_;
  } else if (IsEqualIID(riid, IID_IOleControl)) {
    face = &oleControl_;
  } else if (IsEqualIID(riid, IID_IViewObjectEx) || IsEqualIID(riid, IID_IViewObject2) ||
             IsEqualIID(riid, IID_IViewObject)) {
    face = &viewObject_;
  } else if (IsEqualIID(riid, IID_IPersistStreamInit) || IsEqualIID(riid, IID_IPersist)) {
    face = &persistStream_;
  } else if (IsEqualIID(riid, IID_IPersistStorage)) {
    face = &persistStorage_;
  } else if (IsEqualIID(riid, IID_IQuickActivate)) {
    face = &quickActivate_;
  } else if (IsEqualIID(riid, IID_ISpecifyPropertyPages)) {
    face = &propertyPages_;
  } else if (IsEqualIID(riid, IID_IDataObject)) {
    face = &dataObject_;
  } else if (IsEqualIID(riid, IID_IEmbeddedControl)) {
    face = &embeddedControl_;
  }
  if (!face) return E_NOINTERFACE;
  face->AddRef();
  *out = face;
  return S_OK;
}

// ---- window and picture

void ControlCore::Repaint() noexcept {
  if (window_) InvalidateRect(window_, nullptr, TRUE);
  viewObject_.NotifyViewChange();
  dataObject_.NotifyDataChange();
}

HRESULT ControlCore::DrawInto(HDC dc, const RECT& bounds) {
  if (!hooksLive_) return E_UNEXPECTED;
  const LONG width = bounds.right - bounds.left;
  const LONG height = bounds.bottom - bounds.top;
  if (width <= 0 || height <= 0) return S_OK;
  const int saved = SaveDC(dc);
  // The control paints in its own coordinates, with (0, 0) at the top-left of bounds,
  // and never outside bounds.
  OffsetWindowOrgEx(dc, -bounds.left, -bounds.top, nullptr);
  IntersectClipRect(dc, 0, 0, width, height);
  const RECT client{0, 0, width, height};
  const HRESULT hr = br::com::Guarded(class_, [&] {
    hooks_.Paint(dc, client);
    return S_OK;
  });
  if (saved) RestoreDC(dc, saved);
  return hr;
}

LRESULT ControlCore::WindowMessage(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (!hooksLive_) return DefWindowProcW(window, message, wParam, lParam);
  LRESULT result = 0;
  bool handled = false;
  br::com::Guarded(class_, [&] {
    handled = hooks_.OnMessage(window, message, wParam, lParam, result);
    return S_OK;
  });
  if (handled) return result;

  switch (message) {
    case WM_PAINT: {
      PAINTSTRUCT paint;
      if (HDC dc = BeginPaint(window, &paint)) {
        RECT client;
        GetClientRect(window, &client);
        DrawInto(dc, client);
        EndPaint(window, &paint);
      }
      return 0;
    }
    case WM_PRINTCLIENT:
      if (HDC dc = reinterpret_cast<HDC>(wParam)) {
        RECT client;
        GetClientRect(window, &client);
        DrawInto(dc, client);
      }
      return 0;
    case WM_ERASEBKGND:
      return 1;  // painting covers the whole client area: erasing would only flicker
    case WM_SETFOCUS: {
      // Only the control's current window activates it (not one on its way out).
      if (window != window_) break;
      OwnerHold hold(owner_);
      if (InPlaceActive() && !uiActive_) InPlaceActivate(true);
      // The keys belong to the control's focus child, when it has one.
      if (hooksLive_ && GetFocus() == window) {
        br::com::Guarded(class_, [&] {
          hooks_.PassFocus();
          return S_OK;
        });
      }
      return 0;
    }
    case WM_MOUSEACTIVATE:
      if (window == window_ && InPlaceActive() && !uiActive_) {
        OwnerHold hold(owner_);
        InPlaceActivate(true);
      }
      break;
    case WM_KEYDOWN:
      // Tab reaches the control's own window only when nothing inside takes the keys.
      if (wParam == VK_TAB) {
        LeaveFocus(GetKeyState(VK_SHIFT) < 0);
        return 0;
      }
      break;
    case WM_NEXTDLGCTL:
      // A child tree of the control tabbed past its last (first) window.
      if (!LOWORD(lParam)) LeaveFocus(wParam != 0);
      return 0;
    default:
      break;
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

bool ControlCore::HoldsFocus() const noexcept {
  const HWND focus = GetFocus();
  return window_ && focus && (focus == window_ || IsChild(window_, focus));
}

void ControlCore::LeaveFocus(bool backwards) {
  if (!HoldsFocus()) return;
  OwnerHold hold(owner_);
  // The container knows its own tab order: it is asked first.
  if (const auto controlSite = site_.Query<IOleControlSite>(IID_IOleControlSite)) {
    MSG tab{GetFocus(), WM_KEYDOWN, VK_TAB, 1, static_cast<DWORD>(GetMessageTime()), {}};
    if (controlSite->TranslateAccelerator(&tab, backwards ? kKeyModifierShift : 0) == S_OK && !HoldsFocus()) return;
  }
  // Otherwise the window order: the next (previous) tab stop of the top-level window
  // after the control's window, unless that leads back into the control.
  if (!window_) return;
  const HWND top = GetAncestor(window_, GA_ROOT);
  const HWND next = top && top != window_ ? GetNextDlgTabItem(top, window_, backwards ? TRUE : FALSE) : nullptr;
  if (next && next != window_ && !IsChild(window_, next)) SetFocus(next);
}

void ControlCore::WindowDestroyed(HWND window) noexcept {
  if (window == window_) window_ = nullptr;
}

// ---- client site and activation

HRESULT ControlCore::SetClientSite(IOleClientSite* site) {
  site_ = br::com::ComRef<IOleClientSite>(site);
  return S_OK;
}

HRESULT ControlCore::DoVerb(LONG verb, IOleClientSite* activeSite) {
  if (!site_ && activeSite) SetClientSite(activeSite);
  switch (verb) {
    case OLEIVERB_PRIMARY:
    case OLEIVERB_SHOW:
    case OLEIVERB_INPLACEACTIVATE:
      return InPlaceActivate(false);
    case OLEIVERB_UIACTIVATE:
      return InPlaceActivate(true);
    case OLEIVERB_HIDE:
      UIDeactivate();
      if (window_) ShowWindow(window_, SW_HIDE);
      return S_OK;
    case OLEIVERB_OPEN:
      return OLEOBJ_S_CANNOT_DOVERB_NOW;  // no open-editing window
    case OLEIVERB_PROPERTIES:
      return E_NOTIMPL;  // no property pages
    case OLEIVERB_DISCARDUNDOSTATE:
      return S_OK;
    default:
      if (verb > 0) {
        const HRESULT hr = InPlaceActivate(false);
        return FAILED(hr) ? hr : OLEOBJ_S_INVALIDVERB;
      }
      return E_NOTIMPL;
  }
}

HRESULT ControlCore::InPlaceActivate(bool uiActivate) {
  if (!site_) return E_UNEXPECTED;
  if (!inPlaceSite_) {
    const auto site = site_.Query<IOleInPlaceSite>(IID_IOleInPlaceSite);
    if (!site || site->CanInPlaceActivate() != S_OK) return E_FAIL;
    // Windowed activation even when the site offers windowless: the controls need their
    // own window for the mouse, the keyboard and child windows.
    HRESULT hr;
    if (const auto siteEx = site.Query<IOleInPlaceSiteEx>(IID_IOleInPlaceSiteEx)) {
      BOOL noRedraw = FALSE;
      hr = siteEx->OnInPlaceActivateEx(&noRedraw, 0);
      siteIsEx_ = true;
    } else {
      hr = site->OnInPlaceActivate();
      siteIsEx_ = false;
    }
    if (FAILED(hr)) return hr;
    inPlaceSite_ = site;
  }

  HWND parent = nullptr;
  if (FAILED(inPlaceSite_->GetWindow(&parent)) || !parent || !IsWindow(parent)) {
    InPlaceDeactivate();
    return E_FAIL;
  }
  br::com::ComRef<IOleInPlaceFrame> frame;
  br::com::ComRef<IOleInPlaceUIWindow> document;
  RECT position{};
  RECT clip{};
  OLEINPLACEFRAMEINFO frameInfo{};
  frameInfo.cb = sizeof(frameInfo);
  HRESULT hr = inPlaceSite_->GetWindowContext(frame.Out(), document.Out(), &position, &clip, &frameInfo);
  if (FAILED(hr)) {
    InPlaceDeactivate();
    return hr;
  }
  if (!window_) {
    window_ = ControlWindow::Create(*this, parent, position);
    if (!window_) {
      InPlaceDeactivate();
      return E_FAIL;
    }
  } else if (GetParent(window_) != parent) {
    SetParent(window_, parent);
  }
  SetObjectRects(&position, &clip);
  ShowWindow(window_, SW_SHOWNA);

  const bool becomingUiActive = uiActivate && !uiActive_;
  if (becomingUiActive) {
    uiActive_ = true;
    frame_ = std::move(frame);
    document_ = std::move(document);
    inPlaceSite_->OnUIActivate();
  }
  // UI activation takes the focus, also for a control that is UI-active already; the
  // window hands it on to its focus child.
  if (uiActivate && window_ && !HoldsFocus()) SetFocus(window_);
  if (becomingUiActive) {
    if (frame_) {
      frame_->SetActiveObject(&activeObject_, class_.name);
      frame_->SetBorderSpace(nullptr);
    }
    if (document_) {
      document_->SetActiveObject(&activeObject_, class_.name);
      document_->SetBorderSpace(nullptr);
    }
  }
  if (site_) site_->ShowObject();
  return S_OK;
}

void ControlCore::ReleaseUiWindows() noexcept {
  frame_.Reset();
  document_.Reset();
}

HRESULT ControlCore::UIDeactivate() {
  if (!uiActive_) return S_OK;
  uiActive_ = false;
  if (frame_) frame_->SetActiveObject(nullptr, nullptr);
  if (document_) document_->SetActiveObject(nullptr, nullptr);
  ReleaseUiWindows();
  if (inPlaceSite_) inPlaceSite_->OnUIDeactivate(FALSE);
  return S_OK;
}

HRESULT ControlCore::InPlaceDeactivate() {
  UIDeactivate();
  if (window_) {
    const HWND window = window_;
    window_ = nullptr;
    if (IsWindow(window)) DestroyWindow(window);
  }
  if (!inPlaceSite_) return S_OK;
  const br::com::ComRef<IOleInPlaceSite> site = std::move(inPlaceSite_);
  const auto siteEx = siteIsEx_ ? site.Query<IOleInPlaceSiteEx>(IID_IOleInPlaceSiteEx) : nullptr;
  if (siteEx) {
    siteEx->OnInPlaceDeactivateEx(TRUE);
  } else {
    site->OnInPlaceDeactivate();
  }
  return S_OK;
}

HRESULT ControlCore::SetObjectRects(const RECT* position, const RECT* clip) {
  if (!position) return E_POINTER;
  if (!window_) return S_OK;
  MoveWindow(window_, position->left, position->top, position->right - position->left,
             position->bottom - position->top, TRUE);
  // Only the part of the control inside the clip rectangle may show.
  HRGN region = nullptr;
  if (clip) {
    RECT visible{};
    if (!IntersectRect(&visible, position, clip)) SetRectEmpty(&visible);
    if (!EqualRect(&visible, position)) {
      OffsetRect(&visible, -position->left, -position->top);
      region = CreateRectRgnIndirect(&visible);
    }
  }
  SetWindowRgn(window_, region, TRUE);  // the window owns the region from here on
  return S_OK;
}

HRESULT ControlCore::Close(DWORD saveOption) {
  if (dirty_ && site_ && (saveOption == OLECLOSE_SAVEIFDIRTY || saveOption == OLECLOSE_PROMPTSAVE)) {
    site_->SaveObject();
  }
  InPlaceDeactivate();
  if (adviseHolder_) adviseHolder_->SendOnClose();
  return S_OK;
}

// ---- extent

SIZEL ControlCore::Extent() noexcept {
  if (!extentKnown_) {
    long width = 0;
    long height = 0;
    br::com::Guarded(class_, [&] { return hooks_.GetPreferredSize(&width, &height); });
    const SIZE ppi = ScreenPixelsPerInch();
    extent_.cx = HimetricFromPixels(static_cast<std::int32_t>(width), ppi.cx);
    extent_.cy = HimetricFromPixels(static_cast<std::int32_t>(height), ppi.cy);
    extentKnown_ = true;
  }
  return extent_;
}

void ControlCore::SetExtent(const SIZEL& extent) noexcept {
  extentKnown_ = true;
  if (extent.cx != extent_.cx || extent.cy != extent_.cy) dirty_ = true;
  extent_ = extent;
}

SIZE ControlCore::ExtentInPixels() noexcept {
  const SIZEL extent = Extent();
  const SIZE ppi = ScreenPixelsPerInch();
  return SIZE{PixelsFromHimetric(extent.cx, ppi.cx), PixelsFromHimetric(extent.cy, ppi.cy)};
}

// ---- OLE advise sinks

HRESULT ControlCore::Advise(IAdviseSink* sink, DWORD* connection) {
  if (!adviseHolder_) {
    const HRESULT hr = CreateOleAdviseHolder(adviseHolder_.Out());
    if (FAILED(hr)) return hr;
  }
  return adviseHolder_->Advise(sink, connection);
}

HRESULT ControlCore::Unadvise(DWORD connection) {
  if (!adviseHolder_) return OLE_E_NOCONNECTION;
  return adviseHolder_->Unadvise(connection);
}

HRESULT ControlCore::EnumAdvise(IEnumSTATDATA** advise) {
  if (!advise) return E_POINTER;
  *advise = nullptr;
  if (!adviseHolder_) return S_OK;  // no connection: an empty answer
  return adviseHolder_->EnumAdvise(advise);
}

}  // namespace br::control
