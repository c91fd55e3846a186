// The type library embedded in BR_Info.dll: identity, classes, dual interfaces with every
// member in dispatch-id order, event interfaces and the two enumerations.
#include "tests/wine/common/dll_under_test.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <string>
#include <vector>

namespace {

struct Member {
  DISPID id;
  const wchar_t* name;
  INVOKEKIND kind;
};

constexpr INVOKEKIND M = INVOKE_FUNC;
constexpr INVOKEKIND G = INVOKE_PROPERTYGET;
constexpr INVOKEKIND P = INVOKE_PROPERTYPUT;

struct ClassInfo {
  const wchar_t* name;
  const CLSID* clsid;
  const IID* dual;
  const wchar_t* dualName;
  std::vector<Member> members;  // in vtable order
  const IID* events;
  const wchar_t* eventsName;
  std::vector<Member> eventMembers;
};

std::vector<ClassInfo> Classes() {
  return {
      {L"XObjectInspector", &CLSID_XObjectInspector, &IID_IXObjectInspector, L"IXObjectInspector",
       {{1, L"SetInfo", M}, {2, L"AddInfo", M}, {3, L"DataSet", G}, {4, L"HOCode2Name", M},
        {5, L"GetSelectedObject", M}, {6, L"FormatAttributes", M}},
       &DIID__IXObjectInspectorEvents, L"_IXObjectInspectorEvents", {{1, L"SelectObject", M}}},
      {L"TidesDatabase", &CLSID_TidesDatabase, &IID_ITidesDatabase, L"ITidesDatabase",
       {{1, L"Initialize", M}, {2, L"NumPorts", G}, {3, L"GetPortInfo", M}, {4, L"GetPort", M}, {5, L"GetPorts", M}},
       &DIID__ITidesDatabaseEvents, L"_ITidesDatabaseEvents", {}},
      {L"TidesPort", &CLSID_TidesPort, &IID_ITidesPort, L"ITidesPort",
       {{1, L"PortName", G}, {2, L"GetPortPos", M}, {3, L"Calculate", M}, {4, L"PredictionDate", G},
        {5, L"NumPoints", G}, {6, L"WavePoint", G}, {7, L"MaxValueIndex", G}, {8, L"MinValueIndex", G},
        {9, L"MaxValue", G}, {10, L"MinValue", G}, {11, L"Step", G}, {12, L"SunRise", G}, {13, L"SunSet", G},
        {14, L"BeginTwilight", G}, {15, L"EndTwilight", G}, {16, L"TimeZone", G}},
       &DIID__ITidesPortEvents, L"_ITidesPortEvents", {{1, L"Calculated", M}}},
      {L"TidesPortList", &CLSID_TidesPortList, &IID_ITidesPortList, L"ITidesPortList",
       {{1, L"SetPortList", M}, {2, L"Selected", G}},
       &DIID__ITidesPortListEvents, L"_ITidesPortListEvents", {{1, L"SelectChanged", M}}},
      {L"TidesWindow", &CLSID_TidesWindow, &IID_ITidesWindow, L"ITidesWindow",
       {{1, L"SetPort", M}, {2, L"Calculate", M}, {3, L"SetScale", M}, {4, L"Property", P}, {4, L"Property", G}},
       &DIID__ITidesWindowEvents, L"_ITidesWindowEvents", {{1, L"MouseAction", M}}},
      {L"XChartLegend", &CLSID_XChartLegend, &IID_IXChartLegend, L"IXChartLegend",
       {{1, L"SetLegendData", M}, {2, L"DepthUnits", G}, {3, L"HeightUnits", G}, {4, L"SoundingDatum", G},
        {5, L"VerticalDatum", G}, {6, L"HorizontalDatum", G}, {7, L"EditionDate", G}, {8, L"UpdateDate", G},
        {9, L"EditionNumber", G}, {10, L"UpdateNumber", G}, {11, L"SourceIDCode", G},
        {12, L"BathymetricQuality", G}, {13, L"NonBathymetricQuality", G}, {14, L"DefaultScale", G},
        {15, L"Projection", G}, {16, L"MagneticVariation", G}, {17, L"SourceProducingAgency", G}},
       &DIID__IXChartLegendEvents, L"_IXChartLegendEvents", {}},
      {L"XContoursView", &CLSID_XContoursView, &IID_IXContoursView, L"IXContoursView",
       {{1, L"SetContoursData", M}, {2, L"Palette", P}}, nullptr, nullptr, {}},
      {L"XPICREPView", &CLSID_XPICREPView, &IID_IXPICREPView, L"IXPICREPView",
       {{1, L"SetPalIdxShading", M}, {2, L"Property", G}, {2, L"Property", P}},
       &DIID__IXPICREPViewEvents, L"_IXPICREPViewEvents", {}},
  };
}

std::wstring NameOf(ITypeInfo* info, MEMBERID id = MEMBERID_NIL) {
  BSTR name = nullptr;
  info->GetDocumentation(id, &name, nullptr, nullptr, nullptr);
  std::wstring result = name ? name : L"";
  SysFreeString(name);
  return result;
}

struct TypeLibrary {
  TypeLibrary() {
    REQUIRE(LoadTypeLibEx(br::test::BuiltDllPath().c_str(), REGKIND_NONE, &library) == S_OK);
  }
  ~TypeLibrary() { library->Release(); }
  ITypeInfo* Info(REFGUID guid) {
    ITypeInfo* info = nullptr;
    REQUIRE(library->GetTypeInfoOfGuid(guid, &info) == S_OK);
    return info;
  }
  ITypeLib* library = nullptr;
};

// Members of a type info, in slot order, checked against the expected list.
void CheckMembers(ITypeInfo* info, const std::vector<Member>& expected, WORD firstSlot) {
  TYPEATTR* attributes = nullptr;
  REQUIRE(info->GetTypeAttr(&attributes) == S_OK);
  const UINT count = attributes->cFuncs;
  info->ReleaseTypeAttr(attributes);
  REQUIRE(count == expected.size());
  short previousSlot = -1;
  for (UINT i = 0; i < count; ++i) {
    FUNCDESC* f = nullptr;
    REQUIRE(info->GetFuncDesc(i, &f) == S_OK);
    INFO("member ", i);
    CHECK(f->memid == expected[i].id);
    CHECK(f->invkind == expected[i].kind);
    CHECK(NameOf(info, f->memid) == expected[i].name);
    if (firstSlot) {
      CHECK(f->elemdescFunc.tdesc.vt == VT_HRESULT);
      CHECK(f->oVft == static_cast<short>((firstSlot + i) * sizeof(void*)));
      CHECK(f->oVft > previousSlot);
      previousSlot = f->oVft;
    }
    info->ReleaseFuncDesc(f);
  }
}

}  // namespace

