// brchart's command line: the scene, the display components to use, pixels to click and
// the picture to write. Portable.
#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace br::brchart {

struct ChartClick {
  long x = 0;
  long y = 0;
};

struct ChartOptions {
  std::string scene;       // scene file ("" = the sample harbour beside the program)
  std::string projection;  // "" = the scene's first
  std::string palette;     // "" = the one named like the colour map, else the first
  std::string colorMap;    // "" = the scene's first
  std::string presParams;  // "" = the scene's first
  std::string catalogue;   // folder of the S-57 files ("" = looked for)
  std::vector<ChartClick> clicks;  // --click X,Y: pick there, as a click does
  std::string select;      // an object (by its scene name) to select, as after a pick
  std::string tab;         // the inspector's details tab to bring forward ("" = as it chooses)
  std::string screenshot;  // "" = interactive
  bool help = false;
};

// Exit codes of brchart.
constexpr int kExitOk = 0;
constexpr int kExitFailed = 1;  // the scene, a component or the picture failed
constexpr int kExitUsage = 2;   // the command line is wrong

// Parses the arguments after the program name. False with a one-line message on error.
bool ParseChartOptions(const std::vector<std::string>& arguments, ChartOptions& options, std::string& error);
// "X,Y" (or "X Y") in whole pixels, each within -100000..100000.
bool ParseClick(const std::string& text, ChartClick& click);

// brchart --help.
void WriteChartUsage(std::ostream& out);

}  // namespace br::brchart
