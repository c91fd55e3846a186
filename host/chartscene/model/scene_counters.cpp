#include "host/chartscene/model/scene_counters.h"

#include "host/chartscene/model/scene_misanswers.h"

#include <mutex>

namespace br::chartscene {

namespace {

struct State {
  std::mutex lock;
  std::map<std::string, long, std::less<>> counters;
  std::map<std::string, std::uint32_t, std::less<>> faults;
  std::map<long, std::string> options;
};

// Never destroyed: wrappers may still count while the process ends.
State& TheState() {
  static State* state = new State;
  return *state;
}

}  // namespace

void AddToCounter(const std::string& name, long delta) {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  state.counters[name] += delta;
}

void AddToLiveCounter(std::string_view kind, long delta) {
  thread_local std::string name;
  name.assign("live.").append(kind);
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  auto counter = state.counters.find(name);
  if (counter == state.counters.end()) counter = state.counters.emplace(name, 0).first;
  counter->second += delta;
}

long CounterValue(const std::string& name) {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  const auto it = state.counters.find(name);
  return it == state.counters.end() ? 0 : it->second;
}

std::map<std::string, long> Counters(const std::string& prefix) {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  std::map<std::string, long> found;
  for (const auto& [name, value] : state.counters) {
    if (name.compare(0, prefix.size(), prefix) == 0) found.emplace(name, value);
  }
  return found;
}

void SetFault(const std::string& operation, std::uint32_t result) {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  if (result == 0) {
    state.faults.erase(operation);
  } else {
    state.faults[operation] = result;
  }
}

void ClearFaults() {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  state.faults.clear();
  ClearMisanswers();
}

std::optional<std::uint32_t> CallAndFault(std::string_view operation) {
  thread_local std::string name;
  name.assign("calls.").append(operation);
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  auto counter = state.counters.find(name);
  if (counter == state.counters.end()) counter = state.counters.emplace(name, 0).first;
  ++counter->second;
  if (state.faults.empty()) return std::nullopt;
  const auto it = state.faults.find(operation);
  if (it == state.faults.end()) return std::nullopt;
  return it->second;
}

void RecordFormatterOption(long id, const std::string& value) {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  state.options[id] = value;
}

std::string FormatterOption(long id) {
  State& state = TheState();
  std::lock_guard<std::mutex> guard(state.lock);
  const auto it = state.options.find(id);
  return it == state.options.end() ? std::string() : it->second;
}

}  // namespace br::chartscene
