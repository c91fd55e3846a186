// Helpers shared by the tidefiles suites: folder images made from JSON text and the tool run in-process.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include "tests/native/engine/station_folder.h"
#include "tides/engine/station_files.h"
#include "tools/tidefiles/diagnostics.h"
#include "tools/tidefiles/folder_image.h"

namespace br::tidefiles::test {

// A temporary folder removed with everything in it (the engine suites' helper).
using TemporaryFolder = br::tides::testing::TempFolder;

// JSON text -> folder image; fails the test when the build refuses it.
FolderImage BuildFromJson(const std::string& json, Diagnostics& diagnostics);
FolderImage BuildFromJson(const std::string& json);

std::vector<br::tides::StationIndexRecord> IndexRecords(const std::vector<std::uint8_t>& bytes);
br::tides::StationHeader HeaderAt(const FolderImage& image, std::uint32_t offset);
std::vector<br::tides::ConstituentRecord> RecordsAt(const FolderImage& image, std::uint32_t offset);

// True when some message of that severity contains text.
bool Mentions(const Diagnostics& diagnostics, Severity severity, const std::string& text);

struct ToolRun {
  int status = 0;
  std::string out;
  std::string err;
};
ToolRun RunTool(const std::vector<std::string>& args, const std::string& input = "");

}  // namespace br::tidefiles::test
