#pragma once
// Reads a chart scene file (UTF-8 JSON, docs/chart-scene.md) into a SceneModel over a
// copy of the S-57 catalogue. A scene with a JSON error, an unknown key, acronym or
// object name, a value of the wrong type or a missing stored file is refused whole, with
// the line and column of the fault; nothing of it is kept.

#include <string>

#include "host/chartscene/model/S57Catalogue.h"
#include "host/chartscene/model/scene_model.h"

namespace br::chartscene {

struct SceneError {
  int line = 0;
  int column = 0;
  std::string message;
  // "line L, column C: message"
  std::string Text() const;
};

// folder: where the paths of stored files start (with or without a closing separator).
bool LoadScene(const std::string& json, const std::string& folder, const S57Catalogue& catalogue,
               SceneModel& scene, SceneError& error);

// Days since 1899-12-30 (the automation date) of "YYYY-MM-DD" with an optional
// "THH:MM" or "THH:MM:SS"; false for anything else.
bool ParseSceneDate(const std::string& text, double& days);

}  // namespace br::chartscene
