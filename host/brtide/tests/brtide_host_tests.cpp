// brtide.exe under Wine: every failure on station folders this suite writes (damaged ones
// among them), and its high and low waters against the port sampled every 10 seconds.
// (Its day against TidesPort: the JScript example suite; the wording of usage errors and
// the texts: the native brtide tests.)
#include <doctest/doctest.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "host/brtide/tests/brtide_process.h"
#include "host/brtide/tests/sampled_turns.h"
#include "tests/common/station_writer.h"
#include "tests/wine/common/DllUnderTest.h"

using br::tides::testing::TempFolder;
using br::tides::testing::TestStation;

namespace {

// Writes byte values into a file at an offset.
void Patch(const std::filesystem::path& file, std::size_t at, const std::vector<std::uint8_t>& bytes) {
  std::string content;
  {
    std::ifstream in(file, std::ios::binary);
    content.assign(std::istreambuf_iterator<char>(in), {});
  }
  for (std::size_t i = 0; i < bytes.size(); ++i) content[at + i] = static_cast<char>(bytes[i]);
  std::ofstream(file, std::ios::binary | std::ios::trunc) << content;
}

struct Turn {
  double minutes;
  double height;
  bool high;
};

// The "tides" of brtide's JSON day: {"time": "YYYY-MM-DDTHH:MM:00+00:00", "height_m": H, "type": "high"}.
std::vector<Turn> JsonTides(const std::string& json) {
  std::vector<Turn> turns;
  const std::size_t tides = json.find("\"tides\": [");
  const std::size_t end = json.find(']', tides);
  for (std::size_t at = json.find("{\"time\": \"", tides); at < end; at = json.find("{\"time\": \"", at + 1)) {
    const std::string time = json.substr(at + 10, 25);
    const double minutes = std::stoi(time.substr(11, 2)) * 60.0 + std::stoi(time.substr(14, 2));
    const double height = std::strtod(json.c_str() + json.find("\"height_m\": ", at) + 12, nullptr);
    turns.push_back({minutes, height, json.compare(json.find("\"type\": \"", at) + 9, 4, "high") == 0});
  }
  return turns;
}

}  // namespace

TEST_CASE("every failure gives its exit status and one line on standard error") {
  // Constituent records are {number, phase in tenths of a degree, amplitude in millimetres}.
  const std::vector<TestStation> stations = {{"Worked M2", 3000, -240, 0, {{0, 0, 0}, {29, 0, 1000}}},
                                             {"Second", 3030, -250, 0, {{0, 0, 1000}, {29, 0, 500}}}};
  TempFolder folder("brtide"), incomplete("brtide_partial");
  br::tides::testing::WriteStationFolder(folder.path(), stations);
  br::tides::testing::WriteStationFolder(incomplete.path(), stations);
  std::filesystem::remove(incomplete.path() / "td_pnt.dat");
  const std::string path = folder.str(), missing = path + "\\missing", partial = incomplete.str();

  struct Case {
    std::vector<std::string> args;
    unsigned long status;
    std::string message;
  };
  const Case cases[] = {
      {{"ports", "--folder", missing, "--box", "1", "1", "2", "2"}, 1, "brtide: no folder \"" + missing + "\""},
      {{"ports", "--folder", partial, "--box", "1", "1", "2", "2"},
       1,
       "brtide: \"" + partial + "\" is not a tide station folder (td_num.ntx, td_crd.ntx and td_pnt.dat, readable)"},
      {{"ports", "--folder", path, "--box", "0", "0", "1", "1"},
       1,
       "brtide: no station inside the box in \"" + path + "\" (2 stations)"},
      {{"day", "--folder", path, "--port", "2", "--date", "2024-01-01"},
       1,
       "brtide: no station 2 in \"" + path + "\" (station numbers 0 to 1)"},
      {{"days", "--folder", path, "--port", "0", "--from", "2024-01-02", "--to", "2024-01-01"},
       2,
       "brtide: --to 2024-01-01 is before --from 2024-01-02"},
      {{"day", "--folder", path, "--port", "0", "--date", "2024-01-01", "--size", "300x200"},
       2,
       "brtide: --size goes with --png"},
      {{"day", "--folder", path, "--port", "0", "--date", "20240101"},
       2,
       "brtide: bad date \"20240101\" (a real day as YYYY-MM-DD, years 100 to 9999)"},
  };
  for (const Case& c : cases) {
    CAPTURE(c.message);
    const br::test::ProcessResult r = br::test::RunBrtide(c.args);
    CHECK(r.exitCode == c.status);
    CHECK(r.out.empty());
    CHECK(r.err == c.message + "\n");
  }

  // Damage to the second station's block (at byte 58: name 0..39, latitude 40, longitude
  // 42, zone 44, count 45, records from 46): the folder is refused, naming the station,
  // where the library would give heights and sun times from it or from its neighbour.
  const struct {
    std::size_t at;
    std::vector<std::uint8_t> bytes;
    std::string problem;
  } damage[] = {
      {44, {127}, "zone description 127 is outside -14..12 hours (UTC+14 to UTC-12)"},
      {40, {0xFF, 0x7F}, "header position (546\xC2\xB0" "07'N 004\xC2\xB0" "10'W) differs from its index record"},
      {45, {0xFF}, "constituent count -1 is outside 0..69"},
      {45, {127}, "constituent count 127 is outside 0..69"},
      {54, {0xFF, 0xFF}, "constituent record 1: phase 65535 is outside 0..3599 tenths of a degree"},
      {52, {99, 0}, "constituent record 1: number 99 is outside 0..68"},
      {2, {0x1B}, "name holds the control character ESC at byte 2"},
  };
  for (const auto& d : damage) {
    CAPTURE(d.problem);
    TempFolder damaged("brtide_damaged");
    br::tides::testing::WriteStationFolder(damaged.path(), stations);
    Patch(damaged.path() / "td_pnt.dat", 58 + d.at, d.bytes);
    const br::test::ProcessResult r = br::test::RunBrtide({"day", "--folder", damaged.str(), "--port", "1", "--date", "2024-01-01"});
    CHECK(r.exitCode == 1);
    CHECK(r.out.empty());
    const std::string start = "brtide: station 1 of \"" + damaged.str() + "\" is damaged: td_pnt.dat: station 1: " + d.problem;
    CHECK(r.err.compare(0, start.size(), start) == 0);
    CHECK(std::count(r.err.begin(), r.err.end(), '\n') == 1);
  }
}

