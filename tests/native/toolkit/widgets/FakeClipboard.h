#pragma once
#include <string>

#include "toolkit/widgets/edit/EditClipboard.h"

// Holds the clipboard text in memory.
class FakeClipboard : public toolkit::EditClipboard {
public:
  bool put(const std::string& text) override {
    held = text;
    ++puts;
    return true;
  }
  std::string get() override { return held; }

  std::string held;
  int puts = 0;
};
