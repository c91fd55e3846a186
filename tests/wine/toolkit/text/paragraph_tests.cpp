// Paragraphs: wrapping, visual order, long texts, clamping and what reaches the DC,
// with the script processor and through plain GDI.
#include <doctest/doctest.h>

#include <windows.h>

#include <algorithm>
#include <string>

#include "tests/wine/toolkit/text/text_test_support.h"
#include "toolkit/text/TextEngine.h"
#include "toolkit/text/logic/break_rules.h"

using namespace br::test;
using toolkit::TextEngine;

namespace {

const std::wstring kLatin =
    L"The flood stream sets east along the breakwater until half an hour before high water at Brest, "
    L"then turns and runs strongly out of the harbour entrance.";
// Thai: "the harbour of Bangkok is at the mouth of the river" without blanks.
const std::wstring kThai =
    L"\u0e17\u0e48\u0e32\u0e40\u0e23\u0e37\u0e2d\u0e01\u0e23\u0e38\u0e07\u0e40\u0e17\u0e1e\u0e2d\u0e22\u0e39\u0e48"
    L"\u0e17\u0e35\u0e48\u0e1b\u0e32\u0e01\u0e41\u0e21\u0e48\u0e19\u0e49\u0e33\u0e40\u0e08\u0e49\u0e32\u0e1e\u0e23"
    L"\u0e30\u0e22\u0e32\u0e17\u0e48\u0e32\u0e40\u0e23\u0e37\u0e2d\u0e19\u0e49\u0e33\u0e25\u0e36\u0e01";
// Chinese: a harbour sentence without blanks.
const std::wstring kCjk =
    L"\u4e0a\u6d77\u6e2f\u4f4d\u4e8e\u957f\u6c5f\u5165\u6d77\u53e3\u662f\u4e16\u754c\u4e0a\u6700\u7e41\u5fd9\u7684"
    L"\u96c6\u88c5\u7bb1\u6e2f\u53e3\u4e4b\u4e00\u6f6e\u6c50\u6bcf\u65e5\u4e24\u6b21";
const std::wstring kArabicWord1 = L"\u0645\u064A\u0646\u0627\u0621";  // "harbour"
const std::wstring kArabicWord2 = L"\u0645\u0631\u0633\u0649";        // "anchorage"

bool IsThaiMark(wchar_t c) { return c == 0x0E31 || (c >= 0x0E34 && c <= 0x0E3A) || (c >= 0x0E47 && c <= 0x0E4E); }

// Lines no wider than the limit (a line of one cluster may be; blanks at a line's end
// hang past it), every unit drawn once.
void CheckWrapped(EngineOnCanvas& e, const std::wstring& text, int width, int lines) {
  const auto& layout = e.engine.lastLayout();
  CheckCovers(layout, 0, static_cast<int>(text.size()));
  CHECK(lines > 1);
  const int blank = e.engine.measureText(e.canvas.Dc(), L" ").cx;
  for (int line = 0; line < lines; ++line) {
    const auto runs = LineRuns(layout, line);
    REQUIRE_FALSE(runs.empty());
    int units = 0, end = 0;
    for (const auto& run : runs) {
      units += run.length;
      end = std::max(end, run.start + run.length);
    }
    int hanging = 0;
    while (end > 0 && text[end - 1] == L' ') --end, ++hanging;
    CAPTURE(line);
    if (units > 2) CHECK(LineWidth(layout, line) <= width + hanging * blank);
  }
}

struct Mode {
  std::string name;
  bool scripts;
};
const Mode kModes[] = {{"shaped", true}, {"plain GDI", false}};

}  // namespace

