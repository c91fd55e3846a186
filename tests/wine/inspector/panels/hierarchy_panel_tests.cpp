// The hierarchy card standing alone in a host window, over hierarchies written here: the
// tree and the value texts of every type, nodes related in a circle, roots that are not
// level 7 or not a node at all, unreadable levels and values, and the buttons' requests.
#include <doctest/doctest.h>

#include <string>
#include <vector>

#include "inspector/format/hierarchy_request.h"
#include "inspector/panels/GeoHierarchySource.h"
#include "inspector/panels/cHierarchyPanel.h"
#include "inspector/panels/hierarchy_attributes.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/inspector/panels/panel_test_support.h"
#include "toolkit/base/class_records.h"

using namespace br;
using br::inspector::cHierarchyPanel;
using br::test::MountedPanel;
using br::test::Names;
using br::test::ScratchScene;

namespace {

// Dataset CSI0001: a chart's hierarchy, with a source holding a value of every type.
// CSI0002: two sections holding each other. CSI0003: a top node of level 6, a note held
// only by another note, a node whose level is a signed number.
const char* const kScene = R"({
  "format": "chartscene 1",
  "catalogue": {
    "classes": [
      {"code": 57001, "acronym": "csinot", "name": "Supplementary note"},
      {"code": 57002, "acronym": "csidia", "name": "Supplementary diagram"},
      {"code": 57003, "acronym": "csisrc", "name": "Supplementary source"},
      {"code": 57004, "acronym": "csinod", "name": "Supplementary information node"}
    ],
    "attributes": [
      {"code": 57003, "acronym": "csilvl", "name": "Hierarchy level", "type": "U"},
      {"code": 57020, "acronym": "vtext", "name": "Text", "type": "S"},
      {"code": 57021, "acronym": "vi1", "name": "Signed byte", "type": "I"},
      {"code": 57022, "acronym": "vi1max", "name": "Signed byte, none", "type": "I"},
      {"code": 57023, "acronym": "vi2max", "name": "Short, none", "type": "I"},
      {"code": 57024, "acronym": "vi4", "name": "Long", "type": "I"},
      {"code": 57025, "acronym": "vi4max", "name": "Long, none", "type": "I"},
      {"code": 57026, "acronym": "vui1zero", "name": "Enumeration, none", "type": "E"},
      {"code": 57027, "acronym": "vui2", "name": "Word", "type": "U"},
      {"code": 57028, "acronym": "vui4", "name": "Unsigned long", "type": "I"},
      {"code": 57029, "acronym": "vui4zero", "name": "Unsigned long, none", "type": "I"},
      {"code": 57030, "acronym": "vr4", "name": "Float", "type": "R"},
      {"code": 57031, "acronym": "vr4max", "name": "Float, none", "type": "R"},
      {"code": 57032, "acronym": "vr8", "name": "Double", "type": "F"},
      {"code": 57033, "acronym": "vr8max", "name": "Double, none", "type": "F"},
      {"code": 57034, "acronym": "vdate", "name": "Date", "type": "I"},
      {"code": 57035, "acronym": "vbool", "name": "Flag", "type": "I"}
    ]
  },
  "databases": [{"name": "CSI", "kind": "hierarchy", "datasets": [
    {"id": "CSI0001", "objects": [
      {"name": "root", "class": "csinod", "primitive": "none", "text": "CHART SUPPLEMENTARY INFORMATION",
       "attributes": {"csilvl": 7, "OBJNAM": "Chart 7401"}, "members": ["buoyage", "depths"]},
      {"name": "buoyage", "class": "csinod", "primitive": "none", "text": "Buoyage",
       "attributes": {"csilvl": 6}, "members": ["notes"]},
      {"name": "depths", "class": "csinod", "primitive": "none", "text": "Depths",
       "attributes": {"csilvl": 6}, "members": ["survey"]},
      {"name": "notes", "class": "csinod", "primitive": "none", "text": "Notes",
       "attributes": {"csilvl": 5}, "members": ["lateral", "diagram"]},
      {"name": "lateral", "class": "csinot", "primitive": "none", "text": "IALA A lateral marks",
       "attributes": {"vtext": "Red to port", "BOYSHP": {"UI1": 2}}},
      {"name": "diagram", "class": "csidia", "primitive": "none", "text": "Approach diagram"},
      {"name": "survey", "class": "csisrc", "primitive": "none", "text": "Survey 2019",
       "attributes": {"vi1": {"I1": -5}, "vi1max": {"I1": 127}, "vi2max": {"I2": 32767}, "vi4": 42,
                      "vi4max": 2147483647, "vui1zero": {"UI1": 0}, "vui2": {"UI2": 300}, "vui4": {"UI4": 4000000000},
                      "vui4zero": {"UI4": 0}, "vr4": {"R4": 1.5}, "vr4max": {"R4": 3.40282347e38},
                      "vr8": {"R8": -0.0625}, "vr8max": {"R8": 1.7976931348623157e308},
                      "vdate": {"DATE": 45000.5}, "vbool": {"BOOL": true}}}
    ]},
    {"id": "CSI0002", "objects": [
      {"name": "ring-top", "class": "csinod", "primitive": "none", "text": "CHART SUPPLEMENTARY INFORMATION",
       "attributes": {"csilvl": 7}, "members": ["ring-chapter"]},
      {"name": "ring-chapter", "class": "csinod", "primitive": "none", "text": "Chapter",
       "attributes": {"csilvl": 6}, "members": ["ring-a", "ring-b"]},
      {"name": "ring-a", "class": "csinod", "primitive": "none", "text": "A",
       "attributes": {"csilvl": 5}, "members": ["ring-b", "ring-note"]},
      {"name": "ring-b", "class": "csinod", "primitive": "none", "text": "B",
       "attributes": {"csilvl": 5}, "members": ["ring-a"]},
      {"name": "ring-note", "class": "csinot", "primitive": "none", "text": "Note"}
    ]},
    {"id": "CSI0003", "objects": [
      {"name": "top6", "class": "csinod", "primitive": "none", "text": "Harbour",
       "attributes": {"csilvl": 6}, "members": ["top6-note"]},
      {"name": "top6-note", "class": "csinot", "primitive": "none", "text": "Harbour note"},
      {"name": "holder-note", "class": "csinot", "primitive": "none", "text": "Holder", "members": ["orphan"]},
      {"name": "orphan", "class": "csinot", "primitive": "none", "text": "Orphan"},
      {"name": "signed-top", "class": "csinod", "primitive": "none", "text": "CHART SUPPLEMENTARY INFORMATION",
       "attributes": {"csilvl": 7}, "members": ["signed-level"]},
      {"name": "signed-level", "class": "csinod", "primitive": "none", "text": "Signed",
       "attributes": {"csilvl": {"I4": 6}}}
    ]}
  ]}]
})";

