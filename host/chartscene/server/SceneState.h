#pragma once
// One loaded scene as its COM wrappers share it: the model, the selections made on its
// databases, the palettes made from it, and the faults it injects. Every wrapper holds a
// SceneRef, so the scene lives while anything handed out from it lives.

#include <windows.h>

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "host/chartscene/model/scene_model.h"

namespace br::chartscene {

class SceneState {
public:
  explicit SceneState(SceneModel model);
  ~SceneState();
  SceneState(const SceneState&) = delete;
  SceneState& operator=(const SceneState&) = delete;

  const SceneModel& Model() const { return model_; }

  // Counts the call ("calls.<operation>"); the fault injected for it, process-wide first,
  // then by the scene file; S_OK when there is none.
  HRESULT Call(const char* operation) const;

  // Selections: the classes a handle stands for. Open ones count in "selections.open".
  long CreateSelection(std::vector<long> classes);
  bool ReleaseSelection(long handle);
  const std::vector<long>* Selection(long handle) const;

  // The logical palette of palettes[index], made at first request, deleted with the scene.
  HPALETTE Palette(std::size_t index);

private:
  SceneModel model_;
  std::map<long, std::vector<long>> selections_;
  long nextSelection_ = 1;
  std::map<std::size_t, HPALETTE> palettes_;
};

using SceneRef = std::shared_ptr<SceneState>;

}  // namespace br::chartscene
