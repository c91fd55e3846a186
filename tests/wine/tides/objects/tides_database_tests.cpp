// TidesDatabase through the built DLL: one folder per load, ports by box (GetPort's ports:
// the leak and re-entrancy suites). Refusals, null pointers and indices outside: the boundary suite.
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/EventSink.h"  // PortName
#include "tests/wine/common/StationFolder.h"

#include <string>
#include <vector>

using namespace br::test;

namespace {

const TestConstituent kMeanLevel = {0, 1500, 0}, kM2 = {29, 1200, 1100};

HRESULT Initialize(ITidesDatabase* database, const std::wstring& folder) {
  BSTR path = SysAllocString(folder.c_str());
  const HRESULT hr = database->Initialize(path);
  SysFreeString(path);
  return hr;
}

// The names of the ports GetPorts gives for a box, in array order (nothing: VT_EMPTY).
std::vector<std::wstring> PortsIn(ITidesDatabase* database, double a, double b, double c, double d) {
  VARIANT list;
  list.vt = VT_I4;  // whatever the caller had there
  REQUIRE(database->GetPorts(a, b, c, d, &list) == S_OK);
  std::vector<std::wstring> names;
  if (list.vt == VT_EMPTY) return names;
  REQUIRE(list.vt == (VT_ARRAY | VT_UNKNOWN));
  REQUIRE(SafeArrayGetDim(list.parray) == 1);
  CHECK(SafeArrayGetElemsize(list.parray) == sizeof(IUnknown*));
  CHECK(list.parray->rgsabound[0].lLbound == 0);
  CHECK(list.parray->rgsabound[0].cElements > 0);  // never an empty array
  IUnknown** ports = static_cast<IUnknown**>(list.parray->pvData);
  for (ULONG i = 0; i < list.parray->rgsabound[0].cElements; ++i) names.push_back(PortName(ports[i]));
  VariantClear(&list);
  return names;
}

}  // namespace

TEST_CASE("Initialize: a folder without td_pnt.dat fails, a good one opens, later folders are ignored until unload") {
  StationFolder broken({{"Alpha", 600, 1200, 0, {kMeanLevel}}}, true);
  StationFolder good({{"Alpha", 600, 1200, 0, {kMeanLevel}}, {"Bravo", 660, 1260, -1, {kMeanLevel}}});
  StationFolder other({{"Other", 60, 60, 0, {kMeanLevel}}});
  {
    DllUnderTest dll;
    ITidesDatabase* database = nullptr;
    REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
    CHECK(Initialize(database, broken.Path()) == E_INVALIDARG);
    CHECK(Initialize(database, good.Path() + L"\\") == S_OK);  // a trailing separator is accepted
    CHECK(CountOf(database) == 2);
    ITidesDatabase* second = nullptr;  // the files are open for the process
    REQUIRE(dll.Create(CLSID_TidesDatabase, &second) == S_OK);
    CHECK(Initialize(second, other.Path()) == S_OK);
    CHECK(CountOf(second) == 2);
    second->Release();
    database->Release();
  }
  DllUnderTest dll;  // after an unload the next load opens another folder
  ITidesDatabase* database = OpenedDatabase(dll, other.Path());
  CHECK(CountOf(database) == 1);
  database->Release();
}

TEST_CASE("GetPorts: strict box edges, swapped corners, VT_EMPTY for an empty box") {
  // Stations 0 and 3 lie on the corners of the box (10N 20E)-(12N 22E), 1 inside it.
  StationFolder folder({{"Alpha", 600, 1200, 0, {kMeanLevel, kM2}}, {"Bravo", 660, 1260, -1, {kMeanLevel, kM2}},
                        {"Charlie", -630, -315, 1, {kMeanLevel, kM2}}, {"Delta", 720, 1320, 0, {kMeanLevel}}});
  DllUnderTest dll;
  ITidesDatabase* db = OpenedDatabase(dll, folder.Path());
  using Names = std::vector<std::wstring>;
  const Names three = {L"Alpha", L"Bravo", L"Delta"};
  // Alpha and Delta lie exactly on the corners: only Bravo is strictly inside.
  CHECK(PortsIn(db, Degrees(600), Degrees(1200), Degrees(720), Degrees(1320)) == Names{L"Bravo"});
  CHECK(PortsIn(db, 9.9, 19.9, 12.1, 22.1) == three);
  CHECK(PortsIn(db, 12.1, 22.1, 9.9, 19.9) == three);  // (LatMax, LonMax, LatMin, LonMin)
  CHECK(PortsIn(db, 9.9, 22.1, 12.1, 19.9) == three);  // longitudes swapped only
  CHECK(PortsIn(db, -90, 170, 90, -170).size() == 4);  // no wrap at 180: -170..170
  CHECK(PortsIn(db, 11.0, 19.0, 11.0, 23.0).empty());  // no height: VT_EMPTY
  db->Release();
}
