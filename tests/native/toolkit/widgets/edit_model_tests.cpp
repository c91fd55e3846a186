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

// A move with no editable place left in its direction goes back to position 0 (and, where 0
// itself cannot be typed over, on to the first place that can).
TEST_CASE("restricted fields: a caret move past the last place goes to position 0") {
  FakeClipboard clip;
  EditModel latitude;
  REQUIRE(latitude.setEditType(kEditLatitude, ""));
  REQUIRE(latitude.setValue(-12.5));
  REQUIRE((latitude.pressKey(EditKey::End, false, false, clip) && latitude.caret() == 10));
  CHECK((latitude.pressKey(EditKey::Right, false, false, clip) && latitude.caret() == 0));
  CHECK((latitude.pressKey(EditKey::Left, false, false, clip) && latitude.caret() == 0));
  latitude.setCaret(4, 0);
  CHECK((latitude.pressKey(EditKey::Right, false, false, clip) && latitude.caret() == 6));  // over the '.'

  EditModel month;
  REQUIRE(month.setEditType(kEditMonth, ""));
  REQUIRE(month.setDateText("05-2024", 45427.0));
  month.setCaret(6, 0);
  CHECK((month.pressKey(EditKey::Right, false, false, clip) && month.caret() == 0));

  EditModel masked;
  REQUIRE(masked.setEditType(kEditText, "(999)"));
  masked.setCaret(3, 0);
  CHECK((masked.pressKey(EditKey::Right, false, false, clip) && masked.caret() == 1));
  CHECK((masked.pressKey(EditKey::Left, false, false, clip) && masked.caret() == 1));
}

// Kept on purpose: a value outside the coordinate ranges would not fit the mask's degree
// field, and the caret places and the value read back follow the mask.
TEST_CASE("coordinate values are held to +-90 and +-180 degrees") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditLatitude, ""));
  CHECK((edit.setValue(95.0) && edit.text() == "90\xB0" "00.000'N"));
  REQUIRE(edit.setEditType(kEditLongitude, ""));
  CHECK((edit.setValue(-1000.0) && edit.text() == "180\xB0" "00.000'W"));
  CHECK(edit.getValue() == doctest::Approx(-180.0));
}
