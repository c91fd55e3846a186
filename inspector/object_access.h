#pragma once
// What the tree reads of the host's chart objects, each read a failure-tolerant step:
// a host that fails answers "nothing", never stops a fill.

#include <windows.h>
#include <oleauto.h>

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "GeoData.h"
#include "frame/com/ComRef.h"
#include "inspector/rules/guid_text.h"

namespace br::inspector {

using br::com::ComRef;

// The kind of the chart databases, whose rules (collections, hidden classes) apply.
extern const GUID kChartDatabaseKind;
// Hierarchy objects show as such when their dataset's kind is not below this one.
extern const GUID kHierarchyKind;

IdBytes BytesOf(const GUID& id);
GUID GuidOf(const IdBytes& bytes);
bool KindNotBelow(const GUID& kind, const GUID& floor);

// The owner's database face, null when it has none.
ComRef<IGeoDatabase> DatabaseOf(IUnknown* owner);
// Whether the owner is a dataset entry (a raster chart or a library).
bool IsDataSetEntry(IUnknown* owner);
bool IsRasterEntry(IUnknown* owner);

// GetGeoObject answering exactly S_OK with an object; null otherwise.
ComRef<IGeoObject> ObjectOf(IGeoDatabase* database, const GUID& id);

struct ObjectFacts {
  long classCode = 0;
  long primitive = 0;
  GUID kind{};
  GUID id{};
  bool haveKind = false;
};
// Class code is required; kind, id and primitive are read when the host answers.
std::optional<ObjectFacts> FactsOf(IGeoObject* object);

// Property 0, the flag word (VT_UI4 or anything that converts); 0 when unknown.
std::uint32_t FlagsOf(IGeoObject* object);

// An attribute's value converted to a 32-bit number; none when absent.
std::optional<long> NumberAttribute(IGeoObject* object, long code);
// Whether a list attribute (an array of 8-bit or 16-bit numbers) holds a value.
bool ListAttributeHolds(IGeoObject* object, long code, unsigned value);
// A text attribute; empty when absent or not text.
std::wstring TextAttribute(IGeoObject* object, long code);

// The related objects of slot 12 (every relation) or 13 (only those it holds; falls back
// to 12 when the host keeps no direction). The visitor borrows each; false stops.
enum class Relation { kAll = 12, kMembers = 13 };
void ForEachRelated(IGeoObject* object, Relation relation, const std::function<bool(IGeoObject*)>& visit);

// The database of an object's dataset (for records of collection objects).
ComRef<IGeoDatabase> DatabaseOfObject(IGeoObject* object);

}  // namespace br::inspector
