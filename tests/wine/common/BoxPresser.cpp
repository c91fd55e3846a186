#include "tests/wine/common/BoxPresser.h"

namespace br::test {

BoxPresser* BoxPresser::s_current = nullptr;

BoxPresser::BoxPresser(std::vector<int> buttons, std::function<void()> whileUp)
    : buttons_(std::move(buttons)), whileUp_(std::move(whileUp)) {
  s_current = this;
  hook_ = SetWindowsHookExA(WH_CBT, OnCbt, nullptr, GetCurrentThreadId());
}

BoxPresser::~BoxPresser() {
  UnhookWindowsHookEx(hook_);
  s_current = nullptr;
}

LRESULT CALLBACK BoxPresser::OnCbt(int code, WPARAM wParam, LPARAM lParam) {
  const HWND box = reinterpret_cast<HWND>(wParam);
  char caption[64] = "";
  if (s_current && code == HCBT_ACTIVATE && box != s_current->last_ &&
      GetWindowTextA(box, caption, sizeof caption) && lstrcmpA(caption, "BRCL Error") == 0) {
    s_current->last_ = box;
    SetTimer(box, 1, 10, Press);  // runs in the box's own loop, once it is set up
  }
  return CallNextHookEx(nullptr, code, wParam, lParam);
}

void CALLBACK BoxPresser::Press(HWND box, UINT, UINT_PTR timer, DWORD) {
  KillTimer(box, timer);
  BoxPresser& self = *s_current;
  char text[1024] = "";
  GetDlgItemTextA(box, 0xFFFF, text, sizeof text);  // the message box's text control
  self.abortRetryIgnore += GetDlgItem(box, IDABORT) && GetDlgItem(box, IDRETRY) && GetDlgItem(box, IDIGNORE);
  const int button = self.texts.size() < self.buttons_.size() ? self.buttons_[self.texts.size()] : IDABORT;
  self.texts.push_back(text);
  if (self.whileUp_) self.whileUp_();
  PostMessageA(box, WM_COMMAND, MAKEWPARAM(button, BN_CLICKED), reinterpret_cast<LPARAM>(GetDlgItem(box, button)));
}

}  // namespace br::test
