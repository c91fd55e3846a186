// The three files of a station folder, held whole in memory.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace br::tidefiles {

struct FolderImage {
  std::vector<std::uint8_t> stationIndex;     // "td_num.ntx"
  std::vector<std::uint8_t> coordinateIndex;  // "td_crd.ntx"
  std::vector<std::uint8_t> stationData;      // "td_pnt.dat"
};

// Reads the three files of folder. On failure returns false with a message naming the file.
bool ReadFolderImage(const std::string& folder, FolderImage& image, std::string& error);

// Writes the three files into folder (made if missing). Each file is written under a
// temporary name and renamed, so a failed write never leaves a half-written file behind.
bool WriteFolderImage(const std::string& folder, const FolderImage& image, std::string& error);

}  // namespace br::tidefiles
