#include "toolkit/widgets/cXEdit2.h"

#include <oleauto.h>

#include <algorithm>
#include <vector>

#include "toolkit/base/class_records.h"
#include "toolkit/widgets/support/MeasuringDC.h"
#include "toolkit/widgets/support/WindowsClipboard.h"

namespace toolkit {

namespace {

bool keyDown(int virtualKey) { return GetKeyState(virtualKey) < 0; }

EditKey editKeyOf(int virtualKey) {
  switch (virtualKey) {
    case VK_LEFT: return EditKey::Left;
    case VK_RIGHT: return EditKey::Right;
    case VK_HOME: return EditKey::Home;
    case VK_END: return EditKey::End;
    case VK_BACK: return EditKey::Backspace;
    case VK_DELETE: return EditKey::Delete;
    case VK_INSERT: return EditKey::Insert;
    case 'A': return EditKey::LetterA;
    case 'C': return EditKey::LetterC;
    case 'V': return EditKey::LetterV;
    case 'X': return EditKey::LetterX;
    default: return EditKey::Other;
  }
}

}  // namespace

cXEdit2::cXEdit2(int maxLength) : model_(maxLength) {}

const ClassRecord* cXEdit2::getClassRecord() const { return &records::cXEdit2; }

// Configuration ---------------------------------------------------------------------

bool cXEdit2::setEditType(int type, const char* mask) {
  if (!model_.setEditType(type, mask ? mask : "")) return false;
  setTodayIfDate();
  refresh();
  return true;
}

void cXEdit2::setTodayIfDate() {
  if (model_.type() != kEditMonth) return;
  SYSTEMTIME now{};
  GetLocalTime(&now);
  now.wHour = now.wMinute = now.wSecond = now.wMilliseconds = 0;
  double today = 0;
  if (SystemTimeToVariantTime(&now, &today)) setValue(today);
}

void cXEdit2::setText(std::string_view text) {
  model_.setText(text);
  refresh();
}

std::string cXEdit2::getText() const { return model_.text(); }

bool cXEdit2::setNumber(int number) {
  if (!model_.setNumber(number)) return false;
  refresh();
  return true;
}

bool cXEdit2::setValue(double value) {
  bool done;
  if (model_.type() == kEditMonth) {
    SYSTEMTIME when{};
    done = VariantTimeToSystemTime(value, &when) != FALSE;
    if (done) {
      char buffer[128] = {};
      const int written = GetDateFormatA(LOCALE_SYSTEM_DEFAULT, 0, &when, model_.mask().c_str(), buffer,
                                         static_cast<int>(sizeof(buffer)));
      done = written > 0 && model_.setDateText(std::string_view(buffer, static_cast<size_t>(written - 1)), value);
    }
  } else {
    done = model_.setValue(value);
  }
  if (done) refresh();
  return done;
}

bool cXEdit2::setMaxLength(int maxLength) {
  if (!model_.setMaxLength(maxLength)) return false;
  refresh();
  return true;
}

bool cXEdit2::setSelectionLength(int length) {
  if (!model_.setSelectionLength(length)) return false;
  refresh();
  return true;
}

bool cXEdit2::setOverwrite(bool overwrite) { return model_.setOverwrite(overwrite); }

void cXEdit2::setCaret(int position, int selectionLength) {
  model_.setCaret(position, selectionLength);
  refresh();
}

void cXEdit2::lendFont(HFONT font) {
  cXComponent::lendFont(font);
  refresh();
}

void cXEdit2::setEnabled(bool enabled) {
  cXComponent::setEnabled(enabled);
  invalidate();
}

// Drawing ---------------------------------------------------------------------------

HGDIOBJ cXEdit2::selectFont(HDC dc) const {
  HFONT font = getFont();
  return SelectObject(dc, font ? static_cast<HGDIOBJ>(font) : GetStockObject(DEFAULT_GUI_FONT));
}

int cXEdit2::textX(HDC dc, int index) const {
  const std::string& text = model_.text();
  index = std::clamp(index, 0, static_cast<int>(text.size()));
  SIZE extent{0, 0};
  if (index > 0) GetTextExtentPoint32A(dc, text.c_str(), index, &extent);
  return extent.cx;
}

void cXEdit2::refresh() {
  text_ = model_.text();  // the stored component text follows the edit
  if (!isValid()) return;
  HWND hwnd = getHandle();
  HDC dc = GetDC(hwnd);
  if (dc) {
    HGDIOBJ old = selectFont(dc);
    const RECT client = getClientRect();
    const int visible = std::max<int>(client.right - client.left - 2 * kMargin, 1);
    const int caretX = textX(dc, model_.caret());
    // Keep the caret in view; scroll back when the text got shorter.
    if (caretX - scroll_ > visible) scroll_ = caretX - visible;
    if (caretX < scroll_) scroll_ = caretX;
    const int textWidth = textX(dc, static_cast<int>(model_.text().size()));
    if (scroll_ > 0 && textWidth - scroll_ < visible) scroll_ = std::max(0, textWidth - visible);
    SelectObject(dc, old);
    ReleaseDC(hwnd, dc);
  }
  placeSystemCaret();
  invalidate();
}

void cXEdit2::placeSystemCaret() {
  if (!hasCaret_ || !isValid()) return;
  HWND hwnd = getHandle();
  HDC dc = GetDC(hwnd);
  if (!dc) return;
  HGDIOBJ old = selectFont(dc);
  TEXTMETRICA tm{};
  GetTextMetricsA(dc, &tm);
  const RECT client = getClientRect();
  const int x = kMargin + textX(dc, model_.caret()) - scroll_;
  const int y = (client.bottom - client.top - tm.tmHeight) / 2;
  SelectObject(dc, old);
  ReleaseDC(hwnd, dc);
  SetCaretPos(x, y);
}

void cXEdit2::paint(HDC dc) {
  const RECT client = getClientRect();
  if (client.right <= client.left || client.bottom <= client.top) return;
  render(dc, client);
}

void cXEdit2::render(HDC target, const RECT& client) {
  const int width = client.right - client.left, height = client.bottom - client.top;
  HDC memory = CreateCompatibleDC(target);
  HBITMAP bitmap = memory ? CreateCompatibleBitmap(target, width, height) : nullptr;
  if (!bitmap) {
    if (memory) DeleteDC(memory);
    return;
  }
  HGDIOBJ oldBitmap = SelectObject(memory, bitmap);
  HGDIOBJ oldFont = selectFont(memory);
  const bool enabled = getEnabledFlag();
  const RECT whole{0, 0, width, height};
  SetBkColor(memory, colorOf(enabled ? COLOR_WINDOW : COLOR_BTNFACE));
  ExtTextOutA(memory, 0, 0, ETO_OPAQUE, &whole, nullptr, 0, nullptr);

  TEXTMETRICA tm{};
  GetTextMetricsA(memory, &tm);
  const std::string& text = model_.text();
  const int length = static_cast<int>(text.size());
  const int x0 = kMargin - scroll_;
  const int y = (height - tm.tmHeight) / 2;
  SetBkMode(memory, TRANSPARENT);
  SetTextColor(memory, colorOf(enabled ? COLOR_WINDOWTEXT : COLOR_GRAYTEXT));
  ExtTextOutA(memory, x0, y, 0, nullptr, text.c_str(), static_cast<UINT>(length), nullptr);

  const int from = model_.selectionStart(), to = model_.selectionEnd();
  if (to > from) {
    const int left = x0 + textX(memory, from), right = x0 + textX(memory, to);
    const RECT band{left, y, right, y + tm.tmHeight};
    SetBkMode(memory, OPAQUE);
    SetBkColor(memory, colorOf(COLOR_HIGHLIGHT));
    SetTextColor(memory, colorOf(COLOR_HIGHLIGHTTEXT));
    ExtTextOutA(memory, left, y, ETO_OPAQUE | ETO_CLIPPED, &band, text.c_str() + from,
                static_cast<UINT>(to - from), nullptr);
  }
  BitBlt(target, client.left, client.top, width, height, memory, 0, 0, SRCCOPY);
  SelectObject(memory, oldFont);
  SelectObject(memory, oldBitmap);
  DeleteObject(bitmap);
  DeleteDC(memory);
}

int cXEdit2::indexAt(int x) {
  if (!isValid()) return 0;
  const std::string& text = model_.text();
  HWND hwnd = getHandle();
  HDC dc = GetDC(hwnd);
  if (!dc) return 0;
  HGDIOBJ old = selectFont(dc);
  const int wanted = x - kMargin + scroll_;
  int best = 0;
  int previous = 0;
  for (int i = 1; i <= static_cast<int>(text.size()); ++i) {
    const int edge = textX(dc, i);
    if (wanted < (previous + edge) / 2) break;  // nearer to the boundary before
    best = i;
    previous = edge;
  }
  SelectObject(dc, old);
  ReleaseDC(hwnd, dc);
  return best;
}

// Input -----------------------------------------------------------------------------

int cXEdit2::onKeyDown(ToolkitEvent& event, int key) {
  if (event.source != this || !isVisible()) return 0;
  const EditKey editKey = editKeyOf(key);
  if (editKey == EditKey::Other) return 0;
  WindowsClipboard clipboard(getHandle());
  if (!model_.pressKey(editKey, keyDown(VK_SHIFT), keyDown(VK_CONTROL), clipboard)) return 0;
  event.handled = true;
  refresh();
  return 1;
}

int cXEdit2::onChar(ToolkitEvent& event, int ch) {
  if (event.source != this || !isVisible()) return 0;
  if (ch < 0x20 && keyDown(VK_CONTROL)) {
    event.handled = true;  // Ctrl+letter: the key-down did the work
    return 1;
  }
  if (!model_.typeChar(static_cast<unsigned char>(ch))) return 0;
  event.handled = true;
  refresh();
  return 1;
}

int cXEdit2::onMouseDown(ToolkitEvent& event, int x, int) {
  if (event.source != this || event.params[2] != 0) return 0;
  model_.placeCaret(indexAt(x), false);
  if (model_.isFree()) {
    captureMouse();
    dragging_ = true;
  }
  refresh();
  return 1;
}

int cXEdit2::onMouseDrag(ToolkitEvent& event, int x, int) {
  if (event.source != this || !dragging_) return 0;
  model_.placeCaret(indexAt(x), true);
  refresh();
  return 1;
}

int cXEdit2::onMouseUp(ToolkitEvent& event, int, int) {
  if (event.source != this || !dragging_) return 0;
  dragging_ = false;
  if (GetCapture() == getHandle()) ReleaseCapture();
  return 1;
}

int cXEdit2::onFocusGained(ToolkitEvent& event) {
  if (event.source == this && isValid()) {
    MeasuringDC dc(getFont());
    const int height = dc.valid() ? dc.metrics().tmHeight : 16;
    hasCaret_ = CreateCaret(getHandle(), nullptr, 1, height) != FALSE;
    placeSystemCaret();
    if (hasCaret_) ShowCaret(getHandle());
  }
  return 0;  // owners (an editing table) want to know too
}

int cXEdit2::onFocusLost(ToolkitEvent& event) {
  if (event.source == this && hasCaret_) {
    DestroyCaret();
    hasCaret_ = false;
  }
  dragging_ = false;
  return 0;
}

int cXEdit2::onResized(ToolkitEvent& event) {
  if (event.source == this) refresh();
  return 0;
}

// Sizes -----------------------------------------------------------------------------

SIZE cXEdit2::getPreferredSize() {
  MeasuringDC dc(getFont());
  if (!dc.valid()) return SIZE{100, 20};
  const TEXTMETRICA& tm = dc.metrics();
  const int limit = model_.maxLength();
  const int characters = limit > 0 ? std::min(limit, 30) : 10;
  const int textWidth = dc.measure(model_.text(), DT_SINGLELINE).cx;
  const int width = std::max<int>(characters * tm.tmAveCharWidth, textWidth) + 2 * kMargin + 2;
  return SIZE{width + insets_.left + insets_.right, tm.tmHeight + 2 * kMargin + insets_.top + insets_.bottom};
}

SIZE cXEdit2::getPreferredSizeIn(const RECT&) { return getPreferredSize(); }

}  // namespace toolkit
