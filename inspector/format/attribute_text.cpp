#include "inspector/format/attribute_text.h"

#include <cctype>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <deque>

#include "frame/format/number_format.h"

namespace br::inspector {

std::optional<AttributeText> SplitAttributeText(std::string_view text) {
  const std::size_t at = text.find_first_of("#=");
  if (at == std::string_view::npos || at + 1 >= text.size()) return std::nullopt;
  return AttributeText{std::string(text.substr(0, at)), std::string(text.substr(at + 1))};
}

std::string CleanAttributeValue(std::string_view value) {
  std::string cleaned;
  cleaned.reserve(value.size());
  for (std::size_t i = 0; i < value.size();) {
    if (value[i] == '|') {
      cleaned += '\r';
      ++i;
      continue;
    }
    if (value[i] == '<' && i + 4 <= value.size() && std::tolower(static_cast<unsigned char>(value[i + 1])) == 'b' &&
        std::tolower(static_cast<unsigned char>(value[i + 2])) == 'r' && value[i + 3] == '>') {
      cleaned += '\r';
      i += 4;
      continue;
    }
    cleaned += value[i++];
  }
  return cleaned;
}

std::optional<std::string> MagneticVariationText(double degrees) {
  if (degrees == NO_VALUE || !std::isfinite(degrees)) return std::nullopt;
  const char hemisphere = degrees > 0 ? 'E' : degrees < 0 ? 'W' : ' ';
  const double size = std::fabs(degrees);
  char text[400];  // room for the widest double with two decimals
  // "%d" takes an int: only whole values that fit one go through it.
  if (size == std::floor(size) && size <= static_cast<double>(INT32_MAX)) {
    std::snprintf(text, sizeof text, "%d\xB0%c", static_cast<int>(size), hemisphere);
  } else {
    std::snprintf(text, sizeof text, "%.2f\xB0%c", size, hemisphere);
  }
  return std::string(text);
}

bool IsHiddenInformation(long code, std::string_view value) {
  return code == kCodeInformation && value.find("0x") != std::string_view::npos;
}

std::vector<long> OrderChartAttributeCodes(const std::vector<long>& listed, bool informedObject) {
  std::deque<long> order;
  for (long code : listed) {
    if (code == kCodeObjectName) {
      order.push_front(code);
    } else if (code == kCodeInformation && informedObject) {
      const bool nameFirst = !order.empty() && order.front() == kCodeObjectName;
      order.insert(order.begin() + (nameFirst ? 1 : 0), code);
    } else {
      order.push_back(code);
    }
  }
  return {order.begin(), order.end()};
}

}  // namespace br::inspector
