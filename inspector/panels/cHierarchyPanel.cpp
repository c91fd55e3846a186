#include "inspector/panels/cHierarchyPanel.h"

#include "frame/errors/cErrHandler.h"
#include "frame/settings/localised_texts.h"
#include "inspector/format/hierarchy_request.h"
#include "inspector/format/hierarchy_values.h"
#include "inspector/panels/GeoHierarchySource.h"
#include "inspector/panels/PanelSettings.h"
#include "inspector/panels/geo_object_rules.h"
#include "inspector/panels/hierarchy_attributes.h"
#include "toolkit/base/class_records.h"
#include "toolkit/core/ToolkitEvent.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/GridLayout.h"
#include "toolkit/table/logic/cell_kinds.h"

using Microsoft::WRL::ComPtr;

namespace br::inspector {

namespace {

std::unique_ptr<toolkit::Layout> PartsLayout(int orientation) {
  return orientation == 0 ? std::make_unique<toolkit::GridLayout>(2, 1) : std::make_unique<toolkit::GridLayout>(1, 2);
}

// A single text column that fills the width, rows chosen whole.
void SetUpList(toolkit::Table& table, const char* caption) {
  table.addColumn("text", caption, toolkit::table::kCellText, 0, nullptr, false);
  table.setTableStyle((table.getTableStyle() | toolkit::Table::kStyleWholeRow | toolkit::Table::kStyleFillLast |
                       toolkit::Table::kStyleNoEditOnSelect) &
                      ~(toolkit::Table::kStyleHorizontalGrid | toolkit::Table::kStyleVerticalGrid));
}

}  // namespace

cHierarchyPanel::cHierarchyPanel(const PanelSettings& settings, int orientation)
    : Panel(PartsLayout(orientation == 0 ? 0 : 1)),
      settings_(settings),
      orientation_(orientation == 0 ? 0 : 1),
      tree_(std::make_unique<toolkit::BorderLayout>(0, 2)),
      buttons_(std::make_unique<toolkit::GridLayout>(2, 1)),
      showStation_(GetText("ObjInspector", 35, "Show station").c_str()),
      highlight_(GetText("ObjInspector", 36, "Highlight coverage").c_str()) {
  SetUpList(nodes_, "Hierarchy");
  SetUpList(attributes_, "Attributes");
  buttons_.insertNamed(nullptr, &showStation_, "show station");
  buttons_.insertNamed(nullptr, &highlight_, "highlight coverage");
  tree_.insertNamed("Center", &nodes_, "hierarchy");
  tree_.insertNamed("South", &buttons_, "buttons");
  insertNamed(nullptr, &tree_, "tree");
  insertNamed(nullptr, &attributes_, "attributes");
}

cHierarchyPanel::~cHierarchyPanel() = default;

const toolkit::ClassRecord* cHierarchyPanel::getClassRecord() const { return &toolkit::records::cHierarchyPanel; }

void cHierarchyPanel::Report(const char* function, HRESULT result, const char* why) const {
  ErrRecord record(ErrPlace{__FILE__, function, __LINE__});
  record.text = why;
  settings_.Errors().ReportResult("cHierarchyPanel", record, static_cast<std::int32_t>(result));
}

void cHierarchyPanel::Clear() {
  nodes_.removeAllRows();
  attributes_.removeAllRows();
  hierarchy_.clear();
  catalogue_.Reset();
  cut_ = false;
}

HRESULT cHierarchyPanel::Fill(IGeoObject* object) {
  Clear();
  if (object == nullptr) return E_FAIL;
  GeoHierarchySource source(object);
  std::string why;
  const std::optional<HierarchyTree> tree = BuildHierarchyTree(source, 0, &why);
  if (!tree) {
    Report("Fill", E_FAIL, why.c_str());
    return E_FAIL;
  }
  ComPtr<IGeoDataSet> dataSet;
  if (SUCCEEDED(object->GetDataSet(&dataSet)) && dataSet) catalogue_ = CatalogueOf(dataSet.Get());

  for (const HierarchyNode& node : tree->nodes) {
    Node shown{source.Object(node.handle), node.item, node.parent, {}};
    BSTR text = nullptr;
    if (SUCCEEDED(shown.object->GetText(&text))) shown.text = AnsiText(text);
    SysFreeString(text);
    std::string row(static_cast<std::size_t>(2 * node.depth), ' ');
    row += HierarchyTitle(catalogue_.Get(), node.item.classCode);
    if (!shown.text.empty()) row += " - " + shown.text;
    nodes_.appendRowText(0, row.c_str(), 0);
    hierarchy_.push_back(std::move(shown));
  }
  cut_ = tree->cut;
  SelectNode(tree->start >= 0 ? tree->start : 0);
  return S_OK;
}

bool cHierarchyPanel::SelectNode(int row) {
  if (row < 0 || row >= static_cast<int>(hierarchy_.size())) return false;
  if (nodes_.getCurrentRow() != row) nodes_.selectRow(row, false);
  ShowAttributes(row);
  return true;
}

void cHierarchyPanel::ShowAttributes(int node) {
  attributes_.removeAllRows();
  if (node < 0 || node >= static_cast<int>(hierarchy_.size())) return;
  for (const std::string& row : HierarchyAttributeRows(hierarchy_[node].object.Get(), catalogue_.Get())) {
    attributes_.appendRowText(0, row.c_str(), 0);
  }
}

std::string cHierarchyPanel::RequestFor(int node) const {
  if (node < 0 || node >= static_cast<int>(hierarchy_.size())) return {};
  const Node& chosen = hierarchy_[node];
  GUID kind{};
  if (FAILED(chosen.object->GetKindId(&kind))) {
    Report("RequestFor", E_FAIL, "the kind cannot be read");
    return {};
  }
  return HierarchyRequestText(chosen.text, chosen.item.id, HierarchyIdOf(kind));
}

std::string cHierarchyPanel::HighlightRequest() const { return RequestFor(nodes_.getCurrentRow()); }

std::string cHierarchyPanel::ShowStationRequest() const {
  int node = nodes_.getCurrentRow();
  if (node < 0 || node >= static_cast<int>(hierarchy_.size())) return {};
  while (hierarchy_[node].text != kHierarchyTitle && hierarchy_[node].parent >= 0) node = hierarchy_[node].parent;
  return RequestFor(node);
}

int cHierarchyPanel::onAction(toolkit::ToolkitEvent& event) {
  if (event.source == &nodes_) {
    if (event.params[3] == toolkit::Table::kNotifySelect) ShowAttributes(static_cast<int>(event.params[0]));
    return 0;
  }
  if (event.source != &showStation_ && event.source != &highlight_) return 0;
  const std::string request = event.source == &showStation_ ? ShowStationRequest() : HighlightRequest();
  if (!request.empty() && requests_) requests_(request);
  return 1;
}

}  // namespace br::inspector
