#include "tests/wine/boundary/control_host.h"

#include <doctest/doctest.h>

namespace br::test {

namespace {

constexpr const wchar_t* kHostClass = L"BR_Info_ReliabilityHost";
using AttachEntry = HRESULT(WINAPI*)(IUnknown*, HWND, IUnknown**);
using WinInitEntry = BOOL(WINAPI*)();

HWND MakeHostWindow(int width, int height) {
  WNDCLASSW wc{};
  if (!GetClassInfoW(GetModuleHandleW(nullptr), kHostClass, &wc)) {
    wc.lpfnWndProc = DefWindowProcW;
    wc.hInstance = GetModuleHandleW(nullptr);
    wc.lpszClassName = kHostClass;
    RegisterClassW(&wc);
  }
  return CreateWindowExW(0, kHostClass, L"host", WS_POPUP | WS_VISIBLE | WS_CLIPCHILDREN, 0, 0, width, height,
                         nullptr, nullptr, GetModuleHandleW(nullptr), nullptr);
}

}  // namespace

HostedControl::HostedControl(const DllUnderTest& dll, const CLSID& clsid, int width, int height) {
  atl_ = LoadLibraryW(L"atl.dll");
  REQUIRE(atl_ != nullptr);
  auto winInit = reinterpret_cast<WinInitEntry>(reinterpret_cast<void*>(GetProcAddress(atl_, "AtlAxWinInit")));
  auto attach = reinterpret_cast<AttachEntry>(reinterpret_cast<void*>(GetProcAddress(atl_, "AtlAxAttachControl")));
  REQUIRE((winInit && attach));
  winInit();
  REQUIRE(dll.Create(clsid, IID_IUnknown, reinterpret_cast<void**>(&control_)) == S_OK);
  host_ = MakeHostWindow(width, height);
  REQUIRE(host_ != nullptr);
  REQUIRE(attach(control_, host_, &site_) == S_OK);
  IOleWindow* window = nullptr;
  REQUIRE(control_->QueryInterface(IID_IOleWindow, reinterpret_cast<void**>(&window)) == S_OK);
  window->GetWindow(&window_);
  window->Release();
  REQUIRE(window_ != nullptr);
}

HostedControl::~HostedControl() {
  Close();
  if (atl_) FreeLibrary(atl_);
}

void HostedControl::Close() {
  if (host_) DestroyWindow(host_);
  host_ = nullptr;
  window_ = nullptr;
  if (site_) site_->Release();
  site_ = nullptr;
  DropReference();
}

void HostedControl::DropReference() {
  if (control_) control_->Release();
  control_ = nullptr;
}

void HostedControl::QueryOrFail(const IID& iid, void** out) const {
  REQUIRE(control_ != nullptr);
  REQUIRE(control_->QueryInterface(iid, out) == S_OK);
}

Picture::Picture(int width, int height) : width_(width), height_(height) {
  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof(info.bmiHeader);
  info.bmiHeader.biWidth = width;
  info.bmiHeader.biHeight = -height;
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  info.bmiHeader.biCompression = BI_RGB;
  dc_ = CreateCompatibleDC(nullptr);
  void* bits = nullptr;
  bitmap_ = CreateDIBSection(dc_, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  bits_ = static_cast<std::uint32_t*>(bits);
  old_ = SelectObject(dc_, bitmap_);
}

Picture::~Picture() {
  SelectObject(dc_, old_);
  DeleteObject(bitmap_);
  DeleteDC(dc_);
}

COLORREF Picture::At(int x, int y) const {
  if (!bits_ || x < 0 || y < 0 || x >= width_ || y >= height_) return 0xFFFFFFFF;
  GdiFlush();
  const std::uint32_t pixel = bits_[static_cast<std::size_t>(y) * width_ + x];
  return RGB((pixel >> 16) & 0xFF, (pixel >> 8) & 0xFF, pixel & 0xFF);
}

HRESULT Picture::Draw(IUnknown* control) const {
  IViewObject* view = nullptr;
  HRESULT hr = control->QueryInterface(IID_IViewObject, reinterpret_cast<void**>(&view));
  if (FAILED(hr)) return hr;
  const RECTL box{0, 0, width_, height_};
  hr = view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, dc_, &box, nullptr, nullptr, 0);
  view->Release();
  return hr;
}

}  // namespace br::test
