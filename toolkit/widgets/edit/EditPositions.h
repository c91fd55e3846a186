#pragma once
// Where the caret of an edit may rest. Free fields (plain text, integers,
// decimals) allow every position from 0 to the text length. Restricted fields
// allow only the positions a user can type over: in masked text the mask's '9'
// places and a '-' at position 0; in coordinates the mask's letters D, M, S, d,
// m, s and $; in dates the digits of the text.

#include <string>
#include <string_view>

namespace toolkit {

class EditPositions {
public:
  EditPositions(int type, std::string_view mask, std::string_view text);

  bool restricted() const { return restricted_; }
  int textLength() const { return length_; }
  bool editable(int position) const;
  // In coordinate fields: the mask letter behind a place of the text, or '\0'.
  char coordinateRole(int position) const;

  // -1 when there is none.
  int first() const;
  int last() const;
  int nextAfter(int position) const;     // first editable position > position
  int previousBefore(int position) const;  // last editable position < position

  // The position a move towards `target` ends on: `target` itself when the caret
  // may rest there, else the next one in the direction of the move, else the
  // nearest one the other way; 0 when the field has no editable position.
  int settle(int target, bool forward) const;

private:
  int type_;
  std::string_view mask_;
  std::string_view text_;
  std::string coordinateRoles_;  // per text place: the coordinate field letter, or '\0'
  int length_;
  bool restricted_;
};

}  // namespace toolkit
