// One group per edit type: the keys and characters that change its text.
#include <doctest/doctest.h>

#include "tests/native/toolkit/widgets/FakeClipboard.h"
#include "toolkit/widgets/edit/EditModel.h"

using namespace toolkit;

namespace {
void type(EditModel& edit, const char* chars) {
  for (const char* c = chars; *c; ++c) edit.typeChar(static_cast<unsigned char>(*c));
}
bool key(EditModel& edit, EditKey k, bool shift = false, bool ctrl = false) {
  FakeClipboard clip;
  return edit.pressKey(k, shift, ctrl, clip);
}
// Text and caret together; a caret of -1 is not checked.
void CheckState(const EditModel& edit, const std::string& text, int caret = -1) {
  CHECK(edit.text() == text);
  if (caret >= 0) CHECK(edit.caret() == caret);
}
}  // namespace

TEST_CASE("type 1, free text: insert, overwrite, remove, limits") {
  EditModel edit(5);
  edit.setText("ab");
  CHECK((edit.type() == kEditText && !edit.overwrite()));
  edit.setCaret(1, 0);
  type(edit, "XY");
  CheckState(edit, "aXYb", 3);
  CHECK(edit.typeChar('Z'));
  CHECK_FALSE(edit.typeChar('W'));  // five characters: the limit
  CHECK(edit.text() == "aXYZb");
  // Backspace and Delete remove one character or the selection.
  edit.setCaret(2, 0);
  CHECK(key(edit, EditKey::Delete));
  CHECK(edit.text() == "aXZb");
  edit.setCaret(4, -3);
  CHECK(key(edit, EditKey::Backspace));
  CheckState(edit, "a", 1);
  edit.setCaret(0, 0);
  CHECK(key(edit, EditKey::Backspace));  // nothing to the left: still consumed
  CHECK(edit.text() == "a");
}

TEST_CASE("type 6, latitude: -12.5 and the hemisphere letter") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditLatitude, ""));
  CHECK(edit.mask() == kDefaultLatitudeMask);
  CHECK((edit.setValue(-12.5) && edit.text() == "12\xB0" "30.000'S"));
  CHECK((key(edit, EditKey::End) && edit.caret() == 10));
  CHECK_FALSE(edit.typeChar('e'));
  CHECK((edit.typeChar('n') && edit.getValue() == doctest::Approx(12.5)));
  // A pasted coordinate fills the places in order.
  FakeClipboard clip;
  clip.held = "33\xB0" "15.500'S";
  CHECK(key(edit, EditKey::Home));
  CHECK(edit.pressKey(EditKey::LetterV, false, true, clip));
  CHECK(edit.text() == "33\xB0" "15.500'S");
  CHECK(edit.getValue() == doctest::Approx(-(33 + 15.5 / 60)));
}

TEST_CASE("type 8, month and year: digits over digits") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditMonth, ""));
  CHECK((edit.mask() == kDefaultMonthPicture && edit.noPaste()));
  CHECK((edit.setDateText("05-2024", 45427.0) && edit.caret() == 0));  // 2024-05-15
  type(edit, "11");
  CHECK(edit.caret() == 3);  // over the '-'
  CHECK_FALSE(edit.typeChar('-'));
  type(edit, "1999");
  CHECK(edit.text() == "11-1999");
  CHECK(edit.getValue() == doctest::Approx(MonthPicture::toPlatformDate(CivilDate{1999, 11, 15})));
}
