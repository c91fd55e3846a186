#include <doctest/doctest.h>

#include <string>
#include <vector>

#include "toolkit/text/logic/break_rules.h"

using namespace toolkit::text;

namespace {

// The positions where a line may start, and where a cut would split a cluster.
std::vector<std::size_t> Breaks(const std::u16string& text) {
  std::vector<CharBreak> chars(text.size());
  markBreaks(text.data(), text.size(), chars.data());
  std::vector<std::size_t> at;
  for (std::size_t i = 0; i < chars.size(); ++i)
    if (chars[i].softBreak) at.push_back(i);
  return at;
}

std::vector<std::size_t> InsideClusters(const std::u16string& text) {
  std::vector<CharBreak> chars(text.size());
  markBreaks(text.data(), text.size(), chars.data());
  std::vector<std::size_t> at;
  for (std::size_t i = 0; i < chars.size(); ++i)
    if (!chars[i].clusterStart) at.push_back(i);
  return at;
}

using V = std::vector<std::size_t>;

}  // namespace

TEST_CASE("words break after blanks and hyphens, never at the start") {
  CHECK(Breaks(u"Port of  Brest") == V{5, 9});
  CHECK(Breaks(u"  lead") == V{2});
  CHECK(Breaks(u"Saint-Malo") == V{6});
  CHECK(Breaks(u"\u00a0x y").size() == 1);  // no break at a no-break space
  CHECK(Breaks(u"a\tb\u3000c") == V{2, 4});
}

TEST_CASE("ideographs and kana break on both sides, except before closing punctuation") {
  CHECK(Breaks(u"東京湾") == V{1, 2});
  CHECK(Breaks(u"港。東") == V{2});
  CHECK(Breaks(u"「港」").empty());
  CHECK(Breaks(u"port東京") == V{4, 5});
  CHECK(Breaks(u"부산항") == V{1, 2});
  CHECK(Breaks(u"\U00020000\U00020001") == V{2});  // supplementary ideographs, not inside the pair
}

TEST_CASE("scripts without blanks between words get no breaks from the fallback rules") {
  CHECK(Breaks(u"\u0e17\u0e48\u0e32\u0e40\u0e23\u0e37\u0e2d").empty());  // Thai "harbour"
}

TEST_CASE("marks, joiners, conjuncts and low surrogates continue a cluster") {
  CHECK(InsideClusters(u"e\u0301") == V{1});
  CHECK(InsideClusters(u"\u0645\u064e\u0631") == V{1});              // Arabic with fatha
  CHECK(InsideClusters(u"\u05e9\u05c1\u05dc") == V{1});              // Hebrew with shin dot
  CHECK(InsideClusters(u"\u0e01\u0e34\u0e48\u0e07") == V{1, 2});     // Thai vowel and tone marks
  CHECK(InsideClusters(u"\u0915\u094d\u0937\u093e") == V{1, 2, 3});  // Devanagari kssa + aa
  CHECK(InsideClusters(u"a\u200db") == V{1});
  CHECK(InsideClusters(u"\u0995\u09bf\u0b95\u0bbf") == V{1, 3});  // Bengali and Tamil vowel signs
  CHECK(InsideClusters(u"\u1100\u1161\u11a8") == V{1, 2});        // Hangul jamo syllable
  CHECK(InsideClusters(u"\U0001F600x") == V{1});
  // A lone low surrogate starts its own cluster rather than joining a letter.
  CHECK(InsideClusters(u"a\xdc00").empty());
  // A mark right after a blank stays with it: the blank is no longer a clean cut.
  std::vector<CharBreak> chars(3);
  markBreaks(u" \u0301x", 3, chars.data());
  CHECK(chars[0].whiteSpace);
  CHECK_FALSE(chars[1].clusterStart);
  CHECK_FALSE(chars[1].softBreak);
}
