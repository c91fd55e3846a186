#pragma once
// The arithmetic of filling lines from runs of measured characters: where a run
// may be cut when it passes the width limit, where an over-long run is split
// before shaping, and where runs stand once a line is put in visual order. The
// text engine feeds it the widths and break properties that the script processor
// (or the GDI fallback) measured; nothing here knows a font.

#include <cstddef>

namespace toolkit::text {

// One UTF-16 code unit of a run, as line filling sees it.
struct CharBreak {
  int width = 0;             // logical advance in pixels (a cluster's width is spread over its units)
  bool softBreak = false;    // a line may start at this unit
  bool whiteSpace = false;   // blank: may hang past the width limit at a line's end
  bool clusterStart = true;  // a cut here splits no cluster (nor a surrogate pair)
};

// How many units of a run go on a line that has `room` pixels left:
//  - all of them when they fit;
//  - else up to the last soft break among the units that fit, blanks after the cut
//    staying on this line;
//  - else, for a run that is not the line's first, 0: the whole run starts the next
//    line (never an empty first part);
//  - else (a single word wider than the line) the whole clusters that fit, at least one.
std::size_t fitRun(const CharBreak* chars, std::size_t count, int room, bool firstOnLine);

// Where to cut an over-long run so that its first piece has at most `limit` units:
// count when it already fits; else after the last blank at or before the limit,
// else at the last cluster start, else at the limit itself. Always in (0, limit].
std::size_t splitPoint(const CharBreak* chars, std::size_t count, std::size_t limit);

// The last soft break in (0, count), for a line that ends because the buffers are
// full rather than the width; count when there is none.
std::size_t lastSoftBreak(const CharBreak* chars, std::size_t count);

// The x offset of each run of a line, by logical index, once the runs stand in the
// visual order `visualToLogical` (visualToLogical[v] = logical index shown v-th).
void visualOffsets(const int* widths, const int* visualToLogical, std::size_t count, int* offsets);

}  // namespace toolkit::text
