#include "picture/cPictureBox.h"

#include "frame/com/ComRef.h"
#include "frame/settings/localised_texts.h"
#include "frame/settings/settings.h"
#include "picture/AXPictDescr.h"
#include "resources/resource.h"
#include "toolkit/core/Panel.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/FlowLayout.h"
#include "toolkit/layout/Layout.h"
#include "toolkit/widgets/AXComponent.h"
#include "toolkit/widgets/Button.h"

#include "BR_Private.h"

#include <algorithm>

namespace br::picture {

namespace {

constexpr wchar_t kWindowClass[] = L"BR_Info_PictureBox";
constexpr DWORD kStyle = WS_POPUP | WS_CAPTION | WS_SYSMENU | WS_THICKFRAME | WS_CLIPCHILDREN;

// The hosted view, as large as its zoomed picture plus room for both scroll bars.
class ViewHost final : public toolkit::AXComponent {
public:
  ViewHost() { create(CLSID_XPICREPView); }
  SIZE getPreferredSize() override {
    IEmbeddedControl* embedded = nullptr;
    long width = 0, height = 0;
    const bool asked = SUCCEEDED(getControl(IID_IEmbeddedControl, reinterpret_cast<void**>(&embedded))) &&
                       SUCCEEDED(embedded->GetPreferredSize(&width, &height));
    if (embedded) embedded->Release();
    if (!asked) return SIZE{100, 100};
    return SIZE{width + 2 * GetSystemMetrics(SM_CXVSCROLL), height + 2 * GetSystemMetrics(SM_CYHSCROLL)};
  }
  SIZE getPreferredSizeIn(const RECT&) override { return getPreferredSize(); }
};

}  // namespace

// The window's tree: the view in the centre, the Close button in a right-aligned row below.
class cPictureBox::Content final : public toolkit::Panel {
public:
  explicit Content(cPictureBox& box) : Panel(std::make_unique<toolkit::BorderLayout>(5, 5)), box_(box) {
    setInsets(3, 3, 3, 3);
    insertNamed("Center", &view, "view");
    insertNamed("South", &buttons_, "buttons");
    buttons_.add(&close_, "close");
  }
  int onAction(toolkit::ToolkitEvent& event) override {
    if (event.source != &close_) return 0;
    box_.Hide();
    if (box_.closed_) box_.closed_();
    return 1;
  }

  ViewHost view;

private:
  cPictureBox& box_;
  toolkit::Panel buttons_{std::make_unique<toolkit::FlowLayout>(toolkit::kAlignRight, 3, 3, true)};
  toolkit::Button close_{GetText("cPictureBox", -1, "Close").c_str()};
};

cPictureBox::cPictureBox(HWND owner, std::function<void()> closed)
    : closed_(std::move(closed)), content_(std::make_unique<Content>(*this)) {
  const HINSTANCE module = toolkit::ToolkitWindows::moduleInstance();
  window_ = CreateDialogParamW(module, MAKEINTRESOURCEW(IDD_PICTURE_BOX), owner, DialogProc,
                               reinterpret_cast<LPARAM>(this));
  if (!window_) {
    // A module without the template (the toolkit linked into a program): the same window
    // made by hand.
    WNDCLASSW wc{};
    if (!GetClassInfoW(module, kWindowClass, &wc)) {
      wc.lpfnWndProc = WindowProc;
      wc.hInstance = module;
      wc.hCursor = LoadCursor(nullptr, IDC_ARROW);
      wc.hbrBackground = reinterpret_cast<HBRUSH>(COLOR_BTNFACE + 1);
      wc.lpszClassName = kWindowClass;
      RegisterClassW(&wc);
    }
    window_ = CreateWindowExW(WS_EX_DLGMODALFRAME, kWindowClass, L"", kStyle, CW_USEDEFAULT, CW_USEDEFAULT, 200, 150,
                              owner, nullptr, module, this);
  }
  if (window_ && content_->create(window_)) LayOut();
}

cPictureBox::~cPictureBox() {
  if (window_) {
    SetWindowLongPtrW(window_, DWLP_USER, 0);
    if (IsWindow(window_)) {
      // The tree's windows go first, while the window is still there.
      content_.reset();
      DestroyWindow(window_);
    }
  }
}

INT_PTR CALLBACK cPictureBox::DialogProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_INITDIALOG) {
    SetWindowLongPtrW(window, DWLP_USER, lParam);
    reinterpret_cast<cPictureBox*>(lParam)->window_ = window;
    return FALSE;
  }
  auto* box = reinterpret_cast<cPictureBox*>(GetWindowLongPtrW(window, DWLP_USER));
  return box && box->OnMessage(message, wParam, lParam) ? TRUE : FALSE;
}

LRESULT CALLBACK cPictureBox::WindowProc(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_NCCREATE) {
    auto* box = static_cast<cPictureBox*>(reinterpret_cast<CREATESTRUCTW*>(lParam)->lpCreateParams);
    SetWindowLongPtrW(window, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(box));
    box->window_ = window;
  }
  auto* box = reinterpret_cast<cPictureBox*>(GetWindowLongPtrW(window, GWLP_USERDATA));
  if (box && box->OnMessage(message, wParam, lParam)) return 0;
  return DefWindowProcW(window, message, wParam, lParam);
}

