#pragma once
// The hover popup that every component window gets: a hidden window of the
// class "AwtAtl__Tooltip__WindowClass" holding a text and a size. One global
// timer (50 ms) watches which listed owner window lies under the cursor (the
// innermost one, when components are nested) and arms its popup; the armed
// popup's own timer (20 ms) shows it after a second of hovering and hides it
// when the cursor leaves or a mouse button goes down.
// Before showing, the owner gets WM_NOTIFY (id 0xF001, code 3) so that it can
// set the text just in time.

#include <windows.h>

#include <string>
#include <string_view>

namespace toolkit {

class cXComponent;

class Tooltip {
public:
  static constexpr const char* kClassName = "AwtAtl__Tooltip__WindowClass";
  static constexpr UINT kScanPeriodMs = 50;
  static constexpr UINT_PTR kTimerId = 1;
  static constexpr UINT kTimerPeriodMs = 20;
  static constexpr DWORD kDelayMs = 1000;
  static constexpr UINT_PTR kNotifyId = 0xF001;
  static constexpr UINT kNotifyCode = 3;
  static constexpr int kTextInset = 3;

  // Makes the hidden popup for an owner window and lists it. Null on failure.
  static HWND createFor(HWND owner);
  // The popup object of a popup window, or null.
  static Tooltip* of(HWND popup);
  static Tooltip* of(const cXComponent& component);
  static size_t count();
  // For module unload: every popup, the scan timer and the window class go.
  static void shutdown();

  void setText(std::string_view text);
  void setSize(int width, int height);
  // The text with a size that fits it, wrapped at `maxWidth` pixels.
  void setFittedText(std::string_view text, int maxWidth = 300);

  const std::string& text() const { return text_; }
  int textLength() const { return static_cast<int>(text_.size()); }
  SIZE size() const { return SIZE{width_, height_}; }
  HWND window() const { return popup_; }
  HWND owner() const { return owner_; }
  bool isShown() const { return shown_; }
  bool isArmed() const { return timerRunning_; }
  DWORD armedAt() const { return armedAt_; }

  // Where a popup of `popup` size goes for the cursor at `cursor`.
  static POINT placement(POINT cursor, SIZE popup, int screenWidth, int screenHeight, int cursorHeight);
  // Background, frame and wrapped text into any DC (the popup paints through it).
  void draw(HDC dc, const RECT& client) const;

private:
  Tooltip(HWND owner);
  ~Tooltip();

  static bool registerClass();
  static LRESULT CALLBACK windowProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam);
  static void CALLBACK scan(HWND, UINT, UINT_PTR, DWORD);
  static void startScanning();
  static Tooltip* findOwner(HWND hwnd);
  static Tooltip* underCursor();
  static void stopScanningWhenIdle();

  bool cursorOverOwner() const;
  void arm();
  void tick();
  void show();
  void hide();

  HWND popup_ = nullptr;
  HWND owner_ = nullptr;
  std::string text_;
  int width_ = 0;
  int height_ = 0;
  DWORD armedAt_ = 0;
  bool timerRunning_ = false;
  // Set once the popup was shown (or the owner left it nothing to show) during
  // the current visit, so that the owner is asked only once per visit.
  bool shown_ = false;
};

}  // namespace toolkit
