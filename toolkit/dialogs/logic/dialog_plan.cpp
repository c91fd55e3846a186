#include "toolkit/dialogs/logic/dialog_plan.h"

#include <algorithm>

namespace toolkit {

namespace {

constexpr unsigned kTypeMask = 0x0F;  // MB_TYPEMASK
constexpr unsigned kOk = 0, kOkCancel = 1, kYesNoCancel = 3, kYesNo = 4;

bool makesButtons(DialogKind kind, unsigned type) {
  if (type == kOk || type == kYesNoCancel || type == kYesNo) return true;
  return kind == DialogKind::kInput && type == kOkCancel;
}

}  // namespace

unsigned dialogButtonType(unsigned style) { return style & kTypeMask; }

std::vector<DialogButton> dialogButtons(DialogKind kind, unsigned style, const char* buttonText) {
  const unsigned type = dialogButtonType(style);
  std::vector<DialogButton> buttons;
  if (!makesButtons(kind, type)) return buttons;
  const bool yes = type == kYesNo || type == kYesNoCancel;
  const bool cancel = type == kYesNoCancel || type == kOkCancel;
  if (kind == DialogKind::kMessage) {
    // The message box widens its buttons by insets; Cancel's are narrower.
    const Rect wide{20, 0, 20, 0};
    const Rect narrow{10, 0, 10, 0};
    const std::string okLabel = yes ? "YES" : (buttonText && *buttonText ? buttonText : "OK");
    buttons.push_back({"OK", okLabel, wide});
    if (yes) buttons.push_back({"NO", "NO", wide});
    if (cancel) buttons.push_back({"CANCEL", "Cancel", narrow});
  } else {
    // The input box widens them by blanks in the labels instead.
    buttons.push_back({"OK", yes ? "    YES    " : "    OK    ", Rect{}});
    if (yes) buttons.push_back({"NO", "    NO    ", Rect{}});
    if (cancel) buttons.push_back({"CANCEL", "  Cancel  ", Rect{}});
  }
  return buttons;
}

int dialogResult(DialogKind kind, unsigned style, std::string_view childName) {
  if (childName == "OK")
    return kind == DialogKind::kMessage && dialogButtonType(style) == kOk ? kDialogOk : kDialogYes;
  if (childName == "NO") return kDialogNo;
  if (childName == "CANCEL") return kDialogCancel;
  return kDialogOk;
}

int dialogEscapeResult(DialogKind kind, unsigned style) {
  const auto buttons = dialogButtons(kind, style, nullptr);
  if (buttons.empty()) return kDialogCancel;
  for (const DialogButton& b : buttons)
    if (b.name == "CANCEL") return kDialogCancel;
  if (kind == DialogKind::kMessage && dialogButtonType(style) == kOk) return kDialogOk;
  return kDialogIgnored;
}

bool dialogEnterPressesOk(DialogKind kind, unsigned style) {
  return !dialogButtons(kind, style, nullptr).empty();  // every row starts with "OK"
}

Rect dialogEditPlacement(const Rect& placeholder) {
  Rect r{placeholder.left + 1, placeholder.top + 1, placeholder.right - 1, placeholder.bottom - 1};
  r.right = std::max(r.right, r.left);
  r.bottom = std::max(r.bottom, r.top);
  return r;
}

}  // namespace toolkit
