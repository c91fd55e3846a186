#pragma once
// The system clipboard as plain ANSI text (CF_TEXT), opened for one window.

#include <windows.h>

#include "toolkit/widgets/edit/EditClipboard.h"

namespace toolkit {

class WindowsClipboard : public EditClipboard {
public:
  explicit WindowsClipboard(HWND owner) : owner_(owner) {}
  bool put(const std::string& text) override;
  std::string get() override;

private:
  HWND owner_;
};

}  // namespace toolkit
