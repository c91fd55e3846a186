// XObjectInspector over scenes written here: record arrays, the grouped tree (labels,
// icons, data words and order read through the tree view's messages), tree modes, the
// chart rules, selection events, GetSelectedObject, DataSet, FormatAttributes,
// HOCode2Name, IUnitsOption, the log of a failing fill and re-entrant sinks.
#include "tests/wine/inspector/InspectorControl.h"

#include "tests/wine/common/AccessibleReader.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/common/registry_test_support.h"

#include "BR_Private.h"
#include "frame/settings/cRegSettings.h"
#include "frame/settings/settings.h"

#include <doctest/doctest.h>

#include <cstring>
#include <fstream>
#include <functional>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

using namespace br::test;

namespace {

// A user database (grouping by class), a chart database (relations, harbours, collections),
// the mariner's dataset "1" and a chain of landmarks deeper than the fill goes.
std::string SceneJson() {
  std::string chain;
  for (int i = 0; i < 40; ++i) {
    chain += ",{\"name\":\"deep-" + std::to_string(i) + "\",\"class\":\"LNDMRK\",\"point\":[1,1]";
    if (i + 1 < 40) chain += ",\"members\":[\"deep-" + std::to_string(i + 1) + "\"]";
    chain += "}";
  }
  return R"({"format":"chartscene 1",
 "catalogue":{"classes":[{"code":55001,"acronym":"harbr_","name":"Harbour"},
   {"code":55500,"acronym":"hrbent","name":"Harbour entry point"},
   {"code":55059,"acronym":"srvint","name":"Internal service"},
   {"code":53355,"acronym":"tecobj","name":"Technical object"},
   {"code":57004,"acronym":"csinod","name":"Supplementary information node"}],
   "hidden":["M_NSYS"]},
 "databases":[
  {"name":"USERDB","kind":"user","datasets":[{"id":"GROUPS1","objects":[
   {"name":"u-other","class":"DEPARE","area":[[0,0],[0,1],[1,1]],"attributes":{"OBJNAM":"Deep"}},
   {"name":"u-rock","class":"UWTROC","point":[0,0],"attributes":{"OBJNAM":"Rock"}},
   {"name":"u-light","class":"LIGHTS","point":[0,0],"attributes":{"OBJNAM":"Lamp"}},
   {"name":"u-track","class":"NAVLNE","line":[[0,0],[1,1]],"attributes":{"OBJNAM":"Track"}},
   {"name":"u-area","class":"ADMARE","area":[[0,0],[0,1],[1,1]],"attributes":{"OBJNAM":"Admin"}},
   {"name":"u-built","class":"BUAARE","area":[[0,0],[0,1],[1,1]],"attributes":{"OBJNAM":"Town"}},
   {"name":"u-harbour","class":"harbr_","point":[0,0],"attributes":{"OBJNAM":"Port"}},
   {"name":"u-tech","class":"tecobj","primitive":"none"},
   {"name":"u-hidden","class":"LIGHTS","point":[0,0],"flags":1,"attributes":{"OBJNAM":"Hidden"}},
   {"name":"u-gone","class":"LIGHTS","point":[0,0],"flags":33554432,"attributes":{"OBJNAM":"Gone"}},
   {"name":"u-marked","class":"UWTROC","point":[0,0],"flags":256,"attributes":{"OBJNAM":"Marked"}},
   {"name":"u-system","class":"M_NSYS","primitive":"none"},
   {"name":"u-pair-1","class":"LIGHTS","point":[0,0],"attributes":{"OBJNAM":"Pair one"}},
   {"name":"u-pair-2","class":"LIGHTS","point":[0,0],"attributes":{"OBJNAM":"Pair two"}},
   {"name":"u-pair","class":"C_AGGR","primitive":"none","attributes":{"OBJNAM":"Pair"},"members":["u-pair-1","u-pair-2"]}
  ]}]},
  {"name":"CHARTDB","kind":"chart","datasets":[{"id":"CHART001","header":{"edition":3,"scale":22000},"objects":[
   {"name":"c-light","class":"LIGHTS","point":[0,0],"attributes":{"OBJNAM":"Alpha"}},
   {"name":"c-beacon","class":"BCNLAT","point":[0,0],"flags":512,"attributes":{"OBJNAM":"Beacon"}},
   {"name":"c-group","class":"C_AGGR","primitive":"none","attributes":{"OBJNAM":"Group"},"members":["c-light","c-beacon"]},
   {"name":"c-harbour","class":"harbr_","point":[0,0],"attributes":{"OBJNAM":"Port"},"members":["c-entry","c-shop"]},
   {"name":"c-entry","class":"hrbent","point":[0,0],"attributes":{"OBJNAM":"Entry"}},
   {"name":"c-shop","class":"srvint","point":[0,0],"attributes":{"OBJNAM":"Shop"}},
   {"name":"c-tech","class":"tecobj","primitive":"none"})" +
         chain + R"(
  ]}]},
  {"name":"ENTRIES","kind":"chart","datasets":[{"id":"RAST0001","type":"raster"},
   {"id":"LIB00001","type":"library","header":{"fileName":"Marks of the harbour"}}]},
  {"name":"CSI","kind":"hierarchy","datasets":[{"id":"CSI0001","objects":[
   {"name":"h-node","class":"csinod","primitive":"none","text":"CHART SUPPLEMENTARY INFORMATION"}]}]},
  {"name":"MARINER","kind":"user","datasets":[{"id":"1","objects":[
   {"name":"m-note","class":"LIGHTS","point":[0,0],"attributes":{"OBJNAM":"Note"}}]}]}
 ]})";
}

