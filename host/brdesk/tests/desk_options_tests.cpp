#include <doctest/doctest.h>

#include <sstream>

#include "host/brdesk/desk_options.h"

using namespace br::brdesk;

TEST_CASE("brdesk options: brtide's rules for boxes, dates and positions") {
  DeskOptions o;
  std::string error;
  REQUIRE(ParseDeskOptions({"--folder", "C:\\world", "--box", "47", "-6", "49.5", "-3", "--date", "2024-02-29",
                            "--select", "3", "--screenshot", "desk.png"},
                           o, error));
  CHECK(o.folder == "C:\\world");
  CHECK((o.box[0] == 47.0 && o.box[1] == -6.0 && o.box[2] == 49.5 && o.box[3] == -3.0));
  CHECK((o.year == 2024 && o.month == 2 && o.day == 29));
  CHECK(o.select == 3);
  CHECK(o.screenshot == "desk.png");
  CHECK_FALSE(CrossesDateLine(o.box));

  // One argument with commas; hemisphere letters; latitudes in either order; a west edge
  // east of the east edge: the box across the 180th meridian, kept as given.
  DeskOptions one;
  REQUIRE(ParseDeskOptions({"--box", "56N,170E,50N,170W"}, one, error));
  CHECK((one.box[0] == 50.0 && one.box[1] == 170.0 && one.box[2] == 56.0 && one.box[3] == -170.0));
  CHECK(CrossesDateLine(one.box));

  const std::pair<std::vector<std::string>, const char*> refused[] = {
      {{"--date", "2023-02-29"}, "--date wants a real day as YYYY-MM-DD, years 100 to 9999"},
      {{"--date", "0099-12-31"}, "--date wants a real day as YYYY-MM-DD, years 100 to 9999"},
      {{"--box", "1 2 nan 4"}, "--box wants SOUTH WEST NORTH EAST in degrees (-90 to 90, -180 to 180, or 48.5N 4.5W)"},
      {{"--box", "91 0 40 1"}, "--box wants SOUTH WEST NORTH EAST in degrees (-90 to 90, -180 to 180, or 48.5N 4.5W)"},
      {{"--select", "-1"}, "--select wants a row number from 0"},
      {{"--select"}, "--select wants a row number from 0"},
      {{"--folder", ""}, "--folder wants a station folder"},
      {{"--zoom", "2"}, "unknown option --zoom (try --help)"},
  };
  for (const auto& [args, message] : refused) {
    DeskOptions kept;
    CHECK_FALSE(ParseDeskOptions(args, kept, error));
    CHECK(error == message);
  }

  DeskOptions help;
  REQUIRE(ParseDeskOptions({"--help"}, help, error));
  CHECK(help.help);
  std::ostringstream usage;
  WriteDeskUsage(usage);
  for (const char* option : {"--folder F", "--box S W N E", "--date", "--select N", "--screenshot FILE", "--help"})
    CHECK(usage.str().find(option) != std::string::npos);
}
