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
  const int sunrise = day["sun"]["sunrise"]["hour"].get<int>() * 60 + day["sun"]["sunrise"]["minute"].get<int>();
  CHECK((sunrise > 6 * 60 && sunrise < 8 * 60));
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
      {{"predict", "f", "--station", "0", "--date", "2023-02-29"}, "", "--date needs", 2},
      {{"predict", "f", "--station", "0", "--date", "2024-01-01", "--step", "nan"}, "", "--step needs", 2},
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
      {{"predict", folder, "--station", "3", "--date", "2024-01-01"}, "", "no station number 3 (the folder has 3 stations"},
      {{"predict", folder, "--at", "1", "1", "--date", "2024-01-01"}, "", "no station at latitude 60', longitude 60'"},
      {{"predict", folder, "--station", "0", "--date", "2024-01-01", "--step", "0.00001"}, "", "at most 1000000 samples"},
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
