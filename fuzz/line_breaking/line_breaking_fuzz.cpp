// The text engine's line filling over any UTF-16 text: the fallback break rules, the cut
// of a run at the width limit, the split of over-long runs and the cut of a line that
// fills its buffers.
//
// One input: u8 room (pixels, signed), u8 piece limit, then UTF-16 units (two bytes each,
// little-endian); each unit's width is its low four bits. Checked beyond "no crash": a
// line's first run gives at least one unit and any run at most all of them; a cut never
// falls inside a cluster; what fits by width is within the room unless it is one cluster
// or hanging blanks; pieces cut by splitPoint cover the text exactly, each within the
// limit; lastSoftBreak stays inside the text.
#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "fuzz/common/fuzz_check.h"
#include "toolkit/text/logic/break_rules.h"
#include "toolkit/text/logic/line_filling.h"

using namespace toolkit::text;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size < 4) return 0;
  const int room = static_cast<std::int8_t>(data[0]) * 4;
  const std::size_t limit = 1 + data[1] % 64;
  std::vector<char16_t> text;
  for (std::size_t i = 2; i + 1 < size; i += 2) text.push_back(static_cast<char16_t>(data[i] | data[i + 1] << 8));
  const std::size_t count = text.size();
  std::vector<CharBreak> chars(count);
  markBreaks(text.data(), count, chars.data());
  for (std::size_t i = 0; i < count; ++i) {
    chars[i].width = text[i] & 0xF;
    FUZZ_CHECK(!chars[i].softBreak || chars[i].clusterStart);
  }

  for (const bool first : {true, false}) {
    const std::size_t fit = fitRun(chars.data(), count, room, first);
    FUZZ_CHECK(fit <= count);
    if (first) FUZZ_CHECK(fit >= 1);
    if (fit > 0 && fit < count) FUZZ_CHECK(chars[fit].clusterStart);
    long long width = 0;
    std::size_t firstClusterEnd = 1;
    while (firstClusterEnd < count && !chars[firstClusterEnd].clusterStart) ++firstClusterEnd;
    std::size_t visible = fit;
    while (visible > 0 && chars[visible - 1].whiteSpace) --visible;
    for (std::size_t i = 0; i < visible; ++i) width += chars[i].width;
    if (fit > firstClusterEnd) FUZZ_CHECK(width <= std::max(room, 0));
  }

  std::size_t at = 0;
  while (at < count) {
    const std::size_t piece = splitPoint(chars.data() + at, count - at, limit);
    FUZZ_CHECK(piece >= 1 && piece <= limit);
    at += piece;
  }
  FUZZ_CHECK(at == count);

  const std::size_t cut = lastSoftBreak(chars.data(), count);
  FUZZ_CHECK(cut >= 1 && cut <= count);
  return 0;
}
