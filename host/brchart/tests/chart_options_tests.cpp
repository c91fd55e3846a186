#include <doctest/doctest.h>

#include <sstream>

#include "host/brchart/chart_options.h"

using namespace br::brchart;

TEST_CASE("brchart options: scene, components, clicks and the picture") {
  ChartOptions o;
  std::string error;
  REQUIRE(ParseChartOptions({"--scene", "C:\\charts\\brest.json", "--projection", "overview", "--palette", "dusk",
                             "--colormap", "day", "--presparams", "two-shades", "--click", "512,384", "--click",
                             "-3 7", "--screenshot", "chart.png", "--catalogue", "Z:\\usr\\share\\gdal", "--select", "fillettes-beacon",
                             "--tab", "Tidal stream"},
                            o, error));
  CHECK(o.scene == "C:\\charts\\brest.json");
  CHECK(o.projection == "overview");
  CHECK(o.palette == "dusk");
  CHECK(o.colorMap == "day");
  CHECK(o.presParams == "two-shades");
  CHECK(o.catalogue == "Z:\\usr\\share\\gdal");
  CHECK(o.screenshot == "chart.png");
  CHECK(o.select == "fillettes-beacon");
  CHECK(o.tab == "Tidal stream");
  REQUIRE(o.clicks.size() == 2);
  CHECK((o.clicks[0].x == 512 && o.clicks[0].y == 384));
  CHECK((o.clicks[1].x == -3 && o.clicks[1].y == 7));
  CHECK_FALSE(o.help);

  ChartOptions none;
  REQUIRE(ParseChartOptions({}, none, error));
  CHECK(none.scene.empty());
  CHECK(none.clicks.empty());
  ChartOptions help;
  REQUIRE(ParseChartOptions({"-h"}, help, error));
  CHECK(help.help);
}

TEST_CASE("brchart options: wrong command lines are refused with a message") {
  const std::pair<std::vector<std::string>, const char*> refused[] = {
      {{"--scene"}, "--scene wants a value"},
      {{"--screenshot", ""}, "--screenshot wants a value"},
      {{"--click", "12"}, "--click wants X,Y in pixels of the chart"},
      {{"--click", "1,2,3"}, "--click wants X,Y in pixels of the chart"},
      {{"--click", "1.5,2"}, "--click wants X,Y in pixels of the chart"},
      {{"--click", "x,2"}, "--click wants X,Y in pixels of the chart"},
      {{"--click", "200000,2"}, "--click wants X,Y in pixels of the chart"},
      {{"--click", "-,2"}, "--click wants X,Y in pixels of the chart"},
      {{"--select"}, "--select wants a value"},
      {{"--tab", ""}, "--tab wants a value"},
      {{"--selected", "x"}, "unknown option --selected (brchart --help lists them)"},
      {{"chart.json"}, "unknown option chart.json (brchart --help lists them)"},
  };
  for (const auto& [arguments, message] : refused) {
    ChartOptions o;
    std::string error;
    CAPTURE(arguments.front());
    CHECK_FALSE(ParseChartOptions(arguments, o, error));
    CHECK(error == message);
  }
  ChartClick click;
  CHECK(ParseClick(" 10 , 20 ", click));
  CHECK((click.x == 10 && click.y == 20));
}

TEST_CASE("brchart usage names every option and the exit codes") {
  std::ostringstream out;
  WriteChartUsage(out);
  const std::string text = out.str();
  for (const char* word : {"--scene", "--projection", "--colormap", "--palette", "--presparams", "--catalogue",
                           "--click", "--select", "--tab", "--screenshot", "--help", "Exit codes: 0"}) {
    CAPTURE(word);
    CHECK(text.find(word) != std::string::npos);
  }
}
