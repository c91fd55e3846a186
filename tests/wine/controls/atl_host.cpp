#include "tests/wine/controls/atl_host.h"

#include <doctest/doctest.h>

namespace br::test {

namespace {

constexpr const wchar_t* kHostClass = L"BR_Info_TestHost";

template <class F>
F Entry(HMODULE module, const char* name) {
  return reinterpret_cast<F>(reinterpret_cast<void*>(GetProcAddress(module, name)));
}

}  // namespace

AtlHost::AtlHost() {
  module_ = LoadLibraryW(L"atl.dll");
  REQUIRE(module_ != nullptr);
  winInit_ = Entry<WinInitEntry>(module_, "AtlAxWinInit");
  attach_ = Entry<AttachEntry>(module_, "AtlAxAttachControl");
  REQUIRE((winInit_ && attach_));
}

AtlHost::~AtlHost() { FreeLibrary(module_); }

HWND AtlHost::MakeWindow(int width, int height) {
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

}  // namespace br::test
