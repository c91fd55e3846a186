// One group per edit type: the keys and characters that change its text.
#include <doctest/doctest.h>

#include "FakeClipboard.h"
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
  SUBCASE("a selection may still be replaced at the limit") {
    edit.setCaret(0, 2);
    CHECK(edit.typeChar('q'));
    CHECK(edit.text() == "qYZb");
  }
  SUBCASE("characters outside 0x20..0x7E are refused") {
    edit.setCaret(0, 0);
    CHECK(key(edit, EditKey::Delete));
    for (unsigned char c : {0x1F, 0x7F, 0xB0}) CHECK_FALSE(edit.typeChar(c));
    CHECK(edit.text() == "XYZb");
  }
  SUBCASE("Backspace and Delete remove one character or the selection") {
    edit.setCaret(2, 0);
    CHECK(key(edit, EditKey::Backspace));
    CheckState(edit, "aYZb", 1);
    CHECK(key(edit, EditKey::Delete));
    CHECK(edit.text() == "aZb");
    edit.setCaret(3, -2);
    CHECK(key(edit, EditKey::Backspace));
    CheckState(edit, "a", 1);
    edit.setCaret(0, 0);
    CHECK(key(edit, EditKey::Backspace));  // nothing to the left: still consumed
    CHECK(edit.text() == "a");
  }
  SUBCASE("Insert toggles overwrite") {
    CHECK((key(edit, EditKey::Insert) && edit.overwrite()));
    edit.setCaret(0, 0);
    type(edit, "12");
    CHECK(edit.text() == "12YZb");
  }
}

TEST_CASE("type 1, masked text: digits and sign over the mask") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditText, "-99.99"));
  CheckState(edit, " 00.00", 0);
  CHECK(edit.overwrite());
  CHECK_FALSE(edit.typeChar('5'));  // the sign place takes '-' or blank only
  CHECK(edit.typeChar('-'));
  type(edit, "1234");
  CheckState(edit, "-12.34", 5);  // the last place: the caret stays there
  CHECK_FALSE(edit.typeChar('x'));
  SUBCASE("Backspace and Delete reset the place under the caret") {
    CHECK(key(edit, EditKey::Backspace));
    CHECK(edit.text() == "-12.30");
    edit.setCaret(0, 0);
    CHECK(key(edit, EditKey::Delete));
    CheckState(edit, " 12.30", 0);
  }
  SUBCASE("no insert mode, no length limit") {
    CHECK((key(edit, EditKey::Insert) && edit.overwrite()));
    CHECK_FALSE(edit.setOverwrite(false));
    CHECK_FALSE(edit.setMaxLength(2));
    CHECK(edit.text() == "-12.34");
  }
  SUBCASE("cutting a selection resets the digits in it") {
    FakeClipboard clip;
    edit.setCaret(1, 3);
    CHECK(edit.pressKey(EditKey::LetterX, false, true, clip));
    CHECK((clip.held == "12." && edit.text() == "-00.34"));
  }
}

TEST_CASE("type 2, integer: digits over \"0\"") {
  EditModel edit(4);
  REQUIRE(edit.setEditType(kEditInteger, ""));
  CHECK((edit.text() == "0" && edit.overwrite()));
  type(edit, "42");
  CHECK(edit.text() == "42");
  CHECK_FALSE(edit.typeChar('-'));
  CHECK_FALSE(edit.typeChar('.'));
  CHECK(edit.getNumber() == 42);
  CHECK(key(edit, EditKey::Backspace));
  CHECK(edit.text() == "4");
  CHECK((key(edit, EditKey::Home) && key(edit, EditKey::Delete)));
  CHECK((edit.text() == "" && edit.getNumber() == 0));
  CHECK(edit.setNumber(-123456));
  CHECK((edit.text() == "-123" && edit.getNumber() == -123));  // cut to the maximum length
}

TEST_CASE("type 3, decimal: one '.' only") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditDecimal, ""));
  CHECK(edit.text() == "0.0");
  CHECK((edit.setValue(3.14159) && edit.text() == "3.1416"));
  CHECK((key(edit, EditKey::End) && key(edit, EditKey::Insert)));  // insert mode
  CHECK_FALSE(edit.overwrite());
  CHECK_FALSE(edit.typeChar('.'));  // a second '.'
  CHECK(edit.typeChar('7'));
  CHECK(edit.text() == "3.14167");
  SUBCASE("the '.' may be typed over itself") {
    CHECK(key(edit, EditKey::Insert));
    edit.setCaret(1, 0);
    CHECK(edit.typeChar('.'));
    CHECK(edit.text() == "3.14167");
  }
  SUBCASE("once it is gone a '.' is taken again") {
    edit.setCaret(2, 0);
    CHECK(key(edit, EditKey::Backspace));
    CHECK(edit.text() == "314167");
    CHECK(edit.typeChar('.'));
    CHECK(edit.getValue() == doctest::Approx(3.14167));
  }
}