TEST_CASE("Latin wraps at blanks into lines no wider than the rectangle") {
  for (const Mode& mode : kModes) {
    CAPTURE(mode.name);
    EngineOnCanvas e(kArabicFace, mode.scripts);
    REQUIRE(e.engine.available() == mode.scripts);
    const int lines = e.Draw(kLatin, 160);
    CheckWrapped(e, kLatin, 160, lines);
    CHECK(e.y == 10 + 20 * lines);
    for (int start : LineStarts(e.engine.lastLayout(), lines)) {
      CHECK(kLatin[start - 1] == L' ');  // every line starts a word
      CHECK(kLatin[start] != L' ');
    }
    for (const auto& run : e.engine.lastLayout()) CHECK(run.shaped == mode.scripts);
    CHECK(e.engine.widest() <= 160 + e.engine.measureText(e.canvas.Dc(), L" ").cx);
    CHECK(e.engine.widest() > 100);  // lines are filled, not one word each
  }
}

TEST_CASE("Thai without blanks is cut between clusters; CJK between ideographs") {
  REQUIRE(HasFace(kThaiFace));
  REQUIRE(HasFace(kCjkFace));
  for (const Mode& mode : kModes) {
    CAPTURE(mode.name);
    {
      EngineOnCanvas e(kThaiFace, mode.scripts);
      const int lines = e.Draw(kThai, 90);
      CheckWrapped(e, kThai, 90, lines);
      for (int start : LineStarts(e.engine.lastLayout(), lines)) CHECK_FALSE(IsThaiMark(kThai[start]));
    }
    {
      EngineOnCanvas e(kCjkFace, mode.scripts);
      const int lines = e.Draw(kCjk, 100);
      CheckWrapped(e, kCjk, 100, lines);
      const SIZE one = e.engine.measureText(e.canvas.Dc(), kCjk.substr(0, 1));
      // Ideographs break anywhere: every line but the last is nearly full.
      for (int line = 0; line + 1 < lines; ++line) CHECK(LineWidth(e.engine.lastLayout(), line) > 100 - 2 * one.cx);
    }
  }
}

TEST_CASE("right-to-left runs stand in visual order") {
  EngineOnCanvas e(kArabicFace, true);
  const std::wstring text = kArabicWord1 + L" port " + kArabicWord2;
  const int port = static_cast<int>(kArabicWord1.size()) + 1;
  auto xOf = [&](int at) {
    for (const auto& run : e.engine.lastLayout())
      if (at >= run.start && at < run.start + run.length) return run.x;
    FAIL("unit not laid out");
    return -1;
  };
  auto levelOf = [&](int at) {
    for (const auto& run : e.engine.lastLayout())
      if (at >= run.start && at < run.start + run.length) return run.level;
    return -1;
  };

  SUBCASE("left-to-right reading: the words in text order") {
    CHECK(e.Draw(text, 500) == 1);
    CHECK(xOf(0) < xOf(port));
    CHECK(xOf(port) < xOf(static_cast<int>(text.size()) - 1));
    CHECK(levelOf(0) % 2 == 1);
    CHECK(levelOf(port) % 2 == 0);
  }
  SUBCASE("right-to-left reading: the first Arabic word at the right") {
    SetTextAlign(e.canvas.Dc(), TA_RTLREADING);
    CHECK(e.Draw(text, 500) == 1);
    CHECK(xOf(0) > xOf(port));
    CHECK(xOf(port) > xOf(static_cast<int>(text.size()) - 1));
    CHECK(GetTextAlign(e.canvas.Dc()) == TA_RTLREADING);  // given back as it was
  }
  CheckCovers(e.engine.lastLayout(), 0, static_cast<int>(text.size()));
  // Runs of one line touch: each starts where the one before it on screen ends.
  auto runs = e.engine.lastLayout();
  std::sort(runs.begin(), runs.end(), [](const auto& a, const auto& b) { return a.x < b.x; });
  for (std::size_t i = 1; i < runs.size(); ++i) CHECK(runs[i].x == runs[i - 1].x + runs[i - 1].width);
}

