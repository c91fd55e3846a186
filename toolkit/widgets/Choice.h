#pragma once
// A drop-down list over the native combo box. The items live in a one-column
// table ("items") owned by the Choice; the combo box is subclassed so that its
// messages become the Choice's events. Every notification but focus and edit
// changes bubbles to the parent as a command event (id 1), the selection change
// (CBN_SELCHANGE) among them; events from elsewhere and keys other than Tab,
// Enter and Esc stop here.

#include "toolkit/data/DataTable.h"
#include "toolkit/widgets/ContainedWindow.h"

namespace toolkit {

class Choice : public ContainedWindow {
public:
  static constexpr DWORD kOwnStyle = WS_CHILD | WS_VISIBLE | WS_TABSTOP;
  static constexpr DWORD kComboStyle = 0x50330043;  // WS_CHILD|WS_VISIBLE|WS_VSCROLL|WS_HSCROLL|WS_GROUP|WS_TABSTOP|CBS_DROPDOWNLIST|CBS_AUTOHSCROLL
  static constexpr SIZE kFallbackSize{20, 100};

  // `widthInCharacters` 0 counts as 10.
  explicit Choice(int horizontalExtent = 0, int widthInCharacters = 0, bool editable = false);

  const ClassRecord* getClassRecord() const override;

  // Items. Indices are those of the list as shown (sorted when sorted is set).
  int addItem(const char* text);
  void removeAllItems();
  int getItemCount() const;
  std::string getItem(int index) const;
  int getSelectedIndex() const;
  // -1 clears the selection; an index outside the list answers false.
  bool select(int index);
  const DataTable& items() const { return items_; }

  // Both take effect when the combo box is made.
  void setSorted(bool sorted) { sorted_ = sorted; }
  void setEditable(bool editable) { editable_ = editable; }
  bool isSorted() const { return sorted_; }
  bool isEditable() const { return editable_; }
  int getHorizontalExtent() const { return horizontalExtent_; }
  int getWidthInCharacters() const { return widthInCharacters_; }

  int dispatchEvent(ToolkitEvent& event) override;
  // Width from the characters, height from the items (the dropped list);
  // cached once measured.
  SIZE getPreferredSizeIn(const RECT& area) override;
  // The same width; the height of the closed field.
  SIZE getPreferredSize() override;

  DWORD comboStyle() const;

protected:
  HWND createNative(HWND ownWindow) override;
  DWORD ownWindowStyle() const override { return kOwnStyle; }

private:
  DataTable items_;
  int selected_ = -1;
  int horizontalExtent_;
  int widthInCharacters_;
  bool editable_;
  bool sorted_ = false;
};

}  // namespace toolkit
