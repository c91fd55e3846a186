#include "tests/wine/toolkit/text/text_test_support.h"

#include <doctest/doctest.h>

#include <algorithm>
#include <cwchar>

namespace br::test {

using toolkit::TextEngine;

TestFont::TestFont(const wchar_t* face, int height, int weight) {
  LOGFONTW logFont{};
  logFont.lfHeight = height;
  logFont.lfWeight = weight;
  logFont.lfCharSet = DEFAULT_CHARSET;
  lstrcpynW(logFont.lfFaceName, face, LF_FACESIZE);
  font_ = CreateFontIndirectW(&logFont);
}

TestFont::~TestFont() {
  if (font_) DeleteObject(font_);
}

namespace {
int CALLBACK FoundFace(const LOGFONTW*, const TEXTMETRICW*, DWORD, LPARAM found) {
  *reinterpret_cast<bool*>(found) = true;
  return 0;
}
}  // namespace

bool HasFace(const wchar_t* face) {
  HDC dc = GetDC(nullptr);
  LOGFONTW logFont{};
  logFont.lfCharSet = DEFAULT_CHARSET;
  lstrcpynW(logFont.lfFaceName, face, LF_FACESIZE);
  bool found = false;
  EnumFontFamiliesExW(dc, &logFont, FoundFace, reinterpret_cast<LPARAM>(&found), 0);
  ReleaseDC(nullptr, dc);
  return found;
}

EngineOnCanvas::EngineOnCanvas(const wchar_t* face, bool withScripts, int width, int height)
    : canvas(width, height, RGB(255, 255, 255)), font(face), engine(withScripts) {
  REQUIRE(font.get());
  oldFont = SelectObject(canvas.Dc(), font.get());
  SetTextColor(canvas.Dc(), RGB(0, 0, 0));
  SetBkMode(canvas.Dc(), TRANSPARENT);
  REQUIRE(engine.setBaseFont(font.get()));
  engine.selectFontSlot(0);
}

EngineOnCanvas::~EngineOnCanvas() { SelectObject(canvas.Dc(), oldFont); }

int EngineOnCanvas::Draw(const std::wstring& text, int width, int lineHeight) {
  return Draw(text, width, 0, static_cast<int>(text.size()), lineHeight);
}

int EngineOnCanvas::Draw(const std::wstring& text, int width, int start, int length, int lineHeight) {
  const RECT rect{10, 10, 10 + width, canvas.Height()};
  y = 10;
  engine.drawParagraph(canvas.Dc(), text, y, rect, start, length, lineHeight);
  return engine.lastLineCount();
}

void CheckCovers(const std::vector<TextEngine::PlacedRun>& layout, int start, int length) {
  std::vector<TextEngine::PlacedRun> runs = layout;
  std::sort(runs.begin(), runs.end(), [](const auto& a, const auto& b) { return a.start < b.start; });
  int at = start;
  for (const auto& run : runs) {
    CHECK(run.start == at);
    CHECK(run.length > 0);
    at = run.start + run.length;
  }
  CHECK(at == start + length);
}

std::vector<TextEngine::PlacedRun> LineRuns(const std::vector<TextEngine::PlacedRun>& layout, int line) {
  std::vector<TextEngine::PlacedRun> runs;
  for (const auto& run : layout)
    if (run.line == line) runs.push_back(run);
  return runs;
}

int LineWidth(const std::vector<TextEngine::PlacedRun>& layout, int line) {
  int width = 0;
  for (const auto& run : LineRuns(layout, line)) width += run.width;
  return width;
}

std::vector<int> LineStarts(const std::vector<TextEngine::PlacedRun>& layout, int lines) {
  std::vector<int> starts;
  for (int line = 1; line < lines; ++line) {
    int first = -1;
    for (const auto& run : LineRuns(layout, line))
      if (first < 0 || run.start < first) first = run.start;
    starts.push_back(first);
  }
  return starts;
}

int InkIn(const Canvas& canvas, int left, int top, int right, int bottom) {
  int ink = 0;
  for (int y = std::max(top, 0); y < std::min(bottom, canvas.Height()); ++y)
    for (int x = std::max(left, 0); x < std::min(right, canvas.Width()); ++x) {
      const COLORREF c = canvas.At(x, y);
      if (GetRValue(c) + GetGValue(c) + GetBValue(c) < 3 * 128) ++ink;
    }
  return ink;
}

}  // namespace br::test
