#include <doctest/doctest.h>

#include "host/brtide/argument_parser.h"
#include "host/brtide/requests.h"
#include "host/brtide/usage.h"

#include <sstream>

using namespace br::brtide;

namespace {
ParseOutcome ParseLine(const std::vector<std::string>& args) { return ArgumentParser(BrtideCommands()).Parse(args); }
}  // namespace

TEST_CASE("a full day command line is split into its options") {
  const ParseOutcome r = ParseLine({"day", "--folder", "data/world", "--near", "-33.86", "151.2", "--date",
                                    "2024-05-01", "--step=0.5", "--csv"});
  REQUIRE(r.ok);
  CHECK((r.parsed.command == "day" && !r.parsed.help));
  CHECK((r.parsed.Value("--folder") == "data/world" && r.parsed.Value("--step") == "0.5"));
  CHECK(r.parsed.Values("--near") == std::vector<std::string>{"-33.86", "151.2"});
  CHECK((r.parsed.Has("--csv") && r.parsed.Values("--csv").empty() && !r.parsed.Has("--port")));
}

TEST_CASE("help is found anywhere and names the command it is about") {
  const ArgumentParser parser(BrtideCommands());
  ParseOutcome r = parser.Parse({"--help"});
  CHECK((r.ok && r.parsed.help && r.parsed.command.empty()));
  r = parser.Parse({"day", "--folder", "x", "-h"});
  CHECK((r.ok && r.parsed.help && r.parsed.command == "day"));
  r = parser.Parse({"help", "ports"});
  CHECK((r.ok && r.parsed.help && r.parsed.command == "ports"));
  // "help" as a value is a folder name, not a request for help.
  r = parser.Parse({"ports", "--folder", "help", "--box", "1", "2", "3", "4"});
  CHECK((r.ok && !r.parsed.help && r.parsed.Value("--folder") == "help"));
}

TEST_CASE("command line mistakes give one clear line each") {
  struct Case {
    std::vector<std::string> args;
    const char* error;
  };
  const Case cases[] = {
      {{}, "no command given (try --help)"},
      {{"tides"}, "unknown command \"tides\" (try --help)"},
      {{"ports", "--folder", "f", "--box", "1", "2", "3"}, "--box needs 4 values: LATMIN LONMIN LATMAX LONMAX"},
      {{"ports", "--folder", "--box", "1", "2", "3", "4"}, "--folder needs 1 value: F"},
      {{"ports", "--folder", "f", "--folder", "g", "--box", "1", "2", "3", "4"}, "--folder is given twice"},
      {{"ports", "--folder", "f", "--port", "1"}, "unknown option --port for ports (try ports --help)"},
      {{"ports", "--folder", "f", "stray"}, "unexpected argument \"stray\" for ports"},
      {{"ports", "--folder", "f"}, "ports needs --box LATMIN LONMIN LATMAX LONMAX"},
      {{"day", "--folder", "f", "--port", "1"}, "day needs --date YYYY-MM-DD"},
      {{"day", "--csv=yes"}, "--csv does not take \"=\""},
  };
  for (const Case& c : cases) {
    CAPTURE(c.error);
    const ParseOutcome r = ParseLine(c.args);
    CHECK_FALSE(r.ok);
    CHECK(r.error == c.error);
  }
}

TEST_CASE("an extra output's option joins the day command only") {
  std::vector<CommandSpec> commands = BrtideCommands();
  AddDayOption(commands, {"--png", 1, "FILE", "picture of the curve", false, ""});
  const ArgumentParser parser(commands);
  const ParseOutcome day = parser.Parse({"day", "--folder", "f", "--port", "3", "--date", "2024-01-01", "--png", "a.png"});
  REQUIRE(day.ok);
  CHECK(day.parsed.Value("--png") == "a.png");
  CHECK_FALSE(parser.Parse({"ports", "--folder", "f", "--box", "1", "2", "3", "4", "--png", "a.png"}).ok);

  std::ostringstream help;
  WriteUsage(parser.Commands(), parser.Find("day"), help);
  CHECK((help.str().find("[--png FILE]") != std::string::npos && help.str().find("picture of the curve") != std::string::npos));
}
