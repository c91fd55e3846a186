// TidesDatabase through the built DLL: one folder per load, station positions and names,
// ports by number and by latitude/longitude box. Refusals before Initialize, null pointers
// and indices outside the stations are in the boundary suite.
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <string>
#include <vector>

using br::test::Degrees;
using br::test::DllUnderTest;
using br::test::StationFolder;
using br::test::TestStation;

namespace {

const br::test::TestConstituent kMeanLevel = {0, 1500, 0};
const br::test::TestConstituent kM2 = {29, 1200, 1100};

// Stations 0 and 3 lie on the corners of the box (10N 20E)-(12N 22E), 1 inside it; 4 has
// no coordinate entry.
std::vector<TestStation> BoxStations() {
  return {
      {"Alpha", 600, 1200, 0, {kMeanLevel, kM2}},
      {"Bravo", 660, 1260, -1, {kMeanLevel, kM2}},
      {"Charlie", -630, -315, 1, {kMeanLevel, kM2}},
      {"Delta", 720, 1320, 0, {kMeanLevel}},
      {"Echo (no coordinate entry)", 900, -600, 0, {kMeanLevel}},
  };
}

br::test::FolderOptions EchoNotInCoordinates() {
  br::test::FolderOptions options;
  options.notInCoordinateIndex = {4};
  return options;
}

HRESULT Initialize(ITidesDatabase* database, const std::wstring& folder) {
  BSTR path = SysAllocString(folder.c_str());
  const HRESULT hr = database->Initialize(path);
  SysFreeString(path);
  return hr;
}

long CountOf(ITidesDatabase* database) {
  long count = -1;
  REQUIRE(database->get_NumPorts(&count) == S_OK);
  return count;
}

std::wstring NameOf(ITidesPort* port) {
  BSTR name = nullptr;
  REQUIRE(port->get_PortName(&name) == S_OK);
  std::wstring result = name ? name : L"";
  SysFreeString(name);
  return result;
}

// The names of the ports GetPorts gives for a box, in array order; checks the array's form.
std::vector<std::wstring> PortsIn(ITidesDatabase* database, double a, double b, double c, double d) {
  VARIANT list;
  list.vt = VT_I4;  // whatever the caller had there
  REQUIRE(database->GetPorts(a, b, c, d, &list) == S_OK);
  std::vector<std::wstring> names;
  if (list.vt == VT_EMPTY) return names;
  REQUIRE(list.vt == (VT_ARRAY | VT_UNKNOWN));
  SAFEARRAY* array = list.parray;
  REQUIRE(SafeArrayGetDim(array) == 1);
  CHECK(SafeArrayGetElemsize(array) == sizeof(IUnknown*));
  LONG lower = -1, upper = -1;
  SafeArrayGetLBound(array, 1, &lower);
  SafeArrayGetUBound(array, 1, &upper);
  CHECK(lower == 0);
  CHECK(upper >= lower);  // nothing found is VT_EMPTY, never an empty array
  for (LONG i = lower; i <= upper; ++i) {
    IUnknown* element = nullptr;
    REQUIRE(SafeArrayGetElement(array, &i, &element) == S_OK);
    ITidesPort* port = br::test::Query<ITidesPort>(element);
    names.push_back(NameOf(port));
    port->Release();
    element->Release();
  }
  VariantClear(&list);
  return names;
}

}  // namespace

