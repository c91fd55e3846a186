#pragma once
// Fonts, a drawing surface and checks over the text engine's layout report,
// shared by the text engine suites of this folder.

#include <windows.h>

#include <string>
#include <vector>

#include "tests/wine/common/Canvas.h"
#include "toolkit/text/TextEngine.h"

namespace br::test {

// A font of `face` at `height` pixels (negative: character height); deleted with it.
class TestFont {
public:
  explicit TestFont(const wchar_t* face, int height = -16, int weight = FW_NORMAL);
  ~TestFont();
  TestFont(const TestFont&) = delete;
  TestFont& operator=(const TestFont&) = delete;
  HFONT get() const { return font_; }

private:
  HFONT font_;
};

// Faces Wine shapes each script with (installed by ./run).
inline const wchar_t* const kArabicFace = L"DejaVu Sans";
inline const wchar_t* const kThaiFace = L"Garuda";
inline const wchar_t* const kDevanagariFace = L"Lohit Devanagari";
inline const wchar_t* const kCjkFace = L"WenQuanYi Micro Hei";

// True when a face of that name is installed.
bool HasFace(const wchar_t* face);

// A white canvas with black text, and an engine whose base font (current slot 0) is `face`.
struct EngineOnCanvas {
  EngineOnCanvas(const wchar_t* face, bool withScripts, int width = 600, int height = 600);
  Canvas canvas;
  TestFont font;
  toolkit::TextEngine engine;
  HGDIOBJ oldFont;
  ~EngineOnCanvas();
  // Lays out (and draws) text in a rectangle `width` wide from (10, 10); answers the line count.
  int Draw(const std::wstring& text, int width, int lineHeight = 20);
  int Draw(const std::wstring& text, int width, int start, int length, int lineHeight = 20);
  int y = 0;
};

// The runs cover [start, start + length) once each, without gaps.
void CheckCovers(const std::vector<toolkit::TextEngine::PlacedRun>& layout, int start, int length);
// Runs of one line, and the line's width.
std::vector<toolkit::TextEngine::PlacedRun> LineRuns(const std::vector<toolkit::TextEngine::PlacedRun>& layout,
                                                     int line);
int LineWidth(const std::vector<toolkit::TextEngine::PlacedRun>& layout, int line);
// Where each line after the first starts in the text.
std::vector<int> LineStarts(const std::vector<toolkit::TextEngine::PlacedRun>& layout, int lines);
// Pixels darker than mid grey inside the rectangle.
int InkIn(const Canvas& canvas, int left, int top, int right, int bottom);

}  // namespace br::test
