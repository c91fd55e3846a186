// The error reporter's "BRCL Error" boxes of this thread, pressed from a hook as they come
// up: notes each box's text, counts those with Abort, Retry and Ignore, presses the given
// buttons in order (Abort beyond them), and runs an optional step while the box is up.
#pragma once

#include <windows.h>

#include <functional>
#include <string>
#include <vector>

namespace br::test {

class BoxPresser {
public:
  explicit BoxPresser(std::vector<int> buttons, std::function<void()> whileUp = {});
  ~BoxPresser();
  BoxPresser(const BoxPresser&) = delete;
  BoxPresser& operator=(const BoxPresser&) = delete;

  std::vector<std::string> texts;
  int abortRetryIgnore = 0;

private:
  static LRESULT CALLBACK OnCbt(int code, WPARAM wParam, LPARAM lParam);
  static void CALLBACK Press(HWND box, UINT, UINT_PTR timer, DWORD);

  static BoxPresser* s_current;
  std::vector<int> buttons_;
  std::function<void()> whileUp_;
  HWND last_ = nullptr;
  HHOOK hook_ = nullptr;
};

}  // namespace br::test
