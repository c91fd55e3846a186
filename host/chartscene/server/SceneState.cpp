#include "host/chartscene/server/SceneState.h"

#include <vector>

#include "host/chartscene/model/scene_counters.h"

namespace br::chartscene {

SceneState::SceneState(SceneModel model) : model_(std::move(model)) { AddToCounter("live.Scene", 1); }

SceneState::~SceneState() {
  AddToCounter("selections.open", -static_cast<long>(selections_.size()));
  for (const auto& [index, palette] : palettes_) DeleteObject(palette);
  AddToCounter("live.Scene", -1);
}

HRESULT SceneState::Call(const char* operation) const {
  if (auto fault = CallAndFault(operation)) return static_cast<HRESULT>(*fault);
  if (model_.faults.empty()) return S_OK;
  const auto it = model_.faults.find(operation);
  return it == model_.faults.end() ? S_OK : static_cast<HRESULT>(it->second);
}

long SceneState::CreateSelection(std::vector<long> classes) {
  const long handle = nextSelection_++;
  selections_[handle] = std::move(classes);
  AddToCounter("selections.open", 1);
  return handle;
}

bool SceneState::ReleaseSelection(long handle) {
  if (selections_.erase(handle) == 0) return false;
  AddToCounter("selections.open", -1);
  return true;
}

const std::vector<long>* SceneState::Selection(long handle) const {
  const auto it = selections_.find(handle);
  return it == selections_.end() ? nullptr : &it->second;
}

HPALETTE SceneState::Palette(std::size_t index) {
  if (index >= model_.palettes.size()) return nullptr;
  const auto found = palettes_.find(index);
  if (found != palettes_.end()) return found->second;
  const auto& colours = model_.palettes[index].colours;
  std::vector<BYTE> storage(sizeof(LOGPALETTE) + colours.size() * sizeof(PALETTEENTRY));
  auto* logical = reinterpret_cast<LOGPALETTE*>(storage.data());
  logical->palVersion = 0x300;
  logical->palNumEntries = static_cast<WORD>(colours.size());
  for (std::size_t i = 0; i < colours.size(); ++i) {
    logical->palPalEntry[i] = {colours[i][0], colours[i][1], colours[i][2], 0};
  }
  const HPALETTE palette = CreatePalette(logical);
  if (palette != nullptr) palettes_[index] = palette;
  return palette;
}

}  // namespace br::chartscene
