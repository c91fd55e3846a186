// A scratch folder holding copies of the planted probe DLL under chosen names, made the
// current folder while the object lives (the previous one comes back at its end).
#pragma once

#include <windows.h>

#include <string>
#include <vector>

namespace br::test {

class PlantedFolder {
public:
  PlantedFolder();   // makes the folder and enters it; REQUIREs the probe DLL
  ~PlantedFolder();  // leaves it and deletes it
  PlantedFolder(const PlantedFolder&) = delete;
  PlantedFolder& operator=(const PlantedFolder&) = delete;

  // A copy of the probe named fileName in the folder.
  void Plant(const wchar_t* fileName) const;
  const std::wstring& Path() const { return path_; }

  // True once any planted copy was loaded in this process.
  bool ProbeRan() const;
  void ForgetProbeRan() const;
  // The full paths of the process's modules that lie in the folder.
  std::vector<std::wstring> ModulesFromHere() const;

  // The system folder, with its closing backslash.
  static std::wstring SystemFolder();
  // The module's full path.
  static std::wstring ModulePath(HMODULE module);

private:
  std::wstring path_;
  std::wstring previous_;
};

}  // namespace br::test
