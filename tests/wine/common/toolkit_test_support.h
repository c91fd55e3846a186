#pragma once
// Helpers for the toolkit suites: components that record what reaches them and window
// rectangles in parent coordinates; the host window and pump are the widget suites'.

#include <windows.h>

#include <string>
#include <vector>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/core/Container.h"
#include "toolkit/core/cXComponent.h"

namespace tktest {

using wtest::HostWindow;
using wtest::pump;
using wtest::Seen;
using wtest::str;
using wtest::xywh;

// The window's rectangle in its parent's client coordinates.
RECT placed(const toolkit::cXComponent& component);

// A component that records every event dispatched to it.
class Probe : public toolkit::cXComponent {
public:
  SIZE pref{10, 10};
  std::vector<Seen> seen;
  int* deletions = nullptr;  // counts destructor runs when set
  bool deleteSelfOnKey = false;

  ~Probe() override;
  int dispatchEvent(toolkit::ToolkitEvent& event) override;
  SIZE getPreferredSize() override { return pref; }
  SIZE getPreferredSizeIn(const RECT&) override { return pref; }
  int onKeyDown(toolkit::ToolkitEvent& event, int key) override;

  std::vector<int> ids() const;
  const Seen* last(int id) const { return wtest::lastOf(seen, id); }
};

// A container that records what bubbles up to it and answers key events with `answer`.
class ProbePanel : public toolkit::Container {
public:
  ProbePanel();
  std::vector<Seen> seen;
  int answer = 0;
  int dispatchEvent(toolkit::ToolkitEvent& event) override;
  int onKeyDown(toolkit::ToolkitEvent&, int) override { return answer; }
};

// A window class whose procedure records the messages it receives: stands for a
// native control's own procedure.
const char* nativeClassName();
struct NativeCall {
  UINT message;
  WPARAM wParam;
};
std::vector<NativeCall>& nativeCalls();
int nativeCount(UINT message);

}  // namespace tktest
