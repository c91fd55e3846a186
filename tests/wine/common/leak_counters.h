// What the leak suites count: GDI objects and heap bytes of the whole process.
#pragma once

#include <cstddef>
#include <functional>

namespace br::test {

// GDI objects of the process: GetGuiResources, or where Wine leaves that unimplemented, the
// live entries of the GDI handle table the PEB points to. -1 when neither can be read.
long GdiObjects();

// Bytes of every busy block on every heap of the process, by HeapWalk: exact, so small
// per-call leaks show.
std::size_t HeapBytesInUse();

// Runs action `rounds` times after one warm-up round (the first paint makes the stock and
// cached objects a process keeps), prints and CHECKs that the GDI objects stayed.
void CheckGdiFlat(const char* what, int rounds, const std::function<void(int)>& action);

}  // namespace br::test
