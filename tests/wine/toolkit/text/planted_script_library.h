#pragma once
// The planted stand-in for usp10.dll (built beside the suite): its file name, and the
// export by which the suite tells it from the system's library.

namespace br::test {

inline constexpr const wchar_t* kPlantedLibrary = L"br_planted_usp10.dll";
inline constexpr const char* kPlantedMarker = "BrPlantedMarker";

}  // namespace br::test
