#include "inspector/TreeBuilder.h"

#include "frame/com/bstr_text.h"
#include "frame/errors/ErrRecord.h"
#include "inspector/dataset_label.h"
#include "inspector/rules/record_layout.h"

#include <cstring>
#include <set>

namespace br::inspector {

namespace {

constexpr long kLabelFlags = 6;
constexpr const char* kReportClass = "CXObjectInspector";
constexpr HRESULT kCutResult = HRESULT_FROM_WIN32(ERROR_BUFFER_OVERFLOW);

bool SameId(const GUID& a, const GUID& b) { return std::memcmp(&a, &b, sizeof(GUID)) == 0; }

struct IdLess {
  bool operator()(const GUID& a, const GUID& b) const { return std::memcmp(&a, &b, sizeof(GUID)) < 0; }
};

}  // namespace

TreeBuilder::TreeBuilder(ObjectTree& tree, std::vector<ObjectRecord>& records, IObjectFormatter* formatter,
                         long labelFlags, long treeMode, br::cErrHandler& reporter)
    : tree_(tree),
      records_(records),
      formatter_(formatter),
      labelFlags_(labelFlags),
      treeMode_(treeMode),
      reporter_(reporter) {}

void TreeBuilder::Add(std::vector<ObjectRecord> incoming) {
  for (ObjectRecord& record : incoming) Classify(std::move(record));
  for (ObjectGroup group : kInsertionOrder)
    for (const ObjectRecord& record : groups_[group]) Insert(record);
  // Chart entries have no group of their own: they come last, the first as the header.
  for (const ObjectRecord& record : groups_[kGroupDataSetEntries]) InsertEntry(record);
  for (Group& group : groups_) group.clear();
}

// ---- sorting

void TreeBuilder::Classify(ObjectRecord record) {
  if (!record.owner) return;
  if (IsDataSetEntry(record.owner.Get())) {
    groups_[kGroupDataSetEntries].push_back(std::move(record));
    return;
  }
  const ComRef<IGeoDatabase> database = DatabaseOf(record.owner.Get());
  if (!database) return;
  GUID kind{};
  if (SUCCEEDED(database->GetKindId(&kind)) && SameId(kind, kChartDatabaseKind)) {
    groups_[kGroupOthers].push_back(std::move(record));
    return;
  }
  const ComRef<IGeoObject> object = ObjectOf(database.Get(), record.id);
  const auto facts = FactsOf(object.Get());
  if (!facts || facts->classCode == kClassTechnical) return;
  if (facts->classCode == kClassHarbour) {
    groups_[kGroupHarbours].push_back(std::move(record));
    return;
  }
  if (FoldIntoCollection(object.Get())) return;
  AidFacts aid;
  if (NeedsAidFacts(facts->classCode)) {
    aid.attribute40 = NumberAttribute(object.Get(), 40).value_or(-1);
    aid.list94Has33 = ListAttributeHolds(object.Get(), 94, 33);
    aid.list35Has17 = ListAttributeHolds(object.Get(), 35, 17);
  }
  groups_[GroupOfClass(facts->classCode, aid)].push_back(std::move(record));
}

// An object in an aggregation or association is listed through that collection, once.
bool TreeBuilder::FoldIntoCollection(IGeoObject* object) {
  bool folded = false;
  ForEachRelated(object, Relation::kAll, [&](IGeoObject* related) {
    long code = 0;
    if (FAILED(related->GetClassCode(&code)) || (code != kClassAggregation && code != kClassAssociation)) return true;
    ObjectRecord collection;
    const ComRef<IGeoDatabase> database = DatabaseOfObject(related);
    if (!database || FAILED(related->GetId(&collection.id))) return true;
    collection.owner = ComRef<IUnknown>(database.Get());
    folded = true;
    Group& group = groups_[code == kClassAggregation ? kGroupAggregations : kGroupAssociations];
    for (const ObjectRecord& known : group)
      if (SameId(known.id, collection.id)) return true;
    group.push_back(std::move(collection));
    return true;
  });
  return folded;
}

// ---- inserting

bool TreeBuilder::HiddenClass(IGeoObject* object, long classCode, IUnknown* owner) {
  const ComRef<IGeoDatabase> database = DatabaseOf(owner);
  ComRef<IGeoCatalog> catalogue;
  if (!database || FAILED(database->QueryInterface(IID_IGeoCatalog, catalogue.OutVoid())) || !catalogue) return false;
  long flags = 0;
  if (FAILED(catalogue->GetClassFlags(classCode, &flags)) || !IsHiddenClassFlags(flags)) return false;
  // A hidden class still shows when it holds something.
  bool holds = false;
  ComRef<IGeoObjectEnum> members;
  if (SUCCEEDED(object->GetMembers(members.Out())) && members) {
    ForEachRelated(object, Relation::kMembers, [&](IGeoObject*) {
      holds = true;
      return false;
    });
  }
  return !holds;
}

void TreeBuilder::Insert(const ObjectRecord& record) {
  const ComRef<IGeoDatabase> database = DatabaseOf(record.owner.Get());
  const ComRef<IGeoObject> object = ObjectOf(database.Get(), record.id);
  const auto facts = FactsOf(object.Get());
  if (!facts) return;
  if (HiddenClass(object.Get(), facts->classCode, record.owner.Get())) return;
  if (facts->haveKind && SameId(facts->kind, kChartDatabaseKind)) {
    if (facts->classCode == kClassTechnical) return;
    if (facts->classCode == 500 || facts->classCode == 502) {
      const std::wstring text = TextAttribute(object.Get(), 102);
      if (text.find(L"_m_bug") != std::wstring::npos || text.find(L"clpare") != std::wstring::npos) return;
    }
  }
  if (IsHiddenFlags(FlagsOf(object.Get()))) return;
  if (records_.empty()) InsertHeader(record);
  Fill(nullptr, record.owner.Get(), object.Get());
}

void TreeBuilder::InsertHeader(const ObjectRecord& record) {
  tree_.Insert(nullptr, true, DataSetLabel(record.owner.Get(), record.id), kIconHeader,
               static_cast<LPARAM>(kHeaderWord));
  records_.push_back(record);
}

void TreeBuilder::InsertEntry(const ObjectRecord& record) {
  if (records_.empty()) {
    InsertHeader(record);
    return;
  }
  const LPARAM index = static_cast<LPARAM>(records_.size());
  records_.push_back(record);
  tree_.Insert(nullptr, false, DataSetLabel(record.owner.Get(), record.id), kIconHeader, index);
}

bool TreeBuilder::IsRecord(const GUID& id) const {
  for (std::size_t i = 1; i < records_.size(); ++i)
    if (SameId(records_[i].id, id)) return true;
  return false;
}

std::wstring TreeBuilder::LabelOf(IGeoObject* object) {
  br::com::BstrHolder label;
  if (!formatter_ || FAILED(formatter_->FormatObject(0, kLabelFlags | labelFlags_, object, 0, 0, label.Out())) || !label.Get())
    return L"";
  return std::wstring(label.Get(), SysStringLen(label.Get()));
}

int TreeBuilder::IconOf(IGeoObject* object, long primitive) {
  const int icon = IconOfPrimitive(primitive);
  bool marked = IsMarkedFlags(FlagsOf(object));
  if (!marked) {
    ForEachRelated(object, Relation::kAll, [&](IGeoObject* related) {
      marked = IsMarkedFlags(FlagsOf(related));
      return !marked;
    });
  }
  return marked ? MarkedIcon(icon) : icon;
}

HTREEITEM TreeBuilder::Fill(HTREEITEM parent, IUnknown* owner, IGeoObject* object) {
  const auto facts = FactsOf(object);
  if (!facts || !facts->haveKind) {
    br::ErrRecord failure(BR_ERR_PLACE("_FillGeoObjTree"));
    failure.line = __LINE__;
    reporter_.ReportResult(kReportClass, failure, E_FAIL);
    return nullptr;
  }
  const bool chart = facts->haveKind && SameId(facts->kind, kChartDatabaseKind);
  if (chart) {
    if (facts->classCode == kClassTechnical) return nullptr;
    if (parent && (facts->classCode == kClassAggregation || facts->classCode == kClassAssociation)) return nullptr;
    if (treeMode_ == 0 && !parent && facts->classCode == kClassHarbour)
      return FillHarbourEntry(owner, object, facts->id);
  }
  const IdBytes id = BytesOf(facts->id);
  if (!limits_.Enter(id)) {
    if (limits_.FirstCut() != FillLimits::Cut::kNone) LogCut();
    return nullptr;
  }
  const bool first = parent && (facts->classCode == kClassHarbour || facts->classCode == kClassHarbourEntry);
  const LPARAM index = static_cast<LPARAM>(records_.size());
  HTREEITEM item = tree_.Insert(parent, first, LabelOf(object), IconOf(object, facts->primitive), index);
  if (item) {
    ObjectRecord record;
    record.owner = ComRef<IUnknown>(owner);
    record.id = facts->id;
    records_.push_back(std::move(record));
    if (chart) {
      FillRelated(item, owner, object, facts->id);
      if (facts->classCode == kClassAggregation || facts->classCode == kClassAssociation) tree_.Expand(item);
    }
  }
  limits_.Leave(id);
  return item;
}

void TreeBuilder::FillRelated(HTREEITEM item, IUnknown* owner, IGeoObject* object, const GUID& parentId) {
  // Both relations list the members; each related object is shown once below an item.
  std::set<GUID, IdLess> shown;
  for (Relation relation : {Relation::kMembers, Relation::kAll}) {
    ForEachRelated(object, relation, [&](IGeoObject* related) {
      const auto facts = FactsOf(related);
      if (!facts) return true;
      const long code = facts->classCode;
      if (code == kClassInternalService || code == kClassExternalService || code == kClassHarbourEntry) return true;
      if (SameId(facts->id, parentId) || limits_.OnPath(BytesOf(facts->id))) return true;
      if (!shown.insert(facts->id).second) return true;
      if (HiddenClass(related, code, owner)) return true;
      Fill(item, owner, related);
      return true;
    });
  }
}

// Tree mode 0: a harbour is listed through its entry point, below which it shows with
// the harbour icon.
HTREEITEM TreeBuilder::FillHarbourEntry(IUnknown* owner, IGeoObject* harbour, const GUID& harbourId) {
  ComRef<IGeoObject> entry;
  ForEachRelated(harbour, Relation::kAll, [&](IGeoObject* related) {
    long code = 0;
    GUID id{};
    if (FAILED(related->GetClassCode(&code)) || code != kClassHarbourEntry || FAILED(related->GetId(&id)) ||
        IsRecord(id))
      return true;
    entry = ComRef<IGeoObject>(related);
    return false;
  });
  if (!entry) return nullptr;
  HTREEITEM item = Fill(nullptr, owner, entry.Get());
  tree_.ForEachItem([&](HTREEITEM candidate) {
    if (!tree_.ParentOf(candidate)) return true;
    const LPARAM data = tree_.DataOf(candidate);
    if (data < 1 || static_cast<std::size_t>(data) >= records_.size() || !SameId(records_[data].id, harbourId))
      return true;
    tree_.SetIcon(candidate, kIconHarbourAtEntry);
    return false;
  });
  return item;
}

void TreeBuilder::LogCut() {
  if (cutLogged_) return;
  cutLogged_ = true;
  br::ErrRecord cut(BR_ERR_PLACE("_FillGeoObjTree"));
  cut.line = __LINE__;
  cut.text = limits_.FirstCut() == FillLimits::Cut::kDepth ? "related objects cut at depth 32"
                                                            : "related objects cut at 10000 items";
  reporter_.ReportResult(kReportClass, cut, kCutResult);
}

}  // namespace br::inspector
