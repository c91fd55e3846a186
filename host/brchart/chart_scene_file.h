// Reads a chart scene file with the S-57 catalogue it names its classes by. Portable.
#pragma once

#include <string>

#include "host/chartscene/model/scene_model.h"

namespace br::brchart {

// The catalogue from `catalogueFolder` (gdal-data's three S-57 files), then the scene;
// stored files are read relative to the scene's folder. False with a one-line message.
bool LoadChartScene(const std::string& path, const std::string& catalogueFolder, chartscene::SceneModel& scene,
                    std::string& error);

// The folder part of a path ("" for a bare name), either separator.
std::string FolderOf(const std::string& path);

}  // namespace br::brchart
