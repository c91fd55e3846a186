#include "ToolkitTestSupport.h"

#include "toolkit/layout/BorderLayout.h"

namespace tktest {

using namespace toolkit;

namespace {

LRESULT CALLBACK nativeProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  nativeCalls().push_back(NativeCall{hwnd, message, wParam});
  return DefWindowProcA(hwnd, message, wParam, lParam);
}

void registerOnce(const char* name, WNDPROC proc) {
  WNDCLASSEXA info{};
  info.cbSize = sizeof(info);
  if (GetClassInfoExA(GetModuleHandleA(nullptr), name, &info)) return;
  WNDCLASSEXA wc{};
  wc.cbSize = sizeof(wc);
  wc.lpfnWndProc = proc;
  wc.hInstance = GetModuleHandleA(nullptr);
  wc.hCursor = LoadCursor(nullptr, IDC_ARROW);
  wc.lpszClassName = name;
  RegisterClassExA(&wc);
}

}  // namespace

RECT placed(HWND hwnd) {
  RECT r{};
  if (!hwnd) return r;
  GetWindowRect(hwnd, &r);
  MapWindowPoints(nullptr, GetParent(hwnd), reinterpret_cast<POINT*>(&r), 2);
  return r;
}

RECT placed(const cXComponent& component) { return placed(component.getHandle()); }

Probe::~Probe() {
  if (deletions) ++*deletions;
}

int Probe::dispatchEvent(ToolkitEvent& event) {
  seen.push_back(wtest::recordOf(event));
  return cXComponent::dispatchEvent(event);
}

int Probe::react(ToolkitEvent& event) {
  if (markHandled) event.handled = true;
  return answer;
}

int Probe::onKeyDown(ToolkitEvent& event, int) {
  if (deleteSelfOnKey) {
    // Something still queued behind this event must be dropped, not dispatched.
    peer()->queue(std::make_unique<ToolkitEvent>(this, 61, event.hwnd));
    delete this;
    return 1;
  }
  return react(event);
}

std::vector<int> Probe::ids() const {
  std::vector<int> out;
  for (const Seen& s : seen) out.push_back(s.id);
  return out;
}

ProbePanel::ProbePanel(std::unique_ptr<Layout> layout) {
  setLayout(layout ? std::move(layout) : std::make_unique<BorderLayout>());
}

int ProbePanel::dispatchEvent(ToolkitEvent& event) {
  seen.push_back(wtest::recordOf(event));
  return Container::dispatchEvent(event);
}

const char* nativeClassName() {
  registerOnce("ToolkitTestNative", nativeProc);
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
