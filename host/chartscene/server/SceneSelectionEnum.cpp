#include "host/chartscene/server/SceneSelectionEnum.h"

#include "host/chartscene/server/scene_misanswer_values.h"

#include <algorithm>

namespace br::chartscene {

SceneSelectionEnum::SceneSelectionEnum(SceneRef scene, std::size_t dataSet)
    : ComObject<IGeoSelectionEnum>("SelectionEnum"), scene_(std::move(scene)), dataSet_(dataSet) {}

IGeoSelectionEnum* NewSelectionEnum(const SceneRef& scene, std::size_t dataSet) {
  return new SceneSelectionEnum(scene, dataSet);
}

STDMETHODIMP SceneSelectionEnum::SetSelection(long selection, long flags) {
  SCENE_CALL("IGeoSelectionEnum.SetSelection");
  const std::vector<long>* classes = scene_->Selection(selection);
  if (classes == nullptr || flags != 0) return E_INVALIDARG;
  classes_ = *classes;
  selected_ = true;
  next_ = 0;
  return S_OK;
}

STDMETHODIMP SceneSelectionEnum::Next(ULONG count, IGeoObject** object, ULONG* fetched) {
  if (object == nullptr || fetched == nullptr) return E_POINTER;
  *object = nullptr;
  *fetched = 0;
  SCENE_CALL("IGeoSelectionEnum.Next");
  if (count != 1) return E_INVALIDARG;
  if (MisanswerNull("IGeoSelectionEnum.Next")) {
    *fetched = 1;  // claims an object and hands out none
    return S_OK;
  }
  const SceneModel& model = scene_->Model();
  const std::vector<std::size_t>& objects = model.dataSets[dataSet_].objects;
  // Never at the end: start over, with the dataset's first object when none is selected.
  if (next_ >= objects.size() && !objects.empty() && Misanswers("IGeoSelectionEnum.Next", Misanswer::Endless)) {
    next_ = 0;
    std::size_t given = objects.front();
    while (next_ < objects.size()) {
      const std::size_t candidate = objects[next_++];
      if (!selected_ ||
          std::find(classes_.begin(), classes_.end(), model.objects[candidate].classCode) != classes_.end()) {
        given = candidate;
        break;
      }
    }
    *object = NewObject(scene_, given);
    *fetched = 1;
    return S_OK;
  }
  while (next_ < objects.size()) {
    const std::size_t candidate = objects[next_++];
    if (!selected_ ||
        std::find(classes_.begin(), classes_.end(), model.objects[candidate].classCode) != classes_.end()) {
      *object = NewObject(scene_, candidate);
      *fetched = 1;
      return S_OK;
    }
  }
  return S_FALSE;
}

STDMETHODIMP SceneSelectionEnum::Reset() {
  SCENE_CALL("IGeoSelectionEnum.Reset");
  next_ = 0;
  return S_OK;
}

}  // namespace br::chartscene
