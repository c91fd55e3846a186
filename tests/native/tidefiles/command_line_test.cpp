// The tidefiles command line: help, bad arguments, build/check/dump on disk, predict.
#include <doctest/doctest.h>

#include <filesystem>
#include <fstream>

#include <nlohmann/json.hpp>

#include "tests/native/tidefiles/tidefiles_test_support.h"

using namespace br::tidefiles::test;
using Json = nlohmann::json;

namespace {

void WriteText(const std::filesystem::path& path, const std::string& text) {
  std::ofstream out(path, std::ios::binary);
  out << text;
}

// A mean-level-only station, an M2-only one and one at 10 30'S 5 15'W.
const char kStations[] = R"([
  {"name": "Level", "latitude": 50, "longitude": -4, "zone": 0, "mean_level": 1.234, "constituents": []},
  {"name": "Semidiurnal", "latitude": 0, "longitude": 0, "zone": 0, "mean_level": 0,
   "constituents": [{"name": "M2", "amplitude": 1, "phase": 0}]},
  {"name": "South", "latitude": -10.5, "longitude": -5.25, "zone": -1, "mean_level": 2,
   "constituents": [{"name": "M2", "amplitude": 0.5, "phase": 40}, {"name": "K1", "amplitude": 0.25, "phase": 200}]}])";

Json PredictJson(const std::string& folder, std::vector<std::string> extra) {
  std::vector<std::string> args = {"predict", folder, "--json"};
  args.insert(args.end(), extra.begin(), extra.end());
  const ToolRun run = RunTool(args);
  REQUIRE_MESSAGE(run.status == 0, run.err);
  return Json::parse(run.out);
}

}  // namespace

TEST_CASE("help and bad command lines") {
  const ToolRun help = RunTool({"--help"});
  CHECK(help.status == 0);
  CHECK(help.out.find("Greenwich phase lag") != std::string::npos);
  CHECK(help.out.find("UTC+1 is -1") != std::string::npos);
  struct Case {
    std::vector<std::string> args;
    const char* message;
  };
  const Case cases[] = {
      {{}, "no command given"},
      {{"frobnicate"}, "unknown command frobnicate"},
      {{"build", "only-one"}, "build needs STATIONS.json and FOLDER"},
      {{"build", "--fast", "a", "b"}, "unknown option --fast"},
      {{"dump"}, "dump needs FOLDER"},
      {{"check", "a", "b"}, "check needs FOLDER"},
      {{"predict", "f", "--date", "2024-01-01"}, "either --station N or --at LAT LON"},
      {{"predict", "f", "--station", "1", "--at", "1", "2", "--date", "2024-01-01"}, "either --station N or --at"},
      {{"predict", "f", "--station", "1"}, "needs --date"},
      {{"predict", "--station", "1", "--date", "2024-01-01"}, "predict needs FOLDER"},
      {{"predict", "f", "--station", "-1", "--date", "2024-01-01"}, "--station needs"},
      {{"predict", "f", "--station"}, "--station needs"},
      {{"predict", "f", "--at", "91", "0", "--date", "2024-01-01"}, "--at needs"},
      {{"predict", "f", "--at", "1"}, "--at needs"},
      {{"predict", "f", "--station", "0", "--date", "2023-02-29"}, "--date needs"},
      {{"predict", "f", "--station", "0", "--date", "2024-01-01", "--step", "0"}, "--step needs"},
      {{"predict", "f", "--station", "0", "--date", "2024-01-01", "--step", "nan"}, "--step needs"},
      {{"predict", "f", "--station", "0", "--date", "2024-01-01", "--utc-offset", "15"}, "--utc-offset needs"},
      {{"predict", "f", "g", "--station", "0", "--date", "2024-01-01"}, "more than one FOLDER"},
  };
  for (const Case& c : cases) {
    const ToolRun run = RunTool(c.args);
    CHECK_MESSAGE(run.status == 2, c.message);
    CHECK_MESSAGE(run.err.find(c.message) != std::string::npos, c.message, "\n", run.err);
    CHECK(run.err.find("usage: tidefiles") != std::string::npos);
  }
}

