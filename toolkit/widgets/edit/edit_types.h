#pragma once
// Edit types of cXEdit2 and the keys its edit logic understands. Portable: the
// window side maps virtual keys onto EditKey.

namespace toolkit {

enum EditType : int {
  kEditText = 1,       // free text, or masked text with a mask of '9' and '-'
  kEditInteger = 2,    // decimal integer
  kEditDecimal = 3,    // decimal number, "%.4f"
  kEditLatitude = 6,   // coordinate by mask, hemisphere N/S
  kEditLongitude = 7,  // coordinate by mask, hemisphere E/W
  kEditMonth = 8,      // date by picture (month and year by default)
};

enum class EditKey {
  Left,
  Right,
  Home,
  End,
  Backspace,
  Delete,
  Insert,
  LetterA,  // with Ctrl: select all
  LetterC,  // with Ctrl: copy
  LetterV,  // with Ctrl: paste
  LetterX,  // with Ctrl: cut
  Other,
};

// Masks used when the caller gives none.
inline constexpr const char* kDefaultLatitudeMask = "DD\xB0MM.mmm'$";
inline constexpr const char* kDefaultLongitudeMask = "DDD\xB0MM.mmm'$";
inline constexpr const char* kDefaultMonthPicture = "MM-yyyy";

}  // namespace toolkit
