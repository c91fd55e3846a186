// The chart data interfaces as the generated header lays them out: BR_Info calls hosts by
// vtable position, so each method the library uses must sit at its fixed slot, and the
// identities and records hosts compile against must keep their values and sizes.
#define CINTERFACE
#include <windows.h>
#include <ole2.h>

#include <cstddef>
#include <cstring>

#include <doctest/doctest.h>

#include "GeoData.h"

namespace {

struct Slot {
  const char* name;
  std::size_t offset;
  std::size_t expected;
};

#define SLOT(Interface, Method, n) {#Interface "::" #Method, offsetof(Interface##Vtbl, Method), n}

void CheckSlots(const Slot* slots, std::size_t count) {
  for (std::size_t i = 0; i < count; ++i) {
    INFO(slots[i].name);
    CHECK(slots[i].offset == slots[i].expected * sizeof(void*));
  }
}

// Vtable size in slots: the last method's slot + 1.
template <typename Vtbl>
constexpr std::size_t SlotCount() {
  return sizeof(Vtbl) / sizeof(void*);
}

bool SameGuid(const GUID& guid, const char* text) {
  wchar_t wide[64];
  MultiByteToWideChar(CP_ACP, 0, text, -1, wide, 64);
  GUID parsed;
  return SUCCEEDED(CLSIDFromString(wide, &parsed)) && IsEqualGUID(guid, parsed);
}

}  // namespace

TEST_CASE("every slot the library calls sits at its fixed vtable position") {
  const Slot data[] = {
      SLOT(IGeoDatabase, GetKindId, 4),       SLOT(IGeoDatabase, GetDataSetById, 7),
      SLOT(IGeoDatabase, GetDataSetHeader, 8), SLOT(IGeoDatabase, GetGeoObject, 9),
      SLOT(IGeoDatabase, CreateSelection, 12), SLOT(IGeoDatabase, ReleaseSelection, 13),
      SLOT(IGeoDatabase, GetName, 17),

      SLOT(IGeoDataSet, GetDatabase, 3),      SLOT(IGeoDataSet, GetKindId, 4),
      SLOT(IGeoDataSet, GetHeader, 10),       SLOT(IGeoDataSet, GetParameters, 11),
      SLOT(IGeoDataSet, GetObjectById, 13),   SLOT(IGeoDataSet, GetObjectEnum, 14),
      SLOT(IGeoDataSet, GetDataSetProperty, 24),

      SLOT(IGeoObject, GetDataSet, 3),        SLOT(IGeoObject, GetKindId, 4),
      SLOT(IGeoObject, GetId, 5),             SLOT(IGeoObject, GetClassCode, 7),
      SLOT(IGeoObject, GetPrimitive, 8),      SLOT(IGeoObject, GetAttribute, 10),
      SLOT(IGeoObject, GetAttributes, 11),    SLOT(IGeoObject, GetRelated, 12),
      SLOT(IGeoObject, GetMembers, 13),       SLOT(IGeoObject, HitTest, 15),
      SLOT(IGeoObject, GetText, 17),          SLOT(IGeoObject, GetProperty, 19),
      SLOT(IGeoObject, GetStorage, 20),

      SLOT(IGeoAttribute, GetOwner, 3),       SLOT(IGeoAttribute, GetCode, 4),
      SLOT(IGeoAttribute, GetValue, 6),

      SLOT(IGeoObjectEnum, Next, 4),
      SLOT(IGeoSelectionEnum, SetSelection, 4), SLOT(IGeoSelectionEnum, Next, 6),
      SLOT(IGeoSelectionEnum, Reset, 8),

      SLOT(IGeoCatalog, GetClassFlags, 8),    SLOT(IGeoCatalog, GetClassNameLength, 11),
      SLOT(IGeoCatalog, GetClassNameText, 12), SLOT(IGeoCatalog, GetAttributeCode, 24),
      SLOT(IGeoCatalog, GetAttributeFlags, 25), SLOT(IGeoCatalog, GetAttributeNameLength, 28),
      SLOT(IGeoCatalog, GetAttributeNameText, 29), SLOT(IGeoCatalog, GetEnumTextLength, 31),
      SLOT(IGeoCatalog, GetEnumText, 32),

      SLOT(IGeoProjection, GeoToPixel, 10),
      SLOT(IPresParams, GetParam, 3),
      SLOT(IColorMap, GetPaletteIndex, 9),
      SLOT(IGeoRasterDataSet, GetChartIssue, 7), SLOT(IGeoRasterDataSet, GetChartIssueRecord, 8),
      SLOT(IGeoRasterDataSet, GetChartHeader, 10),
      SLOT(IGeoLibraryDataSet, GetDataSet, 3),

      SLOT(IObjectFormatter, SetOption, 4),   SLOT(IObjectFormatter, FormatObject, 5),
      SLOT(IObjectFormatter, FormatAttribute, 6), SLOT(IObjectFormatter, GetAttributeName, 13),

      SLOT(ITextTable, GetLanguage, 7),       SLOT(ITextTable, LoadTable, 10),
      SLOT(ITextTable, GetText, 11),
  };
  CheckSlots(data, sizeof(data) / sizeof(data[0]));

  // Nothing after the last slot a host must fill: a longer table would move no slot but
  // would make every host implement methods nobody calls.
  CHECK(SlotCount<IGeoDatabaseVtbl>() == 18);
  CHECK(SlotCount<IGeoDataSetVtbl>() == 25);
  CHECK(SlotCount<IGeoObjectVtbl>() == 21);
  CHECK(SlotCount<IGeoCatalogVtbl>() == 33);
  CHECK(SlotCount<IGeoObjectEnumVtbl>() == 5);
  CHECK(SlotCount<IGeoSelectionEnumVtbl>() == 9);
  CHECK(SlotCount<ITextTableVtbl>() == 12);
  CHECK(SlotCount<IObjectFormatterVtbl>() == 14);
}

