// The three files of a station folder, held whole in memory.
#pragma once

#include <string>

#include "tides/engine/station_folder_check.h"

namespace br::tidefiles {

using FolderImage = br::tides::StationFolderBytes;

// Reads the three files of folder. On failure returns false with a message naming the file.
bool ReadFolderImage(const std::string& folder, FolderImage& image, std::string& error);

// Writes the three files into folder (made if missing). Each file is written under a
// temporary name and renamed, so a failed write never leaves a half-written file behind.
bool WriteFolderImage(const std::string& folder, const FolderImage& image, std::string& error);

}  // namespace br::tidefiles
