// The tidefiles command line: build/check/dump on disk, predict, bad arguments, malformed JSON, missing files.
#include <doctest/doctest.h>

#include <filesystem>
#include <fstream>

#include <nlohmann/json.hpp>

#include "tests/native/tools/tidefiles/tidefiles_test_support.h"

using namespace br::tidefiles::test;
using br::tides::testing::TempFolder;
using Json = nlohmann::json;

namespace {

// A mean-level-only station, an M2-only one and one at 10 30'S 5 15'W.
const char kStations[] = R"([
  {"name": "Level", "latitude": 50, "longitude": -4, "zone": 0, "mean_level": 1.234, "constituents": []},
  {"name": "Semidiurnal", "latitude": 0, "longitude": 0, "zone": 0, "mean_level": 0,
   "constituents": [{"name": "M2", "amplitude": 1, "phase": 0}]},
  {"name": "South", "latitude": -10.5, "longitude": -5.25, "zone": -1, "mean_level": 2,
   "constituents": [{"name": "M2", "amplitude": 0.5, "phase": 40}, {"name": "K1", "amplitude": 0.25, "phase": 200}]}])";

}  // namespace

TEST_CASE("build, check, dump and predict on disk; every failure and bad command line is reported") {
  TempFolder tmp;
  const auto json = tmp.path() / "stations.json";
  std::ofstream(json, std::ios::binary) << kStations;
  const std::string folder = (tmp.path() / "folder").string(), absent = (tmp.path() / "absent").string();
  const ToolRun build = RunTool({"build", json.string(), folder});
  CHECK((build.status == 0 && build.out == "wrote 3 stations to " + folder + ", 0 warnings\n"));
  CHECK(RunTool({"check", folder}).out == "ok: 3 stations\n");
  const ToolRun dump = RunTool({"dump", folder});
  const Json stations = Json::parse(dump.out);
  CHECK((dump.status == 0 && stations.size() == 3 && stations[2]["name"] == "South" && stations[2]["zone"] == -1 &&
         stations[2]["constituents"][1]["name"] == "K1"));
  // Standard input works as the JSON source; a refused build lists every error and leaves the folder untouched.
  const ToolRun bad = RunTool({"build", "-", folder}, R"([{"name": "X"}])");
  CHECK((bad.status == 1 && bad.err.find("nothing written (4 errors)") != std::string::npos));

  auto predictJson = [&](std::vector<std::string> args) {
    args.insert(args.begin(), {"predict", folder, "--json"});
    const ToolRun run = RunTool(args);
    REQUIRE_MESSAGE(run.status == 0, run.err);
    return Json::parse(run.out);
  };
  // Found by position, sun events in zone time: sunrise about 06:24 UT at 5 15'W, shown an hour later.
  const Json day = predictJson({"--at", "-10.5", "-5.25", "--date", "2024-03-01", "--step", "6"});
  CHECK((day["name"] == "South" && day["zone"] == -1));
  const std::string sunrise = day["sun"]["sunrise"]["time"].get<std::string>();
  CHECK((sunrise > "06:00" && sunrise < "08:00" && day["sun"]["sunrise"]["day_offset"] == 0));
  // The table form: the worked M2 day of 1996-01-01 in metres (the engine suite checks its every value).
  const ToolRun table = RunTool({"predict", folder, "--station", "1", "--date", "1996-01-01"});
  CHECK(table.status == 0);
  for (const char* line : {"     2  02:00    -1.037", "lowest:  index 2 (02:00) -1.037 m", "sun (zone time): twilight begin"})
    CHECK_MESSAGE(table.out.find(line) != std::string::npos, line);

  // Malformed JSON is refused with every problem listed and nothing written.
  const auto station = [](const std::string& fields, const std::string& constituents) {
    return R"([{"name": "P", "latitude": 50.5, "longitude": -4.25, "zone": 0, )" + fields + R"("constituents": )" +
           constituents + "}]";
  };
  const std::vector<std::string> fromInput = {"build", "-", folder};
  const struct {
    std::vector<std::string> args;
    std::string input;
    const char* message;
    int status = 1;  // 2 for a bad command line, with the usage after the message
  } failures[] = {
      {{}, "", "no command given", 2},
      {{"frobnicate"}, "", "unknown command frobnicate", 2},
      {{"build", "only-one"}, "", "build needs STATIONS.json and FOLDER", 2},
      {{"predict", "f", "--station", "1", "--at", "1", "2", "--date", "2024-01-01"}, "", "either --station N or --at", 2},
      {{"predict", "f", "--station", "1"}, "", "needs --date", 2},
      {{"predict", "f", "--station", "0", "--date", "2023-02-29"}, "", "bad date \"2023-02-29\"", 2},
      {{"predict", "f", "--station", "0", "--date", "0099-01-01"}, "", "years 100 to 9999", 2},
      {{"predict", "f", "--station", "0", "--date", "2024-01-01", "--step", "nan"}, "", "bad step \"nan\" (hours from 0.001 to 24)", 2},
      {{"predict", "f", "--station", "0", "--date", "2024-01-01", "--step", "0.00001"}, "", "bad step", 2},
      {{"predict", "f", "--at", "91", "0", "--date", "2024-01-01"}, "", "--at needs LAT", 2},
      {fromInput, "[", "not valid JSON"},
      {fromInput, "[1]", "station 0: is not a JSON object"},
      {fromInput, R"([{"latitude": 1, "longitude": 2, "zone": 0, "constituents": []}])", "has no \"name\""},
      {fromInput, R"([{"name": "A", "latitude": 1, "longitude": 2, "zone": 0}])", "no \"constituents\""},
      {fromInput, R"([{"name": "A", "latitude": 90.5, "longitude": 2, "zone": 0, "constituents": []}])", "\"latitude\" must be"},
      {fromInput, R"([{"name": "A", "latitude": 1, "longitude": 2, "zone": 0.5, "constituents": []}])", "\"zone\" must be"},
      {fromInput, station("", R"([{"amplitude": 1, "phase": 0}])"), "neither \"name\" nor \"number\""},
      {fromInput, station("", R"([{"name": "M2", "number": 36, "amplitude": 1, "phase": 0}])"), "is not table row 36"},
      {fromInput, station(R"("mean_level": 1, )", R"([{"name": "Z0", "amplitude": 1, "phase": 0}])"), "mean level is given twice"},
      {{"build", absent + ".json", folder}, "", "absent.json: cannot open"},
      {{"check", absent}, "", "absent: not a folder"},  // on standard output, as the check's problems
      {{"predict", absent, "--station", "0", "--date", "2024-01-01"}, "", "cannot open the station folder"},
      {{"predict", std::string(241, 'x'), "--station", "0", "--date", "2024-01-01"}, "", "longer than 240 characters"},
      {{"predict", folder, "--station", "3", "--date", "2024-01-01"}, "", "no station 3 (station numbers 0 to 2)"},
      {{"predict", folder, "--at", "1N", "1E", "--date", "2024-01-01"}, "", "no station at 01\xC2\xB0" "00'N 001\xC2\xB0" "00'E"},
  };
  for (const auto& f : failures) {
    const ToolRun run = RunTool(f.args, f.input);
    CHECK_MESSAGE(run.status == f.status, f.message);
    const bool onOut = !f.args.empty() && f.args[0] == "check" && f.status == 1;
    CHECK_MESSAGE((onOut ? run.out : run.err).find(f.message) != std::string::npos, f.message, "\n", run.err);
    if (f.status == 2) CHECK(run.err.find("usage: tidefiles") != std::string::npos);
  }
  CHECK(RunTool({"check", folder}).out == "ok: 3 stations\n");
}