TEST_CASE("identities, kinds and records keep their values and sizes") {
  CHECK(SameGuid(IID_IGeoDatabase, "{60154F1E-B65E-4386-B3EA-CC08601D94FC}"));
  CHECK(SameGuid(IID_IGeoObject, "{F7E8B4A7-E607-4002-B308-B1BAAEF91672}"));
  CHECK(SameGuid(IID_ITextTable, "{22703816-2A9E-46F9-84C6-344CAA12313A}"));
  CHECK(SameGuid(CLSID_TextTable, "{D4FD44F9-6C8E-479E-A52B-CD60D4B67B24}"));
  CHECK(SameGuid(CLSID_ObjectFormatter, "{23D263A3-E5EE-4B7E-A951-024CD288E7E6}"));
  CHECK(SameGuid(GEOKIND_CHART_DATABASE, "{C3A9BCDF-3E0D-44FD-9A26-EBAFA78835D7}"));

  // The hierarchy kind as raw bytes: zero but "CSI" at 8 to 10.
  unsigned char bytes[16];
  std::memcpy(bytes, &GEOKIND_HIERARCHY, sizeof(bytes));
  const unsigned char expected[16] = {0, 0, 0, 0, 0, 0, 0, 0, 'C', 'S', 'I', 0, 0, 0, 0, 0};
  CHECK(std::memcmp(bytes, expected, sizeof(bytes)) == 0);

  CHECK(sizeof(GEO_SELECTION_RECORD) == 16);
  CHECK(sizeof(GEO_POINT) == 8);
  CHECK(sizeof(GEO_MAP_METRICS) == 64);
  CHECK(sizeof(GEO_OBJECT_RECORD) == sizeof(void*) + 16);
  CHECK(offsetof(GEO_OBJECT_RECORD, Id) == sizeof(void*));
}
