// The picture panel's bookkeeping: picture names from the object's attribute text, stepping
// through the list, and the zoom choice. Portable, so it is tested natively.
#pragma once

#include <string>
#include <vector>

namespace br::picture {

// The names of an attribute text split at any of ",;:|"; empty names are skipped.
std::vector<std::string> SplitPictureNames(const std::string& text);

// Next: one on, wrapping from the last to the first. Previous: one back, stopping at the
// first. Both give -1 for an empty list (nothing to show).
int NextIndex(int index, int count);
int PreviousIndex(int index, int count);

// The zoom choice: 200%, 150%, 125%, 100%, 75%, 50%, 20% in this order.
constexpr int kZoomSteps[] = {200, 150, 125, 100, 75, 50, 20};
constexpr int kZoomStepCount = static_cast<int>(sizeof kZoomSteps / sizeof kZoomSteps[0]);
constexpr int kDefaultZoomEntry = 3;  // 100%

// The entry's text ("125%"), empty outside the list.
std::string ZoomText(int entry);
// Zoom in moves towards the first entry, zoom out towards the last; neither moves past the
// end, and an entry outside the list stays where it is.
int ZoomInEntry(int entry);
int ZoomOutEntry(int entry);
inline bool CanZoomIn(int entry) { return entry > 0; }
inline bool CanZoomOut(int entry) { return entry < kZoomStepCount - 1; }

// The shading of palettes 0..4 that the panel and the picture window give their view:
// the picture at 100, 90, 75, 25 and 10 percent brightness.
constexpr double kDefaultShading[] = {0, 10, 25, 75, 90};

}  // namespace br::picture
