#include "inspector/format/tidal_stream_text.h"

namespace br::inspector {

namespace {

constexpr char kDegree = '\xB0';

const std::string kMissing;

const std::string& FieldAt(const std::vector<std::string>& fields, std::size_t index) {
  return index < fields.size() ? fields[index] : kMissing;
}

}  // namespace

std::vector<std::string> SplitTidalStreamFields(std::string_view value) {
  std::vector<std::string> fields;
  std::size_t start = 0;
  for (;;) {
    const std::size_t comma = value.find(',', start);
    if (comma == std::string_view::npos) {
      fields.emplace_back(value.substr(start));
      return fields;
    }
    fields.emplace_back(value.substr(start, comma - start));
    start = comma + 1;
  }
}

std::string TidalStreamHourLabel(int hour) {
  // " %s %c": a sign text, then the digit of the hour (a blank at high or low water itself).
  std::string label = " ";
  if (hour == 0) {
    label += "   ";
  } else if (hour < 0) {
    label += "- ";
  } else {
    label += "+";
  }
  label += ' ';
  const int magnitude = hour < 0 ? -hour : hour;
  label += hour == 0 ? ' ' : static_cast<char>('0' + magnitude % 10);
  return label;
}

std::string TidalStreamText(std::string_view value, const TidalStreamCaptions& captions) {
  const std::vector<std::string> fields = SplitTidalStreamFields(value);
  const std::string& a = FieldAt(fields, 0);
  const std::string& b = FieldAt(fields, 1);
  const std::string& reference = FieldAt(fields, 2);
  const std::string& referenceName =
      reference == "HW" ? captions.highWater : reference == "LW" ? captions.lowWater : kMissing;

  // "%s, %s %s(%s)\r"
  std::string text = a + ", " + b + " " + reference + "(" + referenceName + ")\r";
  // "       %s    %s   %s\r"
  text += "       " + captions.time + "    " + captions.direction + "   " + captions.velocity + "\r";
  // "     %s%s      %s°      %s%s\r" per hour, the pairs in field order.
  for (int i = 0; i < kTidalStreamHours; ++i) {
    const std::string& direction = FieldAt(fields, 3 + 2 * static_cast<std::size_t>(i));
    const std::string& rate = FieldAt(fields, 4 + 2 * static_cast<std::size_t>(i));
    text += "     " + reference + TidalStreamHourLabel(i - 6) + "      " + direction + kDegree + "      " + rate +
            captions.knots + "\r";
  }
  return text;
}

}  // namespace br::inspector
