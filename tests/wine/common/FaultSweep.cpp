#include "tests/wine/common/FaultSweep.h"

#include <windows.h>

#include <cstdio>

namespace br::test {

namespace {

const char* const kWrapperKinds[] = {"Database",      "DataSet",    "RasterDataSet",   "Object",  "Attribute",
                                     "ObjectEnum",    "SelectionEnum", "Projection",   "PresParams", "ColorMap",
                                     "ObjectFormatter", "TextTable", "ChartScene",     "Scene"};

}  // namespace

bool FaultSweep::Run(const char* operation, const FaultKind& kind, const std::function<void()>& body) {
  const std::string calls = std::string("calls.") + operation;
  const long before = probe_.Counter(kind.misanswer ? "misanswers.given" : calls.c_str());
  if (kind.misanswer) {
    probe_.SetMisanswer(operation, kind.misanswer);
  } else {
    probe_.SetFault(operation, E_FAIL);
  }
  body();
  probe_.ClearFaults();
  const bool reached = probe_.Counter(kind.misanswer ? "misanswers.given" : calls.c_str()) != before;
  ++runs_;
  if (reached) ++reached_;
  return reached;
}

std::map<std::string, long> FaultSweep::Held() const {
  std::map<std::string, long> held;
  for (const char* kind : kWrapperKinds) {
    const std::string name = std::string("live.") + kind;
    held[name] = probe_.Counter(name.c_str());
  }
  held["selections.open"] = probe_.Counter("selections.open");
  return held;
}

std::string FaultSweep::Changes(const std::map<std::string, long>& before, const std::map<std::string, long>& now) {
  std::string changes;
  for (const auto& [name, value] : now) {
    const auto old = before.find(name);
    const long was = old == before.end() ? 0 : old->second;
    if (was != value) changes += name + " " + std::to_string(was) + " -> " + std::to_string(value) + ", ";
  }
  return changes;
}

std::string FaultSweep::Summary(const char* client, std::size_t operations) const {
  char text[200];
  std::snprintf(text, sizeof text, "%s fault sweep: %zu operations x %zu fault kinds = %zu runs, %zu reached the fault",
                client, operations, kFaultKindCount, runs_, reached_);
  return text;
}

}  // namespace br::test
