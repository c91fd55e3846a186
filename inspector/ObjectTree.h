#pragma once
// The inspector's tree: the toolkit's tree component in Unicode form (object names come in
// any script) with the drawn icons. Items carry the index of their record as data word.

#include <windows.h>
#include <commctrl.h>

#include <functional>
#include <string>

#include "toolkit/widgets/ContainedWindow.h"

namespace br::inspector {

class ObjectTree final : public toolkit::ContainedWindow {
public:
  ObjectTree();
  ~ObjectTree() override;

  HTREEITEM Insert(HTREEITEM parent, bool first, const std::wstring& text, int icon, LPARAM data);
  void DeleteAll();
  void SetItemText(HTREEITEM item, const std::wstring& text);
  void SetIcon(HTREEITEM item, int icon);
  LPARAM DataOf(HTREEITEM item) const;
  HTREEITEM ParentOf(HTREEITEM item) const;
  HTREEITEM Selected() const;
  HTREEITEM FirstItem() const;
  void Select(HTREEITEM item);
  void Expand(HTREEITEM item);
  // Every item, depth first in tree order; false from the visitor stops.
  void ForEachItem(const std::function<bool(HTREEITEM)>& visit) const;
  // WM_SETREDRAW on the native tree.
  void SetRedraw(bool on);

protected:
  HWND createNative(HWND ownWindow) override;

private:
  bool Walk(HTREEITEM item, const std::function<bool(HTREEITEM)>& visit) const;

  HIMAGELIST icons_ = nullptr;
};

}  // namespace br::inspector
