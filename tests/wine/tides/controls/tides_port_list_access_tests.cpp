// TidesPortList read from outside, as a screen reader or an automation tool reads it: the
// ports of a database box hosted in Wine's ATL host, their station names through oleacc in
// name order, the selected row's state, and a row picked through oleacc firing SelectChanged.
#include "tests/wine/common/AccessibleReader.h"
#include "tests/wine/common/PortListControl.h"
#include "tests/wine/common/StationFolder.h"

#include <doctest/doctest.h>

#include <string>
#include <vector>

using namespace br::test;
using Names = std::vector<std::wstring>;

namespace {

const TestConstituent kMeanLevel = {0, 1500, 0};

}  // namespace

TEST_CASE("the station names of a box, read through oleacc in name order with the selected row's state") {
  // Stored in number order; the box leaves Oban out.
  StationFolder folder({{"Saint-Malo", 2918, -121, -1, {kMeanLevel}},
                        {"Brest", 2903, -269, -1, {kMeanLevel}},
                        {"Oban", 3385, -329, 0, {kMeanLevel}},
                        {"Roscoff", 2923, -238, -1, {kMeanLevel}},
                        {"Le Conquet", 2901, -285, -1, {kMeanLevel}}});
  DllUnderTest dll;
  auto database = ComRef<ITidesDatabase>::Adopt(OpenedDatabase(dll, folder.Path()));
  VARIANT ports;
  VariantInit(&ports);
  REQUIRE(database->GetPorts(47.5, -6, 49.5, -1, &ports) == S_OK);
  REQUIRE(ports.vt == (VT_ARRAY | VT_UNKNOWN));

  PortListControl list(dll);
  CHECK(list->SetPortList(ports) == S_OK);
  VariantClear(&ports);
  list.Host(AtlHost::MakeWindow(300, 200));
  const HWND table = list.Table();

  {
    AccessibleReader reader(table);
    REQUIRE(reader.get() != nullptr);
    CHECK(reader.Role() == ROLE_SYSTEM_LIST);
    CHECK(reader.ChildNames() == Names{L"Brest", L"Le Conquet", L"Roscoff", L"Saint-Malo"});
    CHECK(reader.Role(1) == ROLE_SYSTEM_LISTITEM);

    // Filling selected the first by name, as SelectChanged told the host.
    REQUIRE(list.Names() == Names{L"Brest"});
    CHECK(reader.Selection() == std::vector<long>{1});
    CHECK((reader.State(1) & STATE_SYSTEM_SELECTED) != 0);
    for (long other : {2, 3, 4}) CHECK((reader.State(other) & STATE_SYSTEM_SELECTED) == 0);
    SetFocus(table);
    CHECK(reader.State(1) == (STATE_SYSTEM_SELECTABLE | STATE_SYSTEM_FOCUSABLE | STATE_SYSTEM_SELECTED |
                              STATE_SYSTEM_FOCUSED));

    // A row picked from outside is the host's pick too.
    CHECK(reader.get()->accSelect(SELFLAG_TAKESELECTION, ChildId(3)) == S_OK);
    CHECK(list.Names() == Names{L"Brest", L"Roscoff"});
    CHECK(list.Selected() == L"Roscoff");
    CHECK(reader.Selection() == std::vector<long>{3});
    CHECK((reader.State(3) & STATE_SYSTEM_SELECTED) != 0);
    CHECK((reader.State(1) & STATE_SYSTEM_SELECTED) == 0);

    // An empty box empties the list.
    VARIANT empty;
    VariantInit(&empty);
    CHECK(list->SetPortList(empty) == S_OK);
    CHECK(reader.ChildCount() == 0);
  }

  list.Close();
  database.Reset();
  CHECK(dll.CanUnloadNow() == S_OK);
}
