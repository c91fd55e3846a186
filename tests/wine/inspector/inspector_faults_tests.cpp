// XObjectInspector over the sample harbour while the stand-in host fails or answers
// oddly, one operation at a time: the fill, a choice of every tree item (the details
// tabs), a double click, FormatAttributes and DataSet. Every row must leave the host's
// wrappers and selections as they were, and the library unloadable.
#include "tests/wine/inspector/InspectorControl.h"

#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/ScratchScene.h"

#include <doctest/doctest.h>

#include <commctrl.h>

#include <cstdio>
#include <string>
#include <vector>

using namespace br::test;

namespace {

// Every operation of the host the inspector may reach.
const char* const kOperations[] = {
    "IGeoAttribute.GetCode", "IGeoAttribute.GetOwner", "IGeoAttribute.GetValue",
    "IGeoCatalog.GetAttributeCode", "IGeoCatalog.GetAttributeFlags", "IGeoCatalog.GetAttributeNameLength",
    "IGeoCatalog.GetAttributeNameText", "IGeoCatalog.GetClassFlags", "IGeoCatalog.GetClassNameLength",
    "IGeoCatalog.GetClassNameText", "IGeoCatalog.GetEnumText", "IGeoCatalog.GetEnumTextLength",
    "IGeoDataSet.GetDataSetProperty", "IGeoDataSet.GetDatabase", "IGeoDataSet.GetHeader", "IGeoDataSet.GetKindId",
    "IGeoDataSet.GetObjectById", "IGeoDataSet.GetObjectEnum", "IGeoDataSet.GetParameters",
    "IGeoDatabase.CreateSelection", "IGeoDatabase.GetDataSetById", "IGeoDatabase.GetDataSetHeader",
    "IGeoDatabase.GetGeoObject", "IGeoDatabase.GetKindId", "IGeoDatabase.GetName", "IGeoDatabase.ReleaseSelection",
    "IGeoLibraryDataSet.GetDataSet", "IGeoObject.GetAttribute", "IGeoObject.GetAttributes",
    "IGeoObject.GetClassCode", "IGeoObject.GetDataSet", "IGeoObject.GetId", "IGeoObject.GetKindId",
    "IGeoObject.GetMembers", "IGeoObject.GetPrimitive", "IGeoObject.GetProperty", "IGeoObject.GetRelated",
    "IGeoObject.GetStorage", "IGeoObject.GetText", "IGeoObjectEnum.Next", "IGeoRasterDataSet.GetChartHeader",
    "IGeoRasterDataSet.GetChartIssue", "IGeoRasterDataSet.GetChartIssueRecord", "IGeoSelectionEnum.Next",
    "IGeoSelectionEnum.Reset", "IGeoSelectionEnum.SetSelection", "IObjectFormatter.FormatAttribute",
    "IObjectFormatter.FormatObject", "IObjectFormatter.GetAttributeName", "IObjectFormatter.SetOption",
    "ITextTable.GetText"};

struct Kind {
  const char* name;
  HRESULT result;  // the stand-in clears every out-value before it answers this
};
const Kind kKinds[] = {{"failing", E_FAIL},
                       {"failing, out of memory", E_OUTOFMEMORY},
                       {"S_FALSE, nothing handed out", S_FALSE},
                       {"an odd success code, nothing handed out", static_cast<HRESULT>(2)}};

const char* const kLiveKinds[] = {"live.Database",   "live.DataSet",         "live.RasterDataSet", "live.Object",
                                  "live.Attribute",  "live.ObjectEnum",      "live.SelectionEnum", "live.Projection",
                                  "live.PresParams", "live.ColorMap",        "live.Scene",         "selections.open"};

// Chart objects of every panel (lights, a tidal stream, a harbour's services, a collection
// and pictures), the three kinds of dataset entry and a mariner's object.
const wchar_t* kRecords =
    L"minou-lighthouse, minou-light-white, minou-group, fillettes-beacon, goulet-stream, harbour, chandlery, "
    L"mengam-cardinal, magvar, old-wreck, portzic-lighthouse, dataset:FR5BR010, dataset:FR3BR001, "
    L"dataset:LIBBRST";

std::vector<long> Counters(const SceneProbe& probe) {
  std::vector<long> values;
  for (const char* name : kLiveKinds) values.push_back(probe.Counter(name));
  return values;
}

std::vector<HTREEITEM> AllItems(HWND tree) {
  std::vector<HTREEITEM> items;
  for (HTREEITEM item = TreeView_GetRoot(tree); item; item = TreeView_GetNextVisible(tree, item)) {
    items.push_back(item);
    TreeView_Expand(tree, item, TVE_EXPAND);
  }
  return items;
}

std::wstring IdText(const GUID& id) {
  wchar_t text[40] = {};
  StringFromGUID2(id, text, 40);
  return text;
}

struct Outcome {
  HRESULT fill = E_UNEXPECTED;
  HRESULT format = E_UNEXPECTED;
  bool formatText = false;  // FormatAttributes handed out a text
  HRESULT dataSet = E_UNEXPECTED;
  bool dataSetOut = false;
  std::size_t items = 0;
};

// One pass of everything the inspector asks the host, with the fault in place throughout.
Outcome Exercise(const DllUnderTest& dll, const ScratchScene& scene, VARIANT& records, const std::wstring& lightId) {
  Outcome outcome;
  InspectorControl inspector(dll);
  inspector.Host();
  outcome.fill = inspector->SetInfo(records);
  const std::vector<HTREEITEM> items = AllItems(inspector.Tree());
  outcome.items = items.size();
  for (HTREEITEM item : items) {
    inspector.Select(item);
    inspector.DoubleClick();
  }
  const auto database = scene.Database(L"BREST");
  BSTR guid = SysAllocString(lightId.c_str());
  BSTR text = nullptr;
  outcome.format = inspector->FormatAttributes(database.Get(), guid, &text);
  outcome.formatText = text != nullptr;
  SysFreeString(text);
  SysFreeString(guid);
  IUnknown* dataSet = nullptr;
  outcome.dataSet = inspector->get_DataSet(&dataSet);
  outcome.dataSetOut = dataSet != nullptr;
  if (dataSet) dataSet->Release();
  inspector.Close();
  return outcome;
}

}  // namespace