TEST_CASE("predict gives the sun as the library publishes it, marks other days and refuses a damaged folder") {
  // Reykjavik at midsummer: the sun sets after midnight and never reaches -12 degrees.
  // A station kept on UTC-8 at Greenwich: its morning falls on the day before.
  TempFolder tmp;
  const std::string folder = (tmp.path() / "folder").string();
  const ToolRun build = RunTool({"build", "-", folder}, R"([
    {"name": "Reykjavik", "latitude": 64.15, "longitude": -21.933333, "zone": 0, "mean_level": 2, "constituents": []},
    {"name": "Wrong zone", "latitude": 0, "longitude": 0, "zone": 8, "mean_level": 1,
     "constituents": [{"name": "M2", "amplitude": 1, "phase": 0}]}])");
  REQUIRE(build.status == 0);

  const ToolRun reykjavik = RunTool({"predict", folder, "--station", "0", "--date", "2026-06-21", "--step", "6"});
  CHECK(reykjavik.out.find("sun (zone time): twilight begin --:--, sunrise 02:55, sunset 00:04 (next day), twilight end --:--\n") !=
        std::string::npos);
  // Before, the engine's raw times: "twilight begin (-2, -40), sunrise (-1, -56)".
  const ToolRun shifted = RunTool({"predict", folder, "--at", "0", "0", "--date", "2000-03-20", "--step", "5"});
  CHECK(shifted.out.find("sun (zone time): twilight begin 21:19 (previous day), sunrise 22:03 (previous day), sunset 10:10, "
                         "twilight end 10:55\n") != std::string::npos);
  // A step that does not divide 24 hours ends in the next day.
  CHECK(shifted.out.find("     5  01:00 (next day)  ") != std::string::npos);
  const Json json = Json::parse(RunTool({"predict", folder, "--station", "0", "--date", "2026-06-21", "--json"}).out);
  CHECK((json["sun"]["day"] == "ordinary" && json["sun"]["twilight_begin"].is_null() && json["sun"]["twilight_end"].is_null()));
  CHECK((json["sun"]["sunset"]["time"] == "00:04" && json["sun"]["sunset"]["day_offset"] == 1));

  // A zone byte of 127 (UTC-127 hours): dump and predict fail and name the station.
  const auto data = tmp.path() / "folder" / "td_pnt.dat";
  std::string bytes;
  {
    std::ifstream in(data, std::ios::binary);
    bytes.assign(std::istreambuf_iterator<char>(in), {});
  }
  bytes[44] = 127;
  std::ofstream(data, std::ios::binary | std::ios::trunc) << bytes;
  const ToolRun dump = RunTool({"dump", folder});
  CHECK((dump.status == 1 && dump.err.find("tidefiles: dump: td_pnt.dat: station 0: zone description 127 is outside") != std::string::npos));
  const ToolRun predict = RunTool({"predict", folder, "--station", "1", "--date", "2026-06-21"});
  CHECK(predict.status == 1);
  CHECK(predict.err == "tidefiles: predict: " + folder + " is damaged: td_pnt.dat: station 0: zone description 127 is outside "
                       "-14..12 hours (UTC+14 to UTC-12)\n");
}
