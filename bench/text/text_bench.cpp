// Times TextEngine::drawParagraph over a 10,000-unit paragraph mixing Latin, Arabic,
// Hebrew, Thai, Devanagari, Chinese and Korean words, wrapped in a 400-pixel column of
// a 32-bit DIB section: drawn with the script processor, only measured, and drawn
// through plain GDI. Usage: text_bench [COUNT] (default 20 runs of each).
#include <windows.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cwchar>
#include <string>
#include <vector>

#include "toolkit/text/TextEngine.h"

namespace {

using Clock = std::chrono::steady_clock;

std::wstring MixedParagraph(std::size_t length) {
  const wchar_t* const words[] = {
      L"Brest",
      L"tide",
      L"\u0645\u064A\u0646\u0627\u0621",
      L"\u05E0\u05DE\u05DC",
      L"\u0e17\u0e48\u0e32\u0e40\u0e23\u0e37\u0e2d",
      L"\u092c\u0902\u0926\u0930\u0917\u093e\u0939",
      L"\u4e0a\u6d77\u6e2f\u53e3",
      L"\ubd80\uc0b0\ud56d",
      L"12:45",
      L"high water 6.2 m",
  };
  std::wstring text;
  for (std::size_t i = 0; text.size() < length; ++i) {
    text += words[(i * 7) % (sizeof words / sizeof words[0])];
    text += L' ';
  }
  text.resize(length);
  return text;
}

struct Figures {
  double best = 0, median = 0;
  int lines = 0;
};

Figures Time(toolkit::TextEngine& engine, HDC dc, const std::wstring& text, int count) {
  std::vector<double> ms;
  Figures f;
  for (int i = 0; i < count; ++i) {
    const RECT rect{10, 0, 410, 100000};
    int y = 0;
    const Clock::time_point start = Clock::now();
    engine.drawParagraph(dc, text, y, rect, 0, static_cast<int>(text.size()), 18);
    ms.push_back(std::chrono::duration<double, std::milli>(Clock::now() - start).count());
    f.lines = engine.lastLineCount();
  }
  std::sort(ms.begin(), ms.end());
  f.best = ms.front();
  f.median = ms[ms.size() / 2];
  return f;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  const int count = argc > 1 ? std::max(1, _wtoi(argv[1])) : 20;
  const std::wstring text = MixedParagraph(10000);

  BITMAPINFO info{};
  info.bmiHeader.biSize = sizeof info.bmiHeader;
  info.bmiHeader.biWidth = 420;
  info.bmiHeader.biHeight = -4000;
  info.bmiHeader.biPlanes = 1;
  info.bmiHeader.biBitCount = 32;
  void* bits = nullptr;
  HDC dc = CreateCompatibleDC(nullptr);
  HBITMAP bitmap = CreateDIBSection(dc, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
  if (!dc || !bitmap) {
    std::fprintf(stderr, "text_bench: no bitmap\n");
    return 1;
  }
  SelectObject(dc, bitmap);
  SetBkMode(dc, TRANSPARENT);
  LOGFONTW logFont{};
  logFont.lfHeight = -13;
  lstrcpyW(logFont.lfFaceName, L"DejaVu Sans");
  HFONT font = CreateFontIndirectW(&logFont);
  SelectObject(dc, font);

  toolkit::TextEngine shaped(true);
  toolkit::TextEngine plain(false);
  for (toolkit::TextEngine* engine : {&shaped, &plain}) {
    engine->setBaseFont(font);
    engine->selectFontSlot(0);
  }
  if (!shaped.available()) std::printf("usp10.dll not available: the shaped figures are GDI's\n");

  const Figures drawn = Time(shaped, dc, text, count);
  shaped.setMeasureOnly(true);
  const Figures measured = Time(shaped, dc, text, count);
  const Figures gdi = Time(plain, dc, text, count);
  std::printf("drawParagraph, %zu units, 400 px column, %d runs each (best / median ms)\n", text.size(), count);
  std::printf("  shaped and drawn:   %8.2f / %8.2f  (%d lines)\n", drawn.best, drawn.median, drawn.lines);
  std::printf("  shaped, measured:   %8.2f / %8.2f  (%d lines)\n", measured.best, measured.median, measured.lines);
  std::printf("  plain GDI, drawn:   %8.2f / %8.2f  (%d lines)\n", gdi.best, gdi.median, gdi.lines);
  DeleteDC(dc);
  DeleteObject(bitmap);
  DeleteObject(font);
  return 0;
}
