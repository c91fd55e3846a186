// One station as the JSON describes it, in published units: degrees, metres, hours.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace br::tidefiles {

struct ConstituentEntry {
  int row = 0;             // row of the constituent table, 0 = mean level
  std::string label;       // the name or number as given, for messages
  double amplitude = 0.0;  // metres
  double phase = 0.0;      // Greenwich phase lag, degrees
};

struct StationEntry {
  std::size_t index = 0;      // position in the input, for messages
  std::string name;           // UTF-8
  double latitude = 0.0;      // decimal degrees, north positive
  double longitude = 0.0;     // decimal degrees, east positive
  int zone = 0;               // universal time = zone time + zone (UTC+1 holds -1)
  std::optional<double> meanLevel;  // metres above chart datum
  std::uint16_t tag = 0;      // carried in the index records, not used for prediction
  std::vector<ConstituentEntry> constituents;  // a row at most once
};

// "station 12 "Newlyn"" for messages.
std::string DescribeStation(std::size_t index, const std::string& utf8Name);

// "50°06'N 005°33'W" for a position in whole minutes (degrees and minutes, UTF-8).
std::string PositionText(int latitudeMinutes, int longitudeMinutes);

// A text from the input as messages show it: one line (control characters become '?'),
// at most 80 bytes, so that every message stays one line whatever the input holds.
std::string MessageText(const std::string& text);

}  // namespace br::tidefiles
