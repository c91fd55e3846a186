#include "inspector/object_access.h"

#include "frame/geo/geo_enumeration.h"
#include "frame/geo/volume_files.h"

#include <cstring>

namespace br::inspector {

// {C3A9BCDF-3E0D-44FD-9A26-EBAFA78835D7}
const GUID kChartDatabaseKind = {0xC3A9BCDF, 0x3E0D, 0x44FD, {0x9A, 0x26, 0xEB, 0xAF, 0xA7, 0x88, 0x35, 0xD7}};
// All zero but "CSI" in bytes 8 to 10.
const GUID kHierarchyKind = {0, 0, 0, {'C', 'S', 'I', 0, 0, 0, 0, 0}};

IdBytes BytesOf(const GUID& id) {
  IdBytes bytes{};
  static_assert(sizeof(GUID) == sizeof(IdBytes), "a GUID is 16 bytes");
  std::memcpy(bytes.data(), &id, bytes.size());
  return bytes;
}

GUID GuidOf(const IdBytes& bytes) {
  GUID id{};
  std::memcpy(&id, bytes.data(), bytes.size());
  return id;
}

bool KindNotBelow(const GUID& kind, const GUID& floor) { return std::memcmp(&kind, &floor, sizeof(GUID)) >= 0; }

ComRef<IGeoDatabase> DatabaseOf(IUnknown* owner) {
  ComRef<IGeoDatabase> database;
  if (owner && FAILED(owner->QueryInterface(IID_IGeoDatabase, database.OutVoid()))) database.Reset();
  return database;
}

bool IsRasterEntry(IUnknown* owner) {
  ComRef<IUnknown> face;
  return owner && SUCCEEDED(owner->QueryInterface(IID_IGeoRasterDataSet, face.OutVoid())) && face;
}

bool IsDataSetEntry(IUnknown* owner) {
  if (IsRasterEntry(owner)) return true;
  ComRef<IUnknown> face;
  return owner && SUCCEEDED(owner->QueryInterface(IID_IGeoLibraryDataSet, face.OutVoid())) && face;
}

ComRef<IGeoObject> ObjectOf(IGeoDatabase* database, const GUID& id) {
  ComRef<IGeoObject> object;
  if (!database) return object;
  if (database->GetGeoObject(id, object.Out()) != S_OK) object.Reset();
  return object;
}

std::optional<ObjectFacts> FactsOf(IGeoObject* object) {
  if (!object) return std::nullopt;
  ObjectFacts facts;
  if (FAILED(object->GetClassCode(&facts.classCode))) return std::nullopt;
  if (FAILED(object->GetPrimitive(&facts.primitive))) facts.primitive = 0;
  facts.haveKind = SUCCEEDED(object->GetKindId(&facts.kind));
  if (!facts.haveKind) facts.kind = GUID{};
  if (FAILED(object->GetId(&facts.id))) facts.id = GUID{};
  return facts;
}

std::uint32_t FlagsOf(IGeoObject* object) {
  VARIANT value;
  VariantInit(&value);
  std::uint32_t flags = 0;
  if (SUCCEEDED(object->GetProperty(0, &value))) {
    VARIANT number;
    VariantInit(&number);
    if (SUCCEEDED(VariantChangeType(&number, &value, 0, VT_UI4))) flags = number.ulVal;
    VariantClear(&number);
  }
  VariantClear(&value);
  return flags;
}

namespace {

// The attribute's value, cleared by the caller; false when there is none.
bool ValueOf(IGeoObject* object, long code, VARIANT& value) {
  ComRef<IGeoAttribute> attribute;
  if (object->GetAttribute(code, attribute.Out()) != S_OK || !attribute) return false;
  return SUCCEEDED(attribute->GetValue(&value));
}

}  // namespace

std::optional<long> NumberAttribute(IGeoObject* object, long code) {
  VARIANT value, number;
  VariantInit(&value);
  VariantInit(&number);
  std::optional<long> result;
  if (ValueOf(object, code, value) && !(value.vt & VT_ARRAY) && SUCCEEDED(VariantChangeType(&number, &value, 0, VT_I4)))
    result = number.lVal;
  VariantClear(&number);
  VariantClear(&value);
  return result;
}

bool ListAttributeHolds(IGeoObject* object, long code, unsigned wanted) {
  VARIANT value;
  VariantInit(&value);
  bool found = false;
  if (ValueOf(object, code, value) && (value.vt & VT_ARRAY) && !(value.vt & VT_BYREF) && value.parray &&
      SafeArrayGetDim(value.parray) == 1) {
    SAFEARRAY* array = value.parray;
    const UINT size = SafeArrayGetElemsize(array);
    LONG lower = 0, upper = -1;
    if ((size == 1 || size == 2) && SUCCEEDED(SafeArrayGetLBound(array, 1, &lower)) &&
        SUCCEEDED(SafeArrayGetUBound(array, 1, &upper)) && SUCCEEDED(SafeArrayLock(array))) {
      const auto* data = static_cast<const unsigned char*>(array->pvData);
      const LONG count = upper >= lower ? upper - lower + 1 : 0;
      for (LONG i = 0; data && i < count && !found; ++i) {
        unsigned item = size == 1 ? data[i] : static_cast<unsigned>(data[2 * i] | (data[2 * i + 1] << 8));
        found = item == wanted;
      }
      SafeArrayUnlock(array);
    }
  }
  VariantClear(&value);
  return found;
}

std::wstring TextAttribute(IGeoObject* object, long code) {
  VARIANT value;
  VariantInit(&value);
  std::wstring text;
  if (ValueOf(object, code, value) && value.vt == VT_BSTR && value.bstrVal)
    text.assign(value.bstrVal, SysStringLen(value.bstrVal));
  VariantClear(&value);
  return text;
}

void ForEachRelated(IGeoObject* object, Relation relation, const std::function<bool(IGeoObject*)>& visit) {
  ComRef<IGeoObjectEnum> items;
  HRESULT hr = relation == Relation::kMembers ? object->GetMembers(items.Out()) : object->GetRelated(items.Out());
  if (relation == Relation::kMembers && (FAILED(hr) || !items)) hr = object->GetRelated(items.Out());
  if (FAILED(hr) || !items) return;
  br::geo::ForEachItem(items.Get(), [&](IUnknown* item) {
    ComRef<IGeoObject> related;
    if (!item || FAILED(item->QueryInterface(IID_IGeoObject, related.OutVoid())) || !related) return true;
    return visit(related.Get());
  });
}

ComRef<IGeoDatabase> DatabaseOfObject(IGeoObject* object) {
  ComRef<IGeoDatabase> database;
  if (FAILED(br::geo::DatabaseOfObject(object, database.Out()))) database.Reset();
  return database;
}

}  // namespace br::inspector
