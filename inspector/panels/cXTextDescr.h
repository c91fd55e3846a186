#pragma once
// A text description tab of the inspector: the whole text file a chart object names in
// one of its attributes (158 a description, 304 one in the national language), shown as
// it is in a rich edit control. The file is the one stored with the object when the host
// keeps it there, else the one found in the chart database's volume folder or the store
// folder.
//
// What the control calls:
//   Fill(object, code)  loads the named file (S_FALSE: no such attribute, panel unchanged)
//   Clear()             no text and no content, before another object is shown
//   HasContent()        whether the last load gave a text; the tab is shown only then

#include <windows.h>

#include <cstdint>
#include <string>

#include "GeoData.h"
#include "toolkit/widgets/ContainedWindow.h"

namespace br::inspector {

class cXTextDescr final : public toolkit::ContainedWindow {
public:
  // A file named by the object that is neither stored with it nor found in the folders.
  static constexpr HRESULT kFileNotFound = static_cast<HRESULT>(0x80040321);
  static constexpr DWORD kRichEditStyle = 0x50231144;  // child, visible, v-scroll, group, tab stop, multiline, auto v-scroll, no hide sel, want return
  static constexpr long kDescription = 158;
  static constexpr long kNationalDescription = 304;

  cXTextDescr();
  ~cXTextDescr() override;

  const toolkit::ClassRecord* getClassRecord() const override;
  void destroyWindow() override;
  int onNotify(toolkit::ToolkitEvent& event) override;

  HRESULT Fill(IGeoObject* object, long attributeCode);
  void Clear();
  bool HasContent() const { return content_; }
  // The text of the last load, every byte of it (the window stops at a NUL).
  const std::string& Buffer() const { return storedText(); }
  // The rich edit window class in use ("RICHEDIT", or "RichEdit20A" when only the newer
  // library is there); empty before the window is made.
  const std::string& RichEditClass() const { return richEditClass_; }

protected:
  HWND createNative(HWND ownWindow) override;

private:
  HRESULT Load(IGeoObject* object, IGeoDatabase* database, const std::wstring& name);
  HWND MakeRichEdit(HWND ownWindow, std::size_t kind);
  void Show(std::string bytes);

  HMODULE richEditLibraries_[2] = {nullptr, nullptr};  // held for the panel's life
  std::string richEditClass_;
  bool content_ = false;
};

}  // namespace br::inspector
