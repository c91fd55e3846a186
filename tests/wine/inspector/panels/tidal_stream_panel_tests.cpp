// Tidal stream attributes in the attribute panels: the table of lines read back byte for
// byte through IAccessible for high water, low water, a missing reference and a short
// field list, and the formatter's text kept for databases of another kind.
#include <doctest/doctest.h>

#include <string>

#include "inspector/panels/cAttrViewPanel_Tbl.h"
#include "inspector/panels/cP_SHPanel.h"
#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/inspector/panels/panel_test_support.h"

using namespace br;
using br::inspector::cAttrViewPanel_Tbl;
using br::inspector::cP_SHPanel;
using br::test::MountedPanel;
using br::test::Names;
using br::test::ScratchScene;

namespace {

const char* const kScene = R"({
  "format": "chartscene 1",
  "databases": [
    {"name": "TEST", "kind": "chart", "datasets": [{"id": "STREAM01", "objects": [
      {"name": "high", "class": "TS_PAD", "point": [48.3, -4.5], "attributes": {"TS_TSP":
        "Brest,Goulet,HW,060,1.2,065,2.1,068,2.9,070,3.4,070,3.6,068,3.1,000,0.3,250,2.2,248,3.0,248,3.4,250,3.3,250,2.6,245,1.4"}},
      {"name": "low", "class": "TS_PAD", "point": [48.3, -4.5], "attributes": {"TS_TSP":
        "Brest,Goulet,LW,240,1.0,245,1.9,248,2.5,250,2.8,250,2.6,248,1.7,180,0.2,070,1.6,068,2.4,068,2.9,070,2.7,070,2.0,065,1.1"}},
      {"name": "no-reference", "class": "TS_PAD", "point": [48.3, -4.5], "attributes": {"TS_TSP":
        "Brest,Goulet,,060,1.2,065,2.1,068,2.9,070,3.4,070,3.6,068,3.1,000,0.3,250,2.2,248,3.0,248,3.4,250,3.3,250,2.6,245,1.4"}},
      {"name": "short", "class": "TS_PAD", "point": [48.3, -4.5], "attributes": {"TS_TSP": "%s%n,Goulet,HW,060,1.2,065"}}
    ]}]},
    {"name": "MINE", "kind": "user", "datasets": [{"id": "MINE01", "objects": [
      {"name": "own", "class": "TS_PAD", "point": [48.3, -4.5], "attributes": {"TS_TSP": "Brest,Goulet,HW,060,1.2"}}
    ]}]}
  ]
})";

const wchar_t* const kName = L"Tidal stream - panel values";

std::wstring HourLine(const std::wstring& reference, const std::wstring& label, const std::wstring& direction,
                      const std::wstring& rate) {
  return L"     " + reference + label + L"      " + direction + L"\u00B0      " + rate + L"kn\r";
}

const wchar_t* const kLabels[] = {L" -  6", L" -  5", L" -  4", L" -  3", L" -  2", L" -  1", L"      ",
                                  L" + 1",  L" + 2",  L" + 3",  L" + 4",  L" + 5",  L" + 6"};

// The expected table: the first line, the captions, one line per hour from the pairs.
std::wstring Table(const std::wstring& first, const std::wstring& reference,
                   const std::vector<std::pair<std::wstring, std::wstring>>& pairs) {
  std::wstring text = first + L"\r       Time    Direction   Velocity\r";
  for (int hour = 0; hour < 13; ++hour) {
    const bool given = static_cast<std::size_t>(hour) < pairs.size();
    text += HourLine(reference, kLabels[hour], given ? pairs[hour].first : L"", given ? pairs[hour].second : L"");
  }
  return text;
}

}  // namespace

TEST_CASE("tidal stream tables byte for byte: high water, low water, no reference, a short list") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);

  REQUIRE(m.panel.FillObject(scene.Object(L"high").Get(), true, false) == S_OK);
  const std::wstring high = Table(L"Brest, Goulet HW(HighWater)", L"HW",
                                  {{L"060", L"1.2"}, {L"065", L"2.1"}, {L"068", L"2.9"}, {L"070", L"3.4"},
                                   {L"070", L"3.6"}, {L"068", L"3.1"}, {L"000", L"0.3"}, {L"250", L"2.2"},
                                   {L"248", L"3.0"}, {L"248", L"3.4"}, {L"250", L"3.3"}, {L"250", L"2.6"},
                                   {L"245", L"1.4"}});
  CHECK(m.Rows() == Names{std::wstring(kName) + L"\t" + high});

  m.panel.Clear();
  REQUIRE(m.panel.FillObject(scene.Object(L"low").Get(), true, false) == S_OK);
  const std::wstring low = Table(L"Brest, Goulet LW(LowWater)", L"LW",
                                 {{L"240", L"1.0"}, {L"245", L"1.9"}, {L"248", L"2.5"}, {L"250", L"2.8"},
                                  {L"250", L"2.6"}, {L"248", L"1.7"}, {L"180", L"0.2"}, {L"070", L"1.6"},
                                  {L"068", L"2.4"}, {L"068", L"2.9"}, {L"070", L"2.7"}, {L"070", L"2.0"},
                                  {L"065", L"1.1"}});
  CHECK(m.Rows() == Names{std::wstring(kName) + L"\t" + low});

  // No reference: empty brackets, the hours without it.
  m.panel.Clear();
  REQUIRE(m.panel.FillObject(scene.Object(L"no-reference").Get(), true, false) == S_OK);
  const std::wstring none = Table(L"Brest, Goulet ()", L"",
                                  {{L"060", L"1.2"}, {L"065", L"2.1"}, {L"068", L"2.9"}, {L"070", L"3.4"},
                                   {L"070", L"3.6"}, {L"068", L"3.1"}, {L"000", L"0.3"}, {L"250", L"2.2"},
                                   {L"248", L"3.0"}, {L"248", L"3.4"}, {L"250", L"3.3"}, {L"250", L"2.6"},
                                   {L"245", L"1.4"}});
  CHECK(m.Rows() == Names{std::wstring(kName) + L"\t" + none});

  // Six fields: every line still there, the missing cells empty; the data's "%s" printed.
  m.panel.Clear();
  REQUIRE(m.panel.FillObject(scene.Object(L"short").Get(), true, false) == S_OK);
  const std::wstring shortList = Table(L"%s%n, Goulet HW(HighWater)", L"HW", {{L"060", L"1.2"}, {L"065", L""}});
  CHECK(m.Rows() == Names{std::wstring(kName) + L"\t" + shortList});
}

TEST_CASE("the stacked panel shows the same table; databases of another kind keep the formatter's text") {
  MountedPanel<cP_SHPanel> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillObject(scene.Object(L"short").Get(), true, false) == S_OK);
  CHECK(m.Rows() == Names{kName, Table(L"%s%n, Goulet HW(HighWater)", L"HW", {{L"060", L"1.2"}, {L"065", L""}})});

  m.panel.Clear();
  REQUIRE(m.panel.FillObject(scene.Object(L"own").Get(), true, false) == S_OK);
  CHECK(m.Rows() == Names{kName, L"Brest,Goulet,HW,060,1.2"});
}
