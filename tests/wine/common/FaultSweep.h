// The host fault sweep of the chart controls: every operation of the stand-in chart host a
// client calls, run once per fault kind (failing, or one of the stand-in's wrong answers
// with success), with the proof that the client released every wrapper and selection.
#pragma once

#include "tests/wine/common/SceneProbe.h"

#include <functional>
#include <map>
#include <string>
#include <vector>

namespace br::test {

struct FaultKind {
  const char* name;
  int misanswer;  // the stand-in's Misanswer; 0: the operation fails with E_FAIL
};

inline const FaultKind kFaultKinds[] = {
    {"failing", 0},          {"wrong VARIANT type", 1},          {"wrong array shape", 2},
    {"null out-value with success", 3}, {"endless enumerator", 4}, {"1 MB text", 5},
};
inline constexpr std::size_t kFaultKindCount = sizeof kFaultKinds / sizeof kFaultKinds[0];

class FaultSweep {
public:
  explicit FaultSweep(const SceneProbe& probe) : probe_(probe) {}

  // Injects the kind into the operation, runs body and removes it again. True when the
  // client reached the fault: the failing operation was called, or the wrong answer given.
  bool Run(const char* operation, const FaultKind& kind, const std::function<void()>& body);

  // The stand-in's live wrappers of every kind and its open selections.
  std::map<std::string, long> Held() const;

  // The entries of now that differ from before ("live.Object 3 -> 5, "), empty when none.
  static std::string Changes(const std::map<std::string, long>& before, const std::map<std::string, long>& now);

  // Combinations run and reached so far, and the operations reached in at least one kind.
  std::size_t Runs() const { return runs_; }
  std::size_t Reached() const { return reached_; }
  // "operations x kinds" as the suites print it.
  std::string Summary(const char* client, std::size_t operations) const;

private:
  const SceneProbe& probe_;
  std::size_t runs_ = 0;
  std::size_t reached_ = 0;
};

}  // namespace br::test
