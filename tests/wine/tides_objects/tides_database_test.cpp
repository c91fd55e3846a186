// TidesDatabase through the built DLL: opening a folder once per process, station
// positions and names, ports by number and by latitude/longitude box.
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

// Stations 0 and 3 lie on the corners of the box (10N 20E)-(12N 22E), 1 inside it.
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

struct Bstr {
  explicit Bstr(const std::wstring& s) : value(SysAllocString(s.c_str())) {}
  ~Bstr() { SysFreeString(value); }
  BSTR value;
};

ITidesDatabase* OpenDatabase(const DllUnderTest& dll, const StationFolder& folder) {
  ITidesDatabase* database = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  Bstr path(folder.Path());
  REQUIRE(database->Initialize(path.value) == S_OK);
  return database;
}

std::wstring NameOf(ITidesPort* port) {
  BSTR name = nullptr;
  REQUIRE(port->get_PortName(&name) == S_OK);
  std::wstring result = name ? name : L"";
  SysFreeString(name);
  return result;
}

// The names of the ports in a GetPorts result, in array order; checks the array's form.
std::vector<std::wstring> PortNames(VARIANT& list) {
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
  for (LONG i = lower; i <= upper; ++i) {
    IUnknown* element = nullptr;
    REQUIRE(SafeArrayGetElement(array, &i, &element) == S_OK);
    ITidesPort* port = nullptr;
    REQUIRE(element->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port)) == S_OK);
    names.push_back(NameOf(port));
    port->Release();
    element->Release();
  }
  return names;
}

std::vector<std::wstring> PortsIn(ITidesDatabase* database, double a, double b, double c, double d) {
  VARIANT list;
  list.vt = VT_I4;  // whatever the caller had there
  REQUIRE(database->GetPorts(a, b, c, d, &list) == S_OK);
  std::vector<std::wstring> names = PortNames(list);
  VariantClear(&list);
  return names;
}

}  // namespace

