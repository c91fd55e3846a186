// Sinks that act on XObjectInspector from inside SelectObject, on a tree click and on a
// double click: SetInfo, AddInfo, the host window closed, the last reference released.
// Run with the heap's free checking on, so an object used after its end fails at once.
#include "tests/wine/inspector/InspectorControl.h"

#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/ScratchScene.h"

#include <doctest/doctest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

using namespace br::test;

namespace {

const char* kScene = R"({"format":"chartscene 1",
 "databases":[{"name":"USERDB","kind":"user","datasets":[{"id":"GROUPS1","objects":[
   {"name":"u-rock","class":"UWTROC","point":[0,0],"attributes":{"OBJNAM":"Rock"}},
   {"name":"u-light","class":"LIGHTS","point":[0,0],"attributes":{"OBJNAM":"Lamp"}},
   {"name":"u-track","class":"NAVLNE","line":[[0,0],[1,1]],"attributes":{"OBJNAM":"Track"}},
   {"name":"u-pair-1","class":"LIGHTS","point":[0,0],"attributes":{"OBJNAM":"Pair one"}},
   {"name":"u-pair","class":"C_AGGR","primitive":"none","attributes":{"OBJNAM":"Pair"},"members":["u-pair-1"]}]}]}]})";

HRESULT Fill(InspectorControl& inspector, const ScratchScene& scene, const wchar_t* names, bool add) {
  VARIANT records = scene.Records(names);
  const HRESULT hr = add ? inspector->AddInfo(records) : inspector->SetInfo(records);
  VariantClear(&records);
  return hr;
}

enum class Gesture { Click, DoubleClick };

struct Row {
  const char* what;
  // What the sink does, and the items the tree holds after it (-1: no window left).
  std::function<void(std::unique_ptr<InspectorControl>&, const ScratchScene&)> action;
  int items;
};

}  // namespace

TEST_CASE("sinks that fill, add, close the host or release the control inside SelectObject") {
  DllUnderTest dll;
  SceneProbe probe;
  const long openSelections = probe.Counter("selections.open");
  {
    ScratchScene scene{kScene};
    // What the tree holds after the same calls made from outside any event.
    int replaced = 0, initial = 0, added = 0;
    {
      InspectorControl reference(dll);
      reference.Host();
      REQUIRE(Fill(reference, scene, L"u-track", false) == S_OK);
      replaced = static_cast<int>(reference.Items().size());
      REQUIRE(Fill(reference, scene, L"u-light, u-rock, u-pair", false) == S_OK);
      initial = static_cast<int>(reference.Items().size());
      REQUIRE(Fill(reference, scene, L"u-track", true) == S_OK);
      added = static_cast<int>(reference.Items().size());
    }
    REQUIRE(replaced >= 2);
    REQUIRE(added > initial);
    const std::vector<Row> rows = {
        {"SetInfo", [](auto& c, const ScratchScene& s) { CHECK(Fill(*c, s, L"u-track", false) == S_OK); }, replaced},
        {"AddInfo", [](auto& c, const ScratchScene& s) { CHECK(Fill(*c, s, L"u-track", true) == S_OK); }, added},
        {"SetInfo of nothing",
         [](auto& c, const ScratchScene&) {
           VARIANT none;
           none.vt = VT_EMPTY;
           CHECK((*c)->SetInfo(none) == S_OK);
         },
         0},
        {"the host window closed",
         [](auto& c, const ScratchScene& s) {
           DestroyWindow(GetParent(c->Window()));
           // Nothing to fill into any more.
           CHECK(Fill(*c, s, L"u-track", false) == OLE_E_BLANK);
         },
         -1},
        {"the last reference released",
         [](auto& c, const ScratchScene&) {
           IXObjectInspector* raw = c->Get();
           raw->AddRef();
           c->sink.onCall = nullptr;
           c->Close();
           raw->Release();
         },
         -1},
    };
    for (Gesture gesture : {Gesture::Click, Gesture::DoubleClick}) {
      for (const Row& row : rows) {
        INFO(row.what, gesture == Gesture::Click ? " on a click" : " on a double click");
        auto inspector = std::make_unique<InspectorControl>(dll);
        inspector->Host();
        REQUIRE(Fill(*inspector, scene, L"u-light, u-rock, u-pair", false) == S_OK);
        REQUIRE(static_cast<int>(inspector->Items().size()) == initial);
        HTREEITEM rock = inspector->ItemWithData(2);
        REQUIRE(rock != nullptr);
        inspector->Select(rock);
        const std::size_t before = inspector->sink.events.size();
        int calls = 0;
        inspector->sink.onCall = [&] {
          if (++calls > 1) return;
          row.action(inspector, scene);
        };
        if (gesture == Gesture::Click) inspector->Select(inspector->ItemWithData(3));
        else inspector->DoubleClick();
        CHECK(calls >= 1);
        if (row.items >= 0 && inspector->Get()) {
          CHECK(inspector->Items().size() == static_cast<std::size_t>(row.items));
          CHECK(inspector->sink.events.size() > before);
          // The control still answers after the sink returned.
          BSTR guid = nullptr;
          ComRef<IUnknown> owner;
          CHECK(SUCCEEDED((*inspector)->GetSelectedObject(&guid, owner.Out())));
          SysFreeString(guid);
        }
        inspector.reset();
      }
    }
  }
  CHECK(probe.Counter("selections.open") == openSelections);
  CHECK(dll.CanUnloadNow() == S_OK);
}
