#include "tests/native/tidefiles/tidefiles_test_support.h"

#include <doctest/doctest.h>

#include <sstream>

#include "tools/tidefiles/command_line.h"
#include "tools/tidefiles/folder_builder.h"
#include "tools/tidefiles/station_json.h"

namespace br::tidefiles::test {

FolderImage BuildFromJson(const std::string& json, Diagnostics& diagnostics) {
  const std::vector<StationEntry> stations = ReadStationsJson(json, diagnostics);
  REQUIRE_FALSE(diagnostics.HasErrors());
  std::optional<FolderImage> image = BuildFolderImage(stations, diagnostics);
  REQUIRE(image.has_value());
  return *image;
}

FolderImage BuildFromJson(const std::string& json) {
  Diagnostics diagnostics;
  return BuildFromJson(json, diagnostics);
}

std::vector<br::tides::StationIndexRecord> IndexRecords(const std::vector<std::uint8_t>& bytes) {
  std::vector<br::tides::StationIndexRecord> records;
  for (std::size_t at = 0; at + 10 <= bytes.size(); at += 10)
    records.push_back(br::tides::DecodeStationIndexRecord(&bytes[at]));
  return records;
}

br::tides::StationHeader HeaderAt(const FolderImage& image, std::uint32_t offset) {
  REQUIRE(offset + br::tides::StationHeader::kSize <= image.stationData.size());
  return br::tides::DecodeStationHeader(&image.stationData[offset]);
}

std::vector<br::tides::ConstituentRecord> RecordsAt(const FolderImage& image, std::uint32_t offset) {
  const br::tides::StationHeader header = HeaderAt(image, offset);
  std::vector<br::tides::ConstituentRecord> records;
  for (int k = 0; k < header.constituentCount; ++k) {
    const std::size_t at = offset + br::tides::StationHeader::kSize + static_cast<std::size_t>(k) * 6;
    REQUIRE(at + 6 <= image.stationData.size());
    records.push_back(br::tides::DecodeConstituentRecord(&image.stationData[at]));
  }
  return records;
}

bool Mentions(const Diagnostics& diagnostics, Severity severity, const std::string& text) {
  for (const Diagnostic& d : diagnostics.All()) {
    if (d.severity == severity && d.text.find(text) != std::string::npos) return true;
  }
  return false;
}

ToolRun RunTool(const std::vector<std::string>& args, const std::string& input) {
  std::istringstream in(input);
  std::ostringstream out, err;
  ToolRun run;
  run.status = RunTidefiles(args, in, out, err);
  run.out = out.str();
  run.err = err.str();
  return run;
}

}  // namespace br::tidefiles::test