TEST_CASE("type 6, latitude: -12.5 and the hemisphere letter") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditLatitude, ""));
  CHECK(edit.mask() == kDefaultLatitudeMask);
  CHECK((edit.setValue(-12.5) && edit.text() == "12\xB0" "30.000'S"));
  CHECK((key(edit, EditKey::End) && edit.caret() == 10));
  CHECK_FALSE(edit.typeChar('e'));
  CHECK_FALSE(edit.typeChar('5'));
  CHECK(edit.typeChar('n'));
  CHECK(edit.text() == "12\xB0" "30.000'N");
  CHECK(edit.getValue() == doctest::Approx(12.5));
  SUBCASE("digits skip the copied characters") {
    CHECK(key(edit, EditKey::Home));
    type(edit, "456");
    CheckState(edit, "45\xB0" "60.000'N", 4);
    CHECK((key(edit, EditKey::Left) && edit.caret() == 3));
    CHECK((key(edit, EditKey::Left) && edit.caret() == 1));  // over the degree sign
  }
  SUBCASE("Backspace and Delete reset a digit; the hemisphere stays") {
    edit.setCaret(3, 0);
    CHECK(key(edit, EditKey::Backspace));
    CHECK(edit.text() == "12\xB0" "00.000'N");
    CHECK((key(edit, EditKey::End) && key(edit, EditKey::Delete)));
    CHECK(edit.text() == "12\xB0" "00.000'N");
  }
  SUBCASE("no selection, no cut") {
    FakeClipboard clip;
    CHECK((edit.pressKey(EditKey::LetterA, false, true, clip) && edit.selectionLength() == 0));
    CHECK((edit.pressKey(EditKey::Left, true, false, clip) && edit.selectionLength() == 0));
    CHECK_FALSE(edit.setSelectionLength(2));
    CHECK(edit.pressKey(EditKey::LetterX, false, true, clip));
    CHECK((clip.puts == 0 && edit.text() == "12\xB0" "30.000'N"));
  }
  SUBCASE("a pasted coordinate fills the places in order") {
    FakeClipboard clip;
    clip.held = "33\xB0" "15.500'S";
    CHECK(key(edit, EditKey::Home));
    CHECK(edit.pressKey(EditKey::LetterV, false, true, clip));
    CHECK(edit.text() == "33\xB0" "15.500'S");
    CHECK(edit.getValue() == doctest::Approx(-(33 + 15.5 / 60)));
  }
  SUBCASE("values beyond the pole are held at it") {
    CHECK((edit.setValue(123.0) && edit.text() == "90\xB0" "00.000'N"));
  }
}

TEST_CASE("type 7, longitude: three degree digits, E and W") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditLongitude, ""));
  CHECK((edit.setValue(-4.0875) && edit.text() == "004\xB0" "05.250'W"));
  CHECK(key(edit, EditKey::End));
  CHECK_FALSE(edit.typeChar('n'));
  CHECK((edit.typeChar('e') && edit.text() == "004\xB0" "05.250'E"));
  CHECK(key(edit, EditKey::Home));
  type(edit, "17");
  CHECK(edit.text() == "174\xB0" "05.250'E");
  CHECK(edit.getValue() == doctest::Approx(174.0875));
  CHECK_FALSE((edit.setOverwrite(false) || edit.setMaxLength(3)));
}

TEST_CASE("type 8, month and year: digits over digits, no paste") {
  EditModel edit;
  REQUIRE(edit.setEditType(kEditMonth, ""));
  CHECK((edit.mask() == kDefaultMonthPicture && edit.noPaste()));
  CHECK((edit.setDateText("05-2024", 45427.0) && edit.caret() == 0));  // 2024-05-15
  type(edit, "1");
  CheckState(edit, "15-2024", 1);
  type(edit, "1");
  CHECK(edit.caret() == 3);
  CHECK_FALSE(edit.typeChar('-'));
  type(edit, "1999");
  CHECK(edit.text() == "11-1999");
  CHECK(edit.getValue() == doctest::Approx(MonthPicture::toPlatformDate(CivilDate{1999, 11, 15})));
  SUBCASE("Backspace and Delete leave the date alone") {
    CHECK((key(edit, EditKey::Backspace) && key(edit, EditKey::Delete)));
    CHECK(edit.text() == "11-1999");
  }
  SUBCASE("paste is refused") {
    FakeClipboard clip;
    clip.held = "0101";
    edit.setCaret(0, 0);
    CHECK(edit.pressKey(EditKey::LetterV, false, true, clip));
    CHECK(edit.text() == "11-1999");
  }
}
