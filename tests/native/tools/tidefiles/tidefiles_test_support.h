// Helpers shared by the tidefiles suites: folder images made from JSON text and the tool run in-process.
#pragma once

#include <doctest/doctest.h>

#include <sstream>
#include <string>
#include <vector>

#include "tests/common/station_writer.h"
#include "tools/tidefiles/command_line.h"
#include "tools/tidefiles/folder_builder.h"
#include "tools/tidefiles/station_json.h"

namespace br::tidefiles::test {

// JSON text -> folder image; fails the test when the build refuses it.
inline FolderImage BuildFromJson(const std::string& json, Diagnostics& diagnostics) {
  const std::vector<StationEntry> stations = ReadStationsJson(json, diagnostics);
  REQUIRE_FALSE(diagnostics.HasErrors());
  std::optional<FolderImage> image = BuildFolderImage(stations, diagnostics);
  REQUIRE(image.has_value());
  return *image;
}
inline FolderImage BuildFromJson(const std::string& json) {
  Diagnostics diagnostics;
  return BuildFromJson(json, diagnostics);
}

// Some message of that severity contains text.
inline bool Mentions(const Diagnostics& diagnostics, Severity severity, const std::string& text) {
  for (const Diagnostic& d : diagnostics.All())
    if (d.severity == severity && d.text.find(text) != std::string::npos) return true;
  return false;
}

struct ToolRun {
  int status = 0;
  std::string out, err;
};
inline ToolRun RunTool(const std::vector<std::string>& args, const std::string& input = "") {
  std::istringstream in(input);
  std::ostringstream out, err;
  const int status = RunTidefiles(args, in, out, err);
  return {status, out.str(), err.str()};
}

}  // namespace br::tidefiles::test
