#pragma once
// The toolkit's one-line edit: free text, masked text, integers, decimals,
// latitudes, longitudes and month-year dates (EditTypes.h). It draws itself
// through an off-screen bitmap copied in one BitBlt, keeps the system caret on
// the places the type allows, and takes the clipboard as plain ANSI text. The
// text/caret/mask logic lives in EditModel; this class feeds it the window's
// keys, characters and clicks.

#include "toolkit/core/cXComponent.h"
#include "toolkit/widgets/edit/EditModel.h"

namespace toolkit {

class cXEdit2 : public cXComponent {
public:
  // 0 means no limit.
  explicit cXEdit2(int maxLength = 0);

  const ClassRecord* getClassRecord() const override;

  // Types 1, 2, 3, 6, 7, 8; others do nothing (false). Type 8 starts at today.
  bool setEditType(int type, const char* mask = nullptr);
  void setText(std::string_view text) override;
  std::string getText() const override;
  bool setNumber(int number);
  int getNumber() const { return model_.getNumber(); }
  // Types 3, 6, 7 and 8 (an OLE date for 8).
  bool setValue(double value);
  double getValue() const { return model_.getValue(); }
  bool setMaxLength(int maxLength);
  bool setSelectionLength(int length);
  bool setOverwrite(bool overwrite);
  void setCaret(int position, int selectionLength);

  int getEditType() const { return model_.type(); }
  const std::string& getMask() const { return model_.mask(); }
  int getCaret() const { return model_.caret(); }
  int getSelectionLength() const { return model_.selectionLength(); }
  bool getOverwrite() const { return model_.overwrite(); }
  bool getNoPaste() const { return model_.noPaste(); }
  int getMaxLength() const { return model_.maxLength(); }
  const EditModel& model() const { return model_; }
  // First visible pixel of the text (horizontal scrolling).
  int getScrollOffset() const { return scroll_; }

  // Draws the whole client area into an off-screen bitmap and copies it to `dc`.
  void paint(HDC dc) override;
  int onKeyDown(ToolkitEvent& event, int key) override;
  int onChar(ToolkitEvent& event, int ch) override;
  int onMouseDown(ToolkitEvent& event, int x, int y) override;
  int onMouseDrag(ToolkitEvent& event, int x, int y) override;
  int onMouseUp(ToolkitEvent& event, int x, int y) override;
  int onFocusGained(ToolkitEvent& event) override;
  int onFocusLost(ToolkitEvent& event) override;
  int onResized(ToolkitEvent& event) override;
  void lendFont(HFONT font) override;
  void setEnabled(bool enabled) override;
  SIZE getPreferredSize() override;
  SIZE getPreferredSizeIn(const RECT& area) override;

  static constexpr int kMargin = 2;  // pixels left of the text and right of the caret

private:
  // After every change: the window text, the scroll offset, the caret, a repaint.
  void refresh();
  void render(HDC target, const RECT& client);
  // Character boundary nearest to client x.
  int indexAt(int x);
  int textX(HDC dc, int index) const;
  void placeSystemCaret();
  void setTodayIfDate();
  HGDIOBJ selectFont(HDC dc) const;

  EditModel model_;
  int scroll_ = 0;
  bool dragging_ = false;
  bool hasCaret_ = false;
};

}  // namespace toolkit
