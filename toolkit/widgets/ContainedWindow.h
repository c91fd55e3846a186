#pragma once
// A component whose visible part is a native control made as a child of the
// component's own window; by default the tree view "SysTreeView32". The
// control fills the component's client area and speaks for it: getHandle
// answers the control's window, and texts go to the control.
//
// Tree notifications become toolkit events of id 0 (kEventAction) with
// params[0] = the item's data value, params[1] = kTreeSelected or
// kTreeDoubleClick, params[2] = the item handle. A selection change goes to the
// tree component's own dispatchEvent (and bubbles from there); a double click
// goes to the parent's, and marks the notification handled when a parent takes it.

#include <windows.h>
#include <commctrl.h>

#include "toolkit/core/cXComponent.h"

namespace toolkit {

class ContainedWindow : public cXComponent {
public:
  static constexpr int kTreeSelected = 0;
  static constexpr int kTreeDoubleClick = 1;
  static constexpr DWORD kTreeStyle = 0x50030027;  // WS_CHILD|WS_VISIBLE|WS_GROUP|WS_TABSTOP|TVS_HASBUTTONS|TVS_HASLINES|TVS_LINESATROOT|TVS_SHOWSELALWAYS

  ContainedWindow();

  const ClassRecord* getClassRecord() const override;

  // The component's window, then the native control inside it, with the
  // parent component's font. Throws cErr when `parentHwnd` is not a window.
  bool create(HWND parentHwnd) override;
  HWND getHandle() const override;
  bool hasHandle(HWND hwnd) const override;
  void setText(std::string_view text) override;
  std::string getText() const override;
  void setEnabled(bool enabled) override;
  void lendFont(HFONT font) override;
  void requestFocus() override;
  void validate() override;
  int onResized(ToolkitEvent& event) override;
  int onNotify(ToolkitEvent& event) override;
  // Image list and tree background in the system window colour, then a repaint.
  void repaintAll() override;

  HWND nativeWindow() const;

protected:
  // Makes the native control inside `ownWindow` (the tree view here).
  virtual HWND createNative(HWND ownWindow);
  // Style of the component's own window.
  virtual DWORD ownWindowStyle() const { return kDefaultStyle; }
  // Size of the component's own window at creation.
  virtual SIZE initialSize() const { return SIZE{0, 0}; }
  void fitNative();

  HWND native_ = nullptr;

private:
  int treeNotification(ToolkitEvent& event, const NMHDR& header);
};

}  // namespace toolkit