// The registry form of a scene object's identity.
std::wstring ObjectId(const ScratchScene& scene, const wchar_t* name) {
  wchar_t text[40] = {};
  REQUIRE(StringFromGUID2(ScratchScene::IdOf(scene.Object(name).Get()), text, 40) == 39);
  return text;
}

// The identity text with its first 8 bytes zero: "{XXXXXXXX-XXXX-XXXX-" are those bytes.
std::wstring DataSetIdText(const std::wstring& objectId) {
  std::wstring text = objectId;
  for (std::size_t i = 1; i < 19 && i < text.size(); ++i)
    if (text[i] != L'-') text[i] = L'0';
  return text;
}

std::vector<unsigned char> RecordBytes(const ScratchScene& scene, const wchar_t* names) {
  VARIANT records = scene.Records(names);
  std::vector<unsigned char> bytes(records.parray->rgsabound[0].cElements);
  std::memcpy(bytes.data(), records.parray->pvData, bytes.size());
  VariantClear(&records);
  return bytes;
}

std::string Narrow(const std::wstring& text) {
  std::string narrow;
  for (wchar_t c : text) narrow += c < 128 ? static_cast<char>(c) : '?';
  return narrow;
}

VARIANT Bytes(const std::vector<unsigned char>& bytes) {
  VARIANT v;
  v.vt = VT_ARRAY | VT_UI1;
  v.parray = SafeArrayCreateVector(VT_UI1, 0, static_cast<ULONG>(bytes.size()));
  if (!bytes.empty()) std::memcpy(v.parray->pvData, bytes.data(), bytes.size());
  return v;
}

std::wstring Take(BSTR text) {
  std::wstring result = text ? std::wstring(text, SysStringLen(text)) : L"<null>";
  SysFreeString(text);
  return result;
}

// The database name an owner answers.
std::wstring NameOfOwner(IUnknown* owner) {
  if (!owner) return L"<none>";
  ComRef<IGeoDatabase> database = Query<IGeoDatabase>(owner);
  BSTR name = nullptr;
  REQUIRE(database->GetName(&name) == S_OK);
  return Take(name);
}

struct Suite {
  DllUnderTest dll;
  ScratchScene scene{SceneJson()};
  SavedRegistryValue treeMode{HKEY_LOCAL_MACHINE, std::string(br::cRegSettings::BASE_PATH) + "\\" + br::SETTINGS_ENUM_KEY,
                              br::SETTING_TREE_MODE};
  ~Suite() { CHECK(dll.CanUnloadNow() == S_OK); }
};

HRESULT SetRecords(InspectorControl& inspector, ScratchScene& scene, const wchar_t* names, bool add = false) {
  VARIANT records = scene.Records(names);
  const HRESULT hr = add ? inspector->AddInfo(records) : inspector->SetInfo(records);
  VariantClear(&records);
  return hr;
}

const wchar_t* kUserObjects =
    L"u-other, u-rock, u-light, u-track, u-area, u-built, u-harbour, u-tech, u-hidden, u-gone, u-marked, "
    L"u-system, u-pair-1, u-pair-2";

}  // namespace

TEST_CASE("arrays of records: sizes and shapes") {
  Suite s;
  {
    InspectorControl inspector(s.dll);
    VARIANT early = s.scene.Records(L"u-rock");
    CHECK(inspector->AddInfo(early) == OLE_E_BLANK);  // no window, no tree
    CHECK(inspector->SetInfo(early) == OLE_E_BLANK);
    VariantClear(&early);
    inspector.Host();

    const std::vector<unsigned char> two = RecordBytes(s.scene, L"u-rock, u-light");
    REQUIRE(two.size() == 2 * sizeof(GEO_OBJECT_RECORD));
    REQUIRE(sizeof(GEO_OBJECT_RECORD) == 24);
    struct Row {
      std::size_t bytes;
      std::size_t items;  // with the header item
    };
    for (const Row& row : {Row{48, 3}, Row{52, 3}, Row{40, 2}, Row{30, 0}, Row{24, 2}, Row{20, 0}}) {
      INFO("bytes ", row.bytes);
      std::vector<unsigned char> bytes = two;
      bytes.resize(row.bytes, 0);
      VARIANT v = Bytes(bytes);
      CHECK(inspector->SetInfo(v) == S_OK);
      CHECK(inspector.Items().size() == row.items);
      VariantClear(&v);
    }

    SUBCASE("by reference, inside a VARIANT by reference, and refused shapes") {
      VARIANT v = Bytes(two);
      VARIANT byRef;
      byRef.vt = VT_BYREF | VT_ARRAY | VT_UI1;
      byRef.pparray = &v.parray;
      CHECK(inspector->SetInfo(byRef) == S_OK);
      CHECK(inspector.Items().size() == 3);
      VARIANT inVariant;
      inVariant.vt = VT_BYREF | VT_VARIANT;
      inVariant.pvarVal = &v;
      CHECK(inspector->SetInfo(inVariant) == S_OK);
      CHECK(inspector.Items().size() == 3);
      // Two levels of reference are not followed.
      VARIANT twice;
      twice.vt = VT_BYREF | VT_VARIANT;
      twice.pvarVal = &inVariant;
      CHECK(inspector->SetInfo(twice) == S_OK);
      CHECK(inspector.Items().empty());

      // Two dimensions of the same bytes.
      SAFEARRAYBOUND bounds[2] = {{24, 0}, {2, 0}};
      VARIANT square;
      square.vt = VT_ARRAY | VT_UI1;
      square.parray = SafeArrayCreate(VT_UI1, 2, bounds);
      std::memcpy(square.parray->pvData, two.data(), two.size());
      CHECK(inspector->SetInfo(square) == S_OK);
      CHECK(inspector.Items().empty());
      VariantClear(&square);

      // VARIANT elements are 24 bytes too, and never records.
      VARIANT variants;
      variants.vt = VT_ARRAY | VT_VARIANT;
      variants.parray = SafeArrayCreateVector(VT_VARIANT, 0, 2);
      CHECK(inspector->SetInfo(variants) == S_OK);
      CHECK(inspector.Items().empty());
      VariantClear(&variants);

      // Whole records of a plain element type.
      VARIANT records;
      records.vt = VT_ARRAY | VT_UI1;
      SAFEARRAY* array = nullptr;
      REQUIRE(SafeArrayAllocDescriptor(1, &array) == S_OK);
      array->cbElements = sizeof(GEO_OBJECT_RECORD);
      array->rgsabound[0].cElements = 2;
      REQUIRE(SafeArrayAllocData(array) == S_OK);
      std::memcpy(array->pvData, two.data(), two.size());
      records.parray = array;
      CHECK(inspector->SetInfo(records) == S_OK);
      CHECK(inspector.Items().size() == 3);
      SafeArrayDestroy(array);

      VARIANT empty;
      empty.vt = VT_EMPTY;
      CHECK(inspector->SetInfo(empty) == S_OK);
      CHECK(inspector.Items().empty());
      VariantClear(&v);
    }
  }
}

