#pragma once
// Texts of a host's attribute catalogue (IGeoCatalog). Each comes in two calls: the
// length (exactly S_OK, at most kMaxCatalogueText characters), then the text into a
// buffer of length + 1 bytes that is always terminated here. When either call fails the
// field keeps what it held.

#include <windows.h>

#include <optional>
#include <string>

#include "GeoData.h"

namespace br::geo {

inline constexpr long kMaxCatalogueText = 4096;

// The text of one enumerated value of an attribute (slots 31 and 32).
bool ReadEnumText(IGeoCatalog* catalogue, long attributeCode, ULONG value, std::string& field);
// A class name (slots 11 and 12) and an attribute name (slots 28 and 29).
bool ReadClassName(IGeoCatalog* catalogue, long classCode, std::string& field);
bool ReadAttributeName(IGeoCatalog* catalogue, long attributeCode, std::string& field);

// The code of an attribute acronym (slot 24, letter case counts); none unless exactly S_OK.
std::optional<long> FindAttributeCode(IGeoCatalog* catalogue, const char* acronym);

}  // namespace br::geo
