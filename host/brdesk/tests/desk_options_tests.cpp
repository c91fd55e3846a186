#include <doctest/doctest.h>

#include "host/brdesk/desk_options.h"

using namespace br::brdesk;

TEST_CASE("brdesk options") {
  DeskOptions o;
  std::string error;
  REQUIRE(ParseDeskOptions({"--folder", "C:\\world", "--box", "47", "-6", "49.5", "-3", "--date", "2024-02-29",
                            "--select", "3", "--screenshot", "desk.png"},
                           o, error));
  CHECK(o.folder == "C:\\world");
  CHECK(o.box[0] == 47.0);
  CHECK(o.box[1] == -6.0);
  CHECK(o.box[2] == 49.5);
  CHECK(o.box[3] == -3.0);
  CHECK(o.year == 2024);
  CHECK(o.month == 2);
  CHECK(o.day == 29);
  CHECK(o.select == 3);
  CHECK(o.screenshot == "desk.png");

  DeskOptions one;
  REQUIRE(ParseDeskOptions({"--box", "10,20,30,40"}, one, error));
  CHECK(one.box[3] == 40.0);

  CHECK_FALSE(ParseDeskOptions({"--date", "2023-02-29"}, o, error));
  CHECK(error == "--date wants YYYY-MM-DD");
  CHECK_FALSE(ParseDeskOptions({"--box", "50 0 40 1"}, o, error));
  CHECK_FALSE(ParseDeskOptions({"--select", "-1"}, o, error));
  CHECK_FALSE(ParseDeskOptions({"--select"}, o, error));
  CHECK(error == "--select wants a row number from 0");
  CHECK_FALSE(ParseDeskOptions({"--zoom", "2"}, o, error));
  CHECK(error == "unknown option --zoom");
  CHECK_FALSE(ParseDeskOptions({"--box", "1 2 nan 4"}, o, error));
}
