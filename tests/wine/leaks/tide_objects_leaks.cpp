// References and memory of TidesDatabase and TidesPort: the ports GetPorts hands out hold
// exactly the references the array owns, connections hold their sinks only while
// connected, and ten thousand Calculate calls leave the heaps as they were.
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"
#include "tests/wine/leaks/resource_counters.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <cstdio>
#include <vector>

using namespace br::test;
using br::test::leaks::HeapBytesInUse;

namespace {

std::vector<TestStation> Stations() {
  const TestConstituent level = {0, 1500, 0}, m2 = {29, 1200, 1100}, s2 = {36, 400, 1500};
  return {
      {"First", 600, 1200, 0, {level, m2, s2}},
      {"Second", 610, 1210, -1, {level, m2}},
      {"Third", 620, 1220, 1, {level}},
  };
}

ITidesDatabase* OpenDatabase(const DllUnderTest& dll, const StationFolder& folder) {
  ITidesDatabase* db = nullptr;
  REQUIRE(dll.Create(CLSID_TidesDatabase, &db) == S_OK);
  BSTR path = SysAllocString(folder.Path().c_str());
  REQUIRE(db->Initialize(path) == S_OK);
  SysFreeString(path);
  return db;
}

std::vector<IUnknown*> Elements(const VARIANT& list) {
  std::vector<IUnknown*> out;
  REQUIRE(list.vt == (VT_ARRAY | VT_UNKNOWN));
  IUnknown** data = nullptr;
  REQUIRE(SafeArrayAccessData(list.parray, reinterpret_cast<void**>(&data)) == S_OK);
  out.assign(data, data + list.parray->rgsabound[0].cElements);
  SafeArrayUnaccessData(list.parray);
  return out;
}

// Connects sink without keeping the connection point, which would hold the port.
void AdviseOnly(IUnknown* source, EventSink& sink) {
  IConnectionPointContainer* container = nullptr;
  REQUIRE(source->QueryInterface(IID_IConnectionPointContainer, reinterpret_cast<void**>(&container)) == S_OK);
  IConnectionPoint* point = nullptr;
  REQUIRE(container->FindConnectionPoint(DIID__ITidesPortEvents, &point) == S_OK);
  container->Release();
  DWORD cookie = 0;
  REQUIRE(point->Advise(static_cast<IDispatch*>(&sink), &cookie) == S_OK);
  point->Release();
}

}  // namespace