TEST_CASE("every host operation failing or answering nothing: fill, choices, FormatAttributes and DataSet") {
  DllUnderTest dll;
  SceneProbe probe;
  int run = 0;
  {
    ScratchScene scene{ScratchScene::SampleHarbour{}};
    const std::wstring lightId = IdText(ScratchScene::IdOf(scene.Object(L"minou-light-white").Get()));
    // Made once: the scene keeps the owners of every record array it hands out.
    VARIANT records = scene.Records(kRecords);

    // A pass without faults: what every row is measured against.
    const Outcome clean = Exercise(dll, scene, records, lightId);
    REQUIRE(clean.fill == S_OK);
    REQUIRE(clean.format == S_OK);
    REQUIRE(clean.dataSet == S_OK);
    REQUIRE(clean.items > 10);
    const std::vector<long> start = Counters(probe);

    for (const char* operation : kOperations) {
      std::printf("%s\n", operation);
      std::fflush(stdout);
      for (const Kind& kind : kKinds) {
        INFO(std::string(operation), ": ", std::string(kind.name));
        probe.SetFault(operation, kind.result);
        const Outcome outcome = Exercise(dll, scene, records, lightId);
        probe.ClearFaults();
        ++run;

        // No failure of the host stops the fill: what cannot be read is left out.
        CHECK(outcome.fill == S_OK);
        // A database of unknown kind is grouped as a user's: items may be added, never more
        // than the grouping's headings. A success without a value reads as class 0, which no
        // rule hides, so only a failure bounds the count.
        if (FAILED(kind.result)) CHECK(outcome.items <= clean.items + 4);
        // Either a text or a failure, never a success without one.
        CHECK((outcome.format == S_OK) == outcome.formatText);
        if (outcome.format != S_OK) CHECK(FAILED(outcome.format));
        CHECK((outcome.dataSet == S_OK) == outcome.dataSetOut);
        if (outcome.dataSet != S_OK) CHECK((FAILED(outcome.dataSet) || outcome.dataSet == S_FALSE));
        const std::vector<long> end = Counters(probe);
        for (std::size_t i = 0; i < end.size(); ++i) {
          INFO(std::string(kLiveKinds[i]));
          CHECK(end[i] == start[i]);
        }
      }
    }
    VariantClear(&records);
  }
  std::printf("inspector fault sweep: %d operations x %d kinds = %d rows\n",
              static_cast<int>(sizeof(kOperations) / sizeof(kOperations[0])),
              static_cast<int>(sizeof(kKinds) / sizeof(kKinds[0])), run);
  CHECK(dll.CanUnloadNow() == S_OK);
}
