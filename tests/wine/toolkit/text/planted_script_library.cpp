// Exports the script processor's entry point names, each failing; and a marker
// that tells the suite the plant, not the system's library, was loaded.
#include <windows.h>

#include "tests/wine/toolkit/text/planted_script_library.h"

#define BR_PLANTED(name) \
  extern "C" __declspec(dllexport) HRESULT name() { return E_FAIL; }

BR_PLANTED(ScriptItemize)
BR_PLANTED(ScriptShape)
BR_PLANTED(ScriptPlace)
BR_PLANTED(ScriptGetLogicalWidths)
BR_PLANTED(ScriptBreak)
BR_PLANTED(ScriptLayout)
BR_PLANTED(ScriptStringOut)
BR_PLANTED(ScriptTextOut)
BR_PLANTED(ScriptFreeCache)
BR_PLANTED(ScriptStringFree)
BR_PLANTED(ScriptString_pSize)
BR_PLANTED(ScriptStringAnalyse)

// Named as kPlantedMarker says.
extern "C" __declspec(dllexport) int BrPlantedMarker() { return 1; }