TEST_CASE("the type library's identity") {
  TypeLibrary tl;
  TLIBATTR* attributes = nullptr;
  REQUIRE(tl.library->GetLibAttr(&attributes) == S_OK);
  wchar_t text[40] = {};
  StringFromGUID2(attributes->guid, text, 40);
  CHECK(std::string(text, text + wcslen(text)) == "{C897A920-C7AA-4BD6-9C77-19756FD456F4}");
  CHECK(attributes->wMajorVerNum == 1);
  CHECK(attributes->wMinorVerNum == 0);
  CHECK(attributes->lcid == 0x0409);
  CHECK(attributes->syskind == (sizeof(void*) == 8 ? SYS_WIN64 : SYS_WIN32));
  tl.library->ReleaseTLibAttr(attributes);
  BSTR name = nullptr, doc = nullptr;
  REQUIRE(tl.library->GetDocumentation(-1, &name, &doc, nullptr, nullptr) == S_OK);
  CHECK(std::wstring(name) == L"BR_INFOLib");
  CHECK(std::wstring(doc) == L"BR_Info 1.0 Type Library");
  SysFreeString(name);
  SysFreeString(doc);
}

TEST_CASE("eight creatable classes; dual interfaces with every member in order after the seven IDispatch slots; "
          "event dispinterfaces") {
  TypeLibrary tl;
  for (const ClassInfo& c : Classes()) {
    INFO("class ", std::string(c.name, c.name + wcslen(c.name)));
    ITypeInfo* coclass = tl.Info(*c.clsid);
    CHECK(NameOf(coclass) == c.name);
    TYPEATTR* attributes = nullptr;
    REQUIRE(coclass->GetTypeAttr(&attributes) == S_OK);
    CHECK(attributes->typekind == TKIND_COCLASS);
    CHECK((attributes->wTypeFlags & TYPEFLAG_FCANCREATE) != 0);
    const UINT implemented = attributes->cImplTypes;
    coclass->ReleaseTypeAttr(attributes);
    REQUIRE(implemented == (c.events ? 2u : 1u));
    // Every implemented interface is a default: the dual one, and the events as the source.
    int sources = 0;
    for (UINT i = 0; i < implemented; ++i) {
      INT flags = 0;
      coclass->GetImplTypeFlags(i, &flags);
      HREFTYPE ref = 0;
      coclass->GetRefTypeOfImplType(i, &ref);
      ITypeInfo* face = nullptr;
      REQUIRE(coclass->GetRefTypeInfo(ref, &face) == S_OK);
      REQUIRE(face->GetTypeAttr(&attributes) == S_OK);
      CHECK((flags & IMPLTYPEFLAG_FDEFAULT) != 0);
      const bool source = (flags & IMPLTYPEFLAG_FSOURCE) != 0;
      sources += source ? 1 : 0;
      CHECK(IsEqualIID(attributes->guid, source ? *c.events : *c.dual));
      CHECK(attributes->typekind == TKIND_DISPATCH);
      CHECK(((attributes->wTypeFlags & TYPEFLAG_FDUAL) != 0) == !source);
      face->ReleaseTypeAttr(attributes);
      CHECK(NameOf(face) == (source ? c.eventsName : c.dualName));
      if (source) {
        CheckMembers(face, c.eventMembers, 0);
      } else {
        // The vtable view of the dual interface.
        REQUIRE(face->GetRefTypeOfImplType(-1, &ref) == S_OK);
        ITypeInfo* vtableView = nullptr;
        REQUIRE(face->GetRefTypeInfo(ref, &vtableView) == S_OK);
        REQUIRE(vtableView->GetTypeAttr(&attributes) == S_OK);
        CHECK(attributes->typekind == TKIND_INTERFACE);
        CHECK((attributes->wTypeFlags & TYPEFLAG_FOLEAUTOMATION) != 0);
        vtableView->ReleaseTypeAttr(attributes);
        CheckMembers(vtableView, c.members, 7);
        vtableView->Release();
      }
      face->Release();
    }
    CHECK(sources == (c.events ? 1 : 0));
    coclass->Release();
  }
  // MouseAction carries two doubles; SelectChanged one IDispatch.
  const std::pair<const IID*, std::vector<VARTYPE>> parameters[] = {{&DIID__ITidesWindowEvents, {VT_R8, VT_R8}},
                                                                    {&DIID__ITidesPortListEvents, {VT_DISPATCH}}};
  for (const auto& [events, types] : parameters) {
    ITypeInfo* info = tl.Info(*events);
    FUNCDESC* f = nullptr;
    REQUIRE(info->GetFuncDesc(0, &f) == S_OK);
    REQUIRE(f->cParams == static_cast<SHORT>(types.size()));
    for (std::size_t i = 0; i < types.size(); ++i) CHECK(f->lprgelemdescParam[i].tdesc.vt == types[i]);
    info->ReleaseFuncDesc(f);
    info->Release();
  }
}

