#pragma once
// Helpers for the widget suites: a visible host window, a message pump, a panel
// that records what bubbles up to it, key and mouse messages, and pixels drawn
// into a memory bitmap.

#include <windows.h>

#include <cstdint>
#include <string>
#include <vector>

#include "toolkit/core/Container.h"
#include "toolkit/core/cXComponent.h"

namespace wtest {

// A plain popup window at (100, 100) on the screen.
class HostWindow {
public:
  explicit HostWindow(int width = 400, int height = 300);
  ~HostWindow();
  HWND hwnd() const { return hwnd_; }

private:
  HWND hwnd_ = nullptr;
};

void pump(int ms);

// An event as it reached a recording component.
struct Seen {
  int id;
  toolkit::cXComponent* source;
  HWND hwnd;
  std::intptr_t params[7];
  int keyState;
};
Seen recordOf(const toolkit::ToolkitEvent& event);
// The last of `seen` with that id, or null.
const Seen* lastOf(const std::vector<Seen>& seen, int id);

// A container that records every event reaching its dispatchEvent, and answers
// them with `answer`.
class RecordingPanel : public toolkit::Container {
public:
  std::vector<Seen> seen;
  int answer = 0;
  int dispatchEvent(toolkit::ToolkitEvent& event) override;
  int count(int id) const;
  const Seen* last(int id) const { return lastOf(seen, id); }
};

// The panel made a window inside `host`, filling it.
void mount(RecordingPanel& panel, HostWindow& host);

// A recording panel filling a host window of its own.
struct MountedPanel : RecordingPanel {
  HostWindow host;
  MountedPanel() { mount(*this, host); }
};

// WM_KEYDOWN, WM_CHAR and mouse messages sent to `hwnd`.
void key(HWND hwnd, int virtualKey);
void typeChar(HWND hwnd, char ch);
void press(HWND hwnd, UINT message, int x, int y, WPARAM keys);

// A 32-bit top-down DIB with a memory DC, filled with `fill` at first.
class Canvas {
public:
  Canvas(int width, int height, COLORREF fill);
  ~Canvas();
  HDC dc() const { return dc_; }
  COLORREF at(int x, int y) const;
  int countIn(COLORREF colour, const RECT& area) const;

private:
  COLORREF raw(int x, int y) const;
  HDC dc_ = nullptr;
  HBITMAP bitmap_ = nullptr;
  HGDIOBJ old_ = nullptr;
  std::uint32_t* bits_ = nullptr;
  int width_, height_;
};

std::string windowClass(HWND hwnd);

// Rectangles, sizes and points as text, so that one check compares every field.
RECT xywh(int x, int y, int w, int h);
std::string str(const RECT& r);  // "(left,top wxh)"
std::string str(SIZE s);         // "wxh"
std::string str(POINT p);        // "(x,y)"

// Moves the shared cursor to a test point: false where the platform keeps it still.
bool cursorMoves();

}  // namespace wtest
