// The picture of the contours view as numbers: the depth bands of the shading scheme, the
// labelled zone boundaries and the bars beside each label. Portable, so it is tested
// natively; XContoursView only turns it into GDI calls.
#pragma once

#include <string>
#include <vector>

namespace br::contours {

// Zone colours in the order the view reads them: chart colour numbers 21, 31, 30, 29, 28, 2.
constexpr int kZoneCount = 6;
constexpr long kZoneColourNumbers[kZoneCount] = {21, 31, 30, 29, 28, 2};

struct ContourScheme {
  bool twoShades = false;
  double shallow = 0.0;
  double safety = 0.0;
  double deep = 0.0;
};

struct Band {
  int top;
  int bottom;  // exclusive
  int zone;    // index into the zone colours
};

struct Boundary {
  int y;
  std::string label;
};

// A label's box and the two bars that mark its boundary on either side.
struct LabelMarks {
  int boxTop;
  int boxBottom;  // exclusive
  int leftBarX;
  int rightBarX;
  int barWidth;   // never negative: a label wider than the view has no bars
  int barTop;
  static constexpr int kBarHeight = 2;
};

// Bands from top to bottom over [top, bottom): five with four shades, three with two. Each
// is (bottom - top) / n pixels high, the last reaches bottom. An empty or upside-down
// rectangle gives bands of no height.
std::vector<Band> LayBands(const ContourScheme& scheme, int top, int bottom);

// The labelled inner boundaries: shallow, safety and deep contour with four shades, the
// safety contour alone with two.
std::vector<Boundary> LabelBoundaries(const ContourScheme& scheme, int top, int bottom);

// "%.1f" of a depth, however long it gets (a huge depth takes over 300 characters).
std::string DepthLabel(double depth);

// Where a label of textWidth x textHeight at boundary y goes in a view of [left, right).
LabelMarks MarkLabel(int left, int right, int y, int textWidth, int textHeight);

}  // namespace br::contours
