#pragma once
// The inspector's content: the object tree on the left (35 %), and on the right a card
// panel whose card 0 holds the detail tabs and card 1 the hierarchy view. The tab
// "Attributes" holds the attribute table from the start; the others (text descriptions,
// services, lights) are shown only while their panels have content, always in the same order.

#include "inspector/ObjectTree.h"
#include "inspector/panels/cAttrViewPanel_Tbl.h"
#include "inspector/panels/cHierarchyPanel.h"
#include "inspector/panels/cLightsViewPanel.h"
#include "inspector/panels/cP_SHPanel.h"
#include "inspector/panels/cXTextDescr.h"
#include "picture/cXPictDescr.h"
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
  cXTextDescr& description() { return description_; }
  cXTextDescr& nationalDescription() { return nationalDescription_; }
  br::picture::cXPictDescr& picture() { return picture_; }
  // Empties the attribute, picture, text, services, lights and hierarchy panels.
  void clearDetails();
  // Puts the optional tabs in or takes them out by their content, after a fill.
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
  br::picture::cXPictDescr picture_;
  cXTextDescr description_;
  cXTextDescr nationalDescription_;
  // Whether the tab is in the container afterwards.
  bool showTab(toolkit::cXComponent& panel, bool content, long textId, const char* title);
  // Where a tab goes: after the shown tabs that come before it in the fixed order.
  int tabPlace(const toolkit::cXComponent& panel) const;
};

}  // namespace br::inspector
