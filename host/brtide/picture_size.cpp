#include "host/brtide/picture_size.h"

namespace br::brtide {

namespace {

// Digits only, at most 5 of them, in the allowed range.
bool ParseSide(const std::string& text, int& side) {
  if (text.empty() || text.size() > 5) return false;
  int value = 0;
  for (const char c : text) {
    if (c < '0' || c > '9') return false;
    value = value * 10 + (c - '0');
  }
  if (value < kPictureMinSide || value > kPictureMaxSide) return false;
  side = value;
  return true;
}

}  // namespace

bool ParsePictureSize(const std::string& text, PictureSize& size, std::string& error) {
  const std::size_t cross = text.find_first_of("xX");
  PictureSize parsed;
  if (cross == std::string::npos || !ParseSide(text.substr(0, cross), parsed.width) ||
      !ParseSide(text.substr(cross + 1), parsed.height)) {
    error = "--size wants WIDTHxHEIGHT in pixels, each " + std::to_string(kPictureMinSide) + " to " +
            std::to_string(kPictureMaxSide) + " (got \"" + text + "\")";
    return false;
  }
  size = parsed;
  return true;
}

}  // namespace br::brtide
