#include "inspector/object_records.h"

#include "inspector/rules/record_layout.h"

#include <cstring>

namespace br::inspector {

namespace {

SAFEARRAY* ArrayOf(const VARIANT& value) {
  if ((value.vt & VT_ARRAY) && !(value.vt & VT_BYREF)) return value.parray;
  if ((value.vt & VT_ARRAY) && (value.vt & VT_BYREF)) return value.pparray ? *value.pparray : nullptr;
  if (value.vt == (VT_BYREF | VT_VARIANT) && value.pvarVal) {
    const VARIANT& inner = *value.pvarVal;
    if ((inner.vt & VT_ARRAY) && !(inner.vt & VT_BYREF)) return inner.parray;
  }
  return nullptr;
}

// Element types whose bytes may be read as records.
bool PlainElements(SAFEARRAY* array, UINT elementSize) {
  constexpr USHORT kManaged = FADF_BSTR | FADF_UNKNOWN | FADF_DISPATCH | FADF_VARIANT | FADF_RECORD | FADF_HAVEIID;
  if (array->fFeatures & kManaged) return false;
  VARTYPE type = VT_EMPTY;
  const bool typed = SUCCEEDED(SafeArrayGetVartype(array, &type));
  if (elementSize == 1) return !typed || type == VT_UI1 || type == VT_I1;
  return !typed || (type != VT_VARIANT && type != VT_BSTR && type != VT_UNKNOWN && type != VT_DISPATCH &&
                    type != VT_RECORD);
}

}  // namespace

std::vector<ObjectRecord> ReadRecordArray(const VARIANT& value) {
  std::vector<ObjectRecord> records;
  SAFEARRAY* array = ArrayOf(value);
  if (!array || SafeArrayGetDim(array) != 1 || !array->pvData) return records;
  const UINT elementSize = SafeArrayGetElemsize(array);
  if (!PlainElements(array, elementSize)) return records;
  const std::size_t count = RecordCount(elementSize, array->rgsabound[0].cElements, kRecordSize);
  if (count == 0 || FAILED(SafeArrayLock(array))) return records;
  const auto* bytes = static_cast<const unsigned char*>(array->pvData);
  records.reserve(count);
  for (std::size_t i = 0; i < count; ++i) {
    GEO_OBJECT_RECORD raw;
    std::memcpy(&raw, bytes + i * kRecordSize, kRecordSize);
    ObjectRecord record;
    record.owner = br::com::ComRef<IUnknown>(raw.Owner);
    record.id = raw.Id;
    records.push_back(std::move(record));
  }
  SafeArrayUnlock(array);
  return records;
}

}  // namespace br::inspector
