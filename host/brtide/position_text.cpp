#include "host/brtide/position_text.h"

#include "frame/format/coord_format.h"

namespace br::brtide {

namespace {

std::string DegreeSignToUtf8(const std::string& ansi) {
  std::string text;
  text.reserve(ansi.size() + 2);
  for (const char c : ansi) {
    if (static_cast<unsigned char>(c) == 0xB0) {
      text += "\xC2\xB0";
    } else {
      text += c;
    }
  }
  return text;
}

// Station positions are whole minutes times 1/60 in a double, often a hair below the exact
// value (48 deg 23 min reads 48.38333333333333); the degree-minute format truncates, which
// would print 22'.999. A nudge far below the last printed digit (0.00006') restores it.
double AwayFromZero(double degrees) {
  constexpr double kNudge = 1e-9;
  return degrees < 0 ? degrees - kNudge : degrees + kNudge;
}

}  // namespace

std::string LatitudeText(double degrees) { return DegreeSignToUtf8(FormatLatitudeDM(AwayFromZero(degrees))); }

std::string LongitudeText(double degrees) { return DegreeSignToUtf8(FormatLongitudeDM(AwayFromZero(degrees))); }

std::string PositionText(const Position& position) {
  return LatitudeText(position.latitude) + "  " + LongitudeText(position.longitude);
}

std::size_t Utf8Width(const std::string& text) {
  std::size_t width = 0;
  for (const char c : text) {
    if ((static_cast<unsigned char>(c) & 0xC0) != 0x80) ++width;  // not a continuation byte
  }
  return width;
}

std::string PadRight(const std::string& text, std::size_t width) {
  const std::size_t used = Utf8Width(text);
  return used >= width ? text : text + std::string(width - used, ' ');
}

std::string PadLeft(const std::string& text, std::size_t width) {
  const std::size_t used = Utf8Width(text);
  return used >= width ? text : std::string(width - used, ' ') + text;
}

}  // namespace br::brtide
