#pragma once
// The metadata of the dataset the inspector's header item stands for, read from the
// host: the rows the attribute table panel shows, and the text form FormatAttributes
// returns. The owner is the header record's owner (a database, a dataset or a dataset
// entry) and the identity the header record's GUID: an object's (its dataset is asked)
// or the dataset's own (first 8 bytes zero; the last 8 name the dataset).
//
// Agency codes become names through an agency table (the panel's or the control's own
// copy); a code it does not list, or every code without a table, shows in decimal.

#include <windows.h>

#include <string>
#include <vector>

#include "GeoData.h"
#include "frame/geo/AgencyTable.h"
#include "inspector/format/metadata_rows.h"

namespace br::inspector {

// Rows of a raster chart entry (the owner answers the raster interface: the chart and its
// panels), a library dataset (the owner answers the library interface) or an electronic
// chart dataset. E_INVALIDARG for a null owner; E_FAIL without a dataset, with a
// parameter array of the wrong form, or without a chart header record.
HRESULT ReadDataSetMetadata(IUnknown* owner, REFGUID id, const geo::AgencyTable* agencies,
                            std::vector<MetadataRow>& rows);

// The text form: caption, carriage return, value, carriage return, per row. A chart
// dataset's rows come from the header record of the dataset the identity's last 8 bytes
// name; a library's from its parameters. Errors as above; E_NOTIMPL for a raster chart
// entry, which has no text form.
HRESULT FormatDataSetMetadata(IUnknown* owner, REFGUID id, const geo::AgencyTable* agencies, std::string& text);

}  // namespace br::inspector