TEST_CASE("the tree: groups in their order, labels, icons and data words") {
  Suite s;
  InspectorControl inspector(s.dll);
  inspector.Host();
  REQUIRE(SetRecords(inspector, s.scene, kUserObjects) == S_OK);
  const std::vector<TreeItem> items = inspector.Items();
  struct Expected {
    const wchar_t* text;
    int icon;
    LPARAM data;
  };
  // Harbours, class 13, aids, dangers, areas, routeing, aggregations, associations, others;
  // technical, hidden, hidden-class objects dropped, the pair listed once as its collection.
  const Expected expected[] = {{L"DataSet GROUPS1   USERDB", 5, -2},
                               {L"Harbour Port", 1, 1},
                               {L"Built-up area Town", 3, 2},
                               {L"Light Lamp", 1, 3},
                               {L"Underwater rock / awash rock Rock", 1, 4},
                               {L"Underwater rock / awash rock Marked", 7, 5},
                               {L"Administration area (Named) Admin", 3, 6},
                               {L"Navigation line Track", 2, 7},
                               {L"Aggregation Pair", 4, 8},
                               {L"Depth area Deep", 3, 9}};
  REQUIRE(items.size() == std::size(expected));
  for (std::size_t i = 0; i < items.size(); ++i) {
    INFO("item ", i);
    CHECK(Narrow(items[i].text) == Narrow(expected[i].text));
    CHECK(items[i].icon == expected[i].icon);
    CHECK(items[i].selectedIcon == expected[i].icon);
    CHECK(items[i].data == expected[i].data);
    CHECK(items[i].depth == 0);
  }
  // The first item is selected and announced.
  CHECK(inspector.SelectedData() == -2);
  REQUIRE(inspector.sink.events.size() == 1);
  CHECK(inspector.sink.events[0].guid == DataSetIdText(ObjectId(s.scene, L"u-other")));

  SUBCASE("AddInfo appends after the records there") {
    REQUIRE(SetRecords(inspector, s.scene, L"u-light", true) == S_OK);
    const std::vector<TreeItem> more = inspector.Items();
    REQUIRE(more.size() == items.size() + 1);
    CHECK(more.back().text == L"Light Lamp");
    CHECK(more.back().data == 10);
  }
  SUBCASE("the mariner's dataset") {
    REQUIRE(SetRecords(inspector, s.scene, L"m-note") == S_OK);
    CHECK(inspector.RootTexts() == std::vector<std::wstring>{L"Mariner Objects   MARINER", L"Light Note"});
  }
}

TEST_CASE("chart databases: relations, collections and harbours by tree mode") {
  Suite s;
  SceneProbe probe;
  InspectorControl inspector(s.dll);
  inspector.Host();
  // Every object, attribute and enumerator of the host the fill received is released.
  const long objects = probe.Counter("live.Object"), enums = probe.Counter("live.ObjectEnum"),
             attributes = probe.Counter("live.Attribute");
  struct Released {
    SceneProbe& probe;
    long objects, enums, attributes;
    ~Released() {
      CHECK(probe.Counter("live.Object") == objects);
      CHECK(probe.Counter("live.ObjectEnum") == enums);
      CHECK(probe.Counter("live.Attribute") == attributes);
    }
  } released{probe, objects, enums, attributes};

  SUBCASE("a collection shows its members below it, expanded; the marked member marks the light") {
    REQUIRE(SetRecords(inspector, s.scene, L"c-group, c-tech") == S_OK);
    const std::vector<TreeItem> items = inspector.Items();
    REQUIRE(items.size() == 4);
    CHECK(items[0].text == L"DataSet CHART001   CHARTDB");
    CHECK(items[1].text == L"Aggregation Group");
    CHECK(items[1].icon == 4 + 6);  // a member is marked
    CHECK(items[2].text == L"Light Alpha");
    CHECK(items[2].depth == 1);
    CHECK(items[2].icon == 1);
    CHECK(items[3].text == L"Beacon, lateral Beacon");
    CHECK(items[3].icon == 1 + 6);  // flag bit 9
    CHECK(items[3].data == 3);
    CHECK((TreeView_GetItemState(inspector.Tree(), inspector.ItemWithData(1), TVIS_EXPANDED) & TVIS_EXPANDED) != 0);
  }
  SUBCASE("a light below the root leaves its collection out") {
    REQUIRE(SetRecords(inspector, s.scene, L"c-light") == S_OK);
    CHECK(inspector.RootTexts() == std::vector<std::wstring>{L"DataSet CHART001   CHARTDB", L"Light Alpha"});
    CHECK(inspector.Items().size() == 2);
  }
  SUBCASE("tree mode 0: the harbour through its entry point") {
    s.treeMode.SetDword(0);
    REQUIRE(SetRecords(inspector, s.scene, L"c-harbour") == S_OK);
    const std::vector<TreeItem> items = inspector.Items();
    REQUIRE(items.size() == 3);
    CHECK(items[1].text == L"Harbour entry point Entry");
    CHECK(items[1].depth == 0);
    CHECK(items[2].text == L"Harbour Port");
    CHECK(items[2].depth == 1);
    CHECK(items[2].icon == 30);
    CHECK(items[2].selectedIcon == 30);
  }
  SUBCASE("tree mode 1: the harbour itself, services and entry left out") {
    s.treeMode.SetDword(1);
    REQUIRE(SetRecords(inspector, s.scene, L"c-harbour") == S_OK);
    const std::vector<TreeItem> items = inspector.Items();
    REQUIRE(items.size() == 2);
    CHECK(items[1].text == L"Harbour Port");
    CHECK(items[1].icon == 1);
  }
  SUBCASE("a tree mode written as text counts as 0") {
    s.treeMode.SetString("1");
    REQUIRE(SetRecords(inspector, s.scene, L"c-harbour") == S_OK);
    CHECK(inspector.RootTexts().at(1) == L"Harbour entry point Entry");
  }
}

