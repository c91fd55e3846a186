#include "toolkit/widgets/edit/CoordText.h"

#include <cmath>

#include "toolkit/widgets/edit/edit_types.h"

namespace toolkit {

namespace {

// Digits beyond these add nothing a double can hold.
constexpr int kMaxDigits = 18;

struct Field {
  double whole = 0;     // the digits as an integer
  double fraction = 0;  // the digits as a decimal fraction (0.ddd)
};

Field readField(std::string_view text, size_t start, size_t length) {
  Field field;
  double scale = 1;
  int used = 0;
  for (size_t i = start; i < start + length && i < text.size() && used < kMaxDigits; ++i, ++used) {
    const char c = text[i];
    const int digit = (c >= '0' && c <= '9') ? c - '0' : 0;
    field.whole = field.whole * 10 + digit;
    scale /= 10;
    field.fraction += digit * scale;
  }
  return field;
}

}  // namespace

bool CoordText::isFieldLetter(char c) {
  switch (c) {
    case 'D': case 'M': case 'S': case 'd': case 'm': case 's': case '$': return true;
    default: return false;
  }
}

std::string_view CoordText::hemispheres(int kind) {
  if (kind == kEditLatitude) return "NS";
  if (kind == kEditLongitude) return "EW";
  return {};
}

std::string CoordText::roles(std::string_view mask) {
  std::string places;
  size_t i = 0;
  while (i < mask.size()) {
    const char letter = mask[i];
    size_t run = 1;
    while (i + run < mask.size() && mask[i + run] == letter) ++run;
    if (!isFieldLetter(letter)) {
      places.append(run, '\0');
    } else if (letter == '$') {
      places.push_back('$');  // the hemisphere letter is written once
    } else {
      places.append(run, letter);
    }
    i += run;
  }
  return places;
}

double CoordText::parse(std::string_view mask, int kind, std::string_view text) {
  const std::string_view letters = hemispheres(kind);
  if (letters.empty()) return 0;
  const std::string places = roles(mask);
  double degrees = 0, minutes = 0, seconds = 0;
  bool negative = false;
  size_t i = 0;
  while (i < places.size() && i < text.size()) {
    const char letter = places[i];
    size_t run = 1;
    // '$' fields are one place wide; adjacent '$' places are separate fields.
    while (letter != '$' && i + run < places.size() && places[i + run] == letter) ++run;
    switch (letter) {
      case 'D': degrees += readField(text, i, run).whole; break;
      case 'M': minutes += readField(text, i, run).whole; break;
      case 'S': seconds += readField(text, i, run).whole; break;
      case 'd': degrees += readField(text, i, run).fraction; break;
      case 'm': minutes += readField(text, i, run).fraction; break;
      case 's': seconds += readField(text, i, run).fraction; break;
      case '$': {
        const char c = text[i];
        negative = c == letters[1] || c == static_cast<char>(letters[1] + ('a' - 'A'));
        break;
      }
      default: break;
    }
    i += run;
  }
  const double value = degrees + minutes / 60 + seconds / 3600;
  if (!std::isfinite(value)) return 0;
  return negative ? -value : value;
}

}  // namespace toolkit
