#include "toolkit/text/logic/line_filling.h"

namespace toolkit::text {

std::size_t fitRun(const CharBreak* chars, std::size_t count, int room, bool firstOnLine) {
  // Pass 1: the units whose widths stay within the room.
  long long used = 0;
  std::size_t fit = 0;
  while (fit < count && used + chars[fit].width <= room) used += chars[fit++].width;
  if (fit == count) return count;

  // A blank at the limit: the line ends after the blanks, which hang past it,
  // unless the last of them carries marks: then before that one.
  if (chars[fit].whiteSpace) {
    std::size_t end = fit;
    while (end < count && chars[end].whiteSpace) ++end;
    while (end > 0 && end < count && !chars[end].clusterStart) --end;
    if (end > 0) return end;
  }

  // Pass 2: back to the last soft break among the units that fit.
  std::size_t cut = fit;
  while (cut > 0 && !chars[cut].softBreak) --cut;
  if (cut > 0) return cut;
  if (!firstOnLine) return 0;

  // Pass 3: a word wider than the line: whole clusters, at least one.
  cut = fit;
  while (cut > 0 && !chars[cut].clusterStart) --cut;
  if (cut == 0) {
    cut = 1;
    while (cut < count && !chars[cut].clusterStart) ++cut;
  }
  return cut;
}

std::size_t splitPoint(const CharBreak* chars, std::size_t count, std::size_t limit) {
  if (count <= limit) return count;
  if (limit == 0) return 0;
  // After a blank, so that each piece stays a sequence of whole words...
  for (std::size_t cut = limit; cut > 0; --cut)
    if (chars[cut - 1].whiteSpace && !chars[cut].whiteSpace && chars[cut].clusterStart) return cut;
  // ...else between clusters, so that shaping never sees half a cluster.
  for (std::size_t cut = limit; cut > 0; --cut)
    if (chars[cut].clusterStart) return cut;
  return limit;
}

std::size_t lastSoftBreak(const CharBreak* chars, std::size_t count) {
  for (std::size_t cut = count; cut-- > 1;)
    if (chars[cut].softBreak) return cut;
  return count;
}

void visualOffsets(const int* widths, const int* visualToLogical, std::size_t count, int* offsets) {
  int x = 0;
  for (std::size_t v = 0; v < count; ++v) {
    const int logical = visualToLogical[v];
    offsets[logical] = x;
    x += widths[logical];
  }
}

}  // namespace toolkit::text
