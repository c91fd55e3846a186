#include <doctest/doctest.h>

#include <string>
#include <vector>

#include "toolkit/text/logic/break_rules.h"
#include "toolkit/text/logic/line_filling.h"

using namespace toolkit::text;

namespace {

// A run of `text` with every unit `width` pixels wide (marks 0), broken by the
// fallback rules: what the engine gives line filling without the script processor.
std::vector<CharBreak> Measured(const std::u16string& text, int width = 10) {
  std::vector<CharBreak> chars(text.size());
  markBreaks(text.data(), text.size(), chars.data());
  for (CharBreak& c : chars) c.width = c.clusterStart ? width : 0;
  return chars;
}

std::size_t Fit(const std::u16string& text, int room, bool first = true) {
  const std::vector<CharBreak> chars = Measured(text);
  return fitRun(chars.data(), chars.size(), room, first);
}

}  // namespace

TEST_CASE("fitRun cuts a run at the width limit") {
  SUBCASE("a run that fits is taken whole, to the pixel") {
    CHECK(Fit(u"harbour", 70) == 7);
    CHECK(Fit(u"harbour", 1000) == 7);
  }
  SUBCASE("back to the last word start, the blank staying on the line") {
    // "north harbour": 13 units of 10 px; 90 px end inside "harbour".
    CHECK(Fit(u"north harbour", 90) == 6);
    CHECK(Fit(u"north harbour", 90, false) == 6);
  }
  SUBCASE("blanks at the limit hang past it") {
    CHECK(Fit(u"north   harbour", 50) == 8);
    CHECK(Fit(u"north   harbour", 60) == 8);
    // A mark on the last blank: the cut goes before that blank, never between them.
    CHECK(Fit(u"abc \u0301x", 35) == 3);
    CHECK(Fit(u"abc  \u0301x", 35) == 4);
    CHECK(Fit(u" \u0301x", 5, false) == 0);
  }
  SUBCASE("a word wider than the line: the clusters that fit, at least one") {
    CHECK(Fit(u"Hafenbecken", 35) == 3);
    CHECK(Fit(u"Hafenbecken", 5) == 1);
    CHECK(Fit(u"Hafenbecken", 0) == 1);
    CHECK(Fit(u"Hafenbecken", -20) == 1);
  }
  SUBCASE("a run without a break that is not the line's first goes to the next line whole") {
    CHECK(Fit(u"Hafenbecken", 35, false) == 0);
    CHECK(Fit(u"Hafenbecken", 0, false) == 0);
  }
  SUBCASE("a cut never splits a cluster") {
    // e + combining acute: the second unit is part of the first cluster.
    const std::u16string text = u"e\u0301e\u0301e\u0301e\u0301";
    CHECK(Fit(text, 25) == 4);  // two clusters of 10 px
    CHECK(Fit(text, 5) == 2);   // at least the first whole cluster
    // A surrogate pair is one cluster.
    CHECK(Fit(u"\U00020000\U00020001\U00020002", 15) == 2);
  }
  SUBCASE("ideographs break anywhere, closing punctuation stays with its word") {
    CHECK(Fit(u"東京湾の港", 35) == 3);
    CHECK(Fit(u"東京湾。港", 35) == 2);
  }
}

TEST_CASE("fitRun takes at least one unit of the first run and never more than the run") {
  const std::u16string texts[] = {u"a", u"   ", u"ab cd", u"\u0e01\u0e34\u0e19", u"x\u0301\u0302y"};
  for (const std::u16string& text : texts) {
    for (int room = -10; room <= 60; room += 5) {
      const std::vector<CharBreak> chars = Measured(text);
      const std::size_t first = fitRun(chars.data(), chars.size(), room, true);
      CHECK(first >= 1);
      CHECK(first <= text.size());
      const std::size_t later = fitRun(chars.data(), chars.size(), room, false);
      CHECK(later <= text.size());
      // Whatever is taken ends on a cluster boundary.
      if (first < text.size()) CHECK(chars[first].clusterStart);
      if (later > 0 && later < text.size()) CHECK(chars[later].clusterStart);
    }
  }
}

TEST_CASE("splitPoint cuts over-long runs at blanks, else between clusters") {
  const std::u16string words = u"aaaa bbbb cccc dddd";
  std::vector<CharBreak> chars = Measured(words);
  CHECK(splitPoint(chars.data(), chars.size(), 100) == chars.size());
  CHECK(splitPoint(chars.data(), chars.size(), 12) == 10);  // after "bbbb "
  CHECK(splitPoint(chars.data(), chars.size(), 10) == 10);
  CHECK(splitPoint(chars.data(), chars.size(), 4) == 4);  // no blank before: a cluster start

  const std::u16string marks = u"a\u0301\u0302\u0303b\u0301\u0302\u0303";
  chars = Measured(marks);
  CHECK(splitPoint(chars.data(), chars.size(), 3) == 3);  // a cluster longer than the limit

  CHECK(splitPoint(chars.data(), chars.size(), 6) == 4);

  // Pieces taken one after the other cover the text exactly, each within the limit.
  const std::u16string thai(700, u'\u0e01');
  chars = Measured(thai + u"\u0e34" + thai);
  std::size_t at = 0, pieces = 0;
  while (at < chars.size()) {
    const std::size_t n = splitPoint(chars.data() + at, chars.size() - at, 600);
    REQUIRE(n > 0);
    CHECK(n <= 600);
    at += n;
    ++pieces;
  }
  CHECK(at == chars.size());
  CHECK(pieces == 3);
}

TEST_CASE("lastSoftBreak finds where a line cut short by its buffers may end") {
  std::vector<CharBreak> chars = Measured(u"one two three");
  CHECK(lastSoftBreak(chars.data(), chars.size()) == 8);
  CHECK(lastSoftBreak(chars.data(), 8) == 4);
  CHECK(lastSoftBreak(chars.data(), 3) == 3);  // no break: the whole piece
  chars = Measured(u"\u0e01\u0e32\u0e23\u0e17\u0e48\u0e32");
  CHECK(lastSoftBreak(chars.data(), chars.size()) == chars.size());
}

TEST_CASE("visualOffsets places runs by their visual order") {
  const int widths[] = {30, 5, 40, 7};
  int offsets[4] = {};
  const int identity[] = {0, 1, 2, 3};
  visualOffsets(widths, identity, 4, offsets);
  CHECK(offsets[0] == 0);
  CHECK(offsets[1] == 30);
  CHECK(offsets[2] == 35);
  CHECK(offsets[3] == 75);
  // Right-to-left runs 1..3 inside a left-to-right line: shown 0, 3, 2, 1.
  const int mixed[] = {0, 3, 2, 1};
  visualOffsets(widths, mixed, 4, offsets);
  CHECK(offsets[0] == 0);
  CHECK(offsets[3] == 30);
  CHECK(offsets[2] == 37);
  CHECK(offsets[1] == 77);
}
