#pragma once
// Break opportunities and cluster starts from the code units alone, for when the
// script processor is absent: blanks separate words, ideographs and kana break on
// either side, marks and the second half of a surrogate pair stay with what comes
// before them. Scripts that need a dictionary (Thai, Lao, Khmer) get no soft
// breaks here; their lines are cut between clusters.

#include <cstddef>
#include <cstdint>

#include "toolkit/text/logic/line_filling.h"

namespace toolkit::text {

bool isBlank(char16_t unit);
// A unit that never starts a cluster: combining marks, joiners, variation
// selectors, a low surrogate, a consonant after a Devanagari virama.
bool continuesCluster(char16_t previous, char16_t unit);
// A unit after which, or before which, a line may break without a blank.
bool breaksLikeIdeograph(char16_t unit);

// The break properties of one unit given the unit before it (0 at the start);
// the width is left as it was.
void markBreak(char16_t previous, char16_t unit, CharBreak& out);

// Marks `count` units of a 16-bit text (wchar_t on Windows, char16_t elsewhere).
template <typename Unit>
void markBreaks(const Unit* text, std::size_t count, CharBreak* out) {
  static_assert(sizeof(Unit) == sizeof(char16_t), "UTF-16 code units");
  char16_t previous = 0;
  for (std::size_t i = 0; i < count; ++i) {
    const char16_t unit = static_cast<char16_t>(text[i]);
    markBreak(previous, unit, out[i]);
    previous = unit;
  }
}

}  // namespace toolkit::text
