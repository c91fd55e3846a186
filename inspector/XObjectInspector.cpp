#include "inspector/XObjectInspector.h"

#include "frame/com/bstr_text.h"
#include "frame/control/OwnerHold.h"
#include "frame/errors/guarded_operation.h"
#include "frame/settings/localised_texts.h"
#include "frame/settings/settings.h"
#include "inspector/TreeBuilder.h"
#include "inspector/dataset_label.h"
#include "inspector/format/hierarchy_request.h"
#include "inspector/object_access.h"
#include "inspector/panels/dataset_metadata.h"
#include "inspector/rules/attribute_text.h"
#include "inspector/rules/guid_text.h"
#include "inspector/rules/record_layout.h"
#include "inspector/rules/record_search.h"

#include <cstring>
#include <string>

namespace br::inspector {

namespace {

constexpr DISPID kSelectObjectEvent = 1;
constexpr long kAttributeFlags = 4;

bool SameId(const GUID& a, const GUID& b) { return std::memcmp(&a, &b, sizeof(GUID)) == 0; }

// Owners are the same object by COM identity; a host that hands out a fresh wrapper of
// one database for every answer is recognised by the database's name.
bool SameOwner(IUnknown* a, IUnknown* b) {
  if (a == b) return true;
  if (!a || !b) return false;
  br::com::ComRef<IUnknown> ia, ib;
  if (SUCCEEDED(a->QueryInterface(IID_IUnknown, ia.OutVoid())) && SUCCEEDED(b->QueryInterface(IID_IUnknown, ib.OutVoid())) &&
      ia.Get() == ib.Get())
    return true;
  const ComRef<IGeoDatabase> da = DatabaseOf(a), db = DatabaseOf(b);
  if (!da || !db) return false;
  br::com::BstrHolder na, nb;
  if (FAILED(da->GetName(na.Out())) || FAILED(db->GetName(nb.Out())) || SysStringLen(na.Get()) == 0) return false;
  return SysStringLen(na.Get()) == SysStringLen(nb.Get()) &&
         std::memcmp(na.Get(), nb.Get(), SysStringLen(na.Get()) * sizeof(OLECHAR)) == 0;
}

std::wstring IdTextOf(const GUID& id) {
  const std::u16string text = IdText(BytesOf(id));
  return std::wstring(text.begin(), text.end());
}

const std::wstring kZeroIdText = L"{00000000-0000-0000-0000-000000000000}";

}  // namespace

const br::com::ClassIdentity XObjectInspector::kClass = {&CLSID_XObjectInspector, &IID_IXObjectInspector,
                                                         &DIID__IXObjectInspectorEvents, L"XObjectInspector"};

const XObjectInspector::Entry XObjectInspector::kInterfaces[] = {
    {&IID_IUnknown, Self},
    {&IID_IXObjectInspector, Self},
    {&IID_IDispatch, Self},
    {&IID_ISupportErrorInfo, ErrorInfo},
    {&IID_IUnitsOption, UnitsOption},
    {nullptr, nullptr},
};

XObjectInspector::XObjectInspector() {
  br::RegisterTextClient(this);
  settings_.SetErrorHandler(&reporter_);
  settings_.Create();  // without a formatter the tree has no labels and the panels no rows
}

XObjectInspector::~XObjectInspector() {
  std::vector<ObjectRecord> old;
  old.swap(records_);
  old.clear();
  br::UnregisterTextClient(this);
}

// ---- SetInfo and AddInfo

STDMETHODIMP XObjectInspector::SetInfo(VARIANT value) { return Take(value, true); }

STDMETHODIMP XObjectInspector::AddInfo(VARIANT value) { return Take(value, false); }

HRESULT XObjectInspector::Take(const VARIANT& value, bool replace) {
  if (!Panel()) return OLE_E_BLANK;
  if (rebuilding_) return E_ACCESSDENIED;  // a host calling back from inside its own formatter
  br::control::OwnerHold hold(*static_cast<IXObjectInspector*>(this));
  const toolkit::ToolkitWindows::Busy busy;
  return Guard([&] {
    ObjectTree& tree = Panel()->tree();
    const long treeMode = static_cast<long>(br::ReadTreeMode());
    // Deleting and inserting items sends selection notifications: none of them is a choice.
    rebuilding_ = true;
    struct Done {
      bool& flag;
      ObjectTree& tree;
      ~Done() {
        flag = false;
        tree.SetRedraw(true);
      }
    } done{rebuilding_, tree};
    tree.SetRedraw(false);

    // The selected entry, to be found again after the change.
    ObjectRecord remembered;
    bool rememberedHeader = false;
    bool haveRemembered = false;
    const LPARAM selectedWord = tree.DataOf(tree.Selected());
    if (IsRecordWord(selectedWord, records_.size())) {
      remembered = records_[RecordOfWord(selectedWord)];
      rememberedHeader = selectedWord == kHeaderWord;
      haveRemembered = true;
    }

    if (replace) {
      tree.DeleteAll();
      Panel()->clearDetails();
      Panel()->showFilledTabs();
      std::vector<ObjectRecord> old;
      old.swap(records_);  // an owner's release may call back: the list is already empty
    }

    TreeBuilder builder(tree, records_, settings_.Formatter(), settings_.objectFlags, treeMode, reporter_);
    builder.Add(ReadRecordArray(value));

    HTREEITEM chosen = nullptr;
    if (haveRemembered && !rememberedHeader) {
      const auto index = FindRememberedRecord(records_.size(), [&](std::size_t i) {
        return SameId(records_[i].id, remembered.id) && SameOwner(records_[i].owner.Get(), remembered.owner.Get());
      });
      if (index) {
        tree.ForEachItem([&](HTREEITEM item) {
          if (tree.DataOf(item) != static_cast<LPARAM>(*index)) return true;
          chosen = item;
          return false;
        });
      }
    }
    if (!chosen) chosen = tree.FirstItem();
    remembered.owner.Reset();
    rebuilding_ = false;
    // Selecting may fire SelectObject, whose sink may call SetInfo again: nothing below
    // touches an item.
    if (chosen && chosen != tree.Selected()) tree.Select(chosen);
    return S_OK;
  });
}

// ---- selection

void XObjectInspector::ItemChosen(LPARAM data, bool doubleClick) {
  if (rebuilding_ || !IsRecordWord(data, records_.size())) return;
  br::control::OwnerHold hold(*static_cast<IXObjectInspector*>(this));
  const std::size_t index = RecordOfWord(data);
  const ObjectRecord record = records_[index];  // the list may change under the sinks
  const bool header = index == 0;
  ShowDetails(record, header);
  GUID reported = record.id;
  if (header) {
    reported = GuidOf(DataSetIdOf(BytesOf(record.id)));
  } else {
    records_[0] = record;
    if (InspectorPanel* panel = Panel()) {
      ObjectTree& tree = panel->tree();
      HTREEITEM top = tree.FirstItem();
      if (top && tree.DataOf(top) == static_cast<LPARAM>(kHeaderWord))
        tree.SetItemText(top, DataSetLabel(record.owner.Get(), record.id));
    }
  }
  FireSelectObject(IdTextOf(reported), record.owner.Get(), doubleClick);
}

void XObjectInspector::ShowDetails(const ObjectRecord& record, bool header) {
  InspectorPanel* panel = Panel();
  if (!panel) return;
  panel->clearDetails();
  int card = InspectorPanel::kCardDetails;
  if (header) {
    panel->attributes().FillDataSetMetadata(record.owner.Get(), record.id);
  } else {
    const ComRef<IGeoObject> object = ObjectOf(DatabaseOf(record.owner.Get()).Get(), record.id);
    const auto facts = FactsOf(object.Get());
    if (facts) {
      const bool chart = facts->haveKind && SameId(facts->kind, kChartDatabaseKind);
      if (IsHierarchyClass(facts->classCode) && facts->haveKind && KindNotBelow(facts->kind, kHierarchyKind)) {
        card = InspectorPanel::kCardHierarchy;
        panel->hierarchy().Fill(object.Get());  // a failure leaves the card empty, and is logged
      } else
        FillObjectDetails(*panel, object.Get(), facts->classCode, chart);
    }
  }
  panel->showFilledTabs();
  panel->showCard(card);
}

// The attribute table, the pictures, a chart object's lights and text descriptions, and
// for a harbour its services; a failure is logged and leaves what was filled.
void XObjectInspector::FillObjectDetails(InspectorPanel& panel, IGeoObject* object, long classCode, bool chart) {
  br::ErrRecord failure;
  br::RunGuarded(reporter_, "CXObjectInspector", BR_ERR_PLACE("_fillGeoObjectAttr"), failure, [&] {
    const bool collection = classCode == kClassAggregation || classCode == kClassAssociation;
    panel.attributes().FillObject(object, true, !(chart && collection));
    // A picture not found leaves the list with those found before it.
    panel.picture().Fill(object);
    if (chart) {
      panel.lights().FillLights(object);
      // Only a text that loaded shows its tab; a missing file leaves it hidden.
      panel.description().Fill(object, cXTextDescr::kDescription);
      panel.nationalDescription().Fill(object, cXTextDescr::kNationalDescription);
    }
    if (classCode != kClassHarbour) return;
    ForEachRelated(object, Relation::kAll, [&](IGeoObject* related) {
      long code = 0;
      if (FAILED(related->GetClassCode(&code))) return true;
      if (code == kClassInternalService) panel.internalServices().FillObject(related, false, true);
      if (code == kClassExternalService) panel.externalServices().FillObject(related, false, true);
      return true;
    });
  });
}

void XObjectInspector::FireSelectObject(const std::wstring& guidText, IUnknown* owner, bool doubleClick) {
  // Everything the sinks see is a copy: they may call SetInfo or release the control.
  VARIANT ownerValue;
  VariantInit(&ownerValue);
  ownerValue.vt = VT_UNKNOWN;
  ownerValue.punkVal = owner;
  if (owner) owner->AddRef();
  VARIANT arguments[3];
  for (VARIANT& argument : arguments) VariantInit(&argument);
  arguments[2].vt = VT_BSTR;
  arguments[2].bstrVal = SysAllocString(guidText.c_str());
  arguments[1].vt = VT_BYREF | VT_VARIANT;
  arguments[1].pvarVal = &ownerValue;
  arguments[0].vt = VT_I4;
  arguments[0].lVal = doubleClick ? 1 : 0;
  DISPPARAMS parameters = {arguments, nullptr, 3, 0};
  FireEvent(kSelectObjectEvent, &parameters);
  SysFreeString(arguments[2].bstrVal);
  VariantClear(&ownerValue);
}

STDMETHODIMP XObjectInspector::GetSelectedObject(BSTR* guid, IUnknown** owner) {
  if (!guid || !owner) return E_INVALIDARG;
  *guid = nullptr;
  *owner = nullptr;
  return Guard([&] {
    if (!Panel()) return E_FAIL;
    ObjectTree& tree = Panel()->tree();
    const LPARAM word = tree.DataOf(tree.Selected());
    if (!IsRecordWord(word, records_.size())) {
      *guid = SysAllocString(kZeroIdText.c_str());
      return S_FALSE;
    }
    const ObjectRecord& record = records_[RecordOfWord(word)];
    const GUID id = word == kHeaderWord ? GuidOf(DataSetIdOf(BytesOf(record.id))) : record.id;
    *guid = SysAllocString(IdTextOf(id).c_str());
    *owner = ComRef<IUnknown>(record.owner.Get()).Detach();
    return S_OK;
  });
}

void XObjectInspector::UnitsChanged() {
  settings_.SetUnits(units_.units);
  settings_.SetUnitsText(units_.text);
  InspectorPanel* panel = Panel();
  if (!panel || rebuilding_) return;
  br::control::OwnerHold hold(*static_cast<IXObjectInspector*>(this));
  Guard([&] {
    const LPARAM word = panel->tree().DataOf(panel->tree().Selected());
    if (!IsRecordWord(word, records_.size())) return S_FALSE;
    const ObjectRecord record = records_[RecordOfWord(word)];
    ShowDetails(record, word == kHeaderWord);
    return S_OK;
  });
}

// ---- DataSet, agency names and attribute texts

STDMETHODIMP XObjectInspector::get_DataSet(IUnknown** dataSet) {
  if (!dataSet) return E_POINTER;
  *dataSet = nullptr;
  return Guard([&]() -> HRESULT {
    if (records_.empty()) return S_FALSE;
    const ObjectRecord& first = records_[0];
    if (IsDataSetEntry(first.owner.Get())) {
      *dataSet = ComRef<IUnknown>(first.owner.Get()).Detach();
      return S_OK;
    }
    const ComRef<IGeoDatabase> database = DatabaseOf(first.owner.Get());
    if (!database) return E_NOINTERFACE;
    ComRef<IGeoObject> object;
    HRESULT hr = database->GetGeoObject(first.id, object.Out());
    if (hr != S_OK || !object) return FAILED(hr) ? hr : E_FAIL;
    ComRef<IGeoDataSet> found;
    hr = object->GetDataSet(found.Out());
    if (FAILED(hr)) return hr;
    if (!found) return E_FAIL;
    *dataSet = found.Detach();
    return S_OK;
  });
}

STDMETHODIMP XObjectInspector::HOCode2Name(LONG code, BSTR* name, BSTR* abbreviation) {
  // The table leaves an abbreviation it has not found untouched; an untouched out-string
  // is garbage to a marshaller, so it starts out null.
  if (abbreviation) *abbreviation = nullptr;
  if (name) *name = nullptr;
  return Guard([&] { return agencies_.Lookup(static_cast<std::int32_t>(code), name, abbreviation); });
}

STDMETHODIMP XObjectInspector::FormatAttributes(IUnknown* database, BSTR guid, BSTR* attributes) {
  if (!attributes) return E_INVALIDARG;
  *attributes = nullptr;
  if (!database || !guid) return E_INVALIDARG;
  return Guard([&]() -> HRESULT {
    const ComRef<IGeoDatabase> geo = DatabaseOf(database);
    if (!geo) return E_INVALIDARG;
    const auto id = ParseIdText(std::u16string_view(reinterpret_cast<const char16_t*>(guid), SysStringLen(guid)));
    if (!id) return E_INVALIDARG;
    if (IsDataSetId(*id)) {
      std::string text;
      const HRESULT hr = FormatDataSetMetadata(database, GuidOf(*id), &agencies_, text);
      if (FAILED(hr)) return hr;
      *attributes = br::com::BstrFromAnsi(text);
      return S_OK;
    }
    const ComRef<IGeoObject> object = ObjectOf(geo.Get(), GuidOf(*id));
    if (!object) return E_INVALIDARG;
    IObjectFormatter* formatter = settings_.Formatter();
    if (!formatter) return E_FAIL;
    br::com::BstrHolder text;
    if (FAILED(formatter->FormatObject(0, kAttributeFlags | settings_.objectFlags, object.Get(), 0, 0, text.Out())) || !text.Get())
      return E_INVALIDARG;
    const auto lines =
        AttributeLines(std::u16string_view(reinterpret_cast<const char16_t*>(text.Get()), SysStringLen(text.Get())));
    if (!lines) return E_INVALIDARG;
    *attributes = SysAllocStringLen(reinterpret_cast<const OLECHAR*>(lines->data()), static_cast<UINT>(lines->size()));
    return *attributes ? S_OK : E_OUTOFMEMORY;
  });
}

// ---- content

std::unique_ptr<toolkit::Container> XObjectInspector::MakeContent() {
  auto panel = std::make_unique<InspectorPanel>(relay_, settings_);
  panel->hierarchy().SetRequestHandler([this](const std::string& request) { TakeHierarchyRequest(request); });
  return panel;
}

void XObjectInspector::TakeHierarchyRequest(const std::string& request) {
  const auto chosen = ParseHierarchyRequest(request);
  if (!chosen) return;
  br::control::OwnerHold hold(*static_cast<IXObjectInspector*>(this));
  FireSelectObject(IdTextOf(GuidOf(chosen->object)), nullptr, true);
}

void XObjectInspector::ContentGoing() {
  rebuilding_ = true;  // the items going send selection notifications
  std::vector<ObjectRecord> old;
  old.swap(records_);
  rebuilding_ = false;
}

toolkit::cXComponent* XObjectInspector::FocusChild() { return Panel() ? &Panel()->tree() : nullptr; }

}  // namespace br::inspector
