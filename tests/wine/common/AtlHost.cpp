#include "tests/wine/common/AtlHost.h"

#include <doctest/doctest.h>

namespace br::test {

AtlHost::AtlHost() {
  REQUIRE((module_ = LoadLibraryW(L"atl.dll")) != nullptr);
  winInit_ = reinterpret_cast<decltype(winInit_)>(reinterpret_cast<void*>(GetProcAddress(module_, "AtlAxWinInit")));
  attach_ = reinterpret_cast<decltype(attach_)>(reinterpret_cast<void*>(GetProcAddress(module_, "AtlAxAttachControl")));
  REQUIRE((winInit_ && attach_));
}

HWND AtlHost::MakeWindow(int width, int height) {
  WNDCLASSW wc{};
  if (!GetClassInfoW(GetModuleHandleW(nullptr), L"BR_Info_TestHost", &wc)) {
    wc.lpfnWndProc = DefWindowProcW;
    wc.hInstance = GetModuleHandleW(nullptr);
    wc.lpszClassName = L"BR_Info_TestHost";
    RegisterClassW(&wc);
  }
  return CreateWindowExW(0, L"BR_Info_TestHost", L"host", WS_POPUP | WS_VISIBLE | WS_CLIPCHILDREN, 0, 0, width,
                         height, nullptr, nullptr, GetModuleHandleW(nullptr), nullptr);
}

}  // namespace br::test
