#pragma once
// Base of every toolkit component. A component owns one native child window
// (through its ComponentPeer), answers its class record first, and receives the
// window's messages as ToolkitEvents, which it hands to its handlers; whatever a
// handler leaves unanswered goes on to the parent.
//
// The virtual operations are declared in their slot order (noted per line) so
// that subclasses and readers can match them with the slot table. Every window
// operation checks isValid first and does nothing without a live window.

#include <windows.h>
#include <ocidl.h>
#include <olectl.h>

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "toolkit/base/Object.h"
#include "toolkit/core/ComponentPeer.h"
#include "toolkit/core/ToolkitEvent.h"

namespace toolkit {

class cXComponent : public Object {
public:
  // The window style of a component's own window: WS_CHILD | WS_VISIBLE | WS_GROUP | WS_TABSTOP.
  static constexpr DWORD kDefaultStyle = 0x50030000;
  // Peer kind of the plain component window ("Brine_AWTATL1").
  static constexpr int kPeerKind = 1;

  cXComponent();

  const ClassRecord* getClassRecord() const override;              // 0
  ~cXComponent() override;                                         // 1
  virtual cXComponent* getParent() const;                          // 2
  virtual void setParent(cXComponent* parent);                     // 3 (pointer only)
  virtual HWND getHandle() const;                                  // 4
  virtual bool isValid() const;                                    // 5
  virtual bool isEnabled() const;                                  // 6
  virtual bool isVisible() const;                                  // 7
  virtual RECT getWindowRect() const;                              // 8 (screen)
  virtual RECT getClientRect() const;                              // 9
  // Makes the window under `parentHwnd`; throws cErr when that is not a window.
  // Answers false (HWND stays 0) when registration or creation fails.
  virtual bool create(HWND parentHwnd);                            // 10
  virtual void destroyWindow();                                    // 11
  // Queue the event on the peer, then post (send) WM_NCHITTEST to the window so
  // that the peer drains its queue. Without a window the event is dropped: false.
  virtual bool postEvent(std::unique_ptr<ToolkitEvent> event);     // 12
  virtual bool sendEvent(std::unique_ptr<ToolkitEvent> event);     // 13
  virtual void setEnabled(bool enabled);                           // 14
  virtual void show(bool visible);                                 // 15
  virtual void requestFocus();                                     // 16
  virtual POINT getLocation() const;                               // 17 (-1, -1) without a window
  virtual void setLocation(int x, int y);                          // 18
  virtual SIZE getSize() const;                                    // 19
  virtual void setSize(int width, int height, bool show);          // 20
  virtual bool contains(int x, int y) const;                       // 21 (screen)
  virtual void setBounds(int x, int y, int width, int height, bool forceMove, bool repaint);  // 22
  virtual void moveTo(int x, int y, int width, int height, bool repaint);  // 23
  // Adds the move to a BeginDeferWindowPos batch (which becomes null if the
  // platform refuses it) and also applies it at once, so nested layouts see the
  // new client sizes. A null batch means an immediate move.
  virtual void deferBounds(HDWP& batch, int x, int y, int width, int height);  // 24
  virtual void setTextNumber(int number);                          // 25
  virtual void setText(std::string_view text);                     // 26 (stored even without a window)
  virtual std::string getText() const;                             // 27
  virtual void setState(int state);                                // 28
  // CreateWindowEx for this component. Without `className` the toolkit's own
  // class of the peer's kind is used; with one (a system control) the window is
  // subclassed by the toolkit's window procedure.
  virtual bool createWindow(DWORD exStyle, const char* className, const char* title, DWORD style,
                            int x, int y, int width, int height, HWND parent, UINT_PTR id);  // 29
  virtual void validate();                                         // 30 (after each layout placement)
  virtual void transferFocus();                                    // 31 (Tab)
  virtual bool hasHandle(HWND hwnd) const;                         // 32
  virtual HFONT getFont() const;                                   // 33 borrowed, else own
  virtual bool setFontIndirect(const LOGFONTA& font);              // 34
  virtual bool setFont(const char* face, int points, bool bold, bool italic);  // 35
  virtual void setFontObject(IFont* font);                         // 36
  virtual void lendFont(HFONT font);                               // 37 never deleted by this component
  virtual void setInsets(int left, int top, int right, int bottom);  // 38
  virtual bool setPalette(const COLORREF* table, int count);       // 39 exactly 20 entries
  // Overrides one of the system colours 5, 8, 13, 14, 15, 16, 17, 18 and 20 for
  // this component; false for any other index.
  virtual bool setColor(int index, COLORREF value);                // 40
  virtual LONG getStyle() const;                                   // 41
  virtual LONG getExStyle() const;                                 // 42
  virtual bool modifyStyle(DWORD remove, DWORD add, UINT swpFlags);    // 43
  virtual bool modifyExStyle(DWORD remove, DWORD add, UINT swpFlags);  // 44
  virtual void reservedSlot45();                                   // 45
  virtual bool redraw(const RECT* rect, HRGN region, UINT flags);  // 46
  virtual void invalidateRect(const RECT* rect);                   // 47
  virtual void setRedraw(bool enabled);                            // 48
  virtual void reservedSlot49();                                   // 49
  virtual void scrollBy(int dx, int dy);                           // 50
  virtual int scrollEx(int dx, int dy, const RECT* scroll, const RECT* clip, HRGN update,
                       RECT* updateRect, UINT flags);              // 51
  virtual void invalidate();                                       // 52
  virtual void captureMouse();                                     // 53
  virtual int getScrollPos(int bar) const;                         // 54
  virtual int setScrollPos(int bar, int position, bool redraw);    // 55
  virtual int setScrollInfo(int bar, const SCROLLINFO& info, bool redraw);  // 56
  virtual bool getScrollInfo(int bar, SCROLLINFO& info) const;     // 57
  virtual int onPaint(ToolkitEvent& event);                        // 58
  virtual void paint(HDC dc);                                      // 59
  // Routes the event to its handler; an answer of 0 (or an id without a
  // handler) passes the event to the parent. Answers the final non-zero answer,
  // or 0 when it reached the root unanswered.
  virtual int dispatchEvent(ToolkitEvent& event);                  // 60
  virtual int onAction(ToolkitEvent& event);                       // 61
  virtual int onKeyDown(ToolkitEvent& event, int key);             // 62
  virtual int onKeyUp(ToolkitEvent& event, int key);               // 63
  virtual int onChar(ToolkitEvent& event, int ch);                 // 64
  virtual int onMouseDown(ToolkitEvent& event, int x, int y);      // 65
  virtual int onMouseUp(ToolkitEvent& event, int x, int y);        // 66
  virtual int onMouseMove(ToolkitEvent& event, int x, int y);      // 67
  virtual int onMouseDrag(ToolkitEvent& event, int x, int y);      // 68
  virtual int onMouseEnter(ToolkitEvent& event, int x, int y);     // 69
  virtual int onMouseExit(ToolkitEvent& event, int x, int y);      // 70
  virtual int onFocusGained(ToolkitEvent& event);                  // 71
  virtual int onFocusLost(ToolkitEvent& event);                    // 72
  virtual int onScroll(ToolkitEvent& event);                       // 73
  virtual int onMoved(ToolkitEvent& event);                        // 74
  virtual int onResized(ToolkitEvent& event);                      // 75
  virtual int onEraseBackground(ToolkitEvent& event);              // 76
  virtual int onSetCursor(ToolkitEvent& event);                    // 77
  virtual int onNotify(ToolkitEvent& event);                       // 78
  virtual void repaintAll();                                       // 79
  virtual SIZE getPreferredSize();                                 // 80
  virtual SIZE getPreferredSizeIn(const RECT& area);               // 81
  virtual int fireAction();                                        // 82
  virtual void setUserValue1(int value);                           // 83
  virtual int getUserValue1() const;                               // 84
  virtual void setUserValue2(int value);                           // 85
  virtual int getUserValue2() const;                               // 86
  virtual void setUserId(int id);                                  // 87
  // Modal boxes lying exactly over this component's window (ModalDialog): IDOK, IDYES,
  // IDNO or IDCANCEL, or -1 at once when this component has no window. Style 0 shows
  // one button labelled `buttonText` ("OK" when none), 3 Yes/No/Cancel, 4 Yes/No; the
  // input box also knows 1 (OK and Cancel) and copies the typed text to `result` on OK.
  virtual int messageBox(const char* text, UINT style, const char* buttonText);  // 88
  virtual int inputBox(const char* prompt, std::string& result, UINT style);     // 89

