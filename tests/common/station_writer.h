// Writes station folders for the engine tests into fresh temporary folders.
#pragma once

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

#include "tides/engine/station_files.h"
#include "tides/engine/station_folder_check.h"

namespace br::tides::testing {

struct TestStation {
  std::string name;
  std::int16_t latitude = 0;   // minutes
  std::int16_t longitude = 0;  // minutes
  std::int8_t zone = 0;
  std::vector<ConstituentRecord> constituents;
  bool overrideCount = false;  // header count byte: count, else the number of constituents
  std::int8_t count = 0;
};

// A temporary folder removed with the object.
class TempFolder {
 public:
  explicit TempFolder(const std::string& hint = "engine");
  ~TempFolder();
  TempFolder(const TempFolder&) = delete;
  TempFolder& operator=(const TempFolder&) = delete;
  const std::filesystem::path& path() const { return path_; }
  std::string str() const { return path_.string(); }

 private:
  std::filesystem::path path_;
};

// The three files of stations: "td_num.ntx" in the given order, "td_crd.ntx" sorted by
// StationKey, blocks in "td_pnt.dat" in the given order.
StationFolderBytes StationFolderImage(const std::vector<TestStation>& stations);
// Writes them into folder (created if missing).
void WriteStationFolder(const std::filesystem::path& folder, const std::vector<TestStation>& stations);
void TruncateFile(const std::filesystem::path& file, std::uintmax_t size);
void WriteBytes(const std::filesystem::path& file, const std::vector<std::uint8_t>& bytes);

// An index record that only carries a position, as the search takes it.
inline StationIndexRecord Key(std::int16_t lat, std::int16_t lon) {
  StationIndexRecord r;
  r.latitude = lat;
  r.longitude = lon;
  return r;
}

// A station at (lat, lon) minutes, named "S<lat>_<lon>".
inline TestStation Station(std::int16_t lat, std::int16_t lon, std::vector<ConstituentRecord> records = {{0, 0, 1234}}) {
  return {"S" + std::to_string(lat) + "_" + std::to_string(lon), lat, lon, 0, std::move(records)};
}

// Closes the tide files at the end of a test case.
struct Closer {
  ~Closer() { CloseTideFiles(); }
};

}  // namespace br::tides::testing
