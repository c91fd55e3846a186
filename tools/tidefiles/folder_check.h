// Validation of a station folder: everything the engine relies on when it opens the folder,
// searches it and loads a station.
#pragma once

#include <string>
#include <vector>

#include "tools/tidefiles/folder_image.h"

namespace br::tidefiles {

// One line per problem, "<file>: station <n>: <what is wrong>" (station numbers are the
// "td_num.ntx" order; records of "td_crd.ntx" that match no station are named by record).
// Empty when the folder is sound.
std::vector<std::string> CheckFolderImage(const FolderImage& image);

}  // namespace br::tidefiles
