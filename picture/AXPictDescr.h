// AXPictDescr: the picture list of a chart object, shown one at a time in a hosted
// XPICREPView. The inspector's pictorial-representation tab uses it through cXPictDescr:
//
//   HRESULT hr = pictures.Fill(object);   // the object's pictures (attribute 120, PICREP)
//   if (pictures.HasContent()) pictures.Next();   // shows the first
//
// Fill reads the names of attribute 120 (separated by any of ",;:|"; empty names are
// skipped). A name stored with the object (IGeoObject::GetStorage, one stream per name) is
// copied to a temporary file of the component's own folder, %TEMP%\PICREP\<process>_<n>\;
// any other name is looked for in the first volume folder of the object's chart database,
// then in the BasesStore folder. Results: S_OK (the list may be empty: no attribute),
// 0x80040321 for a name found nowhere, 0x80040322 for a stored picture that could not be
// copied; names before the failing one stay in the list. The folder and everything in it
// are deleted with the component (links inside are removed, never followed).
#pragma once

#include "toolkit/widgets/AXComponent.h"

#include "BR_Info.h"
#include "GeoData.h"

#include <string>
#include <vector>

namespace br::picture {

constexpr long kPictureAttribute = 120;  // PICREP
constexpr HRESULT kPictureNotFound = static_cast<HRESULT>(0x80040321);
constexpr HRESULT kPictureNotCopied = static_cast<HRESULT>(0x80040322);

class AXPictDescr : public toolkit::AXComponent {
public:
  AXPictDescr();
  ~AXPictDescr() override;

  const toolkit::ClassRecord* getClassRecord() const override;
  // The window, and in it the XPICREPView with the default shading of the five palettes.
  bool create(HWND parentHwnd) override;

  HRESULT Fill(IGeoObject* object);
  // The same from a names text already read (the attribute's value).
  HRESULT FillNames(IGeoObject* object, const std::string& names);
  bool HasContent() const { return !paths_.empty(); }
  int Count() const { return static_cast<int>(paths_.size()); }
  int Current() const { return current_; }
  const std::wstring& PathAt(int index) const { return paths_.at(static_cast<size_t>(index)); }
  bool Shown() const { return shown_; }

  // Step through the list and show the picture: E_NOTIMPL without a hosted view, S_FALSE
  // (nothing done) for an empty list, else the view's load result.
  HRESULT Next();
  HRESULT Previous();
  // The hosted view's zoom; E_NOTIMPL without one.
  HRESULT SetZoom(long percent);
  // The hosted view (one reference for the caller), or null.
  IXPICREPView* View() const;

  const std::wstring& TemporaryFolder() const { return folder_; }

private:
  HRESULT Show(int index);
  void RemovePicture();
  HRESULT AddStored(IStorage* storage, const std::wstring& name, bool& stored);
  HRESULT AddFound(IGeoObject* object, const std::string& name);

  std::vector<std::wstring> paths_;
  int current_ = -1;
  bool shown_ = false;
  std::wstring folder_;  // ends with a backslash; empty when it could not be made
};

// Sets the shading of palettes 0..4 to 0, 10, 25, 75 and 90 (the picture panel's and the
// picture window's view).
void SetDefaultShading(IXPICREPView* view);

}  // namespace br::picture
