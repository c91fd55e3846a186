#pragma once
// A container showing one child at a time under a native tab strip
// ("SysTabControl32"): every child has a tab labelled with its name at the same
// index, and the children are laid out by a TabLayout in the strip's display
// area. Choosing a tab (TCN_SELCHANGE) selects the page and lays out again; the
// notification then bubbles on, so owners learn of tab changes too.

#include "toolkit/core/Container.h"

namespace toolkit {

class TabContainer : public Container {
public:
  static constexpr DWORD kOwnStyle = WS_CHILD | WS_VISIBLE;
  // WS_CHILD|WS_VISIBLE|WS_CLIPCHILDREN|WS_GROUP; the tab control adds WS_CLIPSIBLINGS itself.
  static constexpr DWORD kStripStyle = 0x52020000;

  TabContainer();

  const ClassRecord* getClassRecord() const override;

  bool create(HWND parentHwnd) override;
  int insertNamed(const char* position, cXComponent* component, const char* name = nullptr) override;
  int insertAtNamed(int index, const char* position, cXComponent* component,
                    const char* name = nullptr) override;
  bool removeComponent(cXComponent* component, bool destroy) override;
  bool removeNamed(const char* name, bool destroy) override;
  bool removeAt(int index, bool destroy) override;
  // A null layout puts a fresh TabLayout back.
  void setLayout(std::unique_ptr<Layout> layout) override;
  void layoutStep(HDWP& batch) override;
  SIZE getPreferredSize() override;
  void lendFont(HFONT font) override;
  int onNotify(ToolkitEvent& event) override;
  int onResized(ToolkitEvent& event) override;

  // False when the layout is no TabLayout, when `index` is already selected, or
  // when it is neither -1 nor a child's index. Otherwise selects it (tab strip
  // too) and, with `relayout`, lays the container out again.
  bool selectPage(int index, bool relayout);
  int getSelectedPage() const;

  HWND tabStrip() const;
  int getTabCount() const;
  std::string getTabText(int index) const;

private:
  void insertTab(int index, const std::string& text);
  bool removeTabAfter(int row, bool removed);
  RECT displayArea() const;

  HWND strip_ = nullptr;
};

}  // namespace toolkit
