#pragma once
// Reading the header record that a host hands back as a SAFEARRAY of bytes.

#include <windows.h>
#include <oleauto.h>

#include <vector>

#include "GeoData.h"
#include "frame/geo/dataset_header.h"

namespace br::geo {

// The first maxBytes bytes of a one-dimensional VT_UI1 array (element size 1). False for
// a null array, more dimensions, another element type or size, or data that cannot be
// locked. The array stays the caller's.
bool ReadByteArray(SAFEARRAY* array, std::size_t maxBytes, std::vector<unsigned char>& bytes);

// GetHeader of the dataset (IGeoDataSet slot 10), parsed; the array is destroyed here.
// The host's failure is returned as it is; an array of the wrong shape gives E_INVALIDARG.
HRESULT ReadDataSetHeader(IGeoDataSet* dataSet, DataSetHeader& header);

// The same through the database (IGeoDatabase slot 8) for the dataset that the
// identity's last 8 bytes name.
HRESULT ReadDataSetHeader(IGeoDatabase* database, REFGUID id, DataSetHeader& header);

}  // namespace br::geo
