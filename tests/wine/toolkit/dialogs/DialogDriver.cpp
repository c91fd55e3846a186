#include "tests/wine/toolkit/dialogs/DialogDriver.h"

#include <algorithm>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/base/class_records.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/dialogs/ModalDialog.h"

namespace br::test {

namespace {

thread_local DialogDriver* t_driver = nullptr;
constexpr DWORD kGiveUpMs = 3000;  // a step that left its box open: close it, never hang

bool isDialogWindow(HWND hwnd) {
  char name[16] = {};
  GetClassNameA(hwnd, name, sizeof name);
  return std::string(name) == "#32770";
}

BOOL CALLBACK collect(HWND hwnd, LPARAM out) {
  if (isDialogWindow(hwnd)) reinterpret_cast<std::vector<HWND>*>(out)->push_back(hwnd);
  return TRUE;
}

toolkit::Container* rootOf(HWND dialog) {
  for (HWND child = GetWindow(dialog, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    toolkit::cXComponent* c = toolkit::ToolkitWindows::componentOf(child);
    if (c && toolkit::isKindOf(c, &toolkit::records::Container)) return static_cast<toolkit::Container*>(c);
  }
  return nullptr;
}

ShownDialog read(HWND window) {
  ShownDialog d;
  d.window = window;
  GetWindowRect(window, &d.rect);
  d.root = rootOf(window);
  d.edit = GetDlgItem(window, toolkit::ModalDialog::kEditId);
  if (!d.root) return d;
  auto* row = static_cast<toolkit::Container*>(d.root->findNamed("BUTTONS"));
  if (!row) return d;
  for (int i = 0; i < row->getChildCount(); ++i) {
    toolkit::cXComponent* c = row->getChild(i);
    if (!toolkit::isKindOf(c, &toolkit::records::Button)) continue;
    d.buttons.push_back(static_cast<toolkit::Button*>(c));
    d.names.push_back(row->getChildName(i));
  }
  return d;
}

}  // namespace

toolkit::Button* ShownDialog::button(const char* name) const {
  for (std::size_t i = 0; i < names.size(); ++i)
    if (names[i] == name) return buttons[i];
  return nullptr;
}

std::vector<std::string> ShownDialog::labels() const {
  std::vector<std::string> out;
  for (toolkit::Button* b : buttons) out.push_back(b->getText());
  return out;
}

void ShownDialog::click(const char* name) const {
  toolkit::Button* b = button(name);
  if (!b) return;
  const HWND h = b->getHandle();
  wtest::press(h, WM_LBUTTONDOWN, 2, 2, MK_LBUTTON);
  wtest::press(h, WM_LBUTTONUP, 2, 2, 0);
}

void ShownDialog::postKey(int virtualKey) const {
  HWND target = GetFocus();
  if (!target || (target != window && !IsChild(window, target))) target = window;
  PostMessageA(target, WM_KEYDOWN, static_cast<WPARAM>(virtualKey), 1);
  PostMessageA(target, WM_KEYUP, static_cast<WPARAM>(virtualKey), 0xC0000001);
}

DialogDriver::DialogDriver(std::vector<Step> steps) : steps_(std::move(steps)), previous_(t_driver) {
  t_driver = this;
  timer_ = SetTimer(nullptr, 0, 10, &DialogDriver::tick);
}

DialogDriver::~DialogDriver() {
  if (timer_) KillTimer(nullptr, timer_);
  t_driver = previous_;
}

void CALLBACK DialogDriver::tick(HWND, UINT, UINT_PTR, DWORD) {
  if (t_driver) t_driver->look();
}

void DialogDriver::look() {
  std::vector<HWND> open;
  EnumThreadWindows(GetCurrentThreadId(), collect, reinterpret_cast<LPARAM>(&open));
  for (HWND window : open) {
    const auto known = std::find(seen_.begin(), seen_.end(), window);
    if (known != seen_.end()) {
      // Still open long after its step ran: the step did not end it.
      if (IsWindowEnabled(window) && GetTickCount() - since_[known - seen_.begin()] > kGiveUpMs)
        PostMessageA(window, WM_CLOSE, 0, 0);
      continue;
    }
    if (!IsWindowVisible(window) || !IsWindowEnabled(window)) continue;
    seen_.push_back(window);
    since_.push_back(GetTickCount());
    if (static_cast<std::size_t>(shown_) >= steps_.size()) {
      PostMessageA(window, WM_CLOSE, 0, 0);  // a box nobody expected
      continue;
    }
    ShownDialog shown = read(window);
    const Step step = steps_[shown_++];
    step(shown);  // may open a box of its own: this runs again inside its loop
  }
}

}  // namespace br::test