const wchar_t* const kRootRow = L"Supplementary information node - CHART SUPPLEMENTARY INFORMATION";

std::vector<std::wstring> ReadRows(toolkit::Table& table) {
  br::test::AccessibleReader reader(table.getHandle());
  REQUIRE(reader.get() != nullptr);
  return reader.ChildNames();
}

void Click(toolkit::Button& button) {
  SendMessageA(button.getHandle(), WM_LBUTTONDOWN, MK_LBUTTON, MAKELPARAM(2, 2));
  SendMessageA(button.getHandle(), WM_LBUTTONUP, 0, MAKELPARAM(2, 2));
}

std::string IdText(IGeoObject* object) {
  return inspector::HierarchyIdText(inspector::HierarchyIdOf(ScratchScene::IdOf(object)));
}

struct Requests {
  std::vector<std::string> sent;
  void Attach(cHierarchyPanel& panel) {
    panel.SetRequestHandler([this](const std::string& request) { sent.push_back(request); });
  }
};

}  // namespace

TEST_CASE("hierarchy: the tree from any member, indented by depth, the chosen object's row current") {
  MountedPanel<cHierarchyPanel> m;
  ScratchScene scene(kScene);
  CHECK(toolkit::isKindOf(&m.panel, &toolkit::records::cHierarchyPanel));
  CHECK(m.panel.hierarchyTable().getColumnAlias(0) == "Hierarchy");
  CHECK(m.panel.attributeTable().getColumnAlias(0) == "Attributes");
  CHECK_FALSE(m.panel.HasContent());

  const Names tree{kRootRow,
                   L"  Supplementary information node - Buoyage",
                   L"    Supplementary information node - Notes",
                   L"      Supplementary note - IALA A lateral marks",
                   L"      Supplementary diagram - Approach diagram",
                   L"  Supplementary information node - Depths",
                   L"    Supplementary source - Survey 2019"};
  const struct {
    const wchar_t* name;
    int row;
  } starts[] = {{L"root", 0}, {L"notes", 2}, {L"lateral", 3}, {L"diagram", 4}, {L"survey", 6}};
  for (const auto& start : starts) {
    CAPTURE(br::test::Printable(start.name));
    REQUIRE(m.panel.Fill(scene.Object(start.name).Get()) == S_OK);
    CHECK(ReadRows(m.panel.hierarchyTable()) == tree);
    CHECK(m.panel.hierarchyTable().getCurrentRow() == start.row);
    CHECK_FALSE(m.panel.WasCut());
  }

  // The root's own attributes as the catalogue names them; an enumeration by its text.
  REQUIRE(m.panel.SelectNode(0));
  CHECK(ReadRows(m.panel.attributeTable()) == Names{L"Hierarchy level: 7", L"Object name: Chart 7401"});
  REQUIRE(m.panel.SelectNode(3));
  CHECK(ReadRows(m.panel.attributeTable()) == Names{L"Text: Red to port", L"Buoy shape: can (cylindrical)"});
  CHECK_FALSE(m.panel.SelectNode(7));
  CHECK(inspector::HierarchyTitle(nullptr, 57004) == "57004");
}

