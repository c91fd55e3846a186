#pragma once
// Process environment settings of the stand-in host (read when a component is made):
//   CHARTSCENE_TEXTTABLE   "absent": the text table cannot be created (as if unregistered)
//   CHARTSCENE_LANGUAGE    the text table's language identifier (default 1033)
//   CHARTSCENE_TEXTS       folder of BRInfo.csv when the library names none (default: the
//                          folder of chartscene.dll)

#include <windows.h>

#include <string>

namespace br::chartscene {

// The variable's value, empty when it is not set.
std::wstring EnvironmentText(const wchar_t* name);
long EnvironmentNumber(const wchar_t* name, long fallback);

}  // namespace br::chartscene
