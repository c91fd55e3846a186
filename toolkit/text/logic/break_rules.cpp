#include "toolkit/text/logic/break_rules.h"

namespace toolkit::text {
namespace {

struct Range {
  char16_t first, last;
};

template <std::size_t N>
bool inRanges(char16_t unit, const Range (&ranges)[N]) {
  for (const Range& r : ranges)
    if (unit >= r.first && unit <= r.last) return true;
  return false;
}

// Non-spacing and spacing marks of the scripts the engine is used with.
const Range kMarks[] = {
    {0x0300, 0x036F}, {0x0483, 0x0489}, {0x0591, 0x05BD}, {0x05BF, 0x05BF}, {0x05C1, 0x05C2}, {0x05C4, 0x05C5},
    {0x05C7, 0x05C7}, {0x0610, 0x061A}, {0x064B, 0x065F}, {0x0670, 0x0670}, {0x06D6, 0x06DC}, {0x06DF, 0x06E4},
    {0x06E7, 0x06E8}, {0x06EA, 0x06ED}, {0x0900, 0x0903}, {0x093A, 0x093C}, {0x093E, 0x094F}, {0x0951, 0x0957},
    {0x0962, 0x0963}, {0x0E31, 0x0E31}, {0x0E34, 0x0E3A}, {0x0E47, 0x0E4E}, {0x0EB1, 0x0EB1}, {0x0EB4, 0x0EBC},
    {0x0EC8, 0x0ECD}, {0x1AB0, 0x1AFF}, {0x1DC0, 0x1DFF}, {0x200C, 0x200D}, {0x20D0, 0x20FF}, {0x302A, 0x302F},
    {0x3099, 0x309A}, {0xFE00, 0xFE0F}, {0xFE20, 0xFE2F},
};

// Kana, CJK ideographs, Hangul syllables, compatibility ideographs, full-width forms,
// and the high halves of the supplementary ideograph planes.
const Range kIdeographic[] = {
    {0x2E80, 0x2FFF}, {0x3040, 0x30FF}, {0x3100, 0x31FF}, {0x3400, 0x4DBF}, {0x4E00, 0x9FFF},
    {0xAC00, 0xD7AF}, {0xD840, 0xD87F}, {0xF900, 0xFAFF}, {0xFF01, 0xFF60},
};

// Punctuation that never starts a line, and that never ends one.
const Range kNoLineStart[] = {
    {0x3001, 0x3002}, {0x3009, 0x3009}, {0x300B, 0x300B}, {0x300D, 0x300D}, {0x300F, 0x300F},
    {0x3011, 0x3011}, {0x30FC, 0x30FC}, {0xFF01, 0xFF01}, {0xFF09, 0xFF09}, {0xFF0C, 0xFF0C},
    {0xFF0E, 0xFF0E}, {0xFF1A, 0xFF1B}, {0xFF1F, 0xFF1F}, {0x0021, 0x0021}, {0x0029, 0x0029},
    {0x002C, 0x002C}, {0x002E, 0x002E}, {0x003A, 0x003B}, {0x003F, 0x003F}, {0x005D, 0x005D},
};
const Range kNoLineEnd[] = {
    {0x3008, 0x3008}, {0x300A, 0x300A}, {0x300C, 0x300C}, {0x300E, 0x300E},
    {0x3010, 0x3010}, {0xFF08, 0xFF08}, {0x0028, 0x0028}, {0x005B, 0x005B},
};

bool isDevanagariConsonant(char16_t unit) {
  return (unit >= 0x0915 && unit <= 0x0939) || (unit >= 0x0958 && unit <= 0x095F);
}

}  // namespace

bool isBlank(char16_t unit) {
  return unit == 0x0020 || unit == 0x0009 || unit == 0x3000 || (unit >= 0x2000 && unit <= 0x200A && unit != 0x2007) ||
         unit == 0x205F;
}

bool continuesCluster(char16_t previous, char16_t unit) {
  if (unit >= 0xDC00 && unit <= 0xDFFF) return previous >= 0xD800 && previous <= 0xDBFF;
  if (previous == 0x094D && isDevanagariConsonant(unit)) return true;  // conjunct
  return inRanges(unit, kMarks);
}

bool breaksLikeIdeograph(char16_t unit) { return inRanges(unit, kIdeographic); }

void markBreak(char16_t previous, char16_t unit, CharBreak& out) {
  out.whiteSpace = isBlank(unit);
  out.clusterStart = previous == 0 || !continuesCluster(previous, unit);
  out.softBreak = false;
  if (previous == 0 || !out.clusterStart || out.whiteSpace) return;
  if (inRanges(unit, kNoLineStart) || inRanges(previous, kNoLineEnd)) return;
  const bool afterBlank = isBlank(previous);
  const bool afterHyphen = previous == u'-' || previous == 0x2010 || previous == 0x2013;
  out.softBreak = afterBlank || afterHyphen || breaksLikeIdeograph(unit) ||
                  (breaksLikeIdeograph(previous) && !(previous >= 0xD800 && previous <= 0xDBFF));
}

}  // namespace toolkit::text