TEST_CASE("high and low waters: within a minute and a centimetre of the port's curve every 10 seconds") {
  const char* source = std::getenv("BR_SOURCE_DIR");
  REQUIRE(source != nullptr);
  std::wstring world;
  for (const char* c = source; *c; ++c) world += static_cast<wchar_t>(*c == '/' ? '\\' : *c);
  world = L"Z:" + world + L"\\data\\world";
  const std::string worldPath(world.begin(), world.end());

  br::test::DllUnderTest dll;
  ITidesDatabase* database = br::test::OpenedDatabase(dll, world);
  // Brest (semidiurnal, 7 m springs), Reykjavik, Pensacola (diurnal), Galveston (mixed).
  double worstMinutes = 0.0, worstMetres = 0.0;
  int compared = 0;
  for (const long station : {1491L, 3133L, 630L, 743L}) {
    for (const char* date : {"2026-06-21", "2026-12-21"}) {
      CAPTURE(station);
      CAPTURE(date);
      const br::test::ProcessResult r =
          br::test::RunBrtide({"day", "--folder", worldPath, "--port", std::to_string(station), "--date", date, "--json"});
      REQUIRE(r.exitCode == 0);
      const std::vector<Turn> found = JsonTides(r.out);
      REQUIRE(!found.empty());

      ITidesPort* port = br::test::PortAt(database, station);
      const double day = date[5] == '0' ? 46194.0 : 46377.0;  // 2026-06-21, 2026-12-21
      REQUIRE(port->Calculate(10.0 / 3600.0, day) == S_OK);
      std::vector<double> curve(static_cast<std::size_t>(br::test::Points(port)));
      for (std::size_t k = 0; k < curve.size(); ++k) REQUIRE(port->get_WavePoint(static_cast<LONG>(k), &curve[k]) == S_OK);
      port->Release();
      const auto reference = br::brtide::test::SampledTurns(curve, 10.0 / 60.0);
      for (const auto& ref : reference) {
        if (ref.minutes < 2.0 || ref.minutes > 1438.0) continue;  // may be the next or previous day's
        const auto match = std::min_element(found.begin(), found.end(), [&](const Turn& a, const Turn& b) {
          return (a.high != ref.high) < (b.high != ref.high) ||
                 ((a.high != ref.high) == (b.high != ref.high) && std::fabs(a.minutes - ref.minutes) < std::fabs(b.minutes - ref.minutes));
        });
        CAPTURE(ref.minutes);
        CHECK(match->high == ref.high);
        // brtide prints whole minutes: the time it rounded is within a minute all the same.
        CHECK(std::fabs(match->minutes - ref.minutes) <= 1.0);
        CHECK(std::fabs(match->height - ref.height) <= 0.01);
        worstMinutes = std::max(worstMinutes, std::fabs(match->minutes - ref.minutes));
        worstMetres = std::max(worstMetres, std::fabs(match->height - ref.height));
        ++compared;
      }
      std::size_t inside = 0;
      for (const auto& ref : reference) inside += ref.minutes >= 2.0 && ref.minutes <= 1438.0;
      std::size_t shown = 0;
      for (const Turn& t : found) shown += t.minutes >= 3.0 && t.minutes <= 1437.0;
      CHECK(shown <= inside);
    }
  }
  database->Release();
  MESSAGE(compared << " high and low waters printed by brtide; largest differences " << worstMinutes * 60.0 << " s and "
                   << worstMetres * 1000.0 << " mm from the 10-second curve");
  CHECK(compared >= 20);
}
