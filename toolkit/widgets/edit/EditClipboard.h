#pragma once
// The clipboard as the edit logic sees it: plain 8-bit text in, plain text out.

#include <string>

namespace toolkit {

class EditClipboard {
public:
  virtual ~EditClipboard() = default;
  virtual bool put(const std::string& text) = 0;
  // Empty when the clipboard holds no text.
  virtual std::string get() = 0;
};

}  // namespace toolkit