TEST_CASE("build, check and dump a folder on disk") {
  TemporaryFolder tmp;
  const auto json = tmp.path() / "stations.json";
  WriteText(json, kStations);
  const std::string folder = (tmp.path() / "folder").string();
  const ToolRun build = RunTool({"build", json.string(), folder});
  CHECK((build.status == 0 && build.out == "wrote 3 stations to " + folder + ", 0 warnings\n"));
  CHECK(std::filesystem::file_size(tmp.path() / "folder" / "td_num.ntx") == 30);
  CHECK_FALSE(std::filesystem::exists(tmp.path() / "folder" / "td_num.ntx.tmp"));

  const ToolRun check = RunTool({"check", folder});
  CHECK((check.status == 0 && check.out == "ok: 3 stations\n"));

  const ToolRun dump = RunTool({"dump", folder});
  CHECK(dump.status == 0);
  const Json stations = Json::parse(dump.out);
  REQUIRE(stations.size() == 3);
  CHECK((stations[2]["name"] == "South" && stations[2]["zone"] == -1 && stations[2]["constituents"][1]["name"] == "K1"));

  // Standard input works as the JSON source, and errors leave the folder untouched.
  CHECK(RunTool({"build", "-", (tmp.path() / "other").string()}, kStations).status == 0);
  const ToolRun bad = RunTool({"build", "-", folder}, R"([{"name": "X"}])");
  CHECK((bad.status == 1 && bad.err.find("nothing written (4 errors)") != std::string::npos));
  CHECK(RunTool({"check", folder}).out == "ok: 3 stations\n");
}

TEST_CASE("missing files and folders are reported, never crash") {
  TemporaryFolder tmp;
  const std::string absent = (tmp.path() / "absent").string();
  const struct {
    std::vector<std::string> args;
    bool onOut;
    const char* message;
  } cases[] = {
      {{"build", absent + ".json", tmp.str()}, false, "absent.json: cannot open"},
      {{"check", absent}, true, "absent: not a folder"},
      {{"check", tmp.str()}, true, "td_num.ntx: cannot read"},
      {{"dump", tmp.str()}, false, ""},
      {{"predict", tmp.str(), "--station", "0", "--date", "2024-01-01"}, false, "cannot open the station folder"},
      {{"predict", std::string(241, 'x'), "--station", "0", "--date", "2024-01-01"}, false, "longer than 240 characters"},
  };
  for (const auto& c : cases) {
    const ToolRun run = RunTool(c.args);
    CHECK_MESSAGE(run.status == 1, c.message);
    CHECK_MESSAGE((c.onOut ? run.out : run.err).find(c.message) != std::string::npos, c.message);
  }
}

TEST_CASE("predict prints a day in metres with its extremes and sun events") {
  TemporaryFolder tmp;
  const std::string folder = tmp.str();
  REQUIRE(RunTool({"build", "-", folder}, kStations).status == 0);

  SUBCASE("a station found by position, with its zone time sun events") {
    const Json day = PredictJson(folder, {"--at", "-10.5", "-5.25", "--date", "2024-03-01", "--step", "6"});
    CHECK((day["name"] == "South" && day["zone"] == -1));
    CHECK(day["latitude"].get<double>() == doctest::Approx(-10.5));
    const int sunrise = day["sun"]["sunrise"]["hour"].get<int>() * 60 + day["sun"]["sunrise"]["minute"].get<int>();
    CHECK((sunrise > 6 * 60 && sunrise < 8 * 60));  // about 06:24 UT at 5 15'W, shown an hour later
  }
  SUBCASE("a UTC-5 computer's day is the UTC day from 05:00") {
    const Json utc = PredictJson(folder, {"--station", "2", "--date", "2024-03-01"});
    const Json west = PredictJson(folder, {"--station", "2", "--date", "2024-03-01", "--utc-offset", "-5"});
    for (int k = 0; k + 5 < 25; ++k)
      CHECK(west["heights"][k].get<double>() == doctest::Approx(utc["heights"][k + 5].get<double>()).epsilon(1e-3));
  }
  SUBCASE("the table form: the worked M2 day of 1996-01-01 in metres (the engine suite checks its every value)") {
    const ToolRun run = RunTool({"predict", folder, "--station", "1", "--date", "1996-01-01"});
    CHECK(run.status == 0);
    for (const char* line : {"Semidiurnal", "     2  02:00    -1.037", "lowest:  index 2 (02:00) -1.037 m",
                             "sun (zone time): twilight begin"})
      CHECK_MESSAGE(run.out.find(line) != std::string::npos, line);
  }
  SUBCASE("no such station") {
    const ToolRun number = RunTool({"predict", folder, "--station", "3", "--date", "2024-01-01"});
    CHECK((number.status == 1 && number.err.find("no station number 3 (the folder has 3 stations") != std::string::npos));
    const ToolRun position = RunTool({"predict", folder, "--at", "1", "1", "--date", "2024-01-01"});
    CHECK((position.status == 1 && position.err.find("no station at latitude 60', longitude 60'") != std::string::npos));
  }
  SUBCASE("a step too small for a day") {
    const ToolRun run = RunTool({"predict", folder, "--station", "0", "--date", "2024-01-01", "--step", "0.00001"});
    CHECK((run.status == 1 && run.err.find("at most 1000000 samples") != std::string::npos));
  }
}
