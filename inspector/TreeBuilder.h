#pragma once
// One SetInfo or AddInfo pass over the tree: sorts the incoming records into the groups,
// then inserts the groups in their order, filling each chart object's related objects
// below it. Records are appended to the control's list as their items are made; item
// data words are record indexes (the header item -2, record 0).

#include <windows.h>

#include <array>
#include <vector>

#include "GeoData.h"
#include "frame/errors/cErrHandler.h"
#include "inspector/ObjectTree.h"
#include "inspector/object_access.h"
#include "inspector/object_records.h"
#include "inspector/rules/FillLimits.h"
#include "inspector/rules/object_groups.h"

namespace br::inspector {

class TreeBuilder {
public:
  // treeMode 0 shows a harbour through its entry point.
  // labelFlags are ORed into the formatter's tree label flags.
  TreeBuilder(ObjectTree& tree, std::vector<ObjectRecord>& records, IObjectFormatter* formatter, long labelFlags,
              long treeMode, br::cErrHandler& reporter);

  // Sorts and inserts; records with a null owner are passed over.
  void Add(std::vector<ObjectRecord> incoming);

  const FillLimits& Limits() const { return limits_; }

private:
  using Group = std::vector<ObjectRecord>;

  void Classify(ObjectRecord record);
  bool FoldIntoCollection(IGeoObject* object);
  void Insert(const ObjectRecord& record);
  void InsertEntry(const ObjectRecord& record);
  void InsertHeader(const ObjectRecord& record);
  // Fills one object below parent (null: the root). Returns the item made, if any.
  HTREEITEM Fill(HTREEITEM parent, IUnknown* owner, IGeoObject* object);
  void FillRelated(HTREEITEM item, IUnknown* owner, IGeoObject* object, const GUID& parentId);
  HTREEITEM FillHarbourEntry(IUnknown* owner, IGeoObject* harbour, const GUID& harbourId);
  bool IsRecord(const GUID& id) const;
  bool HiddenClass(IGeoObject* object, long classCode, IUnknown* owner);
  int IconOf(IGeoObject* object, long primitive);
  std::wstring LabelOf(IGeoObject* object);
  void LogCut();

  ObjectTree& tree_;
  std::vector<ObjectRecord>& records_;
  IObjectFormatter* formatter_;
  long labelFlags_;
  long treeMode_;
  br::cErrHandler& reporter_;
  std::array<Group, kGroupCount> groups_;
  FillLimits limits_;
  bool cutLogged_ = false;
};

}  // namespace br::inspector
