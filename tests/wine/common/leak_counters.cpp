#include "tests/wine/common/leak_counters.h"

#include <windows.h>
#include <winternl.h>

#include <doctest/doctest.h>

#include <cstdint>
#include <cstdio>
#include <vector>

namespace br::test {

long GdiObjects() {
  SetLastError(0);
  const DWORD counted = GetGuiResources(GetCurrentProcess(), GR_GDIOBJECTS);
  if (counted != 0 || GetLastError() != ERROR_CALL_NOT_IMPLEMENTED) return static_cast<long>(counted);
  // Wine's table: 16384 entries of 24 bytes, the type byte at offset 14 zero in a free one.
  PROCESS_BASIC_INFORMATION basic = {};
  if (NtQueryInformationProcess(GetCurrentProcess(), ProcessBasicInformation, &basic, sizeof basic, nullptr) != 0 ||
      !basic.PebBaseAddress)
    return -1;
  const auto* peb = reinterpret_cast<const std::uint8_t*>(basic.PebBaseAddress);
  const auto* table = *reinterpret_cast<const std::uint8_t* const*>(peb + (sizeof(void*) == 8 ? 0xF8 : 0x94));
  if (!table) return -1;
  long live = 0;
  for (std::size_t i = 0; i < 16384; ++i) live += table[24 * i + 14] != 0;
  return live;
}

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

void CheckGdiFlat(const char* what, int rounds, const std::function<void(int)>& action) {
  INFO(what);
  action(0);
  const long before = GdiObjects();
  for (int i = 1; i <= rounds; ++i) action(i);
  const long after = GdiObjects();
  std::printf("%s: %ld GDI objects before, %ld after %d rounds\n", what, before, after, rounds);
  CHECK(before > 0);
  CHECK(after == before);
}

}  // namespace br::test