TEST_CASE("1500-unit paragraphs lose nothing") {
  std::wstring mixed;
  while (mixed.size() < 1500) mixed += L"Brest " + kArabicWord1 + L" " + kCjk.substr(0, 7) + L" 12:45 ";
  mixed.resize(1500);
  const std::wstring oneWord(1500, L'x');
  std::wstring marks;
  while (marks.size() < 1500) marks += L"e\u0301";
  std::wstring alternating;  // about 1000 items: more than the item buffer holds
  while (alternating.size() < 1500) alternating += L"a\u05d0 ";
  alternating.resize(1500);

  for (const Mode& mode : kModes) {
    CAPTURE(mode.name);
    const std::wstring* texts[] = {&mixed, &oneWord, &marks, &alternating};
    for (const std::wstring* text : texts) {
      EngineOnCanvas e(kArabicFace, mode.scripts, 400, 100);
      e.engine.setMeasureOnly(true);
      const int lines = e.Draw(*text, 300);
      CheckCovers(e.engine.lastLayout(), 0, 1500);
      CHECK(lines > 1);
      if (text == &alternating && mode.scripts) CHECK(e.engine.lastLayout().size() >= TextEngine::kBufferSize);
      for (const auto& run : e.engine.lastLayout()) {
        CHECK(run.length <= TextEngine::kMaxRunUnits);
        if (run.start > 0) CHECK_FALSE(toolkit::text::continuesCluster((*text)[run.start - 1], (*text)[run.start]));
      }
    }
  }
  SUBCASE("unwrapped, a long paragraph is one line of touching parts") {
    for (const Mode& mode : kModes) {
      EngineOnCanvas e(kArabicFace, mode.scripts, 400, 100);
      e.engine.setWrap(false);
      e.engine.setMeasureOnly(true);
      CHECK(e.Draw(mixed, 300) == 1);
      CHECK(e.y == 30);
      CheckCovers(e.engine.lastLayout(), 0, 1500);
      for (const auto& run : e.engine.lastLayout()) CHECK(run.line == 0);
      CHECK(LineWidth(e.engine.lastLayout(), 0) > 300);
    }
  }
  SUBCASE("a rectangle one pixel wide: one cluster per line") {
    EngineOnCanvas e(kArabicFace, true, 400, 100);
    e.engine.setMeasureOnly(true);
    CHECK(e.Draw(marks, 1) == 750);
    CheckCovers(e.engine.lastLayout(), 0, 1500);
  }
}

TEST_CASE("start and length are clamped to the text; empty paragraphs advance one line") {
  EngineOnCanvas e(kArabicFace, true);
  const std::wstring text = L"Lighthouse";
  CHECK(e.Draw(text, 300, -5, 1000) == 1);
  CheckCovers(e.engine.lastLayout(), 0, 10);
  CHECK(e.Draw(text, 300, 6, 100) == 1);
  CheckCovers(e.engine.lastLayout(), 6, 4);
  CHECK(e.Draw(text, 300, 50, 3) == 0);
  CHECK(e.engine.lastLayout().empty());
  CHECK(e.y == 30);
  CHECK(e.Draw(text, 300, 2, -4) == 0);
  CHECK(e.y == 30);
  CHECK(e.Draw(text, 0) == 0);
  CHECK(e.y == 30);
  CHECK(e.Draw(text, -40) == 0);
  CHECK(InkIn(e.canvas, 0, 0, e.canvas.Width(), e.canvas.Height()) > 0);  // the first draws did ink
}

TEST_CASE("what reaches the DC: ink inside the lines, nothing when only measuring, no '?' for Arabic") {
  for (const Mode& mode : kModes) {
    CAPTURE(mode.name);
    const std::wstring text = kArabicWord1 + L" " + kArabicWord2;
    EngineOnCanvas drawn(kArabicFace, mode.scripts, 300, 100);
    CHECK(drawn.Draw(text, 280) == 1);
    const int width = LineWidth(drawn.engine.lastLayout(), 0);
    CHECK(InkIn(drawn.canvas, 10, 10, 12 + width, 30) > 20);
    CHECK(InkIn(drawn.canvas, 14 + width, 0, 300, 100) == 0);
    CHECK(InkIn(drawn.canvas, 0, 32, 300, 100) == 0);

    EngineOnCanvas measured(kArabicFace, mode.scripts, 300, 100);
    measured.engine.setMeasureOnly(true);
    CHECK(measured.Draw(text, 280) == 1);
    CHECK(InkIn(measured.canvas, 0, 0, 300, 100) == 0);
    CHECK(LineWidth(measured.engine.lastLayout(), 0) == width);

    EngineOnCanvas question(kArabicFace, mode.scripts, 300, 100);
    question.Draw(std::wstring(text.size(), L'?'), 280);
    CHECK_FALSE(question.canvas.SamePixels(drawn.canvas));
  }
}

