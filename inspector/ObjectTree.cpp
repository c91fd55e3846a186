#include "inspector/ObjectTree.h"

#include "inspector/tree_icons.h"
#include "toolkit/core/ToolkitWindows.h"

namespace br::inspector {

ObjectTree::ObjectTree() = default;

ObjectTree::~ObjectTree() {
  // The tree view goes with the component's window; the image list is ours alone.
  if (icons_) ImageList_Destroy(icons_);
}

HWND ObjectTree::createNative(HWND ownWindow) {
  HWND tree = CreateWindowExW(WS_EX_CLIENTEDGE, WC_TREEVIEWW, L"", kTreeStyle, 0, 0, 0, 0, ownWindow, nullptr,
                              toolkit::ToolkitWindows::moduleInstance(), nullptr);
  if (!tree) return nullptr;
  SendMessageW(tree, TVM_SETUNICODEFORMAT, TRUE, 0);
  if (!icons_) icons_ = MakeTreeIcons();
  if (icons_) {
    ImageList_SetBkColor(icons_, GetSysColor(COLOR_WINDOW));
    SendMessageW(tree, TVM_SETIMAGELIST, TVSIL_NORMAL, reinterpret_cast<LPARAM>(icons_));
  }
  return tree;
}

HTREEITEM ObjectTree::Insert(HTREEITEM parent, bool first, const std::wstring& text, int icon, LPARAM data) {
  HWND tree = nativeWindow();
  if (!tree) return nullptr;
  TVINSERTSTRUCTW insert{};
  insert.hParent = parent ? parent : TVI_ROOT;
  insert.hInsertAfter = first ? TVI_FIRST : TVI_LAST;
  insert.item.mask = TVIF_TEXT | TVIF_IMAGE | TVIF_SELECTEDIMAGE | TVIF_PARAM;
  insert.item.pszText = const_cast<wchar_t*>(text.c_str());
  insert.item.iImage = icon;
  insert.item.iSelectedImage = icon;
  insert.item.lParam = data;
  return reinterpret_cast<HTREEITEM>(SendMessageW(tree, TVM_INSERTITEMW, 0, reinterpret_cast<LPARAM>(&insert)));
}

void ObjectTree::DeleteAll() {
  if (HWND tree = nativeWindow()) SendMessageW(tree, TVM_DELETEITEM, 0, reinterpret_cast<LPARAM>(TVI_ROOT));
}

void ObjectTree::SetItemText(HTREEITEM item, const std::wstring& text) {
  HWND tree = nativeWindow();
  if (!tree || !item) return;
  TVITEMW change{};
  change.mask = TVIF_TEXT | TVIF_HANDLE;
  change.hItem = item;
  change.pszText = const_cast<wchar_t*>(text.c_str());
  SendMessageW(tree, TVM_SETITEMW, 0, reinterpret_cast<LPARAM>(&change));
}

void ObjectTree::SetIcon(HTREEITEM item, int icon) {
  HWND tree = nativeWindow();
  if (!tree || !item) return;
  TVITEMW change{};
  change.mask = TVIF_IMAGE | TVIF_SELECTEDIMAGE | TVIF_HANDLE;
  change.hItem = item;
  change.iImage = icon;
  change.iSelectedImage = icon;
  SendMessageW(tree, TVM_SETITEMW, 0, reinterpret_cast<LPARAM>(&change));
}

LPARAM ObjectTree::DataOf(HTREEITEM item) const {
  HWND tree = nativeWindow();
  if (!tree || !item) return -1;
  TVITEMW data{};
  data.mask = TVIF_PARAM | TVIF_HANDLE;
  data.hItem = item;
  if (!SendMessageW(tree, TVM_GETITEMW, 0, reinterpret_cast<LPARAM>(&data))) return -1;
  return data.lParam;
}

HTREEITEM ObjectTree::ParentOf(HTREEITEM item) const {
  HWND tree = nativeWindow();
  return tree && item ? TreeView_GetParent(tree, item) : nullptr;
}

HTREEITEM ObjectTree::Selected() const {
  HWND tree = nativeWindow();
  return tree ? TreeView_GetSelection(tree) : nullptr;
}

HTREEITEM ObjectTree::FirstItem() const {
  HWND tree = nativeWindow();
  return tree ? TreeView_GetRoot(tree) : nullptr;
}

void ObjectTree::Select(HTREEITEM item) {
  HWND tree = nativeWindow();
  if (!tree || !item) return;
  TreeView_SelectItem(tree, item);
  TreeView_EnsureVisible(tree, item);
}

void ObjectTree::Expand(HTREEITEM item) {
  if (HWND tree = nativeWindow()) TreeView_Expand(tree, item, TVE_EXPAND);
}

void ObjectTree::ForEachItem(const std::function<bool(HTREEITEM)>& visit) const {
  HWND tree = nativeWindow();
  if (!tree) return;
  for (HTREEITEM item = TreeView_GetRoot(tree); item; item = TreeView_GetNextSibling(tree, item))
    if (!Walk(item, visit)) return;
}

bool ObjectTree::Walk(HTREEITEM item, const std::function<bool(HTREEITEM)>& visit) const {
  if (!visit(item)) return false;
  HWND tree = nativeWindow();
  for (HTREEITEM child = TreeView_GetChild(tree, item); child; child = TreeView_GetNextSibling(tree, child))
    if (!Walk(child, visit)) return false;
  return true;
}

void ObjectTree::SetRedraw(bool on) {
  if (HWND tree = nativeWindow()) SendMessageW(tree, WM_SETREDRAW, on ? TRUE : FALSE, 0);
}

}  // namespace br::inspector