TEST_CASE("Initialize: a folder without td_pnt.dat fails, a good one opens, later folders are ignored until unload") {
  br::test::FolderOptions noData;
  noData.withoutDataFile = true;
  StationFolder broken(BoxStations(), noData);
  StationFolder good(BoxStations(), EchoNotInCoordinates());
  StationFolder other({{"Other", 60, 60, 0, {kMeanLevel}}});
  {
    DllUnderTest dll;
    ITidesDatabase* database = nullptr;
    REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
    CHECK(Initialize(database, broken.Path()) == E_INVALIDARG);
    CHECK(Initialize(database, good.Path() + L"\\") == S_OK);  // a trailing separator is accepted
    CHECK(CountOf(database) == 5);

    // The files are open for the process: another good folder changes nothing.
    ITidesDatabase* second = nullptr;
    REQUIRE(dll.Create(CLSID_TidesDatabase, &second) == S_OK);
    CHECK(Initialize(second, other.Path()) == S_OK);
    CHECK(CountOf(second) == 5);
    second->Release();
    database->Release();
    REQUIRE(dll.CanUnloadNow() == S_OK);
  }
  // After an unload the next load opens another folder.
  DllUnderTest dll;
  ITidesDatabase* database = br::test::OpenedDatabase(dll, other.Path());
  CHECK(CountOf(database) == 1);
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("GetPortInfo: positions in degrees, names through the coordinate index and the ANSI code page") {
  StationFolder folder(BoxStations(), EchoNotInCoordinates());
  DllUnderTest dll;
  ITidesDatabase* database = br::test::OpenedDatabase(dll, folder.Path());
  double latitude = 0, longitude = 0;
  BSTR name = nullptr;
  CHECK(database->GetPortInfo(2, &latitude, &longitude, &name) == S_OK);
  CHECK(latitude == Degrees(-630));
  CHECK(longitude == doctest::Approx(-5.25));
  REQUIRE(name != nullptr);
  CHECK(std::wstring(name) == L"Charlie");
  SysFreeString(name);

  // A station missing from the coordinate index has its position but an empty name.
  name = nullptr;
  CHECK(database->GetPortInfo(4, &latitude, &longitude, &name) == S_OK);
  CHECK(latitude == doctest::Approx(15.0));
  REQUIRE(name != nullptr);
  CHECK(SysStringLen(name) == 0);
  SysFreeString(name);
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("station names come through the ANSI code page, the whole 40-byte field") {
  StationFolder folder({{"Br\xE9st", 2903, -270, -1, {kMeanLevel}}, {std::string(40, 'N'), 100, 100, 0, {kMeanLevel}}});
  DllUnderTest dll;
  ITidesDatabase* database = br::test::OpenedDatabase(dll, folder.Path());
  double latitude = 0, longitude = 0;
  BSTR name = nullptr;
  REQUIRE(database->GetPortInfo(0, &latitude, &longitude, &name) == S_OK);
  if (GetACP() == 1252) CHECK(std::wstring(name) == L"Br\u00E9st");
  CHECK(SysStringLen(name) == 5);
  SysFreeString(name);
  REQUIRE(database->GetPortInfo(1, &latitude, &longitude, &name) == S_OK);
  CHECK(std::wstring(name) == std::wstring(40, L'N'));
  SysFreeString(name);
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("GetPort: a new port per call that outlives the database; a station without coordinates predicts nothing") {
  StationFolder folder(BoxStations(), EchoNotInCoordinates());
  DllUnderTest dll;
  ITidesDatabase* database = br::test::OpenedDatabase(dll, folder.Path());
  IUnknown* a = nullptr;
  IUnknown* b = nullptr;
  REQUIRE(database->GetPort(1, &a) == S_OK);
  REQUIRE(database->GetPort(1, &b) == S_OK);
  REQUIRE(a != nullptr);
  CHECK(a != b);                      // nothing cached
  CHECK(br::test::RefCount(a) == 1);  // one reference, the caller's
  ITidesPort* bravo = br::test::Query<ITidesPort>(a);
  CHECK(NameOf(bravo) == L"Bravo");
  double latitude = 0, longitude = 0;
  CHECK(bravo->GetPortPos(&latitude, &longitude) == S_OK);
  CHECK(latitude == Degrees(660));
  CHECK(longitude == Degrees(1260));

  ITidesPort* echo = br::test::PortAt(database, 4);
  CHECK(NameOf(echo).empty());

  // Ports need only the process-wide engine.
  database->Release();
  long points = -1;
  CHECK(bravo->Calculate(1.0, 36526.0) == S_OK);
  CHECK(bravo->get_NumPoints(&points) == S_OK);
  CHECK(points == 25);
  br::test::EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(echo));
  CHECK(echo->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 1);
  CHECK(echo->get_NumPoints(&points) == S_OK);
  CHECK(points == 0);
  sink.Disconnect();
  echo->Release();
  bravo->Release();
  a->Release();
  b->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("GetPorts: strict box edges, swapped corners, VT_EMPTY for an empty box") {
  StationFolder folder(BoxStations(), EchoNotInCoordinates());
  DllUnderTest dll;
  ITidesDatabase* database = br::test::OpenedDatabase(dll, folder.Path());
  using Names = std::vector<std::wstring>;
  const Names three = {L"Alpha", L"Bravo", L"Delta"};
  // Alpha and Delta lie exactly on the corners: only Bravo is strictly inside.
  CHECK(PortsIn(database, Degrees(600), Degrees(1200), Degrees(720), Degrees(1320)) == Names{L"Bravo"});
  CHECK(PortsIn(database, 9.9, 19.9, 12.1, 22.1) == three);
  CHECK(PortsIn(database, 12.1, 22.1, 9.9, 19.9) == three);  // (LatMax, LonMax, LatMin, LonMin)
  CHECK(PortsIn(database, 9.9, 22.1, 12.1, 19.9) == three);  // longitudes swapped only
  CHECK(PortsIn(database, 14, -11, 16, -9) == Names{L""});  // listed, with an empty name
  // No wrap at 180 degrees: the corners are swapped into -170..170.
  CHECK(PortsIn(database, -90, 170, 90, -170).size() == 5);

  // A box of no height is VT_EMPTY.
  CHECK(PortsIn(database, 11.0, 19.0, 11.0, 23.0).empty());
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);  // every port of every array was released
}
