#include "inspector/format/light_abbreviation.h"

#include <cmath>
#include <cstdio>

#include "frame/format/number_format.h"

namespace br::inspector {

namespace {

constexpr long kCategoryDirectional = 1;
constexpr long kCharacteristicMorse = 12;

bool Known(const std::optional<double>& value) { return value && *value != NO_VALUE && std::isfinite(*value); }

// Periods, heights and ranges are never negative; bearings may be, and wrap.
bool Usable(const std::optional<double>& value) { return Known(value) && *value >= 0; }

// At most `decimals` decimals, trailing zeros and a trailing point dropped.
std::string Number(double value, int decimals) {
  char text[64];
  std::snprintf(text, sizeof text, "%.*f", decimals, value);
  std::string out = text;
  if (out.find('.') != std::string::npos) {
    while (!out.empty() && out.back() == '0') out.pop_back();
    if (!out.empty() && out.back() == '.') out.pop_back();
  }
  return out;
}

// A bearing as charts write it: three digits, one decimal only when there is one.
std::string Bearing(double degrees) {
  double bearing = std::fmod(degrees, 360.0);
  if (bearing < 0) bearing += 360.0;
  bearing = std::round(bearing * 10.0) / 10.0;
  if (bearing >= 360.0) bearing -= 360.0;
  char text[32];
  if (bearing == std::floor(bearing)) {
    std::snprintf(text, sizeof text, "%03d", static_cast<int>(bearing));
  } else {
    std::snprintf(text, sizeof text, "%05.1f", bearing);
  }
  return std::string(text) + '\xB0';
}

const char* ColourText(long code) {
  static const char* const kColours[] = {"W", "B", "R", "G", "Bu", "Y", "Gy", "Br", "Am", "Vi", "Or", "Mg", "Pk"};
  return code >= 1 && code <= 13 ? kColours[code - 1] : "";
}

// A group worth writing: not empty, and not a single flash (a Morse letter always is).
bool Written(const std::string& group, bool morse) { return !group.empty() && (morse || group != "1"); }

// The characteristic with its groups: each part of a composite ("Q+LFl") takes the
// group of its place.
std::string CharacteristicWithGroups(long code, const std::string& signalGroup) {
  const std::string text = LightCharacteristicText(code);
  if (text.empty()) return text;
  const std::vector<std::string> groups = SignalGroups(signalGroup);
  const bool morse = code == kCharacteristicMorse;
  std::string out;
  std::size_t part = 0;
  std::size_t start = 0;
  for (;;) {
    const std::size_t plus = text.find('+', start);
    out += text.substr(start, plus == std::string::npos ? std::string::npos : plus - start);
    if (part < groups.size() && Written(groups[part], morse)) out += "(" + groups[part] + ")";
    if (plus == std::string::npos) break;
    out += '+';
    start = plus + 1;
    ++part;
  }
  return out;
}

}  // namespace

std::string LightCharacteristicText(long code) {
  switch (code) {
    case 1: return "F";
    case 2: return "Fl";
    case 3: return "LFl";
    case 4: return "Q";
    case 5: return "VQ";
    case 6: return "UQ";
    case 7: return "Iso";
    case 8: return "Oc";
    case 9: return "IQ";
    case 10: return "IVQ";
    case 11: return "IUQ";
    case 12: return "Mo";
    case 13: return "FFl";
    case 14: return "Fl+LFl";
    case 15: return "Oc+Fl";
    case 16: return "FLFl";
    case 17: return "Al.Oc";
    case 18: return "Al.LFl";
    case 19: return "Al.Fl";
    case 20: return "Al.Fl";  // group alternating: the groups say which
    case 25: return "Q+LFl";
    case 26: return "VQ+LFl";
    case 27: return "UQ+LFl";
    case 28: return "Al";
    case 29: return "Al.FFl";
    default: return "";
  }
}

std::vector<std::string> SignalGroups(const std::string& value) {
  std::vector<std::string> groups;
  std::size_t at = 0;
  while ((at = value.find('(', at)) != std::string::npos) {
    const std::size_t close = value.find(')', at + 1);
    if (close == std::string::npos) break;
    groups.push_back(value.substr(at + 1, close - at - 1));
    at = close + 1;
  }
  return groups;
}

std::string LightAbbreviation(const LightValues& light) {
  // Parts 2 to 5: joined by a full stop, except after a closing bracket.
  std::vector<std::string> parts;
  if (light.characteristic) {
    std::string characteristic = CharacteristicWithGroups(*light.characteristic, light.signalGroup);
    if (!characteristic.empty()) parts.push_back(std::move(characteristic));
  }
  std::string colours;
  for (long colour : light.colours) colours += ColourText(colour);
  if (!colours.empty()) parts.push_back(colours);
  if (Usable(light.period) && *light.period > 0) parts.push_back(Number(*light.period, 2) + "s");

  std::string text;
  for (const std::string& part : parts) {
    if (!text.empty() && text.back() != ')') text += '.';
    text += part;
  }
  if (!text.empty()) {
    for (long category : light.categories) {
      if (category == kCategoryDirectional) {
        text.insert(0, "Dir");
        break;
      }
    }
  }
  if (Usable(light.height)) text += Number(*light.height, 1) + "m";
  if (Usable(light.range)) text += Number(*light.range, 1) + "M";
  if (Known(light.sectorOne) && Known(light.sectorTwo)) {
    if (!text.empty()) text += ' ';
    text += Bearing(*light.sectorOne) + "-" + Bearing(*light.sectorTwo);
  }
  return text;
}

}  // namespace br::inspector
