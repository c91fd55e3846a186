#pragma once
// A component that holds children in a child list and arranges them through its
// layout object. Every control's tree of components is rooted in a Container.
//
// The child list is a DataTable with the columns "Component" (the child, as a
// pointer), "Position" (its layout constraint, e.g. "North") and "Name"; rows
// keep insertion order, which is the layout order. The container does not own
// its children: they are deleted by the remove operations with `destroy` set, or
// by whoever made them. A child deleted on its own leaves the list by itself.

#include <memory>
#include <vector>

#include "toolkit/core/cXComponent.h"
#include "toolkit/data/DataTable.h"
#include "toolkit/layout/Layout.h"

namespace toolkit {

class Container : public cXComponent {
public:
  // Columns of the child list.
  static constexpr int kColumnComponent = 0;
  static constexpr int kColumnPosition = 1;
  static constexpr int kColumnName = 2;

  Container();
  ~Container() override;

  const ClassRecord* getClassRecord() const override;
  // Also creates the windows of children that have none yet.
  bool create(HWND parentHwnd) override;
  // Keeps the focus where it is when it already lies inside this container.
  void requestFocus() override;
  // At the root: Tab moves the focus to the next focusable component of the tree
  // (Shift+Tab to the previous one). Past the last (first) one the parent window gets
  // WM_NEXTDLGCTL to take the focus out of the tree; if it does not, the focus wraps around.
  void transferFocus() override;
  bool hasHandle(HWND hwnd) const override;
  // A new font of the container is lent on to its children.
  bool setFontIndirect(const LOGFONTA& font) override;
  void setFontObject(IFont* font) override;
  void lendFont(HFONT font) override;
  void repaintAll() override;
  SIZE getPreferredSize() override;
  SIZE getPreferredSizeIn(const RECT& area) override;
  using cXComponent::setPalette;

  virtual void doLayout();                                                      // 90
  virtual int add(cXComponent* component, const char* name = nullptr);          // 91
  virtual int insertNamed(const char* position, cXComponent* component,
                          const char* name = nullptr);                          // 92
  virtual bool removeComponent(cXComponent* component, bool destroy);           // 93
  virtual bool removeNamed(const char* name, bool destroy);                     // 94
  virtual bool removeAt(int index, bool destroy);                               // 95
  virtual int insertAt(int index, cXComponent* component, const char* name = nullptr);  // 96
  virtual int insertAtNamed(int index, const char* position, cXComponent* component,
                            const char* name = nullptr);                        // 97
  virtual void setChildValues(int value);                                       // 98
  // A SAFEARRAY (VT_ARRAY, possibly VT_BYREF) of one dimension, 4-byte
  // elements, 20 of them from index 0; anything else answers E_INVALIDARG.
  virtual HRESULT setPalette(const VARIANT& palette);                           // 99
  virtual void setLayout(std::unique_ptr<Layout> layout);                       // 100
  // One container's part of a layout pass: place the children inside the client
  // area less the insets, then recurse into visible child containers.
  virtual void layoutStep(HDWP& batch);                                         // 101
  virtual SIZE layoutGrid(const RECT& area, bool place, HDWP& batch);           // 102
  virtual SIZE layoutBorderRegion(const RECT& area, int region, bool place, HDWP& batch);  // 103
  virtual SIZE layoutFlow(const RECT& area, int cellWidth, int cellHeight, int alignment,
                          bool place, HDWP& batch);                             // 104
  virtual SIZE layoutTabs(const RECT& area, HDWP& batch);                       // 105
  virtual SIZE layoutSplitter(const RECT& area, int orientation, bool place, HDWP& batch);  // 106

  // Child list access.
  int getChildCount() const;
  cXComponent* getChild(int index) const;
  std::string getChildName(int index) const;
  std::string getChildPosition(int index) const;
  int indexOf(const cXComponent* component) const;  // -1 when not a child
  cXComponent* findChild(const char* name) const;   // first child of that name, or null
  // The first component of that name in the subtree below this container, depth first:
  // each child is looked at, then the subtree of a child container, before the next child.
  cXComponent* findNamed(const char* name) const;
  const DataTable& childList() const { return children_; }

  Layout* getLayout() const { return layout_.get(); }
  // Parent window for the children while the container has no window of its own.
  void setCreationParent(HWND hwnd) { creationParent_ = hwnd; }
  HWND getCreationParent() const { return creationParent_; }
  // Sets a SplitterLayout's ratio from its first panes' preferred sizes.
  void initializeSplit();
  // Windows in the subtree below this container (the size of a layout batch).
  int countWindows() const;

private:
  friend class cXComponent;
  void forgetChild(cXComponent* child);
  HWND windowForChildren() const;
  int insertRow(int before, const char* position, cXComponent* component, const char* name);
  bool removeRow(int row, bool destroy);
  RECT layoutArea() const;  // client area less the insets
  void collectFocusable(std::vector<cXComponent*>& out) const;

  DataTable children_;
  std::unique_ptr<Layout> layout_;
  HWND creationParent_ = nullptr;
};

}  // namespace toolkit
