#pragma once
// The inspector's content: the object tree on the left (35 %), and on the right a card
// panel whose card 0 holds the detail tabs and card 1 the hierarchy view. The tab
// "Attributes" is there from the start; its card is where the attribute table goes.

#include "inspector/ObjectTree.h"
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

  explicit InspectorPanel(Owner& owner);
  ~InspectorPanel() override;

  ObjectTree& tree() { return tree_; }
  toolkit::TabContainer& tabs() { return tabs_; }
  toolkit::Panel& attributesCard() { return attributes_; }
  // Card 0 (details) or 1 (hierarchy), laid out again when it changes.
  void showCard(int card);
  int shownCard() const;

  int onAction(toolkit::ToolkitEvent& event) override;

private:
  Owner& owner_;
  ObjectTree tree_;
  toolkit::Panel cards_;
  toolkit::TabContainer tabs_;
  toolkit::Panel hierarchy_;
  toolkit::Panel attributes_;
};

}  // namespace br::inspector
