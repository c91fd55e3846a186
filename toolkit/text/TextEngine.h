#pragma once
// Measures and draws paragraphs that may mix scripts and writing directions.
// With the script processor (ScriptLibrary) runs are itemized, shaped with the
// current font slot (falling back to slot 0, then to no script shaping), broken at
// soft breaks and laid out in visual order; without it, or with no current slot,
// the same lines are broken by the portable rules and drawn with plain GDI.
// Texts are UTF-16 throughout.
//
// All working arrays are fixed buffers allocated once per engine; a paragraph of
// any length is drawn whole: runs longer than the buffers are split at blanks or
// between clusters, and a line ends early when its glyphs fill the buffers.

#include <windows.h>

#include <usp10.h>

#include <memory>
#include <string_view>
#include <vector>

#include "toolkit/text/ScriptLibrary.h"

namespace toolkit {

class TextEngine {
public:
  static constexpr int kSlots = 5;
  // Glyphs of a line, items of a paragraph, runs of a line.
  static constexpr int kBufferSize = 1000;
  // The longest run shaped at once: its glyphs (at most 3/2 of its units + 16)
  // always fit the buffers.
  static constexpr int kMaxRunUnits = (kBufferSize - 16) * 2 / 3;

  // A run as it was put on a line by the last drawParagraph (drawn or measured).
  struct PlacedRun {
    int start = 0;   // in the whole text
    int length = 0;  // in UTF-16 units
    int line = 0;    // 0 for the paragraph's first line
    int x = 0;       // from the rectangle's left
    int width = 0;
    int level = 0;        // bidirectional embedding level (0 without shaping)
    int slot = -1;        // font slot it was drawn with; -1 for the DC's font
    int script = 0;       // the script processor's script id; 0 when drawn unshaped
    bool shaped = false;  // through the script processor (else plain GDI)
  };

  // With `load` the engine loads usp10.dll at its first use (measuring, drawing, or
  // asking whether it is available), not before.
  explicit TextEngine(bool load = true);
  ~TextEngine();
  TextEngine(const TextEngine&) = delete;
  TextEngine& operator=(const TextEngine&) = delete;

  // See ScriptLibrary::load; a failure leaves the engine on plain GDI. Caches made
  // with the previous library are freed first.
  bool loadScriptLibrary(const wchar_t* fileName);
  bool available() const;
  HMODULE scriptModule() const;

  // Puts `font` in slot 0..4: the slot's script cache is freed and its previous
  // font deleted if the slot owned it (unless it is the same font, which stays as
  // it is). Answers the slot, or -1 (nothing changed) outside 0..4.
  int setFontSlot(int slot, HFONT font, bool owned);
  // Makes `slot` current if it holds a font, else no slot; answers the previous one.
  int selectFontSlot(int slot);
  int currentSlot() const { return current_; }
  HFONT slotFont(int slot) const;

  // Normal, bold and bold underlined copies of `font` in slots 0, 1 and 2, kept
  // and deleted by the engine (the previous three with them). False, nothing
  // changed, when `font` is not a font.
  bool setBaseFont(HFONT font);
  HFONT baseFont(int index) const;

  // When off, a paragraph is drawn on one line whatever its width.
  void setWrap(bool on) { wrap_ = on; }
  bool wrap() const { return wrap_; }
  // When on, drawParagraph only measures and lays out.
  void setMeasureOnly(bool on) { measureOnly_ = on; }
  bool measureOnly() const { return measureOnly_; }
  // The widest run met since the last reset.
  int widest() const { return widest_; }
  void resetWidest() { widest_ = 0; }

  // Width and height of the text in the current slot's font (the DC's font with
  // no slot), shaped when the script processor is there, else GDI's extent.
  SIZE measureText(HDC dc, std::wstring_view text);

  // Draws (or measures) text[start, start + length) from (rect.left, y), broken
  // into lines no wider than the rectangle, and advances y by lineHeight per line.
  // start and length are clamped to the text; an empty paragraph or a rectangle
  // of no width only advances y by one line.
  void drawParagraph(HDC dc, std::wstring_view text, int& y, const RECT& rect, int start, int length, int lineHeight);

  // What the last drawParagraph put where, in drawing order, and how many lines.
  const std::vector<PlacedRun>& lastLayout() const { return layout_; }
  int lastLineCount() const { return lines_; }

private:
  struct Slot {
    HFONT font = nullptr;
    SCRIPT_CACHE cache = nullptr;
    bool owned = false;
  };
  struct Run {
    int start = 0;
    int length = 0;
    SCRIPT_ANALYSIS analysis{};
    int slot = 0;
    int glyphStart = 0;
    int glyphCount = 0;
    int width = 0;
  };
  struct Buffers;
  struct Paragraph;

  void loadIfPending() const;
  void freeCaches();
  void releaseSlotFont(int slot);
  HFONT selectRunFont(Paragraph& p, int slot);
  int drawShaped(Paragraph& p, int start, int end);
  void drawPlain(Paragraph& p, int start, int end);
  bool itemize(Paragraph& p, int start, int end);
  HRESULT shapeRun(Paragraph& p, Run& run, int glyphStart);
  int fitShapedRun(Paragraph& p, const Run& run, int room, bool firstOnLine);
  void splitRun(std::size_t index, int firstLength);
  void flushLine(Paragraph& p);

  // Loaded on first use, which may be a const question.
  mutable ScriptLibrary script_;
  mutable bool loadPending_;
  std::unique_ptr<Buffers> buffers_;
  Slot slots_[kSlots];
  HFONT baseFonts_[3] = {};
  int current_ = -1;
  bool wrap_ = true;
  bool measureOnly_ = false;
  int widest_ = 0;
  std::vector<Run> runs_;
  std::vector<SCRIPT_ITEM> bigItems_;
  std::vector<PlacedRun> layout_;
  int lines_ = 0;
};

}  // namespace toolkit
