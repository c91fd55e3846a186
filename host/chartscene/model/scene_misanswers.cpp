#include "host/chartscene/model/scene_misanswers.h"

#include "host/chartscene/model/scene_counters.h"

#include <atomic>
#include <map>
#include <mutex>

namespace br::chartscene {

namespace {

struct State {
  std::mutex lock;
  std::map<std::string, Misanswer, std::less<>> kinds;
  std::atomic<bool> any{false};
};

// Never destroyed: wrappers may still answer while the process ends.
State& TheState() {
  static State* state = new State;
  return *state;
}

}  // namespace

void SetMisanswer(const std::string& operation, Misanswer kind) {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  if (kind == Misanswer::None) {
    state.kinds.erase(operation);
  } else {
    state.kinds[operation] = kind;
  }
  state.any = !state.kinds.empty();
}

void ClearMisanswers() {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  state.kinds.clear();
  state.any = false;
}

bool Misanswers(std::string_view operation, Misanswer kind) {
  State& state = TheState();
  if (!state.any) return false;
  {
    std::lock_guard<std::mutex> guard(state.lock);
    const auto it = state.kinds.find(operation);
    if (it == state.kinds.end() || it->second != kind) return false;
  }
  AddToCounter("misanswers.given", 1);
  return true;
}

}  // namespace br::chartscene
