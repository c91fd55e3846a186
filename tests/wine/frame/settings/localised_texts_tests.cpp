// Localised texts through the stand-in text table of chartscene.dll: the localiser is made
// once and not retried while it stands, only exactly S_OK gives a text, the client list is
// a set whose last leaver destroys it, and the module's unload paths release it or only
// forget it. The stand-in's counters show every component made and released.
#include <doctest/doctest.h>

#include <objbase.h>

#include <string>

#include "GeoData.h"
#include "frame/settings/localised_texts.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/registry_test_support.h"

using namespace br;
using br::test::SceneProbe;
using br::test::ScopedEnvironment;

namespace {

// COM stays up for the whole run, so the localiser's own initialisation is never the last.
struct ComForTheRun {
  ComForTheRun() { CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED); }
} comForTheRun;

const SceneProbe& Probe() {
  static SceneProbe probe;
  return probe;
}

long LiveTables() { return Probe().Counter("live.TextTable"); }

// Ends a case with no localiser, whatever the case left behind.
void DestroyLocaliser() {
  const int client = 0;
  RegisterTextClient(&client);
  UnregisterTextClient(&client);
  REQUIRE_FALSE(LocaliserExists());
}

}  // namespace

TEST_CASE("without a component every text is its default, and the attempt is not repeated") {
  DestroyLocaliser();
  const long live = LiveTables();
  long language = 0;
  CHECK(GetLanguage(&language) == OLE_E_BLANK);  // asking does not make the localiser
  CHECK(language == -1);
  CHECK_FALSE(LocaliserExists());
  {
    ScopedEnvironment absent(L"CHARTSCENE_TEXTTABLE", L"absent");
    CHECK(GetText("ObjInspector", 1, "Attributes") == "Attributes");
  }
  CHECK(LocaliserExists());
  CHECK(GetLanguage(&language) == OLE_E_BLANK);
  const long made = Probe().Counter("TextTable.created");
  CHECK(GetText("ObjInspector", 10, "Lights") == "Lights");  // the component is there now, unasked
  CHECK(Probe().Counter("TextTable.created") == made);

  // A table that does not load: the component goes at once and the defaults stay.
  DestroyLocaliser();
  Probe().SetFault("ITextTable.LoadTable", E_FAIL);
  CHECK(GetText("ObjInspector", 1, "Attributes") == "Attributes");
  Probe().SetFault("ITextTable.LoadTable", S_OK);
  CHECK(LiveTables() == live);
  CHECK(GetText("ObjInspector", 1, "Attributes") == "Attributes");
  CHECK(Probe().Counter("calls.ITextTable.LoadTable") > 0);
  DestroyLocaliser();
}

TEST_CASE("texts: the table's language, exactly S_OK, an empty text replacing the default") {
  DestroyLocaliser();
  ScratchFolder folder;
  WriteTextFile(folder / "BRInfo.csv",
                          "section,id,1033,1036\n"
                          "ObjInspector,1,Attributes,Attributs\n"
                          "ObjInspector,55,unknown,\"\"\n"
                          "ObjInspector,4,Not defined,Non d\xC3\xA9" "fini\n"
                          "cPictureBox,-1,Close\n");
  const std::wstring wideFolder(folder.Path().begin(), folder.Path().end());
  ScopedEnvironment texts(L"CHARTSCENE_TEXTS", wideFolder.c_str());
  ScopedEnvironment french(L"CHARTSCENE_LANGUAGE", L"1036");

  CHECK(GetText("ObjInspector", 1, "Attributes") == "Attributs");
  CHECK(GetText("ObjInspector", 55, "unknown").empty());        // S_OK with no text
  CHECK(GetText("cPictureBox", -1, "Close") == "Close");         // no French cell: S_FALSE
  CHECK(GetText("ObjInspector", 999, "fallback") == "fallback");
  if (GetACP() == 1252) CHECK(GetText("ObjInspector", 4, "Not defined") == "Non d\xE9" "fini");
  long language = 0;
  CHECK(GetLanguage(&language) == S_OK);
  CHECK(language == 1036);

  // A success that is not S_OK, even with a text, leaves the default.
  Probe().SetFault("ITextTable.GetText", S_FALSE);
  CHECK(GetText("ObjInspector", 1, "Attributes") == "Attributes");
  Probe().SetFault("ITextTable.GetText", E_OUTOFMEMORY);
  CHECK(GetText("ObjInspector", 1, "Attributes") == "Attributes");
  Probe().SetFault("ITextTable.GetText", S_OK);
  Probe().SetFault("ITextTable.GetLanguage", E_UNEXPECTED);
  CHECK(GetLanguage(&language) == E_UNEXPECTED);
  CHECK(language == -1);
  Probe().ClearFaults();
  CHECK(GetLanguage(nullptr) == E_POINTER);
  DestroyLocaliser();
}

TEST_CASE("clients: a set; the last one to leave destroys the localiser and releases the component") {
  DestroyLocaliser();
  const long live = LiveTables();
  const int first = 1, second = 2;

  RegisterTextClient(&first);
  RegisterTextClient(&first);
  CHECK(LiveTables() == live + 1);
  UnregisterTextClient(&first);  // held once: gone
  CHECK_FALSE(LocaliserExists());
  CHECK(LiveTables() == live);

  RegisterTextClient(&first);
  RegisterTextClient(&second);
  UnregisterTextClient(&second);
  UnregisterTextClient(&second);  // no longer there: nothing happens
  CHECK(LocaliserExists());
  UnregisterTextClient(&first);
  CHECK_FALSE(LocaliserExists());
  CHECK(LiveTables() == live);
  long language = 0;
  CHECK(GetLanguage(&language) == OLE_E_BLANK);

  // A localiser made by a lookup alone has no clients: an unknown one leaving keeps it.
  CHECK(GetText("ObjInspector", 1, "Attributes") == "Attributes");
  UnregisterTextClient(&second);
  CHECK(LocaliserExists());

  // The next use after a destruction starts afresh: the new component reads the new setting.
  {
    ScopedEnvironment french(L"CHARTSCENE_LANGUAGE", L"1036");
    CHECK(GetText("ObjInspector", 10, "Lights") == "Lights");  // the English component stands
    DestroyLocaliser();
    CHECK(GetText("ObjInspector", 10, "Lights") == "Feux");
  }
  DestroyLocaliser();
}

TEST_CASE("module life: unload releases on the making thread only; detach only forgets") {
  DestroyLocaliser();
  const long live = LiveTables();
  CHECK(DestroyLocaliserAtUnload());  // nothing to do
  GetText("ObjInspector", 1, "Attributes");
  REQUIRE(LiveTables() == live + 1);

  bool fromOtherThread = true;
  HANDLE thread = CreateThread(
      nullptr, 0,
      [](void* result) -> DWORD {
        *static_cast<bool*>(result) = DestroyLocaliserAtUnload();
        return 0;
      },
      &fromOtherThread, 0, nullptr);
  WaitForSingleObject(thread, INFINITE);
  CloseHandle(thread);
  CHECK_FALSE(fromOtherThread);
  CHECK(LocaliserExists());

  CHECK(DestroyLocaliserAtUnload());
  CHECK_FALSE(LocaliserExists());
  CHECK(LiveTables() == live);

  // Detach: forgotten, not released (the component's count stays up: that is the point).
  GetText("ObjInspector", 1, "Attributes");
  DropLocaliserAtDetach();
  CHECK_FALSE(LocaliserExists());
  CHECK(LiveTables() == live + 1);
}
