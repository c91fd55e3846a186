#include "host/chartscene/server/base_catalogue.h"

#include <windows.h>

#include "host/chartscene/server/SceneModule.h"
#include "host/chartscene/server/scene_environment.h"

namespace br::chartscene {

namespace {

std::string AnsiPath(const std::wstring& path) {
  const int size = WideCharToMultiByte(CP_ACP, 0, path.c_str(), -1, nullptr, 0, nullptr, nullptr);
  std::string ansi(size > 0 ? static_cast<std::size_t>(size) : 1, '\0');
  if (size > 0) WideCharToMultiByte(CP_ACP, 0, path.c_str(), -1, &ansi[0], size, nullptr, nullptr);
  ansi.resize(ansi.size() - 1);
  return ansi;
}

}  // namespace

const S57Catalogue* BaseCatalogue(std::string& error) {
  // Kept for the process: scenes copy it, and nothing of it may run at unload.
  static S57Catalogue* catalogue = nullptr;
  if (catalogue != nullptr) return catalogue;
  std::wstring folder = EnvironmentText(L"CHARTSCENE_S57");
  if (folder.empty()) folder = SceneModule::Folder() + L"s57";
  auto* loaded = new S57Catalogue;
  if (!loaded->LoadFolder(AnsiPath(folder), error)) {
    delete loaded;
    return nullptr;
  }
  catalogue = loaded;
  return catalogue;
}

}  // namespace br::chartscene
