#include "frame/format/coord_format.h"

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstring>

namespace br {

namespace {

constexpr char DEGREE_SIGN = '\xB0';
constexpr std::size_t PRESET_MAX_LENGTH = 100;

// Beyond 2^53 a double no longer holds every integer; totals that large need
// the whole degrees split off first.
constexpr double EXACT_INTEGER_LIMIT = 9007199254740992.0;

// A double carries 17 significant digits; decimals past those would be binary
// noise, so wider fields are computed to 17 places and filled with zeros.
constexpr std::size_t MAX_COMPUTED_DECIMALS = 17;

struct PresetMask {
  const char* mask;
  std::int64_t unitsPerDegree;
  std::size_t degreeWidth;
  bool hundredths;  // "MM'.mm $" rather than "MM.mmm'$"
};

const PresetMask PRESETS[] = {
    {COORD_MASK_LAT_MINUTES, 60000, 2, false},
    {COORD_MASK_LAT_HUNDREDTHS, 6000, 2, true},
    {COORD_MASK_LON_MINUTES, 60000, 3, false},
    {COORD_MASK_LON_HUNDREDTHS, 6000, 3, true},
};

// Decimal digits of a non-negative whole number held in a double.
std::string WholeNumberText(double whole) {
  if (whole < 1e18) {
    return std::to_string(static_cast<std::uint64_t>(whole));
  }
  char buffer[400];  // DBL_MAX has 309 digits
  std::snprintf(buffer, sizeof buffer, "%.0f", whole);
  return buffer;
}

void AppendPadded(std::string& out, const std::string& digits, std::size_t width) {
  if (digits.size() < width) {
    out.append(width - digits.size(), '0');
  }
  out += digits;
}

// Leading zeros up to the width; a longer number keeps its leftmost digits.
void AppendCut(std::string& out, const std::string& digits, std::size_t width) {
  if (digits.size() > width) {
    out.append(digits, 0, width);
  } else {
    AppendPadded(out, digits, width);
  }
}

double PowerOfTen(std::size_t n) {
  static const double exact[] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                 1e8,  1e9,  1e10, 1e11, 1e12, 1e13, 1e14, 1e15,
                                 1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22};
  if (n < sizeof exact / sizeof exact[0]) {
    return exact[n];
  }
  return std::pow(10.0, static_cast<double>(n));
}

// The integer part of fraction x 10^width, written to width digits; never cut.
void AppendDecimals(std::string& out, double fraction, std::size_t width) {
  const std::size_t computed = width < MAX_COMPUTED_DECIMALS ? width : MAX_COMPUTED_DECIMALS;
  std::string digits = WholeNumberText(std::trunc(fraction * PowerOfTen(computed)));
  digits.append(width - computed, '0');
  AppendPadded(out, digits, width);
}

std::string FormatPreset(const PresetMask& preset, char hemisphere, double magnitude) {
  const std::int64_t units = preset.unitsPerDegree;
  const std::int64_t unitsPerMinute = units / 60;
  std::string degrees;
  std::int64_t rest;
  const double total = std::floor(magnitude * static_cast<double>(units) + 0.5);
  if (total < EXACT_INTEGER_LIMIT) {
    const auto whole = static_cast<std::int64_t>(total);
    degrees = std::to_string(whole / units);
    rest = whole % units;
  } else {
    // Far outside any real coordinate; keep the degrees exact and round the rest.
    double wholeDegrees = std::floor(magnitude);
    rest = static_cast<std::int64_t>(
        std::floor((magnitude - wholeDegrees) * static_cast<double>(units) + 0.5));
    if (rest >= units) {
      wholeDegrees += 1.0;
      rest -= units;
    }
    degrees = WholeNumberText(wholeDegrees);
  }

  std::string out;
  AppendPadded(out, degrees, preset.degreeWidth);
  out += DEGREE_SIGN;
  AppendPadded(out, std::to_string(rest / unitsPerMinute), 2);
  if (preset.hundredths) {
    out += "'.";
    AppendPadded(out, std::to_string(rest % unitsPerMinute), 2);
    out += ' ';
  } else {
    out += '.';
    AppendPadded(out, std::to_string(rest % unitsPerMinute), 3);
    out += '\'';
  }
  out += hemisphere;
  if (out.size() > PRESET_MAX_LENGTH) {
    out.resize(PRESET_MAX_LENGTH);
  }
  return out;
}

bool IsMaskLetter(char c) {
  return c != '\0' && std::strchr("DMSdms$", c) != nullptr;
}

std::string FormatGeneral(const char* mask, char hemisphere, double magnitude) {
  // Every step truncates; nothing is rounded.
  const double degrees = std::trunc(magnitude);
  const double degreeFraction = magnitude - degrees;
  const double minutes = degreeFraction * 60.0;
  const double minuteFraction = minutes - std::trunc(minutes);
  const double seconds = minuteFraction * 60.0;
  const double secondFraction = seconds - std::trunc(seconds);

  std::string out;
  const char* p = mask;
  while (*p != '\0') {
    const char letter = *p;
    if (!IsMaskLetter(letter)) {
      out += letter;
      ++p;
      continue;
    }
    std::size_t width = 0;
    while (p[width] == letter) {
      ++width;
    }
    p += width;
    switch (letter) {
      case '$': out += hemisphere; break;
      case 'D': AppendCut(out, WholeNumberText(degrees), width); break;
      case 'M': AppendCut(out, WholeNumberText(std::trunc(minutes)), width); break;
      case 'S': AppendCut(out, WholeNumberText(std::trunc(seconds)), width); break;
      case 'd': AppendDecimals(out, degreeFraction, width); break;
      case 'm': AppendDecimals(out, minuteFraction, width); break;
      case 's': AppendDecimals(out, secondFraction, width); break;
    }
  }
  return out;
}

// Degrees and minutes with truncated thousandths of a minute.
std::string FormatDegreesMinutes(double value, char hemisphere, std::size_t degreeWidth) {
  if (!std::isfinite(value)) {
    return std::string();
  }
  const double magnitude = std::fabs(value);
  const double degrees = std::trunc(magnitude);
  const double minutes = (magnitude - degrees) * 60.0;
  const double wholeMinutes = std::trunc(minutes);
  const double thousandths = std::trunc((minutes - wholeMinutes) * 1000.0);

  std::string out;
  AppendPadded(out, WholeNumberText(degrees), degreeWidth);
  out += DEGREE_SIGN;
  out += ' ';
  AppendPadded(out, WholeNumberText(wholeMinutes), 2);
  out += "'.";
  AppendPadded(out, WholeNumberText(thousandths), 3);
  out += ' ';
  out += hemisphere;
  return out;
}

}  // namespace

char HemisphereLetter(int kind, double value) {
  const bool positive = value >= 0.0;
  switch (kind) {
    case COORD_LATITUDE: return positive ? 'N' : 'S';
    case COORD_LONGITUDE: return positive ? 'E' : 'W';
    default: return '\0';
  }
}

std::string FormatCoord(const char* mask, int kind, double value) {
  if (mask == nullptr || *mask == '\0' || (kind != COORD_LATITUDE && kind != COORD_LONGITUDE) ||
      !std::isfinite(value)) {
    return std::string();
  }
  const char hemisphere = HemisphereLetter(kind, value);
  const double magnitude = std::fabs(value);
  for (const PresetMask& preset : PRESETS) {
    if (std::strcmp(mask, preset.mask) == 0) {
      return FormatPreset(preset, hemisphere, magnitude);
    }
  }
  return FormatGeneral(mask, hemisphere, magnitude);
}

std::string FormatLatitudeDM(double value) {
  return FormatDegreesMinutes(value, HemisphereLetter(COORD_LATITUDE, value), 2);
}

std::string FormatLongitudeDM(double value) {
  return FormatDegreesMinutes(value, HemisphereLetter(COORD_LONGITUDE, value), 3);
}

}  // namespace br
