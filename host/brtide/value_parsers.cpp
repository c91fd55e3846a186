#include "host/brtide/value_parsers.h"

#include <cctype>
#include <charconv>
#include <cmath>

namespace br::brtide {

namespace {

bool AllDigits(const std::string& text, std::size_t from, std::size_t count) {
  if (from + count > text.size()) return false;
  for (std::size_t i = from; i < from + count; ++i) {
    if (!std::isdigit(static_cast<unsigned char>(text[i]))) return false;
  }
  return true;
}

int DaysInMonth(int year, int month) {
  static const int kDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  const bool leap = (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
  return month == 2 && leap ? 29 : kDays[month - 1];
}

// Degrees with an optional hemisphere letter: positive for the first letter, negative
// for the second ("NS" for latitudes, "EW" for longitudes).
std::optional<double> ParseDegrees(std::string text, const char* letters, double limit) {
  double sign = 1.0;
  if (!text.empty()) {
    const char last = static_cast<char>(std::toupper(static_cast<unsigned char>(text.back())));
    if (last == letters[0] || last == letters[1]) {
      sign = last == letters[0] ? 1.0 : -1.0;
      text.pop_back();
      if (!text.empty() && (text.front() == '-' || text.front() == '+')) return std::nullopt;
    }
  }
  const std::optional<double> value = ParseNumber(text);
  if (!value || std::fabs(*value) > limit) return std::nullopt;
  return sign * *value;
}

}  // namespace

std::optional<br::tides::CalendarDate> ParseIsoDate(const std::string& text) {
  if (text.size() != 10 || text[4] != '-' || text[7] != '-') return std::nullopt;
  if (!AllDigits(text, 0, 4) || !AllDigits(text, 5, 2) || !AllDigits(text, 8, 2)) return std::nullopt;
  const int year = std::stoi(text.substr(0, 4));
  const int month = std::stoi(text.substr(5, 2));
  const int day = std::stoi(text.substr(8, 2));
  if (year < 100 || month < 1 || month > 12 || day < 1 || day > DaysInMonth(year, month)) return std::nullopt;
  br::tides::CalendarDate date;
  date.year = static_cast<std::int16_t>(year);
  date.month = static_cast<std::uint8_t>(month);
  date.day = static_cast<std::uint8_t>(day);
  return date;
}

std::optional<double> ParseNumber(const std::string& text) {
  std::size_t start = 0;
  if (!text.empty() && text[0] == '+') start = 1;  // from_chars takes no plus sign
  if (start >= text.size() || text[start] == '+' || std::isspace(static_cast<unsigned char>(text[start]))) {
    return std::nullopt;
  }
  double value = 0.0;
  const char* first = text.data() + start;
  const char* last = text.data() + text.size();
  const auto [end, error] = std::from_chars(first, last, value);
  if (error != std::errc() || end != last || !std::isfinite(value)) return std::nullopt;
  return value;
}

std::optional<double> ParseLatitude(const std::string& text) { return ParseDegrees(text, "NS", 90.0); }

std::optional<double> ParseLongitude(const std::string& text) { return ParseDegrees(text, "EW", 180.0); }

std::optional<double> ParseStep(const std::string& text) {
  const std::optional<double> step = ParseNumber(text);
  if (!step || *step < kMinStepHours || *step > kMaxStepHours) return std::nullopt;
  return step;
}

std::optional<long> ParseStationNumber(const std::string& text) {
  if (text.empty() || text.size() > 5 || !AllDigits(text, 0, text.size())) return std::nullopt;
  const long number = std::stol(text);
  if (number > 32766) return std::nullopt;
  return number;
}

}  // namespace br::brtide