TEST_CASE("selection: events, GetSelectedObject and the remembered entry") {
  Suite s;
  InspectorControl inspector(s.dll);
  inspector.Host();
  REQUIRE(SetRecords(inspector, s.scene, L"u-light, u-rock") == S_OK);
  inspector.sink.events.clear();

  const std::wstring rock = ObjectId(s.scene, L"u-rock");
  inspector.Select(inspector.ItemWithData(2));
  REQUIRE(inspector.sink.events.size() == 1);
  CHECK(inspector.sink.events[0].guid == rock);
  CHECK(inspector.sink.events[0].ownerType == VT_UNKNOWN);
  CHECK(NameOfOwner(inspector.sink.events[0].owner.Get()) == L"USERDB");
  CHECK(inspector.sink.events[0].doubleClick == 0);

  inspector.DoubleClick();
  REQUIRE(inspector.sink.events.size() == 2);
  CHECK(inspector.sink.events[1].guid == rock);
  CHECK(inspector.sink.events[1].doubleClick == 1);

  BSTR guid = nullptr;
  ComRef<IUnknown> owner;
  CHECK(inspector->GetSelectedObject(&guid, owner.Out()) == S_OK);
  CHECK(Take(guid) == rock);
  CHECK(NameOfOwner(owner.Get()) == L"USERDB");
  CHECK(inspector->GetSelectedObject(nullptr, owner.Out()) == E_INVALIDARG);
  CHECK(inspector->GetSelectedObject(&guid, nullptr) == E_INVALIDARG);

  SUBCASE("the header reports its dataset") {
    inspector.Select(inspector.ItemWithData(-2));
    CHECK(inspector.sink.events.back().guid == DataSetIdText(rock));
    CHECK(inspector->GetSelectedObject(&guid, owner.Out()) == S_OK);
    CHECK(Take(guid) == DataSetIdText(rock));
  }
  SUBCASE("AddInfo keeps the selected object, not the first one") {
    // The rock is record 2 and, being selected, also record 0.
    REQUIRE(SetRecords(inspector, s.scene, L"u-area", true) == S_OK);
    CHECK(inspector.SelectedData() == 2);
    REQUIRE(SetRecords(inspector, s.scene, L"u-light, u-rock") == S_OK);  // rebuilt: found again
    CHECK(inspector.SelectedData() == 2);
    CHECK(inspector.sink.events.back().guid == rock);
  }
  SUBCASE("nothing selected") {
    VARIANT none;
    none.vt = VT_EMPTY;
    REQUIRE(inspector->SetInfo(none) == S_OK);
    CHECK(inspector->GetSelectedObject(&guid, owner.Out()) == S_FALSE);
    CHECK(Take(guid) == L"{00000000-0000-0000-0000-000000000000}");
    CHECK(!owner);
  }
}

TEST_CASE("sinks that call back inside SelectObject") {
  Suite s;
  auto inspector = std::make_unique<InspectorControl>(s.dll);
  inspector->Host();
  REQUIRE(SetRecords(*inspector, s.scene, L"u-light, u-rock, u-area") == S_OK);

  SUBCASE("SetInfo from the sink") {
    int calls = 0;
    inspector->sink.onCall = [&] {
      if (++calls > 1) return;
      CHECK(SetRecords(*inspector, s.scene, L"u-track") == S_OK);
    };
    inspector->Select(inspector->ItemWithData(3));
    CHECK(inspector->RootTexts() == std::vector<std::wstring>{L"DataSet GROUPS1   USERDB", L"Navigation line Track"});
    CHECK(inspector->sink.events.back().guid == DataSetIdText(ObjectId(s.scene, L"u-track")));
  }
  SUBCASE("the last reference released from the sink") {
    IXObjectInspector* raw = inspector->Get();
    raw->AddRef();
    inspector->sink.onCall = [&] {
      inspector->sink.onCall = nullptr;
      inspector->Close();  // the host window and the test's reference go
      raw->Release();
    };
    inspector->Select(inspector->ItemWithData(2));
    CHECK(inspector->sink.events.size() >= 2);
  }
  inspector.reset();
}