  // Plain accessors.
  ComponentPeer* peer() const { return peer_.get(); }
  const RECT& bounds() const { return bounds_; }
  const RECT& insets() const { return insets_; }
  int getUserId() const { return userId_; }
  int getState() const { return state_; }
  bool getEnabledFlag() const { return enabled_ != 0; }
  bool isRedrawEnabled() const { return redrawEnabled_ != 0; }
  const std::string& storedText() const { return text_; }
  HFONT ownFont() const { return ownFont_; }
  HFONT borrowedFont() const { return borrowedFont_; }
  HWND tooltipWindow() const { return tooltip_; }
  // The colour for a system colour index: this component's override, else the system's.
  COLORREF colorOf(int systemIndex) const;

  // Index into the colour overrides for a system colour index, or -1.
  static int colorSlot(int systemIndex);

protected:
  explicit cXComponent(int peerKind);

  // Enters a window made outside createWindow (a native control inside this
  // component) under this component: its messages become this component's events.
  void adoptWindow(HWND hwnd);
  void setTooltipWindow(HWND hwnd) { tooltip_ = hwnd; }
  void clearCachedPreferredSize() { cachedPreferredSize_ = SIZE{0, 0}; }

  // Fields, in the order of the data model.
  RECT bounds_{0, 0, 0, 0};
  SIZE cachedPreferredSize_{0, 0};
  std::int32_t redrawEnabled_ = 1;
  RECT insets_{0, 0, 0, 0};
  cXComponent* parent_ = nullptr;
  std::unique_ptr<ComponentPeer> peer_;
  HFONT ownFont_ = nullptr;
  HFONT borrowedFont_ = nullptr;
  std::int32_t enabled_ = 1;
  std::int32_t state_ = 0;
  std::string text_;
  std::int32_t userId_ = 0;
  std::int32_t userValue1_ = 0;
  std::int32_t userValue2_ = 0;
  static constexpr int kColorCount = 9;
  COLORREF colours_[kColorCount];  // CLR_INVALID = no override
  HWND tooltip_ = nullptr;

private:
  void focusIfSource(const ToolkitEvent& event);
  void detachFromParent();
};

}  // namespace toolkit