TEST_CASE("hierarchy: value texts for every type, the no-value markers unknown, unreadable values said so") {
  MountedPanel<cHierarchyPanel> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.Fill(scene.Object(L"survey").Get()) == S_OK);
  CHECK(ReadRows(m.panel.attributeTable()) ==
        Names{L"Signed byte: -5",         L"Signed byte, none: <unknown>",
              L"Short, none: <unknown>",  L"Long: 42",
              L"Long, none: <unknown>",   L"Enumeration, none: <unknown>",
              L"Word: 300",               L"Unsigned long: 4000000000",
              L"Unsigned long, none: <unknown>", L"Float: 1.500",
              L"Float, none: <unknown>",  L"Double: -0.062",
              L"Double, none: <unknown>", L"Date: <unknown value type>",
              L"Flag: <unknown value type>"});

  // Values the host will not hand out: the rows stay, each saying so.
  br::test::SceneProbe probe;
  probe.SetFault("IGeoAttribute.GetValue", E_FAIL);
  REQUIRE(m.panel.SelectNode(0));
  CHECK(ReadRows(m.panel.attributeTable()) ==
        Names{L"Hierarchy level: <Error retrieving value>", L"Object name: <Error retrieving value>"});
  // Nor can the levels be read: the build fails and the panel is empty.
  CHECK(m.panel.Fill(scene.Object(L"root").Get()) == E_FAIL);
  probe.ClearFaults();
  CHECK_FALSE(m.panel.HasContent());
  CHECK(m.panel.attributeTable().getRowCount() == 0);
}

TEST_CASE("hierarchy: sections holding each other end, each shown once on a path") {
  MountedPanel<cHierarchyPanel> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.Fill(scene.Object(L"ring-b").Get()) == S_OK);
  CHECK(ReadRows(m.panel.hierarchyTable()) == Names{L"Supplementary information node - CHART SUPPLEMENTARY INFORMATION",
                                                    L"  Supplementary information node - Chapter",
                                                    L"    Supplementary information node - A",
                                                    L"      Supplementary information node - B",
                                                    L"      Supplementary note - Note",
                                                    L"    Supplementary information node - B",
                                                    L"      Supplementary information node - A",
                                                    L"        Supplementary note - Note"});
  CHECK(m.panel.hierarchyTable().getCurrentRow() == 5);  // B under the chapter, not under A
  CHECK_FALSE(m.panel.WasCut());
}