TEST_CASE("DataSet, FormatAttributes, HOCode2Name and IUnitsOption") {
  Suite s;
  InspectorControl inspector(s.dll);
  inspector.Host();

  ComRef<IUnknown> dataSet;
  CHECK(inspector->get_DataSet(nullptr) == E_POINTER);
  CHECK(inspector->get_DataSet(dataSet.Out()) == S_FALSE);
  CHECK(!dataSet);
  REQUIRE(SetRecords(inspector, s.scene, L"u-rock") == S_OK);
  REQUIRE(inspector->get_DataSet(dataSet.Out()) == S_OK);
  ComRef<IGeoDatabase> database;
  REQUIRE(Query<IGeoDataSet>(dataSet.Get())->GetDatabase(database.Out()) == S_OK);
  CHECK(NameOfOwner(database.Get()) == L"USERDB");

  const auto userDb = s.scene.Database(L"USERDB");
  BSTR text = nullptr;
  BSTR rock = SysAllocString(ObjectId(s.scene, L"u-rock").c_str());
  CHECK(inspector->FormatAttributes(userDb.Get(), rock, &text) == S_OK);
  CHECK(Take(text) == L"Object name\rRock");
  for (const wchar_t* bad : {L"BR_Info.XObjectInspector", L"", L"{12345678-0000-0000-0000-000000000000}",
                             L"{2C3A2B7E-0000-0000-5553-45524442AAAAA}"}) {
    INFO(std::string(bad, bad + wcslen(bad)));
    BSTR guid = SysAllocString(bad);
    text = reinterpret_cast<BSTR>(1);
    CHECK(inspector->FormatAttributes(userDb.Get(), guid, &text) == E_INVALIDARG);
    CHECK(text == nullptr);
    SysFreeString(guid);
  }
  CHECK(inspector->FormatAttributes(userDb.Get(), nullptr, &text) == E_INVALIDARG);
  CHECK(inspector->FormatAttributes(nullptr, rock, &text) == E_INVALIDARG);
  CHECK(inspector->FormatAttributes(s.scene.Object(L"u-rock").Get(), rock, &text) == E_INVALIDARG);
  CHECK(inspector->FormatAttributes(userDb.Get(), rock, nullptr) == E_INVALIDARG);
  SysFreeString(rock);

  ComRef<IUnitsOption> units = Query<IUnitsOption>(inspector.Get());
  CHECK(units->SetOption(1) == S_OK);
  CHECK(units->SetOption(0) == S_OK);
  // The units reach the formatter, and the chosen object's rows are formatted again.
  inspector.Select(inspector.ItemWithData(1));
  SceneProbe probe;
  const long before = probe.Counter("calls.IGeoObject.GetAttributes");
  VARIANT value;
  value.vt = VT_BSTR;
  value.bstrVal = SysAllocString(L"metric");
  CHECK(units->SetUnits(value) == S_OK);
  VariantClear(&value);
  CHECK(s.scene.FormatterOption(63) == L"BSTR:metric");
  CHECK(probe.Counter("calls.IGeoObject.GetAttributes") > before);
  value.vt = VT_R8;
  value.dblVal = 2.0;
  CHECK(units->SetUnits(value) == S_OK);
  CHECK(s.scene.FormatterOption(62) == L"I4:2");
  value.vt = VT_UNKNOWN;
  value.punkVal = nullptr;
  CHECK(units->SetUnits(value) == E_INVALIDARG);
  CHECK(s.scene.FormatterOption(62) == L"I4:2");
}

TEST_CASE("dataset entries, hierarchy objects, an unreadable header and stray notifications") {
  Suite s;
  SceneProbe probe;
  InspectorControl inspector(s.dll);
  inspector.Host();

  SUBCASE("a raster chart entry heads the tree and is the dataset") {
    REQUIRE(SetRecords(inspector, s.scene, L"dataset:RAST0001") == S_OK);
    CHECK(inspector.RootTexts() == std::vector<std::wstring>{L"Raster chart RAST0001"});
    ComRef<IUnknown> dataSet;
    REQUIRE(inspector->get_DataSet(dataSet.Out()) == S_OK);
    ComRef<IGeoRasterDataSet> raster;
    CHECK(dataSet->QueryInterface(IID_IGeoRasterDataSet, raster.OutVoid()) == S_OK);
  }
  SUBCASE("a library is named from its header; entries after the first follow the objects") {
    REQUIRE(SetRecords(inspector, s.scene, L"dataset:LIB00001, c-light, dataset:RAST0001") == S_OK);
    const std::vector<TreeItem> items = inspector.Items();
    REQUIRE(items.size() == 4);
    CHECK(Narrow(items[0].text) == "DataSet CHART001   CHARTDB");
    CHECK(Narrow(items[2].text) == "Library Marks of the harbour   ENTRIES");
    CHECK(items[2].icon == 5);
    CHECK(items[2].data == 2);
    CHECK(Narrow(items[3].text) == "Raster chart RAST0001");
  }
  SUBCASE("without a header the identity names the dataset, all eight characters of it") {
    probe.SetFault("IGeoDatabase.GetDataSetHeader", E_FAIL);
    REQUIRE(SetRecords(inspector, s.scene, L"c-light") == S_OK);
    probe.ClearFaults();
    CHECK(Narrow(inspector.RootTexts().at(0)) == "DataSet CHART001   CHARTDB");
  }
  SUBCASE("a hierarchy object shows the hierarchy card instead of the tabs") {
    REQUIRE(SetRecords(inspector, s.scene, L"h-node, c-light") == S_OK);
    std::function<HWND(HWND)> strip = [&](HWND parent) -> HWND {
      for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
        wchar_t name[64] = {};
        GetClassNameW(child, name, 64);
        if (lstrcmpiW(name, WC_TABCONTROLW) == 0) return child;
        if (HWND deeper = strip(child)) return deeper;
      }
      return nullptr;
    };
    HWND tabStrip = strip(inspector.Window());
    REQUIRE(tabStrip != nullptr);
    CHECK(IsWindowVisible(tabStrip));
    REQUIRE(TabCtrl_GetItemCount(tabStrip) == 1);
    wchar_t title[64] = {};
    TCITEMW tab{};
    tab.mask = TCIF_TEXT;
    tab.pszText = title;
    tab.cchTextMax = 64;
    REQUIRE(SendMessageW(tabStrip, TCM_GETITEMW, 0, reinterpret_cast<LPARAM>(&tab)));
    CHECK(std::wstring(title) == L"Attributes");
    inspector.Select(inspector.ItemWithData(1));
    CHECK(inspector.sink.events.back().guid == ObjectId(s.scene, L"h-node"));
    CHECK_FALSE(IsWindowVisible(tabStrip));
    inspector.Select(inspector.ItemWithData(2));
    CHECK(IsWindowVisible(tabStrip));
  }
  SUBCASE("notifications naming no record are no choice") {
    REQUIRE(SetRecords(inspector, s.scene, L"u-light, u-rock") == S_OK);
    const std::size_t before = inspector.sink.events.size();
    auto notify = [&](LPARAM word) {
      NMTREEVIEWW change{};
      change.hdr.hwndFrom = inspector.Tree();
      change.hdr.code = TVN_SELCHANGEDW;
      change.itemNew.lParam = word;
      SendMessageW(GetParent(inspector.Tree()), WM_NOTIFY, 0, reinterpret_cast<LPARAM>(&change));
    };
    for (LPARAM word : {LPARAM{0}, LPARAM{3}, LPARAM{-1}, LPARAM{99}}) notify(word);
    CHECK(inspector.sink.events.size() == before);
    notify(2);  // the same path with a word that names the rock
    REQUIRE(inspector.sink.events.size() == before + 1);
    CHECK(inspector.sink.events.back().guid == ObjectId(s.scene, L"u-rock"));
  }
}

