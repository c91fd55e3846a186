#include "toolkit/text/TextEngine.h"

#include <algorithm>
#include <climits>

#include "toolkit/text/logic/break_rules.h"
#include "toolkit/text/logic/line_filling.h"

namespace toolkit {
namespace {

// The script processor's break properties over those of the portable rules: its
// soft breaks and blanks win, but a unit either of them keeps inside a cluster
// stays there (some scripts' marks are reported as character stops).
void mergeBreaks(text::CharBreak* chars, int count, const SCRIPT_LOGATTR* attributes) {
  for (int i = 0; i < count; ++i) {
    const SCRIPT_LOGATTR& a = attributes[i];
    chars[i].clusterStart = chars[i].clusterStart && a.fCharStop;
    chars[i].softBreak = chars[i].clusterStart && a.fSoftBreak;
    chars[i].whiteSpace = a.fWhiteSpace != 0;
  }
}

}  // namespace

// The fixed working arrays: a line's glyphs share one set, a paragraph's items
// another; per-unit arrays serve the one run being shaped or broken.
struct TextEngine::Buffers {
  SCRIPT_ITEM items[kBufferSize];
  WORD glyphs[kBufferSize];
  SCRIPT_VISATTR visualAttributes[kBufferSize];
  int advances[kBufferSize];
  GOFFSET offsets[kBufferSize];
  WORD clusters[kBufferSize];
  SCRIPT_LOGATTR logicalAttributes[kBufferSize];
  int widths[kBufferSize];
  text::CharBreak chars[kBufferSize];
  int lineRuns[kBufferSize];
  BYTE levels[kBufferSize];
  int visualToLogical[kBufferSize];
  int runWidths[kBufferSize];
  int runOffsets[kBufferSize];
};

// One drawParagraph call: where it draws and the line being filled.
struct TextEngine::Paragraph {
  HDC dc;
  std::wstring_view text;
  RECT rect;
  int& y;
  int lineHeight;
  int limit;
  bool rtl;
  HGDIOBJ originalFont = nullptr;
  HFONT selected = nullptr;
  int x = 0;              // where the next line part starts (unwrapped paragraphs go on)
  bool openLine = false;  // an unwrapped line has parts and still needs its y step
  int lineCount = 0;      // runs on the line being filled
  int lineWidth = 0;
  int glyphsUsed = 0;
};

TextEngine::TextEngine(bool load) : loadPending_(load), buffers_(std::make_unique<Buffers>()) {}

void TextEngine::loadIfPending() const {
  if (!loadPending_) return;
  loadPending_ = false;
  script_.load(L"usp10.dll");
}

bool TextEngine::available() const {
  loadIfPending();
  return script_.available();
}

HMODULE TextEngine::scriptModule() const {
  loadIfPending();
  return script_.module();
}

TextEngine::~TextEngine() {
  freeCaches();
  for (int slot = 0; slot < kSlots; ++slot) releaseSlotFont(slot);
  for (HFONT& font : baseFonts_) {
    if (font) DeleteObject(font);
    font = nullptr;
  }
}

bool TextEngine::loadScriptLibrary(const wchar_t* fileName) {
  // Caches belong to the library that made them.
  loadPending_ = false;
  freeCaches();
  return script_.load(fileName);
}

void TextEngine::freeCaches() {
  for (Slot& slot : slots_) {
    if (slot.cache && script_.available()) script_.entry().freeCache(&slot.cache);
    slot.cache = nullptr;
  }
}

void TextEngine::releaseSlotFont(int slot) {
  Slot& s = slots_[slot];
  if (s.cache && script_.available()) script_.entry().freeCache(&s.cache);
  s.cache = nullptr;
  if (s.owned && s.font) {
    // A font that another slot holds too moves to that slot's ownership.
    int other = -1;
    for (int j = 0; j < kSlots; ++j)
      if (j != slot && slots_[j].font == s.font) other = j;
    if (other >= 0)
      slots_[other].owned = true;
    else
      DeleteObject(s.font);
  }
  s.font = nullptr;
  s.owned = false;
}

int TextEngine::setFontSlot(int slot, HFONT font, bool owned) {
  if (slot < 0 || slot >= kSlots) return -1;
  Slot& s = slots_[slot];
  const bool base = font && std::find(std::begin(baseFonts_), std::end(baseFonts_), font) != std::end(baseFonts_);
  if (s.font == font) {
    // The same font again: deleting it would leave the slot holding a dead handle.
    if (owned && font && !base) s.owned = true;
    return slot;
  }
  releaseSlotFont(slot);
  s.font = font;
  s.owned = owned && font && !base;
  if (!font && current_ == slot) current_ = -1;
  return slot;
}

int TextEngine::selectFontSlot(int slot) {
  const int previous = current_;
  current_ = (slot >= 0 && slot < kSlots && slots_[slot].font) ? slot : -1;
  return previous;
}

HFONT TextEngine::slotFont(int slot) const { return slot >= 0 && slot < kSlots ? slots_[slot].font : nullptr; }

HFONT TextEngine::baseFont(int index) const { return index >= 0 && index < 3 ? baseFonts_[index] : nullptr; }

bool TextEngine::setBaseFont(HFONT font) {
  LOGFONTW logFont{};
  if (!font || GetObjectType(font) != OBJ_FONT || GetObjectW(font, sizeof logFont, &logFont) != sizeof logFont)
    return false;
  HFONT made[3] = {};
  made[0] = CreateFontIndirectW(&logFont);
  logFont.lfWeight = FW_BOLD;
  made[1] = CreateFontIndirectW(&logFont);
  logFont.lfUnderline = TRUE;
  made[2] = CreateFontIndirectW(&logFont);
  if (!made[0] || !made[1] || !made[2]) {
    for (HFONT f : made)
      if (f) DeleteObject(f);
    return false;
  }

  HFONT previous[3] = {baseFonts_[0], baseFonts_[1], baseFonts_[2]};
  std::copy(std::begin(made), std::end(made), baseFonts_);
  for (int i = 0; i < 3; ++i) setFontSlot(i, made[i], false);
  // The previous set goes, and no slot may keep a handle to it.
  for (HFONT old : previous) {
    if (!old) continue;
    for (int j = 0; j < kSlots; ++j) {
      if (slots_[j].font != old) continue;
      slots_[j].owned = false;
      releaseSlotFont(j);
      if (current_ == j) current_ = -1;
    }
    DeleteObject(old);
  }
  return true;
}

SIZE TextEngine::measureText(HDC dc, std::wstring_view text) {
  SIZE size{0, 0};
  if (!dc) return size;
  const int length = static_cast<int>(std::min<std::size_t>(text.size(), INT_MAX / 2));
  HGDIOBJ previous = current_ >= 0 ? SelectObject(dc, slots_[current_].font) : nullptr;
  bool measured = false;
  if (available() && current_ >= 0 && length > 0) {
    const ScriptEntryPoints& e = script_.entry();
    DWORD flags = SSA_GLYPHS | SSA_FALLBACK;
    if (GetTextAlign(dc) & TA_RTLREADING) flags |= SSA_RTL;
    SCRIPT_STRING_ANALYSIS analysis = nullptr;
    const int glyphs = static_cast<int>(std::min<long long>(length * 3LL / 2 + 16, INT_MAX));
    if (SUCCEEDED(e.stringAnalyse(dc, text.data(), length, glyphs, -1, flags, 0, nullptr, nullptr, nullptr, nullptr,
                                  nullptr, &analysis))) {
      if (const SIZE* extent = e.stringSize(analysis)) {
        size = *extent;
        measured = true;
      }
      e.stringFree(&analysis);
    }
  }
  if (!measured && !GetTextExtentPoint32W(dc, text.data(), length, &size)) size = SIZE{0, 0};
  if (previous) SelectObject(dc, previous);
  return size;
}

// ---------------------------------------------------------------------------
// Paragraphs

void TextEngine::drawParagraph(HDC dc, std::wstring_view text, int& y, const RECT& rect, int start, int length,
                               int lineHeight) {
  layout_.clear();
  lines_ = 0;
  const int size = static_cast<int>(std::min<std::size_t>(text.size(), INT_MAX));
  start = std::clamp(start, 0, size);
  length = std::clamp(length, 0, size - start);
  const long long width = static_cast<long long>(rect.right) - rect.left;
  if (!dc || length == 0 || width <= 0) {
    y += lineHeight;
    return;
  }

  const UINT align = GetTextAlign(dc);
  Paragraph p{dc,
              text,
              rect,
              y,
              lineHeight,
              static_cast<int>(std::min<long long>(width, INT_MAX)),
              (align & TA_RTLREADING) != 0};
  const int end = start + length;
  int reached = start;
  if (available() && current_ >= 0) {
    // Glyph runs are placed by the engine, so the DC must not align or reorder them.
    SetTextAlign(dc, TA_LEFT | TA_TOP | TA_NOUPDATECP);
    reached = drawShaped(p, start, end);
  }
  if (reached < end) {
    SetTextAlign(dc, TA_LEFT | TA_TOP | TA_NOUPDATECP | (align & TA_RTLREADING));
    if (current_ >= 0) selectRunFont(p, current_);
    drawPlain(p, reached, end);
  }
  if (p.openLine) {
    y += lineHeight;
    ++lines_;
  }
  SetTextAlign(dc, align);
  if (p.originalFont) SelectObject(dc, p.originalFont);
}

HFONT TextEngine::selectRunFont(Paragraph& p, int slot) {
  HFONT font = slots_[slot].font;
  if (font && font != p.selected) {
    HGDIOBJ old = SelectObject(p.dc, font);
    if (!p.originalFont) p.originalFont = old;
    p.selected = font;
  }
  return font;
}

// Shapes and draws the paragraph line by line; answers where it stopped: the end,
// or the start of a run the script processor could not take (drawn by GDI then).
int TextEngine::drawShaped(Paragraph& p, int start, int end) {
  if (!itemize(p, start, end)) return start;
  Buffers& b = *buffers_;
  for (std::size_t i = 0; i < runs_.size();) {
    HRESULT hr = shapeRun(p, runs_[i], p.glyphsUsed);
    if (hr == E_OUTOFMEMORY) {
      // The line's glyph buffers are full: the line ends, the run starts the next.
      if (p.lineCount > 0) {
        flushLine(p);
        continue;
      }
      // Alone on a line and still too many glyphs: shape it in halves.
      const Run& run = runs_[i];
      if (run.length <= 1) return run.start;
      text::markBreaks(p.text.data() + run.start, static_cast<std::size_t>(run.length), b.chars);
      const std::size_t half = text::splitPoint(b.chars, run.length, run.length / 2);
      splitRun(i, static_cast<int>(std::max<std::size_t>(half, 1)));
      continue;
    }
    if (FAILED(hr)) {
      if (p.lineCount > 0) flushLine(p);
      return runs_[i].start;
    }
    if (!wrap_ || static_cast<long long>(p.lineWidth) + runs_[i].width <= p.limit) {
      b.lineRuns[p.lineCount++] = static_cast<int>(i);
      p.lineWidth += runs_[i].width;
      p.glyphsUsed += runs_[i].glyphCount;
      ++i;
      if (p.lineCount == kBufferSize) flushLine(p);
      continue;
    }
    // The run passes the limit: its first part ends the line.
    int fit = fitShapedRun(p, runs_[i], p.limit - p.lineWidth, p.lineCount == 0);
    for (int attempt = 0; fit > 0 && fit < runs_[i].length && attempt < 4; ++attempt) {
      splitRun(i, fit);
      hr = shapeRun(p, runs_[i], p.glyphsUsed);
      if (FAILED(hr)) {
        if (p.lineCount > 0) flushLine(p);
        return runs_[i].start;
      }
      // Placed wider than its logical widths told (marks, overhangs): cut again
      // with that much less room.
      const int excess = p.lineWidth + runs_[i].width - p.limit;
      if (excess <= 0) break;
      fit = fitShapedRun(p, runs_[i], p.limit - p.lineWidth - excess, p.lineCount == 0);
    }
    if (fit == 0) {
      flushLine(p);
      continue;
    }
    b.lineRuns[p.lineCount++] = static_cast<int>(i);
    p.lineWidth += runs_[i].width;
    p.glyphsUsed += runs_[i].glyphCount;
    ++i;
    flushLine(p);
  }
  if (p.lineCount > 0) flushLine(p);
  return end;
}

// The paragraph's items, as runs of at most kMaxRunUnits in the current slot.
bool TextEngine::itemize(Paragraph& p, int start, int end) {
  const ScriptEntryPoints& e = script_.entry();
  Buffers& b = *buffers_;
  SCRIPT_CONTROL control{};
  SCRIPT_STATE state{};
  state.uBidiLevel = p.rtl ? 1 : 0;
  const wchar_t* units = p.text.data() + start;
  const int length = end - start;
  SCRIPT_ITEM* items = b.items;
  int count = 0;
  // Itemizing needs room for one item more than it answers.
  HRESULT hr = e.itemize(units, length, kBufferSize - 1, &control, &state, items, &count);
  if (FAILED(hr) && length + 1 > kBufferSize - 1) {
    bigItems_.resize(static_cast<std::size_t>(length) + 2);
    items = bigItems_.data();
    hr = e.itemize(units, length, length + 1, &control, &state, items, &count);
  }
  if (FAILED(hr) || count <= 0) return false;

  runs_.clear();
  for (int k = 0; k < count; ++k) {
    int at = start + items[k].iCharPos;
    const int itemEnd = start + (k + 1 < count ? items[k + 1].iCharPos : length);
    while (at < itemEnd) {
      int piece = itemEnd - at;
      if (piece > kMaxRunUnits) {
        // Too long to shape at once: cut at a blank, else between clusters.
        const int window = std::min(piece, kBufferSize);
        SCRIPT_ANALYSIS analysis = items[k].a;
        const wchar_t* units = p.text.data() + at;
        text::markBreaks(units, static_cast<std::size_t>(window), b.chars);
        if (SUCCEEDED(e.breakText(units, window, &analysis, b.logicalAttributes)))
          mergeBreaks(b.chars, window, b.logicalAttributes);
        piece = static_cast<int>(text::splitPoint(b.chars, window, kMaxRunUnits));
        if (piece <= 0) piece = kMaxRunUnits;
      }
      Run run;
      run.start = at;
      run.length = piece;
      run.analysis = items[k].a;
      run.slot = current_;
      // Marks with nothing to sit on (bad input, or a blank before them in another
      // item) go in a run of their own, unshaped: mark positioning without a base
      // glyph is where script processors fail.
      int marks = 0;
      while (marks < piece && text::continuesCluster(u' ', static_cast<char16_t>(p.text[at + marks]))) ++marks;
      if (marks > 0 && marks < piece) {
        Run bare = run;
        bare.length = marks;
        bare.analysis.eScript = SCRIPT_UNDEFINED;
        runs_.push_back(bare);
        run.start += marks;
        run.length -= marks;
      } else if (marks == piece) {
        run.analysis.eScript = SCRIPT_UNDEFINED;
      }
      runs_.push_back(run);
      at += piece;
    }
  }
  return true;
}

// Shapes and places `run` into the line's glyph buffers from `glyphStart`, with
// its own font, else the fallback font of slot 0, else without script shaping.
HRESULT TextEngine::shapeRun(Paragraph& p, Run& run, int glyphStart) {
  const ScriptEntryPoints& e = script_.entry();
  Buffers& b = *buffers_;
  const int room = kBufferSize - glyphStart;
  if (room <= 0) return E_OUTOFMEMORY;
  const wchar_t* units = p.text.data() + run.start;
  int count = 0;
  auto shape = [&](int slot) {
    selectRunFont(p, slot);
    return e.shape(p.dc, &slots_[slot].cache, units, run.length, room, &run.analysis, b.glyphs + glyphStart, b.clusters,
                   b.visualAttributes + glyphStart, &count);
  };
  HRESULT hr = shape(run.slot);
  if (hr == USP_E_SCRIPT_NOT_IN_FONT && run.slot != 0 && slots_[0].font) {
    hr = shape(0);
    if (SUCCEEDED(hr)) run.slot = 0;
  }
  if (hr == USP_E_SCRIPT_NOT_IN_FONT) {
    run.analysis.eScript = SCRIPT_UNDEFINED;
    hr = shape(run.slot);
  }
  if (FAILED(hr)) return hr;

  ABC abc{};
  selectRunFont(p, run.slot);
  hr = e.place(p.dc, &slots_[run.slot].cache, b.glyphs + glyphStart, count, b.visualAttributes + glyphStart,
               &run.analysis, b.advances + glyphStart, b.offsets + glyphStart, &abc);
  if (FAILED(hr)) return hr;
  run.glyphStart = glyphStart;
  run.glyphCount = count;
  run.width = abc.abcA + static_cast<int>(abc.abcB) + abc.abcC;
  return S_OK;
}

// How many units of the run just shaped go on the line (see text::fitRun).
int TextEngine::fitShapedRun(Paragraph& p, const Run& run, int room, bool firstOnLine) {
  const ScriptEntryPoints& e = script_.entry();
  Buffers& b = *buffers_;
  const wchar_t* units = p.text.data() + run.start;
  SCRIPT_ANALYSIS analysis = run.analysis;
  text::markBreaks(units, static_cast<std::size_t>(run.length), b.chars);
  if (SUCCEEDED(e.breakText(units, run.length, &analysis, b.logicalAttributes)))
    mergeBreaks(b.chars, run.length, b.logicalAttributes);
  // Units that shaping put in one glyph cluster stay together too.
  for (int i = 1; i < run.length; ++i)
    if (b.clusters[i] == b.clusters[i - 1]) b.chars[i].clusterStart = false;
  if (SUCCEEDED(e.getLogicalWidths(&run.analysis, run.length, run.glyphCount, b.advances + run.glyphStart, b.clusters,
                                   b.visualAttributes + run.glyphStart, b.widths))) {
    for (int i = 0; i < run.length; ++i) b.chars[i].width = b.widths[i];
  } else {
    for (int i = 0; i < run.length; ++i) b.chars[i].width = run.width / run.length;
  }
  return static_cast<int>(text::fitRun(b.chars, run.length, room, firstOnLine));
}

void TextEngine::splitRun(std::size_t index, int firstLength) {
  Run rest = runs_[index];
  rest.start += firstLength;
  rest.length -= firstLength;
  runs_[index].length = firstLength;
  runs_.insert(runs_.begin() + static_cast<std::ptrdiff_t>(index) + 1, rest);
}

// Orders the line's runs visually, draws them and starts the next line.
void TextEngine::flushLine(Paragraph& p) {
  const ScriptEntryPoints& e = script_.entry();
  Buffers& b = *buffers_;
  const int n = p.lineCount;
  for (int k = 0; k < n; ++k) {
    const Run& run = runs_[b.lineRuns[k]];
    b.levels[k] = static_cast<BYTE>(run.analysis.s.uBidiLevel);
    b.runWidths[k] = run.width;
  }
  if (FAILED(e.layout(n, b.levels, b.visualToLogical, nullptr)))
    for (int k = 0; k < n; ++k) b.visualToLogical[k] = k;
  text::visualOffsets(b.runWidths, b.visualToLogical, n, b.runOffsets);

  for (int v = 0; v < n; ++v) {
    const int k = b.visualToLogical[v];
    Run& run = runs_[b.lineRuns[k]];
    const int x = p.x + b.runOffsets[k];
    if (!measureOnly_) {
      selectRunFont(p, run.slot);
      e.textOut(p.dc, &slots_[run.slot].cache, p.rect.left + x, p.y, 0, nullptr, &run.analysis, nullptr, 0,
                b.glyphs + run.glyphStart, run.glyphCount, b.advances + run.glyphStart, nullptr,
                b.offsets + run.glyphStart);
    }
    widest_ = std::max(widest_, run.width);
    layout_.push_back(PlacedRun{run.start, run.length, lines_, x, run.width,
                                static_cast<int>(run.analysis.s.uBidiLevel), run.slot,
                                static_cast<int>(run.analysis.eScript), true});
  }
  if (wrap_) {
    p.y += p.lineHeight;
    ++lines_;
  } else {
    p.x += p.lineWidth;
    p.openLine = true;
  }
  p.lineCount = 0;
  p.lineWidth = 0;
  p.glyphsUsed = 0;
}

// The GDI fallback: lines cut by the portable break rules over GDI's extents.
void TextEngine::drawPlain(Paragraph& p, int start, int end) {
  Buffers& b = *buffers_;
  const wchar_t* units = p.text.data();
  const int slot = current_ >= 0 ? current_ : -1;
  if (!wrap_) {
    const int n = end - start;
    SIZE size{};
    if (!GetTextExtentPoint32W(p.dc, units + start, n, &size)) size = SIZE{0, 0};
    if (!measureOnly_)
      ExtTextOutW(p.dc, p.rect.left + p.x, p.y, 0, nullptr, units + start, static_cast<UINT>(n), nullptr);
    widest_ = std::max(widest_, static_cast<int>(size.cx));
    layout_.push_back(PlacedRun{start, n, lines_, p.x, static_cast<int>(size.cx), 0, slot, 0, false});
    p.x += size.cx;
    p.openLine = true;
    return;
  }

  TEXTMETRICW metrics{};
  bool haveMetrics = false;
  for (int at = start; at < end;) {
    const int chunk = std::min(end - at, kBufferSize);
    SIZE total{};
    if (!GetTextExtentExPointW(p.dc, units + at, chunk, 0, nullptr, b.widths, &total)) {
      if (!haveMetrics) haveMetrics = GetTextMetricsW(p.dc, &metrics) != 0;
      const int average = haveMetrics ? static_cast<int>(metrics.tmAveCharWidth) : 8;
      for (int i = 0; i < chunk; ++i) b.widths[i] = (i + 1) * average;
    }
    text::markBreaks(units + at, static_cast<std::size_t>(chunk), b.chars);
    for (int i = 0; i < chunk; ++i) b.chars[i].width = b.widths[i] - (i > 0 ? b.widths[i - 1] : 0);
    int n = static_cast<int>(text::fitRun(b.chars, chunk, p.limit, true));
    if (n == chunk && at + chunk < end) {
      // Cut short by the buffers, not the width: end at a break if the text goes on mid-word.
      text::CharBreak next;
      text::markBreak(static_cast<char16_t>(units[at + chunk - 1]), static_cast<char16_t>(units[at + chunk]), next);
      if (!next.softBreak && !next.whiteSpace) {
        n = static_cast<int>(text::lastSoftBreak(b.chars, chunk));
        if (n == chunk && !next.clusterStart) {
          // No break either: at least keep the cluster that runs on whole.
          n = chunk - 1;
          while (n > 1 && !b.chars[n].clusterStart) --n;
          n = std::max(n, 1);
        }
      }
    }
    const int lineWidth = b.widths[n - 1];
    if (!measureOnly_) ExtTextOutW(p.dc, p.rect.left, p.y, 0, nullptr, units + at, static_cast<UINT>(n), nullptr);
    widest_ = std::max(widest_, lineWidth);
    layout_.push_back(PlacedRun{at, n, lines_, 0, lineWidth, 0, slot, 0, false});
    p.y += p.lineHeight;
    ++lines_;
    at += n;
  }
}

}  // namespace toolkit
