#pragma once
// Helpers for the toolkit suites: components that record what reaches them and window
// rectangles in parent coordinates; the host window and pump are the widget suites'.

#include <windows.h>

#include <string>
#include <vector>

#include "tests/wine/widgets/WidgetTestSupport.h"
#include "toolkit/core/Container.h"
#include "toolkit/core/cXComponent.h"

namespace tktest {

using wtest::HostWindow;
using wtest::pump;

// The window's rectangle in its parent's client coordinates.
RECT placed(HWND hwnd);
RECT placed(const toolkit::cXComponent& component);
using wtest::str;
using wtest::xywh;

using wtest::Seen;

// A component that records every event dispatched to it and answers chosen
// handlers with chosen values.
class Probe : public toolkit::cXComponent {
public:
  SIZE pref{10, 10};
  std::vector<Seen> seen;
  int answer = 0;             // what the handlers below answer
  bool markHandled = false;   // whether they mark the event handled
  int* deletions = nullptr;   // counts destructor runs when set
  bool deleteSelfOnKey = false;

  ~Probe() override;
  int dispatchEvent(toolkit::ToolkitEvent& event) override;
  SIZE getPreferredSize() override { return pref; }
  SIZE getPreferredSizeIn(const RECT&) override { return pref; }
  int onKeyDown(toolkit::ToolkitEvent& event, int key) override;
  int onChar(toolkit::ToolkitEvent& event, int ch) override { return react(event); }
  int onMouseDown(toolkit::ToolkitEvent& event, int, int) override { return react(event); }
  int onAction(toolkit::ToolkitEvent& event) override { return react(event); }
  int onNotify(toolkit::ToolkitEvent& event) override { return react(event); }

  std::vector<int> ids() const;
  const Seen* last(int id) const { return wtest::lastOf(seen, id); }

private:
  int react(toolkit::ToolkitEvent& event);
};

// A container that records what bubbles up to it.
class ProbePanel : public toolkit::Container {
public:
  explicit ProbePanel(std::unique_ptr<toolkit::Layout> layout = nullptr);
  std::vector<Seen> seen;
  int answer = 0;
  int dispatchEvent(toolkit::ToolkitEvent& event) override;
  int onAction(toolkit::ToolkitEvent&) override { return answer; }
  int onKeyDown(toolkit::ToolkitEvent&, int) override { return answer; }
};

// A window class whose procedure records the messages it receives: stands for a
// native control's own procedure.
const char* nativeClassName();
struct NativeCall {
  HWND hwnd;
  UINT message;
  WPARAM wParam;
};
std::vector<NativeCall>& nativeCalls();
int nativeCount(UINT message);

}  // namespace tktest
