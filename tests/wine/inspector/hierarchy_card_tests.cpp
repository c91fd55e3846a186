// The inspector's hierarchy card through the control: a hierarchy object shows its tree,
// read as a client reads it, and the card's buttons lead to SelectObject for the chart's
// node (its identity as text, a null owner, double-click flag 1), or to nothing.
#include "tests/wine/inspector/InspectorControl.h"

#include "tests/wine/common/AccessibleReader.h"
#include "tests/wine/common/ScratchScene.h"

#include <doctest/doctest.h>

#include <string>
#include <vector>

using namespace br::test;

namespace {

const char* const kScene = R"({
  "format": "chartscene 1",
  "catalogue": {
    "classes": [
      {"code": 57001, "acronym": "csinot", "name": "Supplementary note"},
      {"code": 57004, "acronym": "csinod", "name": "Supplementary information node"}
    ],
    "attributes": [{"code": 57003, "acronym": "csilvl", "name": "Hierarchy level", "type": "U"}]
  },
  "databases": [{"name": "CSI", "kind": "hierarchy", "datasets": [
    {"id": "CSI0001", "objects": [
      {"name": "root", "class": "csinod", "primitive": "none", "text": "CHART SUPPLEMENTARY INFORMATION",
       "attributes": {"csilvl": 7}, "members": ["buoyage"]},
      {"name": "buoyage", "class": "csinod", "primitive": "none", "text": "Buoyage",
       "attributes": {"csilvl": 6}, "members": ["lateral"]},
      {"name": "lateral", "class": "csinot", "primitive": "none", "text": "IALA A lateral marks",
       "attributes": {"OBJNAM": "Lateral"}},
      {"name": "top6", "class": "csinod", "primitive": "none", "text": "Harbour",
       "attributes": {"csilvl": 6}, "members": ["top6-note"]},
      {"name": "top6-note", "class": "csinot", "primitive": "none", "text": "Harbour note"},
      {"name": "holder", "class": "csinot", "primitive": "none", "text": "Holder", "members": ["orphan"]},
      {"name": "orphan", "class": "csinot", "primitive": "none", "text": "Orphan"}
    ]}
  ]}]
})";

struct Card {
  DllUnderTest dll;
  ScratchScene scene{kScene};
  InspectorControl inspector{dll};
  Card() { inspector.Host(); }
  ~Card() {
    inspector.Close();
    CHECK(dll.CanUnloadNow() == S_OK);
  }

  void Show(const wchar_t* name) {
    VARIANT records = scene.Records(name);
    REQUIRE(inspector->SetInfo(records) == S_OK);
    VariantClear(&records);
    inspector.Select(inspector.ItemWithData(1));
  }

  // The descendant window a client reads with the role and, for a list, first item.
  HWND Find(long role, const std::wstring& name) const {
    HWND found = nullptr;
    Walk(inspector.Window(), [&](HWND window) {
      AccessibleReader reader(window);
      if (!reader.get() || reader.Role() != role) return;
      const std::wstring text = role == ROLE_SYSTEM_LIST ? (reader.ChildCount() ? reader.Name(1) : L"") : reader.Name();
      if (text.rfind(name, 0) == 0 && !found) found = window;
    });
    return found;
  }
  std::vector<std::wstring> Rows(const std::wstring& first) const {
    HWND list = Find(ROLE_SYSTEM_LIST, first);
    if (!list) return {};
    return AccessibleReader(list).ChildNames();
  }
  void Press(const wchar_t* button) const {
    HWND window = Find(ROLE_SYSTEM_PUSHBUTTON, button);
    REQUIRE(window != nullptr);
    SendMessageA(window, WM_LBUTTONDOWN, MK_LBUTTON, MAKELPARAM(2, 2));
    SendMessageA(window, WM_LBUTTONUP, 0, MAKELPARAM(2, 2));
  }
  std::wstring IdOf(const wchar_t* name) const {
    wchar_t text[40] = {};
    REQUIRE(StringFromGUID2(ScratchScene::IdOf(scene.Object(name).Get()), text, 40) == 39);
    return text;
  }

  template <class Visit>
  static void Walk(HWND parent, const Visit& visit) {
    for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
      visit(child);
      Walk(child, visit);
    }
  }
};

}  // namespace

TEST_CASE("hierarchy card: the tree of the chosen note, and its buttons' SelectObject") {
  Card c;
  c.Show(L"lateral");
  REQUIRE_FALSE(c.inspector.sink.events.empty());
  CHECK(c.inspector.sink.events.back().guid == c.IdOf(L"lateral"));
  CHECK(c.inspector.sink.events.back().doubleClick == 0);
  const std::size_t chosen = c.inspector.sink.events.size();
  CHECK(c.Rows(L"Supplementary information node") ==
        std::vector<std::wstring>{L"Supplementary information node - CHART SUPPLEMENTARY INFORMATION",
                                  L"  Supplementary information node - Buoyage",
                                  L"    Supplementary note - IALA A lateral marks"});
  CHECK(c.Rows(L"Object name") == std::vector<std::wstring>{L"Object name: Lateral"});

  // The note's own request names no chart: nothing is sent.
  c.Press(L"Highlight coverage");
  CHECK(c.inspector.sink.events.size() == chosen);

  // Show station goes up to the chart's node: its identity, no owner, as a double click.
  c.Press(L"Show station");
  REQUIRE(c.inspector.sink.events.size() == chosen + 1);
  const SelectEvent& shown = c.inspector.sink.events.back();
  CHECK(shown.guid == c.IdOf(L"root"));
  CHECK(shown.ownerType == VT_UNKNOWN);
  CHECK(shown.owner.Get() == nullptr);
  CHECK(shown.doubleClick == 1);

  // From the chart's node itself both buttons name it.
  c.Show(L"root");
  const std::size_t before = c.inspector.sink.events.size();
  c.Press(L"Highlight coverage");
  c.Press(L"Show station");
  REQUIRE(c.inspector.sink.events.size() == before + 2);
  for (std::size_t i = before; i < before + 2; ++i) {
    CHECK(c.inspector.sink.events[i].guid == c.IdOf(L"root"));
    CHECK(c.inspector.sink.events[i].doubleClick == 1);
    CHECK(c.inspector.sink.events[i].owner.Get() == nullptr);
  }
}

TEST_CASE("hierarchy card: a top node with another title, and a note held by a note, send nothing") {
  Card c;
  c.Show(L"top6-note");
  CHECK(c.Rows(L"Supplementary information node") ==
        std::vector<std::wstring>{L"Supplementary information node - Harbour", L"  Supplementary note - Harbour note"});
  const std::size_t before = c.inspector.sink.events.size();
  c.Press(L"Show station");
  c.Press(L"Highlight coverage");
  CHECK(c.inspector.sink.events.size() == before);

  // No hierarchy to show: the card is empty and its buttons idle.
  c.Show(L"orphan");
  CHECK(c.Rows(L"Supplementary") == std::vector<std::wstring>{});
  const std::size_t after = c.inspector.sink.events.size();
  c.Press(L"Show station");
  CHECK(c.inspector.sink.events.size() == after);
}
