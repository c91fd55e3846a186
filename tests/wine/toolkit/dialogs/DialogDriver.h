#pragma once
// Drives the toolkit's modal boxes from inside their modal loop: a thread timer looks for
// each new visible, enabled dialog window of the thread and runs the next step on it, as
// a person would act once the box is on the screen.

#include <windows.h>

#include <functional>
#include <string>
#include <vector>

#include "toolkit/core/Container.h"
#include "toolkit/widgets/Button.h"

namespace br::test {

// What a step sees of a box on the screen.
struct ShownDialog {
  HWND window = nullptr;
  RECT rect{};                                // the dialog's window rectangle (screen)
  toolkit::Container* root = nullptr;         // the toolkit tree filling it
  std::vector<toolkit::Button*> buttons;      // the button row, left to right
  std::vector<std::string> names;             // their child names, in the same order
  HWND edit = nullptr;                        // the input box's typing field

  toolkit::Button* button(const char* name) const;
  std::vector<std::string> labels() const;
  // Presses and releases a button with the mouse, as a click does.
  void click(const char* name) const;
  // A key as the keyboard sends it: posted to the focused window, so that the
  // modal loop's dialog handling sees it.
  void postKey(int virtualKey) const;
};

class DialogDriver {
public:
  using Step = std::function<void(ShownDialog&)>;
  explicit DialogDriver(std::vector<Step> steps);
  ~DialogDriver();
  DialogDriver(const DialogDriver&) = delete;
  DialogDriver& operator=(const DialogDriver&) = delete;

  // How many dialogs a step has run on.
  int shown() const { return shown_; }

private:
  static void CALLBACK tick(HWND, UINT, UINT_PTR, DWORD);
  void look();

  std::vector<Step> steps_;
  std::vector<HWND> seen_;
  std::vector<DWORD> since_;
  int shown_ = 0;
  UINT_PTR timer_ = 0;
  DialogDriver* previous_ = nullptr;
};

}  // namespace br::test
