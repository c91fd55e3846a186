#include "host/brchart/chart_scene_file.h"

#include <fstream>
#include <iterator>

#include "host/chartscene/model/S57Catalogue.h"
#include "host/chartscene/model/scene_loader.h"

namespace br::brchart {

std::string FolderOf(const std::string& path) {
  const std::size_t cut = path.find_last_of("/\\");
  return cut == std::string::npos ? std::string() : path.substr(0, cut);
}

bool LoadChartScene(const std::string& path, const std::string& catalogueFolder, chartscene::SceneModel& scene,
                    std::string& error) {
  chartscene::S57Catalogue catalogue;
  std::string why;
  if (!catalogue.LoadFolder(catalogueFolder, why)) {
    error = "the S-57 catalogue in " + catalogueFolder + " cannot be read: " + why;
    return false;
  }
  std::ifstream in(path, std::ios::binary);
  if (!in) {
    error = "cannot open the scene " + path;
    return false;
  }
  const std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  chartscene::SceneError fault;
  std::string folder = FolderOf(path);
  if (folder.empty()) folder = ".";
  if (!chartscene::LoadScene(text, folder, catalogue, scene, fault)) {
    error = path + ": " + fault.Text();
    return false;
  }
  return true;
}

}  // namespace br::brchart
