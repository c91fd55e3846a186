#include "host/brchart/chart_styles.h"

#include <algorithm>
#include <cmath>

namespace br::brchart {

namespace {

constexpr Rgb kBlack{0, 0, 0};
constexpr Rgb kGrey{128, 128, 128};
constexpr Rgb kMagenta{200, 0, 160};
constexpr Rgb kLand{222, 206, 160};
constexpr Rgb kBuiltUp{190, 170, 120};

bool StartsWith(const std::string& text, const char* prefix) { return text.rfind(prefix, 0) == 0; }

ClassStyle Area(Mark mark, Rgb colour, Dash dash = Dash::Solid, int width = 1) {
  ClassStyle s;
  s.mark = mark;
  s.fixed = colour;
  s.dash = dash;
  s.width = width;
  s.layer = mark == Mark::Fill ? 0 : 1;
  return s;
}

ClassStyle Line(Rgb colour, Dash dash, int width) {
  ClassStyle s = Area(Mark::Line, colour, dash, width);
  s.layer = 2;
  return s;
}

ClassStyle Point(Symbol symbol, Rgb colour, int size) {
  ClassStyle s;
  s.mark = Mark::Symbol;
  s.symbol = symbol;
  s.fixed = colour;
  s.width = size;
  s.layer = 3;
  return s;
}

bool ReadNumber(const chartscene::ScenePresParamsModel& params, long index, double& out) {
  const auto found = params.values.find(index);
  if (found == params.values.end()) return false;
  const chartscene::TypedValue& v = found->second;
  using T = chartscene::TypedValue::Type;
  if (v.type == T::R4 || v.type == T::R8) {
    if (!std::isfinite(v.real)) return false;
    out = v.real;
    return true;
  }
  if (v.type == T::I2 || v.type == T::I4 || v.type == T::UI1 || v.type == T::UI2 || v.type == T::UI4) {
    out = static_cast<double>(v.integer);
    return true;
  }
  return false;
}

}  // namespace

ClassStyle StyleOf(const std::string& acronym, long primitive) {
  // Meta objects cover the whole chart; collections and cartographic objects have no
  // shape of their own to show.
  if (StartsWith(acronym, "M_") || StartsWith(acronym, "C_") || acronym == "MAGVAR" || acronym == "$AREAS")
    return ClassStyle{};
  if (primitive == 3) {
    if (acronym == "DEPARE" || acronym == "DRGARE") {
      ClassStyle s = Area(Mark::Fill, kGrey);
      s.byDepth = true;
      return s;
    }
    if (acronym == "LNDARE") return Area(Mark::Fill, kLand);
    if (acronym == "BUAARE") return Area(Mark::Fill, kBuiltUp);
    if (acronym == "ACHARE" || acronym == "CBLARE" || acronym == "RESARE") return Area(Mark::Outline, kMagenta, Dash::Dashed);
    if (acronym == "OBSTRN") return Area(Mark::Outline, kBlack, Dash::Dotted);
    return Area(Mark::Outline, kGrey);
  }
  if (primitive == 2) {
    if (acronym == "NAVLNE") return Line(kBlack, Dash::Solid, 1);
    if (acronym == "RECTRC") return Line(kBlack, Dash::Dashed, 2);
    if (acronym == "RADLNE") return Line(kMagenta, Dash::Solid, 1);
    if (acronym == "COALNE") return Line(kBlack, Dash::Solid, 2);
    return Line(kGrey, Dash::Solid, 1);
  }
  if (primitive == 1) {
    if (acronym == "LIGHTS") return Point(Symbol::Flare, kMagenta, 6);
    if (StartsWith(acronym, "BOY") || StartsWith(acronym, "BCN")) return Point(Symbol::Circle, kBlack, 4);
    if (acronym == "LNDMRK" || acronym == "BUISGL") return Point(Symbol::Square, kBlack, 4);
    // A tidal stream diamond: its letter refers to the table of the stream there.
    if (StartsWith(acronym, "TS_")) return Point(Symbol::Diamond, kMagenta, 5);
    if (acronym == "UWTROC" || acronym == "WRECKS" || acronym == "OBSTRN") return Point(Symbol::Cross, kBlack, 4);
    return Point(Symbol::Dot, kBlack, 1);
  }
  return ClassStyle{};
}

DepthContours ContoursOf(const chartscene::ScenePresParamsModel* params) {
  DepthContours c;
  if (!params) return c;
  double v = 0;
  if (ReadNumber(*params, 0, v)) c.shallow = v;
  if (ReadNumber(*params, 2, v)) c.deep = v;
  if (ReadNumber(*params, 1, v)) c.safety = v;
  if (c.deep < c.shallow) std::swap(c.deep, c.shallow);
  c.safety = std::min(std::max(c.safety, c.shallow), c.deep);
  return c;
}

long DepthColourNumber(double depth, const DepthContours& contours) {
  if (!std::isfinite(depth) || depth < contours.shallow) return kShallowestWater;
  if (depth < contours.safety) return 31;
  if (depth < contours.deep) return 29;
  return kDeepWater;
}

Rgb ChartColour(const chartscene::SceneColorMapModel* map, const chartscene::ScenePaletteModel* palette,
                long number, Rgb fallback) {
  if (!map || !palette || number == 0) return fallback;
  const auto found = map->indices.find(number);
  if (found == map->indices.end() || found->second >= palette->colours.size()) return fallback;
  const auto& c = palette->colours[found->second];
  return Rgb{c[0], c[1], c[2]};
}

Rgb S57Colour(unsigned value) {
  switch (value) {
    case 1: return Rgb{255, 255, 255};
    case 3: return Rgb{220, 0, 0};
    case 4: return Rgb{0, 160, 0};
    case 5: return Rgb{0, 0, 220};
    case 6: return Rgb{240, 200, 0};
    case 11: return Rgb{255, 140, 0};
    default: return kBlack;
  }
}

}  // namespace br::brchart
