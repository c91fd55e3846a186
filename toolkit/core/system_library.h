#pragma once
// Loading a DLL that ships with Windows (oleacc, atl, usp10, riched20, msftedit, gdiplus)
// from the system folder by its full path. A bare name would also be searched for in the
// host's current folder, where a document's folder (or a share) may hold a planted copy
// that would then run inside the host.

#include <windows.h>

namespace toolkit {

// The module of that file name in the system folder, or null when there is none there.
// A name with a path in it (any "\", "/" or ":") is refused.
HMODULE LoadSystemLibrary(const wchar_t* fileName);

}  // namespace toolkit
