#pragma once
// Object records as hosts hand them to SetInfo and AddInfo: an owner (a chart database or
// a dataset entry) and an object's identity, sizeof(void*) + 16 bytes each.

#include <windows.h>
#include <oleauto.h>

#include <vector>

#include "GeoData.h"
#include "frame/com/ComRef.h"

namespace br::inspector {

struct ObjectRecord {
  br::com::ComRef<IUnknown> owner;  // one reference while the record is kept
  GUID id{};
};

inline constexpr std::size_t kRecordSize = sizeof(GEO_OBJECT_RECORD);
static_assert(kRecordSize == sizeof(void*) + 16, "an owner pointer and a GUID");

// The records of a VARIANT holding a SAFEARRAY directly, by reference, or inside a
// VARIANT passed by reference (one level only). The array must have one dimension and
// data; its elements are bytes (VT_UI1 or VT_I1) or whole records of a plain type (never
// VARIANTs, strings or interfaces that happen to be as large). Records with a null owner
// are kept: the caller decides about them. Anything else gives no records.
std::vector<ObjectRecord> ReadRecordArray(const VARIANT& value);

}  // namespace br::inspector