namespace {

HWND FindClass(HWND parent, const wchar_t* name) {
  for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    wchar_t found[64] = {};
    GetClassNameW(child, found, 64);
    if (lstrcmpiW(found, name) == 0) return child;
    if (HWND deeper = FindClass(child, name)) return deeper;
  }
  return nullptr;
}

std::vector<std::wstring> TabTitles(HWND strip) {
  std::vector<std::wstring> titles;
  for (int i = 0; i < TabCtrl_GetItemCount(strip); ++i) {
    wchar_t title[64] = {};
    TCITEMW tab{};
    tab.mask = TCIF_TEXT;
    tab.pszText = title;
    tab.cchTextMax = 64;
    SendMessageW(strip, TCM_GETITEMW, i, reinterpret_cast<LPARAM>(&tab));
    titles.push_back(title);
  }
  return titles;
}

// The rows of the attribute table as an accessibility client reads them.
std::vector<std::wstring> AttributeRows(const InspectorControl& inspector) {
  HWND strip = FindClass(inspector.Window(), WC_TABCONTROLW);
  REQUIRE(strip != nullptr);
  HWND table = FindClass(GetParent(strip), L"Brine_AWTATL44");
  REQUIRE(table != nullptr);
  AccessibleReader reader(table);
  return reader.ChildNames();
}

}  // namespace

TEST_CASE("the details of the chosen entry: attributes, metadata and services tabs") {
  Suite s;
  InspectorControl inspector(s.dll);
  inspector.Host();
  REQUIRE(SetRecords(inspector, s.scene, L"u-light, u-rock") == S_OK);
  // The header is selected first: the dataset's metadata.
  std::vector<std::wstring> rows = AttributeRows(inspector);
  REQUIRE(rows.size() >= 5);
  CHECK(rows[0] == L"DataSet filename\tGROUPS1.000");

  inspector.Select(inspector.ItemWithData(2));
  CHECK(AttributeRows(inspector) == std::vector<std::wstring>{L"Underwater rock / awash rock Rock\t", L"Object name\tRock"});

  // A harbour's services get their tab while it is chosen.
  s.treeMode.SetDword(1);
  REQUIRE(SetRecords(inspector, s.scene, L"c-harbour") == S_OK);
  HWND strip = FindClass(inspector.Window(), WC_TABCONTROLW);
  CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});
  inspector.Select(inspector.ItemWithData(1));
  CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes", L"Internal services/shops"});
  inspector.Select(inspector.ItemWithData(-2));
  CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});

  // FormatAttributes of a dataset identity: the metadata's text form.
  const auto chartDb = s.scene.Database(L"CHARTDB");
  BSTR text = nullptr;
  BSTR id = SysAllocString(DataSetIdText(ObjectId(s.scene, L"c-light")).c_str());
  CHECK(inspector->FormatAttributes(chartDb.Get(), id, &text) == S_OK);
  const std::wstring metadata = Take(text);
  CHECK(metadata.rfind(L"DataSet filename\rCHART001.000\rSource identification code\r \r", 0) == 0);
  CHECK(metadata.find(L"\rScale\r22000\r") != std::wstring::npos);
  CHECK(metadata.find(L"\rEdition number\r3\r") != std::wstring::npos);
  SysFreeString(id);
}

