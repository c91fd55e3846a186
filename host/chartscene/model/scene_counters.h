#pragma once
// Process-wide counters, injected faults and formatter option records of the stand-in host, so tests can prove that
// a client released everything it was given and can make any operation fail.
//
// Counter names: "live.<Kind>" (wrappers alive now), "calls.<Interface>.<Method>" (calls
// made), "selections.open" (selections created and not released), and whatever else a
// component counts ("TextTable.created", ...).
// Operation names: "<Interface>.<Method>" ("IGeoDatabase.GetName", "ITextTable.LoadTable").

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace br::chartscene {

void AddToCounter(const std::string& name, long delta);
// AddToCounter("live." + kind, delta) without a new string per wrapper.
void AddToLiveCounter(std::string_view kind, long delta);
long CounterValue(const std::string& name);
// Every counter whose name starts with prefix (all of them for "").
std::map<std::string, long> Counters(const std::string& prefix);

// The HRESULT an operation is to return, as a 32-bit pattern; 0 removes the fault.
void SetFault(const std::string& operation, std::uint32_t result);
// Also removes every misanswer (scene_misanswers.h).
void ClearFaults();
// Counts the call and gives the injected result, if any. Cheap enough for every call of a
// client walking thousands of objects: no allocation once a counter exists.
std::optional<std::uint32_t> CallAndFault(std::string_view operation);

// The last value each object formatter option was set to ("I4:1036", "BSTR:unknown"),
// whichever formatter was given it; empty for an option never set.
void RecordFormatterOption(long id, const std::string& value);
std::string FormatterOption(long id);

}  // namespace br::chartscene