TEST_CASE("GetPorts: each port holds exactly the one reference its array element owns") {
  StationFolder folder(Stations());
  DllUnderTest dll;
  ITidesDatabase* db = OpenDatabase(dll, folder);

  VARIANT list;
  REQUIRE(db->GetPorts(-90, -180, 90, 180, &list) == S_OK);
  const std::vector<IUnknown*> ports = Elements(list);
  REQUIRE(ports.size() == 3);
  for (IUnknown* port : ports) {
    CHECK(RefCount(port) == 1);
    ITidesPort* typed = nullptr;
    REQUIRE(port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&typed)) == S_OK);
    CHECK(RefCount(port) == 2);
    typed->Release();
    CHECK(RefCount(port) == 1);
  }
  // A copy of the VARIANT takes a reference per element; clearing it gives them back.
  VARIANT copy;
  VariantInit(&copy);
  REQUIRE(VariantCopy(&copy, &list) == S_OK);
  for (IUnknown* port : ports) CHECK(RefCount(port) == 2);
  VariantClear(&copy);
  for (IUnknown* port : ports) CHECK(RefCount(port) == 1);

  // A second call makes new ports; the first array's are untouched by it.
  VARIANT again;
  REQUIRE(db->GetPorts(-90, -180, 90, 180, &again) == S_OK);
  const std::vector<IUnknown*> others = Elements(again);
  for (std::size_t i = 0; i < ports.size(); ++i) {
    CHECK(others[i] != ports[i]);
    CHECK(RefCount(ports[i]) == 1);
  }
  VariantClear(&again);

  // The array alone keeps the ports (and the library) alive.
  db->Release();
  CHECK(dll.CanUnloadNow() == S_FALSE);
  VariantClear(&list);
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("GetPort, error information and connections release what they take") {
  StationFolder folder(Stations());
  DllUnderTest dll;
  ITidesDatabase* db = OpenDatabase(dll, folder);

  IUnknown* port = nullptr;
  REQUIRE(db->GetPort(0, &port) == S_OK);
  CHECK(RefCount(port) == 1);

  // A port outlives its database: it needs only the process-wide engine.
  db->Release();
  ITidesPort* typed = nullptr;
  REQUIRE(port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&typed)) == S_OK);
  port->Release();
  CHECK(typed->Calculate(1.0, 36526.0) == S_OK);

  // A sink is held while connected, released by Unadvise, and by the port's end.
  EventSink kept(DIID__ITidesPortEvents), dropped(DIID__ITidesPortEvents);
  AdviseOnly(typed, kept);
  REQUIRE(dropped.Connect(typed));
  CHECK(kept.References() == 1);  // the connection point's
  dropped.Disconnect();
  CHECK(dropped.References() == 0);
  CHECK(typed->Calculate(1.0, 36526.0) == S_OK);
  CHECK(kept.calls == 1);

  typed->Release();  // the connection still holds the sink: the port's end releases it
  CHECK(kept.References() == 0);
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("1000 failed Initialize calls with error information leave the heaps flat") {
  StationFolder folder(Stations());
  DllUnderTest dll;
  BSTR missing = SysAllocString((folder.Path() + L"\\missing").c_str());
  auto failOnce = [&] {
    ITidesDatabase* db = nullptr;
    REQUIRE(dll.Create(CLSID_TidesDatabase, &db) == S_OK);
    CHECK(db->Initialize(missing) == E_INVALIDARG);
    IErrorInfo* info = nullptr;
    CHECK(GetErrorInfo(0, &info) == S_OK);  // taking it clears the thread's slot
    if (info) info->Release();
    db->Release();
  };
  for (int i = 0; i < 20; ++i) failOnce();
  const std::size_t before = HeapBytesInUse();
  for (int i = 0; i < 1000; ++i) failOnce();
  const std::size_t after = HeapBytesInUse();
  std::printf("heap in use: %zu bytes before, %zu after 1000 failed Initialize calls\n", before, after);
  CHECK(after <= before + 4096);
  SysFreeString(missing);
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("10 000 Calculate calls leave the heaps flat") {
  StationFolder folder(Stations());
  DllUnderTest dll;
  ITidesDatabase* db = OpenDatabase(dll, folder);
  IUnknown* unknown = nullptr;
  REQUIRE(db->GetPort(0, &unknown) == S_OK);
  ITidesPort* port = nullptr;
  REQUIRE(unknown->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port)) == S_OK);
  unknown->Release();
  EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(port));

  // Days of different lengths, failures among them, and reads of what each gave.
  const double steps[] = {1.0, 0.5, 0.25, 0.0, 3.0, -20.0};
  auto calculate = [&](int i) {
    port->Calculate(steps[i % 6], 36526.0 + (i % 400));
    long n = 0;
    double v = 0;
    port->get_NumPoints(&n);
    port->get_MaxValue(&v);
    BSTR name = nullptr;
    port->get_PortName(&name);
    SysFreeString(name);
  };
  // Warm-up: the largest day, the string cache and the engine's tables reach their size.
  for (int i = 0; i < 200; ++i) calculate(i);
  const std::size_t before = HeapBytesInUse();
  for (int i = 0; i < 10000; ++i) calculate(i);
  const std::size_t after = HeapBytesInUse();
  std::printf("heap in use: %zu bytes before, %zu after 10000 Calculate calls\n", before, after);
  // Below one byte per call: any leak per call fails, one-time growth of a cache passes.
  CHECK(after <= before + 8192);
  CHECK(sink.calls == 10200);

  sink.Disconnect();
  port->Release();
  db->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