TEST_CASE("the Lights tab: shown while the chosen chart object has a light, hidden otherwise") {
  Suite s;
  InspectorControl inspector(s.dll);
  inspector.Host();
  // The chart light is listed as the aggregation that gathers it with its beacon.
  REQUIRE(SetRecords(inspector, s.scene, L"c-light") == S_OK);
  HWND strip = FindClass(inspector.Window(), WC_TABCONTROLW);
  REQUIRE(strip != nullptr);
  CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});  // the header
  inspector.Select(inspector.ItemWithData(1));
  CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes", L"Lights"});
  inspector.Select(inspector.ItemWithData(-2));
  CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});

  // A light of the host's own kind is no chart light; a rock has none.
  REQUIRE(SetRecords(inspector, s.scene, L"u-light, u-rock") == S_OK);
  inspector.Select(inspector.ItemWithData(1));
  CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});
  inspector.Select(inspector.ItemWithData(2));
  CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});
}

TEST_CASE("HOCode2Name answers from the installation's agency table") {
  ScratchFolder folder;
  CreateDirectoryA((folder.Path() + "\\SYSTEM").c_str(), nullptr);
  CreateDirectoryA((folder.Path() + "\\SYSTEM\\HTML").c_str(), nullptr);
  {
    std::ofstream table(folder.Path() + "\\SYSTEM\\HTML\\hosource.txt", std::ios::binary);
    table << "540;FR;Service Hydrographique\r\n541;GB;UK Hydrographic Office\r\n540;XX;Second of a code\r\n";
  }
  SavedRegistryValue keyPath{HKEY_LOCAL_MACHINE, std::string(br::cRegSettings::BASE_PATH) + "\\" + br::SETTINGS_ENUM_KEY,
                             br::SETTING_KEY_PATH};
  keyPath.SetString(folder.Path() + "\\");
  Suite s;
  InspectorControl inspector(s.dll);  // loads the table when it is made

  BSTR name = nullptr;
  BSTR abbreviation = reinterpret_cast<BSTR>(static_cast<uintptr_t>(0xBAD));
  CHECK(inspector->HOCode2Name(540, &name, &abbreviation) == S_OK);
  CHECK(Take(name) == L"Service Hydrographique");  // the first row of a code
  CHECK(Take(abbreviation) == L"FR");
  CHECK(inspector->HOCode2Name(541, &name, nullptr) == S_OK);
  CHECK(Take(name) == L"UK Hydrographic Office");
  CHECK(inspector->HOCode2Name(541, nullptr, &abbreviation) == S_OK);
  CHECK(Take(abbreviation) == L"GB");

  // Not found: the code as its name, and an abbreviation that is null, not left as it was.
  abbreviation = reinterpret_cast<BSTR>(static_cast<uintptr_t>(0xBAD));
  CHECK(inspector->HOCode2Name(550, &name, &abbreviation) == S_FALSE);
  CHECK(Take(name) == L"550");
  CHECK(abbreviation == nullptr);
  CHECK(inspector->HOCode2Name(-7, &name, nullptr) == S_FALSE);
  CHECK(Take(name) == L"-7");
  CHECK(inspector->HOCode2Name(550, nullptr, nullptr) == S_FALSE);
}

TEST_CASE("a failing fill and a fill too deep are logged; no geo failure stops the fill") {
  char temp[MAX_PATH];
  GetTempPathA(MAX_PATH, temp);
  const std::string log = std::string(temp) + "inspector_fill_" + std::to_string(GetCurrentProcessId()) + ".log";
  DeleteFileA(log.c_str());
  SavedRegistryValue mask{HKEY_LOCAL_MACHINE, br::cRegSettings::BASE_PATH, br::SETTING_LOG_MASK};
  SavedRegistryValue file{HKEY_LOCAL_MACHINE, br::cRegSettings::BASE_PATH, br::SETTING_LOG_FILE};
  mask.SetDword(1);
  file.SetString(log);
  {
    Suite s;  // the library reads its log switches when it is loaded
    SceneProbe probe;
    InspectorControl inspector(s.dll);
    inspector.Host();

    REQUIRE(SetRecords(inspector, s.scene, L"deep-0") == S_OK);
    const std::vector<TreeItem> items = inspector.Items();
    CHECK(items.size() == 1 + 32);  // the header and 32 levels
    CHECK(items.back().depth == 31);

    probe.SetFault("IGeoObject.GetKindId", E_FAIL);
    REQUIRE(SetRecords(inspector, s.scene, L"c-light") == S_OK);
    probe.ClearFaults();
    CHECK(inspector.RootTexts() == std::vector<std::wstring>{L"DataSet CHART001   CHARTDB"});
  }
  std::ifstream in(log);
  std::stringstream text;
  text << in.rdbuf();
  const std::string lines = text.str();
  CHECK(lines.find("CXObjectInspector::_FillGeoObjTree") != std::string::npos);
  CHECK(lines.find("related objects cut at depth 32") != std::string::npos);
  CHECK(lines.find("hres:0x80004005") != std::string::npos);
  in.close();
  DeleteFileA(log.c_str());
}

namespace {

// Every rich edit window below `parent`, visible ones only, with the text it holds.
void VisibleRichEditTexts(HWND parent, std::vector<std::string>& texts) {
  for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    char found[32] = {};
    GetClassNameA(child, found, sizeof(found));
    if (lstrcmpiA(found, "RICHEDIT") == 0 && IsWindowVisible(child)) {
      char text[256] = {};
      const LRESULT length = SendMessageA(child, WM_GETTEXT, sizeof(text), reinterpret_cast<LPARAM>(text));
      texts.emplace_back(text, static_cast<std::size_t>(length > 0 ? length : 0));
    }
    VisibleRichEditTexts(child, texts);
  }
}

