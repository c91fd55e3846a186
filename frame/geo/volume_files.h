#pragma once
// Chart data files in the first volume folder of a host's chart database.

#include <windows.h>

#include <string>

#include "GeoData.h"

namespace br::geo {

// The database of an object's dataset (GetDataSet, then GetDatabase); the first failure
// as it is, E_POINTER for a null object or a host that answers success with nothing.
HRESULT DatabaseOfObject(IGeoObject* object, IGeoDatabase** database);

// The database's name (GetName; a failure is returned as it is), then the search below
// Brdata\Enum\<name>\Volumes\00 (frame/settings/data_file_search.h): S_OK with the full
// path, REGDB_E_READREGDB for no folder (an empty name, or one holding a backslash, reads
// no registry at all), E_FAIL when the file is not there.
HRESULT FindVolumeFile(IGeoDatabase* database, const char* fileName, std::string& path);

}  // namespace br::geo
