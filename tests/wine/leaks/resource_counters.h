// What the leak suites count: the process's GDI objects and the bytes in use on its heaps.
#pragma once

#include <windows.h>

#include <cstddef>

namespace br::test::leaks {

// GDI objects owned by the process. GetGuiResources where the platform answers it; Wine
// leaves it unimplemented, so there the live entries of the process's GDI handle table
// (the table the PEB points to) are counted instead.
long GdiObjects();

// Bytes of every busy block on every heap of the process (the C runtime's included),
// by HeapWalk. Exact, unlike working-set figures, so small per-call leaks show.
std::size_t HeapBytesInUse();

}  // namespace br::test::leaks
