#pragma once
// The inspector's hierarchy card: for an object of a chart supplementary information
// hierarchy, the tree of its hierarchy (table "Hierarchy", one row per node, indented two
// blanks per level, the selected object's row current), the attributes of the current
// node (table "Attributes", "name: value") and two buttons that ask the inspector to
// show the node's object: "Highlight coverage" for the current node, "Show station" for
// the nearest node at or above it that carries the chart supplementary information
// title (the root when none does).
//
// What the control calls:
//   cHierarchyPanel(settings, 1)   the hierarchy part beside the attribute list
//   SetRequestHandler(handler)     where the buttons' "%s|%s|%s" requests go
//   Fill(object)                   S_OK, or E_FAIL with the panel cleared
//   Clear()
// Failures are reported to the settings' handler under the source name cHierarchyPanel.

#include <windows.h>

#include <functional>
#include <string>
#include <vector>

#include <wrl/client.h>

#include "GeoData.h"
#include "inspector/format/hierarchy_tree.h"
#include "toolkit/core/Panel.h"
#include "toolkit/table/Table.h"
#include "toolkit/widgets/Button.h"

namespace br::inspector {

class PanelSettings;

class cHierarchyPanel : public toolkit::Panel {
public:
  using RequestHandler = std::function<void(const std::string& request)>;

  // Orientation 1: the hierarchy part and the attribute list side by side; 0 one above
  // the other; other values count as 1.
  explicit cHierarchyPanel(const PanelSettings& settings, int orientation = 1);
  ~cHierarchyPanel() override;

  const toolkit::ClassRecord* getClassRecord() const override;

  void SetRequestHandler(RequestHandler handler) { requests_ = std::move(handler); }

  HRESULT Fill(IGeoObject* object);
  void Clear();
  bool HasContent() const { return nodes_.getRowCount() > 0; }
  // Whether the last Fill stopped at a limit (nodes related in circles, or very many).
  bool WasCut() const { return cut_; }

  // Makes a row of the hierarchy current and lists its node's attributes.
  bool SelectNode(int row);
  // The request a button sends for the current row; empty when there is none.
  std::string HighlightRequest() const;
  std::string ShowStationRequest() const;

  toolkit::Table& hierarchyTable() { return nodes_; }
  toolkit::Table& attributeTable() { return attributes_; }
  toolkit::Button& showStationButton() { return showStation_; }
  toolkit::Button& highlightButton() { return highlight_; }
  int Orientation() const { return orientation_; }

  int onAction(toolkit::ToolkitEvent& event) override;

private:
  struct Node {
    Microsoft::WRL::ComPtr<IGeoObject> object;
    HierarchyItem item;
    int parent = -1;
    std::string text;  // the object's own text (slot 17)
  };

  std::string RequestFor(int node) const;
  void ShowAttributes(int node);
  void Report(const char* function, HRESULT result, const char* why) const;

  const PanelSettings& settings_;
  int orientation_ = 1;
  toolkit::Panel tree_;
  toolkit::Panel buttons_;
  toolkit::Table nodes_;
  toolkit::Table attributes_;
  toolkit::Button showStation_;
  toolkit::Button highlight_;
  std::vector<Node> hierarchy_;
  Microsoft::WRL::ComPtr<IGeoCatalog> catalogue_;
  RequestHandler requests_;
  bool cut_ = false;
};

}  // namespace br::inspector
