#include "toolkit/widgets/support/WindowsClipboard.h"

#include <cstring>

namespace toolkit {

bool WindowsClipboard::put(const std::string& text) {
  if (!OpenClipboard(owner_)) return false;
  bool done = false;
  if (EmptyClipboard()) {
    HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE, text.size() + 1);
    if (block) {
      if (void* data = GlobalLock(block)) {
        std::memcpy(data, text.c_str(), text.size() + 1);
        GlobalUnlock(block);
        done = SetClipboardData(CF_TEXT, block) != nullptr;
      }
      if (!done) GlobalFree(block);  // the clipboard owns it only once set
    }
  }
  CloseClipboard();
  return done;
}

std::string WindowsClipboard::get() {
  std::string text;
  if (!IsClipboardFormatAvailable(CF_TEXT) || !OpenClipboard(owner_)) return text;
  if (HANDLE block = GetClipboardData(CF_TEXT)) {
    if (const char* data = static_cast<const char*>(GlobalLock(block))) {
      // Bounded by the block: a text without its terminating zero must not run on.
      const size_t size = GlobalSize(block);
      text.assign(data, strnlen(data, size));
      GlobalUnlock(block);
    }
  }
  CloseClipboard();
  return text;
}

}  // namespace toolkit
