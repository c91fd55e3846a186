#pragma once
// Texts of chart data as the stand-in's formatter and its script helpers write them,
// read only through the host interfaces (so any host's objects will do): names and
// enumeration texts from the object's database catalogue, values by their VARIANT type.

#include <windows.h>

#include <string>

#include "GeoData.h"

namespace br::chartscene {

// The catalogue of an object's database (GetDataSet, GetDatabase, IGeoCatalog); null
// when a step fails. The caller releases it: into a ComPtr through GetAddressOf, as
// mingw's ComPtr::Attach adds a reference of its own.
IGeoCatalog* CatalogueOfObject(IGeoObject* object);

// A catalogue text by its length and text calls; empty when either fails.
std::wstring ClassNameText(IGeoCatalog* catalogue, long classCode);
std::wstring AttributeNameText(IGeoCatalog* catalogue, long code);
std::wstring EnumValueText(IGeoCatalog* catalogue, long code, ULONG value);

// A value: enumerated numbers and list items as their catalogue texts (the number when
// there is none), list items joined by separator, numbers in decimal ("%g" for floats),
// texts as they are, a missing value (VT_EMPTY, VT_NULL) as missing.
std::wstring ValueText(IGeoCatalog* catalogue, long code, const VARIANT& value, const std::wstring& separator,
                       const std::wstring& missing);

std::wstring WideFromCp1252(const std::string& text);

}  // namespace br::chartscene