bool cPictureBox::OnMessage(UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_SHOWWINDOW:
      // Shown by a show call (not by the owner's minimising or restoring).
      if (wParam && lParam == 0) Place();
      return false;
    case WM_MOVE:
      StorePlacement();
      return false;
    case WM_SIZE:
      StorePlacement();
      LayOut();
      return false;
    case WM_CLOSE:
      Hide();
      if (closed_) closed_();
      return true;
    default:
      return false;
  }
}

IXPICREPView* cPictureBox::View() const {
  IXPICREPView* view = nullptr;
  if (!content_ || FAILED(content_->view.getControl(IID_IXPICREPView, reinterpret_cast<void**>(&view)))) return nullptr;
  return view;
}

SIZE cPictureBox::PreferredClientSize() const { return content_ ? content_->getPreferredSize() : SIZE{100, 100}; }

bool cPictureBox::ShowPicture(const std::wstring& path) {
  const auto view = br::com::ComRef<IXPICREPView>::Adopt(View());
  if (!view || !window_) return false;
  SetDefaultShading(view.Get());
  VARIANT name;
  name.vt = VT_BSTR;
  name.bstrVal = SysAllocString(path.c_str());
  view->put_Property(PRV_PICFILENAME, name);
  VariantClear(&name);
  VARIANT zoom;
  zoom.vt = VT_I4;
  zoom.lVal = 100;
  view->put_Property(PRV_ZOOMPERCENT, zoom);
  // Hidden first, so that showing asks for the size the new picture wants.
  ShowWindow(window_, SW_HIDE);
  ShowWindow(window_, SW_SHOW);
  RedrawWindow(window_, nullptr, nullptr, RDW_INVALIDATE | RDW_FRAME | RDW_ALLCHILDREN | RDW_ERASE);
  return true;
}

void cPictureBox::RemovePicture() {
  const auto view = br::com::ComRef<IXPICREPView>::Adopt(View());
  if (!view) return;
  VARIANT empty;
  VariantInit(&empty);
  view->put_Property(PRV_PICFILENAME, empty);
}

void cPictureBox::Hide() {
  if (window_) ShowWindow(window_, SW_HIDE);
}

void cPictureBox::Place() {
  const SIZE wanted = PreferredClientSize();
  RECT frame{0, 0, wanted.cx, wanted.cy};
  AdjustWindowRectEx(&frame, static_cast<DWORD>(GetWindowLongW(window_, GWL_STYLE)), FALSE,
                     static_cast<DWORD>(GetWindowLongW(window_, GWL_EXSTYLE)));
  // Never larger than the work area of the window's monitor.
  MONITORINFO monitor{sizeof monitor};
  RECT work{0, 0, GetSystemMetrics(SM_CXSCREEN), GetSystemMetrics(SM_CYSCREEN)};
  if (GetMonitorInfoW(MonitorFromWindow(window_, MONITOR_DEFAULTTOPRIMARY), &monitor)) work = monitor.rcWork;
  const int width = std::min<long>(frame.right - frame.left, work.right - work.left);
  const int height = std::min<long>(frame.bottom - frame.top, work.bottom - work.top);

  const RECT stored = br::ReadPictureBoxPlacement();
  int x = 0, y = 0;
  if (stored.right != stored.left && stored.bottom != stored.top) {
    RECT own{};
    GetWindowRect(window_, &own);
    // The first time the stored client corner places it; later it stays where it is.
    x = placed_ ? own.left : stored.left + frame.left;
    y = placed_ ? own.top : stored.top + frame.top;
  } else {
    RECT around = work;
    const HWND active = GetActiveWindow();
    if (active && active != window_) GetWindowRect(active, &around);
    x = (around.left + around.right - width) / 2;
    y = (around.top + around.bottom - height) / 2;
  }
  // Keep it on the work area.
  x = std::max<long>(work.left, std::min<long>(x, work.right - width));
  y = std::max<long>(work.top, std::min<long>(y, work.bottom - height));
  placing_ = true;
  SetWindowPos(window_, nullptr, x, y, width, height, SWP_NOZORDER | SWP_NOACTIVATE);
  placing_ = false;
  placed_ = true;
  StorePlacement();
  LayOut();
}

void cPictureBox::StorePlacement() const {
  if (placing_ || !window_ || !IsWindowVisible(window_)) return;
  RECT client{};
  GetClientRect(window_, &client);
  MapWindowPoints(window_, nullptr, reinterpret_cast<POINT*>(&client), 2);
  br::WritePictureBoxPlacement(client);
}

void cPictureBox::LayOut() {
  if (!content_ || !content_->isValid() || !window_) return;
  RECT client{};
  GetClientRect(window_, &client);
  content_->setBounds(0, 0, client.right, client.bottom, true, true);
  content_->doLayout();
}

}  // namespace br::picture
