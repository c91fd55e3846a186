// cXPictDescr: the picture panel of the object inspector's pictorial-representation tab.
// A tool bar (previous, next | zoom out, zoom choice, zoom in, picture window) over the
// object's pictures in an XPICREPView (AXPictDescr).
//
// What the inspector calls:
//   HRESULT hr = panel.Fill(object);  // attribute 120 of the object; see AXPictDescr.h
//   bool any = panel.HasContent();    // false: no pictures (hide or grey the tab)
//   panel.SetPaletteNumber(n);        // 0..4, the display palette the picture is shaded for
// Fill shows the first picture when there is one and enables previous and next; an open
// picture window follows (it closes when the new object has no pictures).
#pragma once

#include "picture/AXPictDescr.h"
#include "picture/cPictureBox.h"
#include "toolkit/core/Panel.h"
#include "toolkit/widgets/Button.h"
#include "toolkit/widgets/Choice.h"

#include <commctrl.h>

#include <memory>

namespace br::picture {

class cXPictDescr : public toolkit::Panel {
public:
  cXPictDescr();
  ~cXPictDescr() override;

  const toolkit::ClassRecord* getClassRecord() const override;
  // The windows, with the buttons' states applied to them.
  bool create(HWND parentHwnd) override;

  HRESULT Fill(IGeoObject* object);
  HRESULT FillNames(IGeoObject* object, const std::string& names);
  bool HasContent() const { return pictures_.HasContent(); }
  void SetPaletteNumber(int palette);

  // The tool bar's commands, as its buttons give them.
  HRESULT ShowNext();
  HRESULT ShowPrevious();
  void ZoomIn();
  void ZoomOut();
  // Selects a zoom entry (0 = 200% .. 6 = 20%) as the user would.
  void ChooseZoom(int entry);
  void TogglePictureBox(bool open);

  AXPictDescr& pictures() { return pictures_; }
  toolkit::Choice& zoomChoice() { return zoom_; }
  toolkit::Button& previousButton() { return previous_; }
  toolkit::Button& nextButton() { return next_; }
  toolkit::Button& zoomInButton() { return zoomIn_; }
  toolkit::Button& zoomOutButton() { return zoomOut_; }
  toolkit::Button& boxButton() { return box_; }
  cPictureBox* pictureBox() const { return pictureBox_.get(); }

  int onAction(toolkit::ToolkitEvent& event) override;
  int dispatchEvent(toolkit::ToolkitEvent& event) override;

private:
  // The button images (bitmap 204, 16 pixels each), owned here and lent to the buttons.
  struct Images {
    Images();
    ~Images();
    HIMAGELIST list = nullptr;
  };

  void Filled();
  void ZoomChanged();
  void StepsChanged();
  void GiveBoxCurrent();

  Images images_;
  toolkit::Panel bar_;
  toolkit::Panel steps_;
  toolkit::Panel tools_;
  toolkit::Button previous_;
  toolkit::Button next_;
  toolkit::Button zoomOut_;
  toolkit::Choice zoom_;
  toolkit::Button zoomIn_;
  toolkit::Button box_;
  AXPictDescr pictures_;
  std::unique_ptr<cPictureBox> pictureBox_;
  int zoomEntry_;
};

}  // namespace br::picture
