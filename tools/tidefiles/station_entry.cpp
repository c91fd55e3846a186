#include "tools/tidefiles/station_entry.h"

#include <cstdio>

namespace br::tidefiles {

std::string DescribeStation(std::size_t index, const std::string& utf8Name) {
  std::string s = "station " + std::to_string(index);
  if (utf8Name.empty()) return s;
  s += " \"" + MessageText(utf8Name) + "\"";
  return s;
}

namespace {
std::string Angle(int minutes, int degreeDigits, const char* hemispheres) {
  const int size = minutes < 0 ? -minutes : minutes;
  char text[32];
  std::snprintf(text, sizeof text, "%0*d\xC2\xB0%02d'%c", degreeDigits, size / 60, size % 60,
                minutes < 0 ? hemispheres[1] : hemispheres[0]);
  return text;
}
}  // namespace

std::string PositionText(int latitudeMinutes, int longitudeMinutes) {
  return Angle(latitudeMinutes, 2, "NS") + " " + Angle(longitudeMinutes, 3, "EW");
}

std::string MessageText(const std::string& text) {
  std::string shown = text.substr(0, 80);
  for (char& c : shown) {
    if (static_cast<unsigned char>(c) < 0x20 || c == 0x7F) c = '?';
  }
  return shown;
}

}  // namespace br::tidefiles
