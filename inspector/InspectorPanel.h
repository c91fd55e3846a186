#pragma once
// The inspector's content: the object tree on the left (35 %), and on the right a card
// panel whose card 0 holds the detail tabs and card 1 the hierarchy view. The tab
// "Attributes" holds the attribute table from the start; the services and lights tabs are
// shown only while their panels have rows.

#include "inspector/ObjectTree.h"
#include "inspector/panels/cAttrViewPanel_Tbl.h"
#include "inspector/panels/cHierarchyPanel.h"
#include "inspector/panels/cLightsViewPanel.h"
#include "inspector/panels/cP_SHPanel.h"
#include "toolkit/core/Panel.h"
#include "toolkit/widgets/TabContainer.h"

namespace br::inspector {

class InspectorPanel final : public toolkit::Panel {
public:
  // What the panel tells its control: a tree item chosen, by selection or double click.
  class Owner {
  public:
    virtual void TreeItemChosen(LPARAM data, bool doubleClick) = 0;

  protected:
    ~Owner() = default;
  };

  static constexpr int kCardDetails = 0;
  static constexpr int kCardHierarchy = 1;

  InspectorPanel(Owner& owner, const PanelSettings& settings);
  ~InspectorPanel() override;

  ObjectTree& tree() { return tree_; }
  toolkit::TabContainer& tabs() { return tabs_; }
  cAttrViewPanel_Tbl& attributes() { return attributes_; }
  cP_SHPanel& internalServices() { return internal_; }
  cP_SHPanel& externalServices() { return external_; }
  cLightsViewPanel& lights() { return lights_; }
  cHierarchyPanel& hierarchy() { return hierarchy_; }
  // Empties the attribute, services, lights and hierarchy panels.
  void clearDetails();
  // Puts the services and lights tabs in or takes them out by their content, after a fill.
  void showFilledTabs();
  // Card 0 (details) or 1 (hierarchy), laid out again when it changes.
  void showCard(int card);
  int shownCard() const;

  int onAction(toolkit::ToolkitEvent& event) override;

private:
  Owner& owner_;
  ObjectTree tree_;
  toolkit::Panel cards_;
  toolkit::TabContainer tabs_;
  cHierarchyPanel hierarchy_;
  cAttrViewPanel_Tbl attributes_;
  cP_SHPanel internal_;
  cP_SHPanel external_;
  cLightsViewPanel lights_;
  void showTab(toolkit::Panel& panel, bool hasContent, long textId, const char* title);
};

}  // namespace br::inspector
