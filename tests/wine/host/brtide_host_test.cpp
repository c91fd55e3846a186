// brtide's commands on station folders this suite writes: the printed values are checked
// against the same day read from TidesPort directly, and every failure against its exit
// status and its one-line message.
#include <doctest/doctest.h>

#include <windows.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include <filesystem>

#include "BR_Info.h"
#include "tests/native/engine/station_folder.h"
#include "tests/wine/host/brtide_process.h"

using br::test::ProcessResult;
using br::test::RunBrtide;
using br::test::TextLines;
using br::tides::testing::TempFolder;
using br::tides::testing::TestStation;

namespace {

constexpr std::int16_t kM2 = 29;

// Constituent records are {number, phase in tenths of a degree, amplitude in millimetres}.
// Station 4 is cut short; the others differ in position, zone and curve.
const std::vector<TestStation> kStations = {
    {"Worked M2", 3000, -240, 0, {{0, 0, 0}, {kM2, 0, 1000}}},
    {"Zone Port", 600, 1200, -1, {{0, 0, 2500}, {kM2, 900, 1500}}},
    {"Fjord", 4680, 900, -1, {{0, 0, 1000}, {kM2, 1800, 500}}},
    {"Br\xEAhat", 2931, -190, -1, {{0, 0, 5800}, {kM2, 1200, 3000}}},
    {"Ghost", 3030, -250, 0, {{0, 0, 1000}, {kM2, 0, 500}}},  // its block is cut short
};

// The folder of kStations with the last station's block cut short, as a damaged copy might
// be: the library cannot find that station, so it has no name and no day. One folder serves
// the whole suite: the library opens station files once per process.
struct SuiteFolder {
  TempFolder folder{"brtide"};
  SuiteFolder() {
    br::tides::testing::WriteStationFolder(folder.path(), kStations);
    const std::filesystem::path data = folder.path() / "td_pnt.dat";
    br::tides::testing::TruncateFile(data, std::filesystem::file_size(data) - 3);
  }
};

const TempFolder& SharedFolder() {
  static const SuiteFolder shared;
  return shared.folder;
}

// One day's heights as TidesPort gives them, read in this process through the registered
// library.
std::vector<double> PortHeights(long station, double step, double date) {
  REQUIRE(SUCCEEDED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED)));
  std::vector<double> heights;
  ITidesDatabase* db = nullptr;
  REQUIRE(CoCreateInstance(CLSID_TidesDatabase, nullptr, CLSCTX_INPROC_SERVER, IID_ITidesDatabase,
                           reinterpret_cast<void**>(&db)) == S_OK);
  BSTR path = SysAllocString(SharedFolder().path().wstring().c_str());
  REQUIRE(db->Initialize(path) == S_OK);
  SysFreeString(path);
  IUnknown* unknown = nullptr;
  REQUIRE(db->GetPort(station, &unknown) == S_OK);
  REQUIRE(unknown);
  ITidesPort* port = nullptr;
  REQUIRE(unknown->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port)) == S_OK);
  unknown->Release();
  REQUIRE(port->Calculate(step, date) == S_OK);
  long count = 0;
  REQUIRE(port->get_NumPoints(&count) == S_OK);
  REQUIRE(count > 0);
  heights.resize(static_cast<std::size_t>(count));
  for (long k = 0; k < count; ++k) REQUIRE(port->get_WavePoint(k, &heights[static_cast<std::size_t>(k)]) == S_OK);
  port->Release();
  db->Release();
  CoUninitialize();
  return heights;
}

// (time, height) rows of brtide's CSV after its header.
struct CsvRow {
  std::string time;
  double height;
};

std::vector<CsvRow> CsvRows(const std::string& csv) {
  std::vector<std::string> lines = TextLines(csv);
  REQUIRE(!lines.empty());
  CHECK(lines.front() == "time,height_m");
  std::vector<CsvRow> rows;
  for (std::size_t i = 1; i < lines.size(); ++i) {
    const std::size_t comma = lines[i].find(',');
    REQUIRE(comma != std::string::npos);
    rows.push_back({lines[i].substr(0, comma), std::atof(lines[i].c_str() + comma + 1)});
  }
  return rows;
}

constexpr double k2024_03_20 = 45371.0;  // day-count date

}  // namespace

TEST_CASE("CSV gives the port's heights at ISO local times, one row per point") {
  const std::string path = SharedFolder().str();
  const std::vector<double> heights = PortHeights(3, 0.5, k2024_03_20);
  const ProcessResult r = RunBrtide(
      {"day", "--folder", path, "--port", "3", "--date", "2024-03-20", "--step", "0.5", "--csv"});
  CHECK(r.exitCode == 0);
  CHECK(r.err.empty());
  const std::vector<CsvRow> rows = CsvRows(r.out);
  REQUIRE(rows.size() == 49);
  REQUIRE(heights.size() == 49);
  CHECK(rows[0].time == "2024-03-20T00:00:00+00:00");
  CHECK(rows[48].time == "2024-03-21T00:00:00+00:00");
  for (std::size_t k = 0; k < rows.size(); ++k) {
    CAPTURE(k);
    CHECK(std::fabs(rows[k].height - heights[k]) <= 0.0005 + 1e-9);  // printed to the millimetre
  }
  // Mean level 5.8 m with an M2 of 3 m: the day spans most of that range.
  CHECK(*std::max_element(heights.begin(), heights.end()) > 8.0);
  CHECK(*std::min_element(heights.begin(), heights.end()) < 3.6);
}

TEST_CASE("every failure gives its exit status and one line on standard error") {
  const std::string path = SharedFolder().str();
  TempFolder incomplete("brtide_partial");
  br::tides::testing::WriteStationFolder(incomplete.path(), kStations);
  std::filesystem::remove(incomplete.path() / "td_pnt.dat");
  const std::string missing = path + "\\missing";
  const std::string partial = incomplete.str();

  struct Case {
    std::vector<std::string> args;
    unsigned long status;
    std::string message;
  };
  // The wording of each usage error, the listings, the day text and --help are checked in
  // the native brtide tests, the worked day in the engine's; here the exit status, the one
  // line on standard error and nothing on standard output, one usage error among them.
  const Case cases[] = {
      {{"ports", "--folder", missing, "--box", "1", "1", "2", "2"}, 1, "brtide: no folder \"" + missing + "\""},
      {{"ports", "--folder", partial, "--box", "1", "1", "2", "2"},
       1,
       "brtide: \"" + partial + "\" is not a tide station folder (td_num.ntx, td_crd.ntx and td_pnt.dat, readable)"},
      {{"ports", "--folder", path, "--box", "0", "0", "1", "1"},
       1,
       "brtide: no station inside the box in \"" + path + "\" (5 stations)"},
      {{"day", "--folder", path, "--port", "5", "--date", "2024-01-01"},
       1,
       "brtide: no station 5 in \"" + path + "\" (stations 0 to 4)"},
      {{"day", "--folder", path, "--port", "4", "--date", "2024-01-01"},
       1,
       "brtide: no tide day for station 4 \"\" on 2024-01-01 (the station's data or its sun times cannot be had)"},
      {{"day", "--folder", path, "--port", "0", "--date", "20240101"},
       2,
       "brtide: bad date \"20240101\" (a real day as YYYY-MM-DD)"},
  };
  for (const Case& c : cases) {
    CAPTURE(c.message);
    const ProcessResult r = RunBrtide(c.args);
    CHECK(r.exitCode == c.status);
    CHECK(r.out.empty());
    CHECK(r.err == c.message + "\n");
  }
}
