// References GetPorts hands out, and the heaps over many Calculate calls.
#include "tests/wine/common/boundary_support.h"

#include <cstdio>

using namespace br::test;
using namespace br::test::boundary;

namespace {

// Bytes of every busy block on every heap of the process, by HeapWalk: exact, so small
// per-call leaks show.
std::size_t HeapBytesInUse() {
  std::vector<HANDLE> heaps(GetProcessHeaps(0, nullptr) + 16);
  const DWORD count = GetProcessHeaps(static_cast<DWORD>(heaps.size()), heaps.data());
  std::size_t busy = 0;
  for (DWORD i = 0; i < count && i < heaps.size(); ++i) {
    if (!HeapLock(heaps[i])) continue;
    PROCESS_HEAP_ENTRY entry = {};
    while (HeapWalk(heaps[i], &entry))
      if (entry.wFlags & PROCESS_HEAP_ENTRY_BUSY) busy += entry.cbData;
    HeapUnlock(heaps[i]);
  }
  return busy;
}

}  // namespace

TEST_CASE("GetPorts: each port holds exactly the one reference its array element owns") {
  OpenTides t(ThreeStations());
  VARIANT list;
  REQUIRE(t.db->GetPorts(-90, -180, 90, 180, &list) == S_OK);
  REQUIRE(list.vt == (VT_ARRAY | VT_UNKNOWN));
  IUnknown** data = static_cast<IUnknown**>(list.parray->pvData);
  const std::vector<IUnknown*> ports(data, data + list.parray->rgsabound[0].cElements);
  REQUIRE(ports.size() == 3);
  CHECK(RefCounts(ports) == std::vector<ULONG>{1, 1, 1});
  // The array alone keeps the ports (and the library) alive.
  CHECK(t.Finish() == S_FALSE);
  VariantClear(&list);
  CHECK(t.dll.CanUnloadNow() == S_OK);
}

TEST_CASE("10 000 Calculate calls leave the heaps flat") {
  OpenTides t(ThreeStations());
  ITidesPort* port = t.Port(0);
  EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(port));
  // Days of different lengths, failures among them, and reads of what each gave. The
  // warm-up lets the largest day, the string cache and the engine's tables reach their size;
  // the slack is below a byte a call.
  const double steps[] = {1.0, 0.5, 0.25, 0.0, 3.0, -20.0};
  auto work = [&](int i) {
    port->Calculate(steps[i % 6], 36526.0 + (i % 400));
    long n = 0;
    double v = 0;
    port->get_NumPoints(&n);
    port->get_MaxValue(&v);
    BSTR name = nullptr;
    port->get_PortName(&name);
    SysFreeString(name);
  };
  for (int i = 0; i < 200; ++i) work(i);
  const std::size_t before = HeapBytesInUse();
  for (int i = 0; i < 10000; ++i) work(i);
  const std::size_t after = HeapBytesInUse();
  std::printf("heap in use: %zu bytes before, %zu after 10000 Calculate calls\n", before, after);
  CHECK(after <= before + 8192);
  CHECK(sink.calls == 10200);
  sink.Disconnect();
  port->Release();
  CHECK(t.Finish() == S_OK);
}
