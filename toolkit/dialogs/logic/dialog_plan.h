#pragma once
// What the toolkit's message box and input box show and answer, decided without
// windows: the buttons a style makes (child name, label, insets), the result of a
// pressed button, what Esc and Enter do, and where the native typing field goes.
//
// A dialog reacts to a button by its child name, never by its label: "OK" answers
// IDOK in a message box of style 0 and IDYES everywhere else (an input box answers
// IDYES for its OK button too), "NO" answers IDNO and "CANCEL" IDCANCEL.

#include <string>
#include <string_view>
#include <vector>

#include "toolkit/base/geometry.h"

namespace toolkit {

enum class DialogKind { kMessage, kInput };

// The platform's dialog results, repeated here so that this file needs no Windows header.
constexpr int kDialogOk = 1;
constexpr int kDialogCancel = 2;
constexpr int kDialogYes = 6;
constexpr int kDialogNo = 7;
constexpr int kDialogFailed = -1;
// What an Esc or Enter that the box ignores answers.
constexpr int kDialogIgnored = 0;

// Only the button-type bits of a style count (an icon flag beside MB_YESNO still
// makes a Yes/No box): 0 OK, 1 OK and Cancel (input box only), 3 Yes, No and Cancel,
// 4 Yes and No. Every other type makes no buttons.
unsigned dialogButtonType(unsigned style);

struct DialogButton {
  std::string name;   // child name: "OK", "NO" or "CANCEL"
  std::string label;  // what the button shows
  Rect insets;        // left, top, right, bottom
};

// The buttons of a box in their order in the row. `buttonText` labels the single
// button of a message box of style 0; null or empty gives "OK".
std::vector<DialogButton> dialogButtons(DialogKind kind, unsigned style, const char* buttonText);

// The result of pressing the button of that child name; 1 for any other name.
int dialogResult(DialogKind kind, unsigned style, std::string_view childName);

// Esc: a box with a Cancel button, or with no button at all (nothing else could end
// it), answers IDCANCEL; a message box of style 0 answers IDOK as the platform's does;
// a box that must be answered by its buttons (Yes/No, a lone OK of an input box)
// ignores it.
int dialogEscapeResult(DialogKind kind, unsigned style);
// Enter presses the "OK" button when there is one; otherwise it is ignored.
bool dialogEnterPressesOk(DialogKind kind, unsigned style);

// Where the native typing field goes: over the place-holder (given in the dialog's
// client coordinates) shrunk by one pixel on every side, never turned inside out.
Rect dialogEditPlacement(const Rect& placeholder);

}  // namespace toolkit
