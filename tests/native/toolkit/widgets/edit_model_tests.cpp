// Behaviour shared by the edit types: setText, paste, clicks.
#include <doctest/doctest.h>

#include "tests/native/toolkit/widgets/FakeClipboard.h"
#include "toolkit/widgets/edit/EditModel.h"

using namespace toolkit;

TEST_CASE("setText switches to text and cuts to the limit") {
  EditModel edit(4);
  REQUIRE(edit.setEditType(kEditMonth, ""));
  CHECK(edit.noPaste());
  edit.setText("abcdef");
  CHECK((edit.type() == kEditText && !edit.noPaste() && edit.text() == "abcd"));
}

// Copy, cut and paste through the keys are the Wine clipboard case's; here what a typed edit keeps.
TEST_CASE("paste keeps only what the type accepts and stops at the limit") {
  FakeClipboard clip;
  EditModel edit;
  edit.setText("one two");
  REQUIRE(edit.setEditType(kEditDecimal, ""));
  REQUIRE(edit.setMaxLength(6));
  edit.setCaret(0, 3);
  clip.held = "7a.5.9\t1";
  CHECK(edit.pressKey(EditKey::LetterV, false, true, clip));
  CHECK(edit.text() == "7.591");  // letters, a second '.' and the tab refused
  clip.held = "12345";
  CHECK((edit.pressKey(EditKey::LetterV, false, true, clip) && edit.text().size() == 6));
}

// Clicks and drags in free text are the Wine edit suite's, through the window; here the
// tie-break it cannot pin for want of exact font metrics.
TEST_CASE("restricted fields snap a click to the nearest place and never drag-select") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditLatitude, ""));
  REQUIRE(edit.setValue(1.0));
  edit.placeCaret(2, false);  // the degree sign: the next place is as near as the one before
  CHECK(edit.caret() == 3);
  edit.placeCaret(9, false);
  CHECK(edit.caret() == 10);
  edit.placeCaret(0, true);
  CHECK(edit.selectionLength() == 0);
}
