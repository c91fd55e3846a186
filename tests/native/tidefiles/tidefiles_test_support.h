// Helpers shared by the tidefiles suites: station folders made from JSON text, temporary
// folders, and the tool run in-process.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include "tides/engine/station_files.h"
#include "tools/tidefiles/diagnostics.h"
#include "tools/tidefiles/folder_image.h"

namespace br::tidefiles::test {

// A folder under the system's temporary directory, removed with everything in it.
class TemporaryFolder {
 public:
  TemporaryFolder();
  ~TemporaryFolder();
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;
  const std::filesystem::path& Path() const { return path_; }
  std::string Str() const { return path_.string(); }

 private:
  std::filesystem::path path_;
};

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
