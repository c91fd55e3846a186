// Light abbreviations: characteristics with their groups, colours, periods, heights,
// ranges and sectors as charts print them, and the parts left out for missing or bad values.
#include <doctest/doctest.h>

#include <cmath>
#include <limits>
#include <string>

#include "frame/format/number_format.h"
#include "inspector/format/light_abbreviation.h"

using namespace br::inspector;

namespace {

const std::string kDeg = "\xB0";

LightValues Light(long characteristic, const char* group, std::vector<long> colours, double period) {
  LightValues light;
  light.characteristic = characteristic;
  light.signalGroup = group;
  light.colours = std::move(colours);
  light.period = period;
  return light;
}

}  // namespace

TEST_CASE("characteristic, group, colour and period joined as charts write them") {
  LightValues light = Light(2, "(2)", {3}, 6);
  light.height = 12;
  light.range = 5;
  CHECK(LightAbbreviation(light) == "Fl(2)R.6s12m5M");

  CHECK(LightAbbreviation(Light(7, "()", {1, 3, 4}, 4)) == "Iso.WRG.4s");
  CHECK(LightAbbreviation(Light(2, "", {3}, 4)) == "Fl.R.4s");
  CHECK(LightAbbreviation(Light(4, "(3)", {}, 10)) == "Q(3)10s");
  CHECK(LightAbbreviation(Light(8, "(2+1)", {1}, 15)) == "Oc(2+1)W.15s");
  CHECK(LightAbbreviation(Light(2, "(1)", {4}, 2.5)) == "Fl.G.2.5s");          // a single flash is not written
  CHECK(LightAbbreviation(Light(12, "(U)", {1}, 15)) == "Mo(U)W.15s");
  CHECK(LightAbbreviation(Light(12, "(1)", {1}, 15)) == "Mo(1)W.15s");          // a Morse figure always is
  CHECK(LightAbbreviation(Light(25, "(6)(1)", {1}, 15)) == "Q(6)+LFl.W.15s");  // each part its group
  CHECK(LightAbbreviation(Light(25, "(6)", {1}, 15)) == "Q(6)+LFl.W.15s");
  CHECK(LightAbbreviation(Light(19, "()", {1, 3}, 5)) == "Al.Fl.WR.5s");
  CHECK(LightAbbreviation(Light(5, "()", {2, 6, 2}, 0.5)) == "VQ.BYB.0.5s");

  // Fixed lights have no period.
  LightValues fixed;
  fixed.characteristic = 1;
  fixed.colours = {3};
  fixed.height = 8.5;
  fixed.range = 3;
  CHECK(LightAbbreviation(fixed) == "F.R8.5m3M");
}

TEST_CASE("directional lights and sectors") {
  LightValues light = Light(8, "(2)", {1}, 12);
  light.height = 56;
  light.range = 19;
  light.sectorOne = 219;
  light.sectorTwo = 259;
  CHECK(LightAbbreviation(light) == "Oc(2)W.12s56m19M 219" + kDeg + "-259" + kDeg);

  light.sectorOne = 50;
  light.sectorTwo = 70.5;
  light.categories = {5, 1};
  CHECK(LightAbbreviation(light) == "DirOc(2)W.12s56m19M 050" + kDeg + "-070.5" + kDeg);

  // Bearings wrap into 0..360; one sector limit alone is no sector.
  light.categories.clear();
  light.sectorOne = 365;
  light.sectorTwo = -10;
  CHECK(LightAbbreviation(light).substr(17) == "005" + kDeg + "-350" + kDeg);
  light.sectorTwo.reset();
  CHECK(LightAbbreviation(light) == "Oc(2)W.12s56m19M");
}

TEST_CASE("missing, unknown and bad values leave their part out") {
  CHECK(LightAbbreviation(LightValues{}).empty());
  CHECK(LightAbbreviation(Light(99, "(2)", {99}, 6)) == "6s");  // unknown codes write nothing
  CHECK(LightAbbreviation(Light(2, "(2", {3}, 6)) == "Fl.R.6s");  // unclosed group
  CHECK(LightAbbreviation(Light(2, "()", {3}, br::NO_VALUE)) == "Fl.R");
  CHECK(LightAbbreviation(Light(2, "()", {3}, std::nan(""))) == "Fl.R");
  CHECK(LightAbbreviation(Light(2, "()", {3}, -4)) == "Fl.R");
  CHECK(LightAbbreviation(Light(2, "()", {3}, 0)) == "Fl.R");

  LightValues light = Light(2, "()", {4}, 3);
  light.height = std::numeric_limits<double>::infinity();
  light.range = br::NO_VALUE;
  CHECK(LightAbbreviation(light) == "Fl.G.3s");
  light.height = 10.04;  // one decimal at most
  light.range = 7.26;
  CHECK(LightAbbreviation(light) == "Fl.G.3s10m7.3M");

  LightValues onlySector;
  onlySector.sectorOne = 10;
  onlySector.sectorTwo = 20;
  CHECK(LightAbbreviation(onlySector) == "010" + kDeg + "-020" + kDeg);
}

TEST_CASE("signal groups: the bracketed texts, nothing outside or unclosed") {
  CHECK(SignalGroups("()") == std::vector<std::string>{""});
  CHECK(SignalGroups("(6)(1)") == std::vector<std::string>{"6", "1"});
  CHECK(SignalGroups("x(2)y(") == std::vector<std::string>{"2"});
  CHECK(SignalGroups("").empty());
}
