#include "picture/logic/picture_list.h"

namespace br::picture {

std::vector<std::string> SplitPictureNames(const std::string& text) {
  std::vector<std::string> names;
  std::string::size_type start = 0;
  while (start <= text.size()) {
    const std::string::size_type end = text.find_first_of(",;:|", start);
    const std::string::size_type stop = end == std::string::npos ? text.size() : end;
    if (stop > start) names.push_back(text.substr(start, stop - start));
    if (end == std::string::npos) break;
    start = end + 1;
  }
  return names;
}

int NextIndex(int index, int count) {
  if (count <= 0) return -1;
  return index >= 0 && index < count - 1 ? index + 1 : 0;
}

int PreviousIndex(int index, int count) {
  if (count <= 0) return -1;
  if (index > count - 1) return count - 1;
  return index > 0 ? index - 1 : 0;
}

std::string ZoomText(int entry) {
  if (entry < 0 || entry >= kZoomStepCount) return {};
  return std::to_string(kZoomSteps[entry]) + "%";
}

int ZoomInEntry(int entry) { return entry > 0 && entry < kZoomStepCount ? entry - 1 : entry; }

int ZoomOutEntry(int entry) { return entry >= 0 && entry < kZoomStepCount - 1 ? entry + 1 : entry; }

}  // namespace br::picture
