#include <doctest/doctest.h>

#include <string>
#include <vector>

#include "toolkit/dialogs/logic/dialog_plan.h"

using namespace toolkit;

namespace {

// "name=label" per button, in row order.
std::vector<std::string> row(DialogKind kind, unsigned style, const char* text = nullptr) {
  std::vector<std::string> out;
  for (const DialogButton& b : dialogButtons(kind, style, text)) out.push_back(b.name + "=" + b.label);
  return out;
}

using Row = std::vector<std::string>;

}  // namespace

TEST_CASE("message box buttons by style") {
  const auto m = DialogKind::kMessage;
  CHECK(row(m, 0) == Row{"OK=OK"});
  CHECK(row(m, 0, "") == Row{"OK=OK"});
  CHECK(row(m, 0, "Close chart") == Row{"OK=Close chart"});
  CHECK(row(m, 4) == Row{"OK=YES", "NO=NO"});
  CHECK(row(m, 3) == Row{"OK=YES", "NO=NO", "CANCEL=Cancel"});
  // The button text labels only the single button of style 0.
  CHECK(row(m, 4, "Close chart") == Row{"OK=YES", "NO=NO"});
  for (unsigned style : {1u, 2u, 5u, 6u, 15u}) {
    CAPTURE(style);
    CHECK(row(m, style).empty());
  }
  // Only the type bits count: MB_YESNO | MB_ICONQUESTION is a Yes/No box.
  CHECK(row(m, 0x24) == Row{"OK=YES", "NO=NO"});
  CHECK(row(m, 0x10, "Go") == Row{"OK=Go"});
}

TEST_CASE("message box insets: 20 each side, Cancel 10") {
  const auto buttons = dialogButtons(DialogKind::kMessage, 3, nullptr);
  REQUIRE(buttons.size() == 3);
  CHECK(buttons[0].insets == Rect{20, 0, 20, 0});
  CHECK(buttons[1].insets == Rect{20, 0, 20, 0});
  CHECK(buttons[2].insets == Rect{10, 0, 10, 0});
  CHECK(dialogButtons(DialogKind::kMessage, 0, "x")[0].insets == Rect{20, 0, 20, 0});
}

TEST_CASE("input box buttons keep their padding blanks and have no insets") {
  const auto i = DialogKind::kInput;
  CHECK(row(i, 0) == Row{"OK=    OK    "});
  CHECK(row(i, 1) == Row{"OK=    OK    ", "CANCEL=  Cancel  "});
  CHECK(row(i, 4) == Row{"OK=    YES    ", "NO=    NO    "});
  CHECK(row(i, 3) == Row{"OK=    YES    ", "NO=    NO    ", "CANCEL=  Cancel  "});
  CHECK(row(i, 0, "ignored") == Row{"OK=    OK    "});
  for (unsigned style : {2u, 5u, 7u}) {
    CAPTURE(style);
    CHECK(row(i, style).empty());
  }
  for (const DialogButton& b : dialogButtons(i, 3, nullptr)) CHECK(b.insets == Rect{});
}

TEST_CASE("results follow the child name, not the label") {
  const auto m = DialogKind::kMessage, i = DialogKind::kInput;
  CHECK(dialogResult(m, 0, "OK") == kDialogOk);
  CHECK(dialogResult(m, 4, "OK") == kDialogYes);  // the YES button is named "OK"
  CHECK(dialogResult(m, 3, "OK") == kDialogYes);
  CHECK(dialogResult(m, 4, "NO") == kDialogNo);
  CHECK(dialogResult(m, 3, "CANCEL") == kDialogCancel);
  CHECK(dialogResult(m, 0x10, "OK") == kDialogOk);
  // An input box answers IDYES for OK whatever its style.
  CHECK(dialogResult(i, 0, "OK") == kDialogYes);
  CHECK(dialogResult(i, 1, "OK") == kDialogYes);
  CHECK(dialogResult(i, 1, "CANCEL") == kDialogCancel);
  CHECK(dialogResult(i, 4, "NO") == kDialogNo);
  // Anything else (a label, another child) answers 1.
  CHECK(dialogResult(m, 4, "YES") == 1);
  CHECK(dialogResult(i, 3, "EDIT") == 1);
  CHECK(dialogResult(m, 3, "") == 1);
}

TEST_CASE("Esc ends every box that has no other way out") {
  const auto m = DialogKind::kMessage, i = DialogKind::kInput;
  // No buttons: Esc is the only way out.
  for (unsigned style : {1u, 2u, 5u, 9u}) CHECK(dialogEscapeResult(m, style) == kDialogCancel);
  for (unsigned style : {2u, 5u, 8u}) CHECK(dialogEscapeResult(i, style) == kDialogCancel);
  CHECK(dialogEscapeResult(m, 3) == kDialogCancel);
  CHECK(dialogEscapeResult(i, 1) == kDialogCancel);
  CHECK(dialogEscapeResult(i, 3) == kDialogCancel);
  CHECK(dialogEscapeResult(m, 0) == kDialogOk);
  CHECK(dialogEscapeResult(m, 4) == kDialogIgnored);
  CHECK(dialogEscapeResult(i, 4) == kDialogIgnored);
  CHECK(dialogEscapeResult(i, 0) == kDialogIgnored);

  CHECK(dialogEnterPressesOk(m, 0));
  CHECK(dialogEnterPressesOk(i, 4));
  CHECK_FALSE(dialogEnterPressesOk(m, 1));
  CHECK_FALSE(dialogEnterPressesOk(i, 5));
}

TEST_CASE("the typing field lies one pixel inside its place-holder") {
  CHECK(dialogEditPlacement(Rect{10, 40, 190, 62}) == Rect{11, 41, 189, 61});
  // Too small to shrink: an empty rectangle at the inner corner, never inverted.
  CHECK(dialogEditPlacement(Rect{5, 5, 6, 6}) == Rect{6, 6, 6, 6});
  CHECK(dialogEditPlacement(Rect{0, 0, 0, 0}) == Rect{1, 1, 1, 1});
  const Rect odd = dialogEditPlacement(Rect{-3, 2, -2, 3});
  CHECK(odd.width() == 0);
  CHECK(odd.height() == 0);
}
