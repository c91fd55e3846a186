#include <doctest/doctest.h>

#include "host/brtide/requests.h"

using namespace br::brtide;

namespace {

ParsedCommand Parsed(std::vector<std::string> args, const std::vector<CommandSpec>& commands = BrtideCommands()) {
  const ParseOutcome r = ArgumentParser(commands).Parse(args);
  REQUIRE(r.ok);
  return r.parsed;
}

}  // namespace

TEST_CASE("a ports request carries the box as given") {
  PortsRequest request;
  std::string error;
  REQUIRE(BuildPortsRequest(Parsed({"ports", "--folder", "w", "--box", "49N", "5W", "47.5", "-3"}), request, error));
  CHECK(request.folder == "w");
  CHECK((request.box.latMin == 49.0 && request.box.lonMin == -5.0 && request.box.latMax == 47.5 && request.box.lonMax == -3.0));

  CHECK_FALSE(BuildPortsRequest(Parsed({"ports", "--folder", "w", "--box", "91", "0", "1", "1"}), request, error));
  CHECK(error == "bad LATMIN \"91\" (degrees -90..90, or 48.5N)");
  CHECK_FALSE(BuildPortsRequest(Parsed({"ports", "--folder", "w", "--box", "1", "0", "2", "200"}), request, error));
  CHECK(error == "bad LONMAX \"200\" (degrees -180..180, or 4.5W)");
  CHECK_FALSE(BuildPortsRequest(Parsed({"ports", "--folder", "", "--box", "1", "0", "2", "2"}), request, error));
  CHECK(error == "the station folder name is empty");
}

TEST_CASE("a day request needs exactly one way to choose the station") {
  DayRequest request;
  std::string error;
  REQUIRE(BuildDayRequest(Parsed({"day", "--folder", "w", "--port", "12", "--date", "2024-05-01"}), request, error));
  CHECK((*request.port == 12 && !request.nearTo && request.step == 1.0 && !request.csv));
  CHECK((request.date.year == 2024 && request.date.month == 5 && request.date.day == 1));

  request = DayRequest();
  REQUIRE(BuildDayRequest(Parsed({"day", "--folder", "w", "--near", "48.4", "4.5W", "--date", "2024-05-01", "--step",
                                  "0.25", "--csv"}),
                          request, error));
  CHECK((!request.port && request.nearTo->latitude == 48.4 && request.nearTo->longitude == -4.5));
  CHECK((request.step == 0.25 && request.csv));

  CHECK_FALSE(BuildDayRequest(Parsed({"day", "--folder", "w", "--date", "2024-05-01"}), request, error));
  CHECK(error == "day needs either --port N or --near LAT LON");
  CHECK_FALSE(BuildDayRequest(Parsed({"day", "--folder", "w", "--port", "1", "--near", "1", "1", "--date", "2024-05-01"}),
                              request, error));
  CHECK(error == "day needs either --port N or --near LAT LON");
}

TEST_CASE("a day request names the value that is wrong") {
  DayRequest request;
  std::string error;
  CHECK_FALSE(BuildDayRequest(Parsed({"day", "--folder", "w", "--port", "1", "--date", "2024-02-30"}), request, error));
  CHECK(error == "bad date \"2024-02-30\" (a real day as YYYY-MM-DD)");
  CHECK_FALSE(BuildDayRequest(Parsed({"day", "--folder", "w", "--port", "x1", "--date", "2024-02-03"}), request, error));
  CHECK(error == "bad station number \"x1\" (a whole number from 0)");
  CHECK_FALSE(BuildDayRequest(Parsed({"day", "--folder", "w", "--near", "95", "1", "--date", "2024-02-03"}), request, error));
  CHECK(error == "bad LAT \"95\" (degrees -90..90, or 48.5N)");
  CHECK_FALSE(
      BuildDayRequest(Parsed({"day", "--folder", "w", "--port", "1", "--date", "2024-02-03", "--step", "0"}), request, error));
  CHECK(error == "bad step \"0\" (hours from 0.001 to 24)");
}

TEST_CASE("options of extra outputs reach the request untouched") {
  std::vector<CommandSpec> commands = BrtideCommands();
  AddDayOption(commands, {"--png", 1, "FILE", "", false, ""});
  DayRequest request;
  std::string error;
  REQUIRE(BuildDayRequest(Parsed({"day", "--folder", "w", "--port", "1", "--date", "2024-02-03", "--png", "c.png"}, commands),
                          request, error));
  REQUIRE(request.extras.size() == 1);
  CHECK(request.extras.at("--png") == std::vector<std::string>{"c.png"});
}
