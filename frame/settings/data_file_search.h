#pragma once
// Finding chart data files (pictures) in the folder trees named in the registry.

#include <windows.h>

#include <string>

namespace br {

// Depth-first search of a folder tree: a folder's own files before its
// subfolders. Only files with the archive attribute and without the hidden
// attribute count; names compare without regard to letter case. Unreadable
// folders count as empty. S_OK with the full path, or E_FAIL.
HRESULT FindFileInTree(const std::string& folder, const char* fileName, std::string& path);

// The same below the first volume folder of a chart database (the default value
// of Brdata\Enum\<database>\Volumes\00, less its last character).
// REGDB_E_READREGDB when that value is empty, or at once, without reading the
// registry, for a database name that is empty or holds a backslash; E_FAIL when the
// file is not found.
HRESULT FindVolumeFile(const std::string& databaseName, const char* fileName, std::string& path);

// The same below the "BasesStore" folder.
HRESULT FindStoreFile(const char* fileName, std::string& path);

}  // namespace br
