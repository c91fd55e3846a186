// brtide's commands on station folders this suite writes: the printed values are checked
// against the same day read from TidesPort directly, and every failure against its exit
// status and its one-line message.
#include <doctest/doctest.h>

#include <windows.h>

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
const char kDegree[] = "\xC2\xB0";

// Constituent records are {number, phase in tenths of a degree, amplitude in millimetres}.
// Station 0 is the engine's worked day: M2 alone, amplitude 1.000, phase 0.
const std::vector<TestStation> kStations = {
    {"Worked M2", 3000, -240, 0, {{0, 0, 0}, {kM2, 0, 1000}}},
    {"Zone Port", 600, 1200, -1, {{0, 0, 2500}, {kM2, 900, 1500}}},
    {"Fjord", 4680, 900, -1, {{0, 0, 1000}, {kM2, 1800, 500}}},
    {"Br\xEAhat", 2931, -190, -1, {{0, 0, 5800}, {kM2, 1200, 3000}}},
    {"Ghost", 3030, -250, 0, {{0, 0, 1000}, {kM2, 0, 500}}},  // its block is cut short
};

bool HasLine(const std::vector<std::string>& lines, const std::string& wanted) {
  for (const std::string& line : lines) {
    if (line == wanted) return true;
  }
  return false;
}

std::string Fixed3(double value) {
  char text[32];
  std::snprintf(text, sizeof text, "%.3f", value);
  return text;
}

std::string Clock(double dayCountDate) {
  const double fraction = dayCountDate - static_cast<double>(static_cast<long long>(dayCountDate));
  const long minutes = std::lround(fraction * 1440.0);
  char text[16];
  std::snprintf(text, sizeof text, "%02ld:%02ld", minutes / 60, minutes % 60);
  return text;
}

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

// One day as TidesPort gives it, read in this process through the registered library.
struct PortDay {
  std::vector<double> heights;
  long maxIndex = 0, minIndex = 0, zone = 0;
  double maxValue = 0, minValue = 0;
  double beginTwilight = 0, sunrise = 0, sunset = 0, endTwilight = 0;
};

PortDay ReadPortDay(long station, double step, double date) {
  REQUIRE(SUCCEEDED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED)));
  PortDay day;
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
  day.heights.resize(static_cast<std::size_t>(count));
  for (long k = 0; k < count; ++k) REQUIRE(port->get_WavePoint(k, &day.heights[static_cast<std::size_t>(k)]) == S_OK);
  REQUIRE(port->get_MaxValueIndex(&day.maxIndex) == S_OK);
  REQUIRE(port->get_MinValueIndex(&day.minIndex) == S_OK);
  REQUIRE(port->get_MaxValue(&day.maxValue) == S_OK);
  REQUIRE(port->get_MinValue(&day.minValue) == S_OK);
  REQUIRE(port->get_TimeZone(&day.zone) == S_OK);
  REQUIRE(port->get_BeginTwilight(&day.beginTwilight) == S_OK);
  REQUIRE(port->get_SunRise(&day.sunrise) == S_OK);
  REQUIRE(port->get_SunSet(&day.sunset) == S_OK);
  REQUIRE(port->get_EndTwilight(&day.endTwilight) == S_OK);
  port->Release();
  db->Release();
  CoUninitialize();
  return day;
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

// Day-count dates of the days used below.
constexpr double k1996_01_01 = 35065.0;
constexpr double k2024_03_20 = 45371.0;

}  // namespace

