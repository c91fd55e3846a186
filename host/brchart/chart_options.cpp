#include "host/brchart/chart_options.h"

#include <cstdlib>
#include <sstream>

namespace br::brchart {

namespace {

bool ParsePixel(const std::string& text, long& value) {
  if (text.empty() || text.size() > 7) return false;
  std::size_t start = text[0] == '-' ? 1 : 0;
  if (start == text.size()) return false;
  for (std::size_t i = start; i < text.size(); ++i)
    if (text[i] < '0' || text[i] > '9') return false;
  value = std::strtol(text.c_str(), nullptr, 10);
  return value >= -100000 && value <= 100000;
}

}  // namespace

bool ParseClick(const std::string& text, ChartClick& click) {
  std::string spaced = text;
  for (char& c : spaced)
    if (c == ',') c = ' ';
  std::istringstream in(spaced);
  std::string x, y, more;
  if (!(in >> x >> y) || (in >> more)) return false;
  return ParsePixel(x, click.x) && ParsePixel(y, click.y);
}

bool ParseChartOptions(const std::vector<std::string>& arguments, ChartOptions& options, std::string& error) {
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    const std::string& name = arguments[i];
    auto value = [&](std::string& out) {
      if (i + 1 >= arguments.size() || arguments[i + 1].empty()) {
        error = name + " wants a value";
        return false;
      }
      out = arguments[++i];
      return true;
    };
    if (name == "--help" || name == "-h") {
      options.help = true;
    } else if (name == "--scene") {
      if (!value(options.scene)) return false;
    } else if (name == "--screenshot") {
      if (!value(options.screenshot)) return false;
    } else if (name == "--projection") {
      if (!value(options.projection)) return false;
    } else if (name == "--palette") {
      if (!value(options.palette)) return false;
    } else if (name == "--colormap") {
      if (!value(options.colorMap)) return false;
    } else if (name == "--presparams") {
      if (!value(options.presParams)) return false;
    } else if (name == "--select") {
      if (!value(options.select)) return false;
    } else if (name == "--tab") {
      if (!value(options.tab)) return false;
    } else if (name == "--catalogue") {
      if (!value(options.catalogue)) return false;
    } else if (name == "--click") {
      std::string text;
      ChartClick click;
      if (!value(text)) return false;
      if (!ParseClick(text, click)) {
        error = "--click wants X,Y in pixels of the chart";
        return false;
      }
      options.clicks.push_back(click);
    } else {
      error = "unknown option " + name + " (brchart --help lists them)";
      return false;
    }
  }
  return true;
}

void WriteChartUsage(std::ostream& out) {
  out << "brchart: a chart program's stand-in. It draws a chart scene and picks the objects\n"
         "under a click through the chart host's hit test.\n"
         "\n"
         "  brchart [options]\n"
         "\n"
         "  --scene FILE        the chart scene (default: the sample harbour beside the program)\n"
         "  --projection NAME   the scene's projection to draw in (default: its first)\n"
         "  --colormap NAME     the colour map (default: the scene's first)\n"
         "  --palette NAME      the palette (default: the one named like the colour map)\n"
         "  --presparams NAME   the presentation parameters: depth contours (default: the first)\n"
         "  --catalogue DIR     the folder of gdal-data's S-57 files (default: s57 beside the program)\n"
         "  --click X,Y         pick the objects at that pixel, as a click does; repeatable\n"
         "  --select NAME       select the object of that scene name (after any clicks)\n"
         "  --tab TITLE         bring the inspector's details tab of that title forward\n"
         "                      (\"Lights\", \"Tidal stream\", ...)\n"
         "  --screenshot FILE   write the chart as PNG and exit, without showing a window;\n"
         "                      the picked objects and the inspector's tree are printed\n"
         "  --help              this text\n"
         "\n"
         "Exit codes: 0 done, 1 the scene, a component or the picture failed, 2 a wrong command line.\n";
}

}  // namespace br::brchart