// The file name the picture tab's view shows (empty when none), asked of the control that
// the tab's ATL host window holds.
std::wstring ShownPictureName(HWND inspectorWindow) {
  HWND host = FindClass(inspectorWindow, L"AtlAxWin");
  REQUIRE(host != nullptr);
  using GetControl = HRESULT(WINAPI*)(HWND, IUnknown**);
  const auto getControl = reinterpret_cast<GetControl>(
      reinterpret_cast<void*>(GetProcAddress(GetModuleHandleA("atl.dll"), "AtlAxGetControl")));
  const bool haveGetControl = getControl != nullptr;
  REQUIRE(haveGetControl);
  ComRef<IUnknown> control;
  REQUIRE(getControl(host, control.Out()) == S_OK);
  ComRef<IXPICREPView> view = Query<IXPICREPView>(control.Get());
  REQUIRE(view);
  VARIANT name;
  VariantInit(&name);
  REQUIRE(view->get_Property(PRV_PICFILENAME, &name) == S_OK);
  REQUIRE(name.vt == VT_BSTR);
  const std::wstring text = Take(name.bstrVal);
  return text;
}

std::string SourcePath(const char* relative) {
  const char* root = getenv("BR_SOURCE_DIR");
  REQUIRE(root != nullptr);
  return std::string("Z:") + root + "/" + relative;
}

}  // namespace

TEST_CASE("the picture and text description tabs: shown with content, in their order, texts read back") {
  DllUnderTest dll;
  ScratchFolder files;
  WriteTextFile(files / "about.txt", "About the buoy");
  WriteTextFile(files / "national.txt", "Sur la bouee");
  std::string folder = files.Path();
  for (char& c : folder)
    if (c == '\\') c = '/';
  ScratchScene scene(R"({"format":"chartscene 1","databases":[{"name":"TABSDB","kind":"chart","datasets":[
    {"id":"TABS0001","objects":[
     {"name":"all","class":"BOYLAT","point":[0,0],
      "attributes":{"OBJNAM":"All","TXTDSC":"ABOUT.TXT","NTXTDS":"NATIONAL.TXT","PICREP":"BEACON.PNG"},
      "files":{"ABOUT.TXT":")" + folder + R"(/about.txt","NATIONAL.TXT":")" + folder +
                     R"(/national.txt","BEACON.PNG":")" + SourcePath("data/harbour/files/beacon.png") + R"("}},
     {"name":"text","class":"BOYLAT","point":[0,0],"attributes":{"OBJNAM":"Text","TXTDSC":"ABOUT.TXT"},
      "files":{"ABOUT.TXT":")" + folder + R"(/about.txt"}},
     {"name":"picture","class":"BOYLAT","point":[0,0],"attributes":{"OBJNAM":"Picture","PICREP":"BEACON.PNG"},
      "files":{"BEACON.PNG":")" + SourcePath("data/harbour/files/beacon.png") + R"("}},
     {"name":"missing","class":"BOYLAT","point":[0,0],"attributes":{"OBJNAM":"Missing","TXTDSC":"nowhere-at-all.txt"}},
     {"name":"none","class":"BOYLAT","point":[0,0],"attributes":{"OBJNAM":"None"}}]}]}]})");
  {
    InspectorControl inspector(dll);
    inspector.Host();
    VARIANT records = scene.Records(L"all, text, picture, missing, none");
    REQUIRE(inspector->SetInfo(records) == S_OK);
    VariantClear(&records);
    HWND strip = FindClass(inspector.Window(), WC_TABCONTROLW);
    REQUIRE(strip != nullptr);
    HWND tabs = GetParent(strip);
    auto select = [&](const wchar_t* name) {
      HTREEITEM found = nullptr;
      for (LPARAM data = 1; data <= 5 && !found; ++data) {
        const HTREEITEM item = inspector.ItemWithData(data);
        if (!item) continue;
        TVITEMW read{};
        wchar_t text[64] = {};
        read.mask = TVIF_TEXT | TVIF_HANDLE;
        read.hItem = item;
        read.pszText = text;
        read.cchTextMax = 64;
        SendMessageW(inspector.Tree(), TVM_GETITEMW, 0, reinterpret_cast<LPARAM>(&read));
        if (std::wstring(text).find(name) != std::wstring::npos) found = item;
      }
      REQUIRE(found != nullptr);
      inspector.Select(found);
    };
    auto showPage = [&](int page) {
      TabCtrl_SetCurSel(strip, page);
      NMHDR change{strip, static_cast<UINT_PTR>(GetDlgCtrlID(strip)), static_cast<UINT>(TCN_SELCHANGE)};
      SendMessageW(tabs, WM_NOTIFY, change.idFrom, reinterpret_cast<LPARAM>(&change));
    };

    select(L"All");
    CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes", L"Pictorial representation", L"Textual description",
                                                        L"Textual description in national language"});
    // The first picture is shown: the view holds the copy of the stored one.
    const std::wstring shown = ShownPictureName(inspector.Window());
    CHECK(shown.find(L"\\PICREP\\") != std::wstring::npos);
    CHECK(shown.find(L"TIF") != std::wstring::npos);
    showPage(2);
    std::vector<std::string> texts;
    VisibleRichEditTexts(inspector.Window(), texts);
    CHECK(texts == std::vector<std::string>{"About the buoy"});
    showPage(3);
    texts.clear();
    VisibleRichEditTexts(inspector.Window(), texts);
    CHECK(texts == std::vector<std::string>{"Sur la bouee"});

    select(L"Text");
    CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes", L"Textual description"});
    select(L"Picture");
    CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes", L"Pictorial representation"});
    select(L"Missing");
    CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});
    select(L"None");
    CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});
    // The header's metadata has no texts either.
    inspector.Select(inspector.ItemWithData(-2));
    CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes"});
    select(L"Text");
    CHECK(TabTitles(strip) == std::vector<std::wstring>{L"Attributes", L"Textual description"});
  }
  CHECK(dll.CanUnloadNow() == S_OK);
}
