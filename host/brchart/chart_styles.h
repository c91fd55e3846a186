// How brchart draws each object class: fills, outlines, lines and point symbols, in the
// scene's colours where a chart colour number is mapped, in fixed colours elsewhere. A
// chart program has its own presentation library; this is a small, readable one. Portable.
#pragma once

#include <string>

#include "host/chartscene/model/scene_model.h"

namespace br::brchart {

struct Rgb {
  unsigned char red = 0, green = 0, blue = 0;
  friend bool operator==(const Rgb& a, const Rgb& b) {
    return a.red == b.red && a.green == b.green && a.blue == b.blue;
  }
};

enum class Mark { None, Fill, Outline, Line, Symbol };
enum class Symbol { Dot, Circle, Square, Cross, Flare, Diamond };
enum class Dash { Solid, Dashed, Dotted };

struct ClassStyle {
  Mark mark = Mark::None;
  long colourNumber = 0;  // chart colour number through the colour map (0: use `fixed`)
  Rgb fixed;              // the colour when the number is 0 or not mapped
  Dash dash = Dash::Solid;
  int width = 1;          // pen width, or the symbol's half size
  Symbol symbol = Symbol::Dot;
  bool byDepth = false;   // a depth area: the colour follows its shallowest depth
  int layer = 0;          // drawing order: fills 0, outlines 1, lines 2, symbols 3
};

// Chart colour numbers of the depth zones, shallow to deep, and of the sea around them.
constexpr long kShallowestWater = 21;
constexpr long kDeepWater = 28;

// The style of a class (acronym as the catalogue spells it) drawn with that primitive
// (1 point, 2 line, 3 area). Meta objects, collections and objects without geometry
// are not drawn (Mark::None).
ClassStyle StyleOf(const std::string& acronym, long primitive);

// The depth contours that decide a depth area's colour (metres).
struct DepthContours {
  double shallow = 2.0;
  double safety = 10.0;
  double deep = 30.0;
};
// From presentation parameters: 0 shallow, 1 safety, 2 deep (R4 or R8); absent values keep
// the defaults, and a safety contour outside shallow..deep is pulled inside.
DepthContours ContoursOf(const chartscene::ScenePresParamsModel* params);
// The colour number of a depth area whose shallowest depth is `depth`:
// 21 above the shallow contour, 31 above the safety contour, 29 above the deep one, 28 below.
long DepthColourNumber(double depth, const DepthContours& contours);

// A chart colour number through the colour map into the palette; `fallback` when either
// is missing or the number or index is not there.
Rgb ChartColour(const chartscene::SceneColorMapModel* map, const chartscene::ScenePaletteModel* palette,
                long number, Rgb fallback);

// The S-57 COLOUR value (1 white, 2 black, 3 red, 4 green, 5 blue, 6 yellow, ...) of a
// symbol; black for anything else.
Rgb S57Colour(unsigned value);

}  // namespace br::brchart