TEST_CASE("a run the slot's font cannot shape falls back to slot 0's font") {
  REQUIRE(HasFace(kThaiFace));
  EngineOnCanvas e(kArabicFace, true);
  TestFont thai(kThaiFace);
  e.engine.setFontSlot(3, thai.get(), false);
  e.engine.selectFontSlot(3);
  const std::wstring text = kThai.substr(0, 8) + L" " + kArabicWord1;
  CHECK(e.Draw(text, 500) == 1);
  CheckCovers(e.engine.lastLayout(), 0, static_cast<int>(text.size()));
  bool arabicFellBack = false, thaiKept = false;
  for (const auto& run : e.engine.lastLayout()) {
    if (run.start == 0) thaiKept = run.slot == 3;
    if (run.start + run.length == static_cast<int>(text.size())) arabicFellBack = run.slot == 0;
  }
  CHECK(thaiKept);
  CHECK(arabicFellBack);
}

TEST_CASE("text that begins with a mark or holds lone surrogates is drawn whole") {
  REQUIRE(HasFace(kThaiFace));
  const std::wstring texts[] = {
      L"\u0e49\u0e33\u0e40\u0e08\u0e49\u0e32 \u0e48\u0e48\u0e48",  // Thai tone marks first
      L"\u064e\u0645\u064e \u0651\u0651",                          // Arabic marks first
      L"\u094d\u0915\u094d \u093e",                                // Devanagari virama first
      std::wstring(L"a\xdc00"
                   L"b\xd800 c\xd800\xd800 \xdfff",
                   11),  // lone halves of pairs
  };
  for (const Mode& mode : kModes) {
    CAPTURE(mode.name);
    for (const std::wstring& text : texts) {
      EngineOnCanvas e(kThaiFace, mode.scripts, 300, 200);
      CHECK(e.Draw(text, 200) >= 1);
      CheckCovers(e.engine.lastLayout(), 0, static_cast<int>(text.size()));
      CHECK(e.Draw(text, 8) >= 1);  // narrow: cut wherever it may
      CheckCovers(e.engine.lastLayout(), 0, static_cast<int>(text.size()));
    }
  }
}

TEST_CASE("Arabic, Hebrew, Thai, Devanagari, Chinese and Hangul are shaped with the fonts that cover them") {
  struct Sample {
    const wchar_t* face;
    std::wstring text;
  };
  const Sample samples[] = {
      {kArabicFace, kArabicWord1},
      {kArabicFace, L"\u05E0\u05DE\u05DC \u05D7\u05D9\u05E4\u05D4"},
      {kThaiFace, kThai.substr(0, 12)},
      {kDevanagariFace, L"\u092e\u0941\u0902\u092c\u0908 \u092c\u0902\u0926\u0930\u0917\u093e\u0939"},
      {kCjkFace, kCjk.substr(0, 6)},
      {kCjkFace, L"\ubd80\uc0b0\ud56d"},
  };
  for (const Sample& sample : samples) {
    REQUIRE(HasFace(sample.face));
    EngineOnCanvas e(sample.face, true);
    CHECK(e.Draw(sample.text, 500) == 1);
    CheckCovers(e.engine.lastLayout(), 0, static_cast<int>(sample.text.size()));
    for (const auto& run : e.engine.lastLayout()) {
      CAPTURE(run.start);
      CHECK(run.shaped);
      if (sample.text[run.start] != L' ') CHECK(run.script != 0);  // not the unshaped fallback
    }
  }
}