TEST_CASE("hierarchy: a top node below level 7 is the root; a note held by a note, or a signed level, gives nothing") {
  MountedPanel<cHierarchyPanel> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.Fill(scene.Object(L"top6-note").Get()) == S_OK);
  CHECK(ReadRows(m.panel.hierarchyTable()) ==
        Names{L"Supplementary information node - Harbour", L"  Supplementary note - Harbour note"});

  // Failures are reported under the panel's name, with the step that failed.
  struct Seen : br::cErrHandler {
    std::vector<std::string> failures;
    bool Report(const char* className, br::ErrRecord& record) noexcept override {
      failures.push_back(std::string(className) + "::" + record.function + ": " + (record.text ? record.text : ""));
      return true;
    }
  } seen;
  m.settings.SetErrorHandler(&seen);
  CHECK(m.panel.Fill(scene.Object(L"orphan").Get()) == E_FAIL);
  CHECK_FALSE(m.panel.HasContent());
  CHECK(seen.failures == std::vector<std::string>{"cHierarchyPanel::Fill: the first related object is not a node"});
  REQUIRE(m.panel.Fill(scene.Object(L"top6").Get()) == S_OK);
  CHECK(m.panel.Fill(scene.Object(L"signed-top").Get()) == E_FAIL);
  CHECK_FALSE(m.panel.HasContent());
  CHECK(m.panel.Fill(nullptr) == E_FAIL);
  m.settings.SetErrorHandler(nullptr);
}

TEST_CASE("hierarchy: the buttons send the node's text, identity and kind; show station goes up to the chart's node") {
  MountedPanel<cHierarchyPanel> m;
  ScratchScene scene(kScene);
  Requests requests;
  requests.Attach(m.panel);
  CHECK(m.panel.showStationButton().getText() == "Show station");
  CHECK(m.panel.highlightButton().getText() == "Highlight coverage");

  // Nothing shown, nothing sent.
  Click(m.panel.highlightButton());
  CHECK(requests.sent.empty());

  REQUIRE(m.panel.Fill(scene.Object(L"lateral").Get()) == S_OK);
  const std::string kind = "{00000000-0000-0000-4353-490000000000}";
  const std::string root = "CHART SUPPLEMENTARY INFORMATION|" + IdText(scene.Object(L"root").Get()) + "|" + kind;
  Click(m.panel.highlightButton());
  Click(m.panel.showStationButton());
  REQUIRE(requests.sent.size() == 2);
  CHECK(requests.sent[0] == "IALA A lateral marks|" + IdText(scene.Object(L"lateral").Get()) + "|" + kind);
  CHECK_FALSE(inspector::ParseHierarchyRequest(requests.sent[0]));  // the inspector shows nothing for it
  CHECK(requests.sent[1] == root);
  const auto request = inspector::ParseHierarchyRequest(requests.sent[1]);
  REQUIRE(request);
  CHECK(request->object == inspector::HierarchyIdOf(ScratchScene::IdOf(scene.Object(L"root").Get())));

  // A row chosen by the user: its attributes show, the buttons take it.
  m.panel.hierarchyTable().selectRow(0, true);
  CHECK(ReadRows(m.panel.attributeTable()) == Names{L"Hierarchy level: 7", L"Object name: Chart 7401"});
  Click(m.panel.highlightButton());
  CHECK(requests.sent.back() == root);

  // A hierarchy whose top node has another text sends that text.
  REQUIRE(m.panel.Fill(scene.Object(L"top6-note").Get()) == S_OK);
  Click(m.panel.showStationButton());
  CHECK(requests.sent.back() == "Harbour|" + IdText(scene.Object(L"top6").Get()) + "|" + kind);
}

TEST_CASE("hierarchy: side by side or one above the other") {
  br::test::Apartment apartment;
  br::inspector::PanelSettings settings;
  for (int orientation : {0, 1, 2, -1}) {
    wtest::HostWindow host{400, 300};
    cHierarchyPanel panel(settings, orientation);
    CHECK(panel.Orientation() == (orientation == 0 ? 0 : 1));
    REQUIRE(panel.create(host.hwnd()));
    panel.setBounds(0, 0, 400, 300, true, true);
    panel.doLayout();
    RECT tree{}, list{};
    GetWindowRect(panel.hierarchyTable().getHandle(), &tree);
    GetWindowRect(panel.attributeTable().getHandle(), &list);
    if (orientation == 0) {
      CHECK(list.top >= tree.bottom);
    } else {
      CHECK(list.left >= tree.right);
    }
  }
}