TEST_CASE("ports lists the stations strictly inside the box, with numbers, names and positions") {
  const std::string path = SharedFolder().str();
  // 48.5..51 N, 5 W..3 W: the worked station, Brehat and the cut one, not the others.
  const ProcessResult r = RunBrtide({"ports", "--folder", path, "--box", "51", "-3", "48.5", "-5"});
  CHECK(r.exitCode == 0);
  CHECK(r.err.empty());
  const std::vector<std::string> lines = TextLines(r.out);
  INFO(r.out);
  REQUIRE(lines.size() == 9);
  CHECK(lines[0] == "Folder  " + path + " (5 stations)");
  CHECK(lines[4] == std::string("     0  Worked M2             50") + kDegree + " 00'.000 N  004" + kDegree + " 00'.000 W");
  // The file's name is ANSI (0xEA); brtide prints UTF-8.
  CHECK(lines[5] == std::string("     3  Br\xC3\xAAhat                48") + kDegree + " 51'.000 N  003" + kDegree +
                        " 10'.000 W");
  // The cut station is listed by its index record, with no name.
  CHECK(lines[6] == std::string("     4                        50") + kDegree + " 30'.000 N  004" + kDegree + " 10'.000 W");
  CHECK(lines[8] == "3 stations in the box");
}

TEST_CASE("day prints the port's own extremes, sun times and zone") {
  const std::string path = SharedFolder().str();
  const PortDay port = ReadPortDay(1, 1.0, k2024_03_20);
  const ProcessResult r =
      RunBrtide({"day", "--folder", path, "--port", "1", "--date", "2024-03-20"});
  CHECK(r.exitCode == 0);
  CHECK(r.err.empty());
  const std::vector<std::string> lines = TextLines(r.out);
  REQUIRE(lines.size() == 12 + 25);
  CHECK(lines[0] == "Station   1  Zone Port");
  CHECK(lines[1] == std::string("Position  10") + kDegree + " 00'.000 N  020" + kDegree + " 00'.000 E");
  CHECK(port.zone == -1);
  CHECK(lines[2] == "Zone      -1 (station time UTC+01:00)");
  CHECK(lines[3] == "Date      2024-03-20");
  CHECK(lines[5] == "  twilight begins  " + Clock(port.beginTwilight));
  CHECK(lines[6] == "  sunrise          " + Clock(port.sunrise));
  CHECK(lines[7] == "  sunset           " + Clock(port.sunset));
  CHECK(lines[8] == "  twilight ends    " + Clock(port.endTwilight));
  // At 10 N, 20 E on the equinox the sun rises about 04:44 UT, 05:44 in zone UTC+1.
  CHECK(lines[6].substr(19, 4) == "05:4");
  char clock[16];
  std::snprintf(clock, sizeof clock, "%02ld:00", port.maxIndex);
  CHECK(lines[9] == "Highest   " + Fixed3(port.maxValue) + " m at " + clock);
  std::snprintf(clock, sizeof clock, "%02ld:00", port.minIndex);
  CHECK(lines[10] == "Lowest    " + Fixed3(port.minValue) + " m at " + clock);
  CHECK(lines[11] == "Heights   metres, every 1 hour, times in this computer's standard time UTC+00:00");
  for (std::size_t k = 0; k < 25; ++k) {
    CAPTURE(k);
    std::snprintf(clock, sizeof clock, "%02zu:00", k);
    CHECK(lines[12 + k].rfind("  " + std::string(clock) + "  " + std::string(8 - Fixed3(port.heights[k]).size(), ' ') +
                                  Fixed3(port.heights[k]),
                              0) == 0);
  }
}

TEST_CASE("CSV gives the port's heights at ISO local times, one row per point") {
  const std::string path = SharedFolder().str();
  const PortDay port = ReadPortDay(3, 0.5, k2024_03_20);
  const ProcessResult r = RunBrtide(
      {"day", "--folder", path, "--port", "3", "--date", "2024-03-20", "--step", "0.5", "--csv"});
  CHECK(r.exitCode == 0);
  CHECK(r.err.empty());
  const std::vector<CsvRow> rows = CsvRows(r.out);
  REQUIRE(rows.size() == 49);
  REQUIRE(port.heights.size() == 49);
  CHECK(rows[0].time == "2024-03-20T00:00:00+00:00");
  CHECK(rows[48].time == "2024-03-21T00:00:00+00:00");
  for (std::size_t k = 0; k < rows.size(); ++k) {
    CAPTURE(k);
    CHECK(std::fabs(rows[k].height - port.heights[k]) <= 0.0005 + 1e-9);  // printed to the millimetre
  }
  // Mean level 5.8 m with an M2 of 3 m: the day spans most of that range.
  CHECK(port.maxValue > 8.0);
  CHECK(port.minValue < 3.6);
}

