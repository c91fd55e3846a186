// The probe DLL that suites plant under the names the library loads (planted_probe.dll):
// its one export, and the mark it leaves in the current folder when it is loaded.
#pragma once

namespace br::test {

inline constexpr const char* kPlantedProbeExport = "PlantedProbe";
inline constexpr const wchar_t* kPlantedProbeMark = L"planted_probe_ran.txt";

}  // namespace br::test