TEST_CASE("the enumerations tagTW_PROPERTY and tagPRV_PROPERTY") {
  TypeLibrary tl;
  struct Enum {
    const wchar_t* name;
    std::vector<std::pair<std::wstring, long>> values;
  };
  const Enum enums[] = {{L"tagTW_PROPERTY", {{L"TW_DRAWTEXT", 1}, {L"TW_FORMATTEXT", 2}}},
                        {L"tagPRV_PROPERTY", {{L"PRV_PICFILENAME", 1}, {L"PRV_ZOOMPERCENT", 2}, {L"PRV_BITMAP", 3}}}};
  for (const Enum& e : enums) {
    ITypeInfo* found = nullptr;
    MEMBERID member = 0;
    USHORT count = 1;
    std::wstring name = e.name;
    REQUIRE(tl.library->FindName(name.data(), 0, &found, &member, &count) == S_OK);
    REQUIRE(count == 1);
    TYPEATTR* attributes = nullptr;
    REQUIRE(found->GetTypeAttr(&attributes) == S_OK);
    CHECK(attributes->typekind == TKIND_ENUM);
    REQUIRE(attributes->cVars == e.values.size());
    for (UINT i = 0; i < attributes->cVars; ++i) {
      VARDESC* v = nullptr;
      REQUIRE(found->GetVarDesc(i, &v) == S_OK);
      CHECK(NameOf(found, v->memid) == e.values[i].first);
      VARIANT value;
      VariantInit(&value);
      VariantChangeType(&value, v->lpvarValue, 0, VT_I4);
      CHECK(value.lVal == e.values[i].second);
      found->ReleaseVarDesc(v);
    }
    found->ReleaseTypeAttr(attributes);
    found->Release();
  }
}