TEST_CASE("the worked M2 day comes out with its known heights and extremes") {
  const std::string path = SharedFolder().str();
  const ProcessResult csv = RunBrtide({"day", "--folder", path, "--port", "0", "--date", "1996-01-01", "--csv"});
  REQUIRE(csv.exitCode == 0);
  const std::vector<CsvRow> rows = CsvRows(csv.out);
  REQUIRE(rows.size() == 25);
  CHECK(rows[0].height == doctest::Approx(-0.4984).epsilon(0.002));
  CHECK(rows[1].height == doctest::Approx(-0.8775).epsilon(0.002));
  CHECK(rows[2].height == doctest::Approx(-1.0368).epsilon(0.002));
  CHECK(rows[3].height == doctest::Approx(-0.9364).epsilon(0.002));

  const ProcessResult text = RunBrtide({"day", "--folder", path, "--port", "0", "--date", "1996-01-01"});
  REQUIRE(text.exitCode == 0);
  const std::vector<std::string> lines = TextLines(text.out);
  const PortDay port = ReadPortDay(0, 1.0, k1996_01_01);
  CHECK(port.minIndex == 2);
  CHECK(port.maxIndex == 21);
  CHECK(HasLine(lines, "Lowest    " + Fixed3(port.minValue) + " m at 02:00"));
  CHECK(HasLine(lines, "Highest   " + Fixed3(port.maxValue) + " m at 21:00"));
  CHECK(port.minValue == doctest::Approx(-1.0368).epsilon(0.002));
  CHECK(port.maxValue == doctest::Approx(1.0301).epsilon(0.002));
}

// The nearest station's line and the polar-day lines are worded in the native brtide
// tests; the choice of station and the polar days in the engine's.

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
  // The wording of each usage error is checked in the native brtide tests; here the exit
  // status, the one line on standard error and nothing on standard output.
  const Case cases[] = {
      {{"ports", "--folder", missing, "--box", "1", "1", "2", "2"}, 1, "brtide: no folder \"" + missing + "\""},
      {{"ports", "--folder", partial, "--box", "1", "1", "2", "2"},
       1,
       "brtide: \"" + partial + "\" is not a tide station folder (td_num.ntx, td_crd.ntx and td_pnt.dat, readable)"},
      {{"ports", "--folder", path, "--box", "0", "0", "1", "1"},
       1,
       "brtide: no station inside the box in \"" + path + "\" (5 stations)"},
      // Strict edges: a box whose edge runs through station 0 (50 N) leaves it out.
      {{"ports", "--folder", path, "--box", "50", "-4.5", "50.4", "-3.5"},
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
      {{}, 2, "brtide: no command given (try --help)"},
  };
  for (const Case& c : cases) {
    CAPTURE(c.message);
    const ProcessResult r = RunBrtide(c.args);
    CHECK(r.exitCode == c.status);
    CHECK(r.out.empty());
    CHECK(r.err == c.message + "\n");
  }
}

TEST_CASE("--help describes the commands and exits 0") {
  ProcessResult r = RunBrtide({"--help"});
  CHECK(r.exitCode == 0);
  CHECK(r.out.find("brtide day --folder F (--port N | --near LAT LON) --date YYYY-MM-DD [--step H] [--csv]") !=
        std::string::npos);
  r = RunBrtide({"ports", "--help"});
  CHECK(r.exitCode == 0);
  CHECK(r.out.rfind("usage: brtide ports --folder F --box LATMIN LONMIN LATMAX LONMAX\n", 0) == 0);
}
