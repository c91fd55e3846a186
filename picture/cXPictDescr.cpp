#include "picture/cXPictDescr.h"

#include "frame/com/ComRef.h"
#include "picture/logic/picture_list.h"
#include "resources/resource.h"
#include "toolkit/base/class_records.h"
#include "toolkit/core/ToolkitEvent.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/layout/FlowLayout.h"
#include "toolkit/layout/GridLayout.h"

#include "BR_Private.h"

namespace br::picture {

namespace {

constexpr int kImageWidth = 16;

}  // namespace

cXPictDescr::Images::Images() {
  list = ImageList_LoadImageW(toolkit::ToolkitWindows::moduleInstance(), MAKEINTRESOURCEW(IDB_PICTURE_TOOLBAR),
                              kImageWidth, 0, CLR_DEFAULT, IMAGE_BITMAP, LR_CREATEDIBSECTION);
}

cXPictDescr::Images::~Images() {
  if (list) ImageList_Destroy(list);
}

cXPictDescr::cXPictDescr()
    : bar_(std::make_unique<toolkit::GridLayout>(1, 2, 0, 0, "25;75")),
      steps_(std::make_unique<toolkit::FlowLayout>(0, 3, 3, true)),
      tools_(std::make_unique<toolkit::FlowLayout>(0, 3, 3, true)),
      previous_(images_.list, 4, 6),
      next_(images_.list, 5, 7),
      zoomOut_(images_.list, 1, 9),
      zoom_(0, 6),
      zoomIn_(images_.list, 0, 8),
      box_(images_.list, 10, 11),
      zoomEntry_(kDefaultZoomEntry) {
  box_.kind = toolkit::Button::kToggle;
  insertNamed("North", &bar_, "toolbar");
  insertNamed("Center", &pictures_, "picture");
  bar_.add(&steps_, "steps");
  bar_.add(&tools_, "tools");
  steps_.add(&previous_, "previous");
  steps_.add(&next_, "next");
  tools_.add(&zoomOut_, "zoomout");
  tools_.add(&zoom_, "zoom");
  tools_.add(&zoomIn_, "zoomin");
  tools_.add(&box_, "picturebox");
  for (int entry = 0; entry < kZoomStepCount; ++entry) zoom_.addItem(ZoomText(entry).c_str());
  zoom_.select(zoomEntry_);
  previous_.setEnabled(false);
  next_.setEnabled(false);
}

cXPictDescr::~cXPictDescr() {
  // The window goes before the component whose picture it may be showing.
  pictureBox_.reset();
}

const toolkit::ClassRecord* cXPictDescr::getClassRecord() const { return &toolkit::records::cXPictDescr; }

bool cXPictDescr::create(HWND parentHwnd) {
  if (!Panel::create(parentHwnd)) return false;
  StepsChanged();
  zoomIn_.setEnabled(CanZoomIn(zoomEntry_));
  zoomOut_.setEnabled(CanZoomOut(zoomEntry_));
  return true;
}

HRESULT cXPictDescr::Fill(IGeoObject* object) {
  if (!object) return E_POINTER;
  // The window lets go of the last object's picture first: its file is about to go.
  if (pictureBox_) pictureBox_->RemovePicture();
  const HRESULT hr = pictures_.Fill(object);
  Filled();
  return hr;
}

HRESULT cXPictDescr::FillNames(IGeoObject* object, const std::string& names) {
  if (pictureBox_) pictureBox_->RemovePicture();
  const HRESULT hr = pictures_.FillNames(object, names);
  Filled();
  return hr;
}

void cXPictDescr::Filled() {
  StepsChanged();
  if (pictures_.HasContent()) pictures_.Next();
  // An open window shows the new first picture, or closes when there is none.
  if (pictureBox_ && box_.isChecked()) {
    if (pictures_.Current() >= 0)
      GiveBoxCurrent();
    else
      TogglePictureBox(false);
  }
}

void cXPictDescr::SetPaletteNumber(int palette) {
  IEmbeddedControl* embedded = nullptr;
  if (FAILED(pictures_.getControl(IID_IEmbeddedControl, reinterpret_cast<void**>(&embedded)))) return;
  VARIANT number;
  number.vt = VT_I4;
  number.lVal = palette;
  embedded->SetPalette(number);
  embedded->Release();
}

void cXPictDescr::StepsChanged() {
  previous_.setEnabled(pictures_.HasContent());
  next_.setEnabled(pictures_.HasContent());
}

HRESULT cXPictDescr::ShowNext() {
  const HRESULT hr = pictures_.Next();
  GiveBoxCurrent();
  return hr;
}

HRESULT cXPictDescr::ShowPrevious() {
  const HRESULT hr = pictures_.Previous();
  GiveBoxCurrent();
  return hr;
}

void cXPictDescr::GiveBoxCurrent() {
  if (pictureBox_ && box_.isChecked() && pictures_.Current() >= 0)
    pictureBox_->ShowPicture(pictures_.PathAt(pictures_.Current()));
}

void cXPictDescr::ZoomIn() { ChooseZoom(ZoomInEntry(zoomEntry_)); }

void cXPictDescr::ZoomOut() { ChooseZoom(ZoomOutEntry(zoomEntry_)); }

void cXPictDescr::ChooseZoom(int entry) {
  if (entry < 0 || entry >= kZoomStepCount || entry == zoomEntry_) return;
  zoom_.select(entry);
  ZoomChanged();
}

void cXPictDescr::ZoomChanged() {
  const int entry = zoom_.getSelectedIndex();
  if (entry < 0 || entry >= kZoomStepCount) return;
  zoomEntry_ = entry;
  zoomIn_.setEnabled(CanZoomIn(entry));
  zoomOut_.setEnabled(CanZoomOut(entry));
  pictures_.SetZoom(kZoomSteps[entry]);
}

void cXPictDescr::TogglePictureBox(bool open) {
  if (!open) {
    box_.setChecked(false);
    if (pictureBox_) pictureBox_->Hide();
    return;
  }
  // Nothing to show: the toggle stays up.
  if (pictures_.Current() < 0) {
    box_.setChecked(false);
    return;
  }
  if (!pictureBox_) {
    HWND owner = getHandle() ? GetAncestor(getHandle(), GA_ROOT) : nullptr;
    pictureBox_ = std::make_unique<cPictureBox>(owner, [this] { box_.setChecked(false); });
  }
  box_.setChecked(pictureBox_->ShowPicture(pictures_.PathAt(pictures_.Current())));
}

int cXPictDescr::onAction(toolkit::ToolkitEvent& event) {
  if (event.source == &previous_) {
    ShowPrevious();
  } else if (event.source == &next_) {
    ShowNext();
  } else if (event.source == &zoomIn_) {
    ZoomIn();
  } else if (event.source == &zoomOut_) {
    ZoomOut();
  } else if (event.source == &box_) {
    TogglePictureBox(box_.isChecked());
  } else {
    return Panel::onAction(event);
  }
  return 1;
}

int cXPictDescr::dispatchEvent(toolkit::ToolkitEvent& event) {
  // The zoom choice's selection change arrives as a command (notification, id, window).
  if (event.id == toolkit::kEventCommand && event.source == &zoom_ && event.param(0) == CBN_SELCHANGE) {
    ZoomChanged();
    return 1;
  }
  return Panel::dispatchEvent(event);
}

}  // namespace br::picture
