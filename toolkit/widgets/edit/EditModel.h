#pragma once
// The text, caret, selection and mask logic of the one-line edit cXEdit2, free of
// any window: the window side feeds it characters, keys and clicks and draws
// what it holds.
//
// The selection runs from the caret over `selectionLength` characters; a
// negative length extends to the left of the caret. Coordinate and date fields
// never have a selection, and their caret, like that of masked text, rests only
// on places the user can type over (EditPositions); a caret key with no such place
// left in its direction sends it back to position 0.

#include <string>
#include <string_view>

#include "toolkit/widgets/edit/EditClipboard.h"
#include "toolkit/widgets/edit/EditPositions.h"
#include "toolkit/widgets/edit/edit_types.h"
#include "toolkit/widgets/edit/MonthPicture.h"

namespace toolkit {

class EditModel {
public:
  // `maxLength` 0 means no limit; a negative one counts as 0.
  explicit EditModel(int maxLength = 0);

  // Types 1, 2, 3, 6, 7 and 8; any other answers false and changes nothing.
  // Coordinates start at 0 and dates at the platform date 0 until a value is
  // set; an empty mask takes the type's default.
  bool setEditType(int type, std::string_view mask);
  // Switches to type 1 and allows paste; drops the mask unless it is exactly as
  // long as the new text; cuts the text to the maximum length.
  void setText(std::string_view text);
  // Type 2 only: the decimal text, cut to the maximum length.
  bool setNumber(long long number);
  // Types 3, 6 and 7 (type 8 takes its text from the platform: setDateText).
  // Values that are not finite change nothing.
  bool setValue(double value);
  // Type 8: the text the platform made for `platformDate` with the picture.
  bool setDateText(std::string_view text, double platformDate);
  // Ignored for types 6, 7, 8, masked text and negative lengths; cuts the text.
  bool setMaxLength(int maxLength);
  bool setSelectionLength(int length);  // clamped into the text; not for 6, 7, 8
  bool setOverwrite(bool overwrite);    // not for 6, 7, 8 and masked text
  void setCaret(int position, int selectionLength);
  void setNoPaste(bool noPaste) { noPaste_ = noPaste; }

  int type() const { return type_; }
  const std::string& mask() const { return mask_; }
  const std::string& text() const { return text_; }
  int maxLength() const { return maxLength_; }
  int caret() const { return caret_; }
  int selectionLength() const { return selection_; }
  int selectionStart() const { return selection_ < 0 ? caret_ + selection_ : caret_; }
  int selectionEnd() const { return selection_ < 0 ? caret_ : caret_ + selection_; }
  bool overwrite() const { return overwrite_; }
  bool noPaste() const { return noPaste_; }
  bool isMasked() const { return type_ == kEditText && !mask_.empty(); }
  bool isCoordinate() const { return type_ == kEditLatitude || type_ == kEditLongitude; }
  // Free text, integers and decimals: characters are inserted and removed.
  bool isFree() const { return !positions().restricted(); }

  // The text read as a decimal integer (leading blanks and a sign allowed),
  // clamped to the 32-bit range; 0 when it holds no number.
  int getNumber() const;
  // The value the text stands for: the number (types 1 to 3), signed degrees
  // (6, 7) or the platform date (8).
  double getValue() const;

  // One typed character. Answers whether it was taken; a character the field
  // does not accept changes nothing.
  bool typeChar(unsigned char ch);
  // One key of the key list; answers whether it was consumed.
  bool pressKey(EditKey key, bool shift, bool ctrl, EditClipboard& clipboard);
  // A click (extend false) or a drag (extend true) at a character boundary.
  void placeCaret(int index, bool extend);

  // Counts every change of the text, for the window to know when to repaint.
  unsigned revision() const { return revision_; }

private:
  EditPositions positions() const { return EditPositions(type_, mask_, text_); }
  int length() const { return static_cast<int>(text_.size()); }
  int anchor() const { return caret_ + selection_; }
  void moveCaret(int target, bool forward, bool extend);
  void normalize();
  void changed() { ++revision_; }
  void cutToMaxLength();
  void fillFromMask();

  // Whether `ch` may go in where the characters [replaceFrom, +replaceCount) are.
  bool acceptsFree(unsigned char ch, int replaceFrom, int replaceCount) const;
  bool acceptsAt(int position, unsigned char ch) const;
  bool typeFree(unsigned char ch);
  bool typeRestricted(unsigned char ch);
  void eraseSelection();
  void resetAt(int position);
  bool removeOne(bool backwards);
  bool copy(EditClipboard& clipboard) const;
  bool cut(EditClipboard& clipboard);
  void paste(const std::string& text);
  void selectAll();

  int type_ = kEditText;
  std::string mask_;
  std::string text_;
  int maxLength_ = 0;
  int caret_ = 0;
  int selection_ = 0;
  bool overwrite_ = false;
  bool noPaste_ = false;
  CivilDate date_;  // the last date set, for the parts the picture does not show
  unsigned revision_ = 0;
};

}  // namespace toolkit
