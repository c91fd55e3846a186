#include "tests/wine/common/toolkit_test_support.h"

#include "toolkit/layout/BorderLayout.h"

namespace tktest {

using namespace toolkit;

namespace {
LRESULT CALLBACK nativeProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  nativeCalls().push_back(NativeCall{message, wParam});
  return DefWindowProcA(hwnd, message, wParam, lParam);
}
}  // namespace

RECT placed(const cXComponent& component) {
  RECT r{};
  HWND hwnd = component.getHandle();
  if (!hwnd) return r;
  GetWindowRect(hwnd, &r);
  MapWindowPoints(nullptr, GetParent(hwnd), reinterpret_cast<POINT*>(&r), 2);
  return r;
}

Probe::~Probe() {
  if (deletions) ++*deletions;
}

int Probe::dispatchEvent(ToolkitEvent& event) {
  seen.push_back(wtest::recordOf(event));
  return cXComponent::dispatchEvent(event);
}

int Probe::onKeyDown(ToolkitEvent& event, int key) {
  if (!deleteSelfOnKey) return cXComponent::onKeyDown(event, key);
  // Something still queued behind this event must be dropped, not dispatched.
  peer()->queue(std::make_unique<ToolkitEvent>(this, 61, event.hwnd));
  delete this;
  return 1;
}

std::vector<int> Probe::ids() const {
  std::vector<int> out;
  for (const Seen& s : seen) out.push_back(s.id);
  return out;
}

ProbePanel::ProbePanel() { setLayout(std::make_unique<BorderLayout>()); }

int ProbePanel::dispatchEvent(ToolkitEvent& event) {
  seen.push_back(wtest::recordOf(event));
  return Container::dispatchEvent(event);
}

const char* nativeClassName() {
  static const bool registered = [] {
    WNDCLASSEXA wc{};
    wc.cbSize = sizeof(wc);
    wc.lpfnWndProc = nativeProc;
    wc.hInstance = GetModuleHandleA(nullptr);
    wc.lpszClassName = "ToolkitTestNative";
    return RegisterClassExA(&wc) != 0;
  }();
  (void)registered;
  return "ToolkitTestNative";
}

std::vector<NativeCall>& nativeCalls() {
  static std::vector<NativeCall> calls;
  return calls;
}

int nativeCount(UINT message) {
  int n = 0;
  for (const NativeCall& c : nativeCalls()) n += c.message == message;
  return n;
}

}  // namespace tktest