TEST_CASE("Initialize: a folder without td_pnt.dat fails, a good one then opens, later folders are ignored") {
  br::test::FolderOptions noData;
  noData.withoutDataFile = true;
  StationFolder broken(BoxStations(), noData);
  StationFolder good(BoxStations(), EchoNotInCoordinates());
  StationFolder other({{"Other", 60, 60, 0, {kMeanLevel}}});
  DllUnderTest dll;

  ITidesDatabase* database = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  long count = -7;
  CHECK(database->get_NumPorts(&count) == E_ACCESSDENIED);
  CHECK(count == -7);  // nothing written
  {
    Bstr path(broken.Path());
    CHECK(database->Initialize(path.value) == E_INVALIDARG);
  }
  CHECK(database->get_NumPorts(&count) == E_ACCESSDENIED);
  {
    Bstr path(good.Path() + L"\\");  // a trailing separator is accepted
    CHECK(database->Initialize(path.value) == S_OK);
  }
  CHECK(database->get_NumPorts(&count) == S_OK);
  CHECK(count == 5);
  CHECK(database->get_NumPorts(nullptr) == E_POINTER);

  // The files are open for the process: another folder, a bad one, or none changes nothing.
  ITidesDatabase* second = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &second) == S_OK);
  {
    Bstr path(other.Path());
    CHECK(second->Initialize(path.value) == S_OK);
  }
  CHECK(second->get_NumPorts(&count) == S_OK);
  CHECK(count == 5);
  {
    Bstr path(broken.Path());
    CHECK(second->Initialize(path.value) == S_OK);
  }
  CHECK(second->Initialize(nullptr) == S_OK);
  CHECK(second->get_NumPorts(&count) == S_OK);
  CHECK(count == 5);

  second->Release();
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("after an unload the next load opens another folder") {
  StationFolder other({{"Other", 60, 60, 0, {kMeanLevel}}});
  {
    StationFolder first(BoxStations());
    DllUnderTest dll;
    ITidesDatabase* database = OpenDatabase(dll, first);
    long count = 0;
    database->get_NumPorts(&count);
    CHECK(count == 5);
    database->Release();
    REQUIRE(dll.CanUnloadNow() == S_OK);
  }
  DllUnderTest dll;
  ITidesDatabase* database = OpenDatabase(dll, other);
  long count = 0;
  database->get_NumPorts(&count);
  CHECK(count == 1);
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("GetPortInfo: positions in degrees, names through the coordinate index") {
  StationFolder folder(BoxStations(), EchoNotInCoordinates());
  DllUnderTest dll;
  ITidesDatabase* database = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  double latitude = 0, longitude = 0;
  BSTR name = nullptr;
  CHECK(database->GetPortInfo(0, &latitude, &longitude, &name) == E_ACCESSDENIED);
  database->Release();
  database = OpenDatabase(dll, folder);

  CHECK(database->GetPortInfo(2, &latitude, &longitude, &name) == S_OK);
  CHECK(latitude == Degrees(-630));
  CHECK(latitude == doctest::Approx(-10.5));
  CHECK(longitude == doctest::Approx(-5.25));
  REQUIRE(name != nullptr);
  CHECK(std::wstring(name) == L"Charlie");
  SysFreeString(name);

  latitude = longitude = 0;
  CHECK(database->GetPortInfo(1, &latitude, &longitude, nullptr) == S_OK);
  CHECK(latitude == doctest::Approx(11.0));
  CHECK(longitude == doctest::Approx(21.0));

  // A station missing from the coordinate index has its position but an empty name.
  name = nullptr;
  CHECK(database->GetPortInfo(4, &latitude, &longitude, &name) == S_OK);
  CHECK(latitude == doctest::Approx(15.0));
  REQUIRE(name != nullptr);
  CHECK(SysStringLen(name) == 0);
  SysFreeString(name);

  CHECK(database->GetPortInfo(-1, &latitude, &longitude, nullptr) == E_INVALIDARG);
  CHECK(database->GetPortInfo(5, &latitude, &longitude, nullptr) == E_INVALIDARG);
  CHECK(database->GetPortInfo(0, nullptr, &longitude, nullptr) == E_POINTER);
  CHECK(database->GetPortInfo(0, &latitude, nullptr, nullptr) == E_POINTER);
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("station names come through the ANSI code page, the whole 40-byte field") {
  const std::string forty(40, 'N');
  StationFolder folder({{"Br\xE9st", 2903, -270, -1, {kMeanLevel}}, {forty, 100, 100, 0, {kMeanLevel}}});
  DllUnderTest dll;
  ITidesDatabase* database = OpenDatabase(dll, folder);
  double latitude = 0, longitude = 0;
  BSTR name = nullptr;
  REQUIRE(database->GetPortInfo(0, &latitude, &longitude, &name) == S_OK);
  if (GetACP() == 1252) CHECK(std::wstring(name) == L"Br\u00E9st");
  CHECK(SysStringLen(name) == 5);
  SysFreeString(name);
  REQUIRE(database->GetPortInfo(1, &latitude, &longitude, &name) == S_OK);
  CHECK(std::wstring(name) == std::wstring(40, L'N'));
  SysFreeString(name);
  database->Release();  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("GetPort: a new initialised port per call; out of range gives S_OK and null") {
  StationFolder folder(BoxStations(), EchoNotInCoordinates());
  DllUnderTest dll;
  ITidesDatabase* database = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  IUnknown* port = reinterpret_cast<IUnknown*>(1);
  CHECK(database->GetPort(0, &port) == E_ACCESSDENIED);
  database->Release();
  database = OpenDatabase(dll, folder);

  CHECK(database->GetPort(0, nullptr) == E_POINTER);
  for (long index : {-1L, 5L, 40000L}) {
    port = reinterpret_cast<IUnknown*>(1);
    CHECK(database->GetPort(index, &port) == S_OK);
    CHECK(port == nullptr);  // set to null first
  }

  IUnknown* a = nullptr;
  IUnknown* b = nullptr;
  REQUIRE(database->GetPort(1, &a) == S_OK);
  REQUIRE(database->GetPort(1, &b) == S_OK);
  REQUIRE(a != nullptr);
  CHECK(a != b);  // nothing cached
  CHECK(br::test::RefCount(a) == 1);  // one reference, the caller's
  ITidesPort* bravo = nullptr;
  REQUIRE(a->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&bravo)) == S_OK);
  CHECK(NameOf(bravo) == L"Bravo");
  double latitude = 0, longitude = 0;
  CHECK(bravo->GetPortPos(&latitude, &longitude) == S_OK);
  CHECK(latitude == Degrees(660));
  CHECK(longitude == Degrees(1260));
  long points = -1;
  CHECK(bravo->get_NumPoints(&points) == S_OK);
  CHECK(points == 0);

  // Ports outlive the database: they need only the process-wide engine.
  database->Release();
  CHECK(bravo->Calculate(1.0, 36526.0) == S_OK);
  CHECK(bravo->get_NumPoints(&points) == S_OK);
  CHECK(points == 25);
  bravo->Release();
  a->Release();
  b->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("a station missing from the coordinate index gives a port with no name that predicts nothing") {
  StationFolder folder(BoxStations(), EchoNotInCoordinates());
  DllUnderTest dll;
  ITidesDatabase* database = OpenDatabase(dll, folder);
  IUnknown* unknown = nullptr;
  REQUIRE(database->GetPort(4, &unknown) == S_OK);
  REQUIRE(unknown != nullptr);
  ITidesPort* port = nullptr;
  unknown->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port));
  unknown->Release();
  CHECK(NameOf(port).empty());
  br::test::EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(port));
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 1);
  long points = -1;
  CHECK(port->get_NumPoints(&points) == S_OK);
  CHECK(points == 0);
  sink.Disconnect();
  port->Release();
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("GetPorts: strict box edges, swapped corners, VT_EMPTY for an empty box") {
  StationFolder folder(BoxStations(), EchoNotInCoordinates());
  DllUnderTest dll;
  ITidesDatabase* database = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  VARIANT list;
  CHECK(database->GetPorts(0, 0, 1, 1, &list) == E_ACCESSDENIED);
  database->Release();
  database = OpenDatabase(dll, folder);
  CHECK(database->GetPorts(0, 0, 1, 1, nullptr) == E_POINTER);

  // Alpha and Delta lie exactly on the box's corners: only Bravo is strictly inside.
  const double latLow = Degrees(600), lonLow = Degrees(1200), latHigh = Degrees(720), lonHigh = Degrees(1320);
  CHECK(PortsIn(database, latLow, lonLow, latHigh, lonHigh) == std::vector<std::wstring>{L"Bravo"});
  const std::vector<std::wstring> three = {L"Alpha", L"Bravo", L"Delta"};
  CHECK(PortsIn(database, 9.9, 19.9, 12.1, 22.1) == three);
  CHECK(PortsIn(database, 12.1, 22.1, 9.9, 19.9) == three);  // (LatMax, LonMax, LatMin, LonMin)
  CHECK(PortsIn(database, 9.9, 22.1, 12.1, 19.9) == three);  // longitudes swapped only
  CHECK(PortsIn(database, -11, -6, -10, -5) == std::vector<std::wstring>{L"Charlie"});
  // The station without a coordinate entry is listed, with an empty name.
  CHECK(PortsIn(database, 14, -11, 16, -9) == std::vector<std::wstring>{L""});

  // A box of no height holds nothing: VT_EMPTY.
  VARIANT empty;
  empty.vt = VT_I4;
  CHECK(database->GetPorts(11.0, 19.0, 11.0, 23.0, &empty) == S_OK);
  CHECK(empty.vt == VT_EMPTY);
  CHECK(database->GetPorts(50, 50, 60, 60, &empty) == S_OK);
  CHECK(empty.vt == VT_EMPTY);

  // No wrap at 180 degrees: a box across it is two boxes.
  CHECK(PortsIn(database, -90, 170, 90, -170).size() == 5);  // swapped into -170..170
  database->Release();
  CHECK(dll.CanUnloadNow() == S_OK);  // every port of every array was released
}
