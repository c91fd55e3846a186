// The text engine's portable breaking over random text of mixed scripts: units drawn from
// the blocks whose rules differ (Latin, marks, Hebrew, Arabic, Devanagari, Thai, blanks and
// joiners, CJK punctuation, ideographs, Hangul, surrogate halves, variation selectors,
// full-width forms, any unit), which raw units (line_breaking) seldom reach together; it
// checks the break marks themselves and the visual offsets besides the line filling.
//
// One input: u8 room (times 4 pixels), u8 split limit, then three bytes per unit: script,
// place in the script's block, width in pixels (0 to 63). Checked beyond "no crash":
// the first unit starts a cluster and no line; a soft break is a cluster start and no
// blank; the second half of a surrogate pair never starts a cluster; a line never ends
// inside a cluster, holds no more than its room save blanks hanging past it or one
// cluster wider than the line; filling the whole text into lines of that room always
// ends with every line non-empty; a split point lies in (0, limit]; visual offsets lay
// the runs side by side.
#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <numeric>
#include <vector>

#include "fuzz/common/fuzz_check.h"
#include "toolkit/text/logic/break_rules.h"
#include "toolkit/text/logic/line_filling.h"

using namespace toolkit::text;

namespace {

struct Block {
  char16_t first;
  unsigned size;
};

const Block kBlocks[] = {
    {0x0020, 0x5F}, {0x00A0, 0x60}, {0x0300, 0x70}, {0x0590, 0x70}, {0x0600, 0x100}, {0x0900, 0x80},
    {0x0E00, 0x80}, {0x2000, 0x70}, {0x3000, 0x100}, {0x4E00, 0x100}, {0xAC00, 0x100}, {0xD800, 0x400},
    {0xDC00, 0x400}, {0xFE00, 0x30}, {0xFF00, 0x61}, {0x0000, 0x10000}};

bool IsHighSurrogate(char16_t u) { return u >= 0xD800 && u <= 0xDBFF; }
bool IsLowSurrogate(char16_t u) { return u >= 0xDC00 && u <= 0xDFFF; }

std::size_t FirstClusterEnd(const CharBreak* chars, std::size_t count) {
  std::size_t end = 1;
  while (end < count && !chars[end].clusterStart) ++end;
  return end;
}

void CheckFit(const CharBreak* chars, std::size_t count, int room, bool first) {
  const std::size_t cut = fitRun(chars, count, room, first);
  FUZZ_CHECK(cut <= count);
  long long total = 0;
  for (std::size_t i = 0; i < count; ++i) total += chars[i].width;
  if (total <= room) FUZZ_CHECK(cut == count);
  if (count > 0 && first) FUZZ_CHECK(cut >= 1);
  if (cut < count) FUZZ_CHECK(chars[cut].clusterStart);
  // What lies past the room is hanging blanks or, on a line's first run, one cluster.
  long long used = 0;
  std::size_t fit = 0;
  while (fit < count && used + chars[fit].width <= room) used += chars[fit++].width;
  bool blanksOnly = true;
  for (std::size_t i = fit; i < cut; ++i) blanksOnly = blanksOnly && chars[i].whiteSpace;
  FUZZ_CHECK(cut <= fit || blanksOnly || (first && cut == FirstClusterEnd(chars, count)));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  br::fuzz::InputReader in(data, size);
  const int room = in.U8() * 4;
  const std::size_t limit = in.U8();
  std::vector<char16_t> text;
  std::vector<int> widths;
  while (in.Remaining() >= 3) {
    const Block& block = kBlocks[in.U8() % (sizeof kBlocks / sizeof kBlocks[0])];
    const unsigned place = in.U8() | (block.size > 0x100 ? in.U8() << 8 : 0);
    text.push_back(static_cast<char16_t>(block.first + place % block.size));
    widths.push_back(in.U8() % 64);
  }
  const std::size_t count = text.size();
  std::vector<CharBreak> chars(count);
  for (std::size_t i = 0; i < count; ++i) chars[i].width = widths[i];
  markBreaks(text.data(), count, chars.data());

  for (std::size_t i = 0; i < count; ++i) {
    FUZZ_CHECK(chars[i].width == widths[i]);  // left as it was
    if (i == 0) FUZZ_CHECK(chars[i].clusterStart && !chars[i].softBreak);
    if (chars[i].softBreak) FUZZ_CHECK(chars[i].clusterStart && !chars[i].whiteSpace);
    if (i > 0 && IsLowSurrogate(text[i]) && IsHighSurrogate(text[i - 1])) {
      FUZZ_CHECK(!chars[i].clusterStart && !chars[i].softBreak);
    }
    if (i > 0 && IsHighSurrogate(text[i - 1]) && chars[i].softBreak) FUZZ_CHECK(!IsLowSurrogate(text[i]));
  }

  CheckFit(chars.data(), count, room, true);
  CheckFit(chars.data(), count, room, false);

  // A whole text filled into lines of the room: every line takes at least one unit.
  std::size_t start = 0;
  std::size_t lines = 0;
  while (start < count) {
    const std::size_t taken = fitRun(chars.data() + start, count - start, room, true);
    FUZZ_CHECK(taken >= 1 && taken <= count - start);
    start += taken;
    FUZZ_CHECK(++lines <= count);
  }

  const std::size_t split = splitPoint(chars.data(), count, limit);
  if (count <= limit) {
    FUZZ_CHECK(split == count);
  } else if (limit > 0) {
    FUZZ_CHECK(split > 0 && split <= limit);
  }

  const std::size_t soft = lastSoftBreak(chars.data(), count);
  FUZZ_CHECK(soft == count || (soft > 0 && soft < count && chars[soft].softBreak));
  for (std::size_t i = soft + 1; i < count; ++i) FUZZ_CHECK(!chars[i].softBreak);

  // Runs (the widths) shown in an order made from the text: reversed spans, as the
  // right-to-left parts of a line stand.
  std::vector<int> order(count);
  std::iota(order.begin(), order.end(), 0);
  for (std::size_t i = 0; i < count;) {
    std::size_t end = i + 1 + text[i] % 5;
    if (end > count) end = count;
    if (text[i] & 0x100) std::reverse(order.begin() + static_cast<std::ptrdiff_t>(i), order.begin() + static_cast<std::ptrdiff_t>(end));
    i = end;
  }
  std::vector<int> offsets(count, -1);
  visualOffsets(widths.data(), order.data(), count, offsets.data());
  int x = 0;
  for (std::size_t v = 0; v < count; ++v) {
    FUZZ_CHECK(offsets[static_cast<std::size_t>(order[v])] == x);
    x += widths[static_cast<std::size_t>(order[v])];
  }
  return 0;
}
