#include "inspector/InspectorPanel.h"

#include "frame/settings/localised_texts.h"
#include "toolkit/core/ToolkitEvent.h"
#include "toolkit/layout/GridLayout.h"
#include "toolkit/layout/TabLayout.h"

#include <memory>

namespace br::inspector {

namespace {

std::unique_ptr<toolkit::Layout> CardLayout() {
  auto cards = std::make_unique<toolkit::TabLayout>();
  cards->selectedIndex = InspectorPanel::kCardDetails;
  cards->preferredOfAll = 1;
  return cards;
}

}  // namespace

InspectorPanel::InspectorPanel(Owner& owner, const PanelSettings& settings)
    // The one row takes the whole height: by default a grid row is only as tall as its
    // tallest child wants, which left the tree and the tabs a strip at the top.
    : toolkit::Panel(std::make_unique<toolkit::GridLayout>(1, 2, 3, 0, "35,65", toolkit::kAlignCenter)),
      owner_(owner),
      cards_(CardLayout()),
      hierarchy_(settings, 1),
      attributes_(settings),
      internal_(settings),
      external_(settings),
      lights_(settings) {
  insertNamed(nullptr, &tree_, "tree");
  insertNamed(nullptr, &cards_, "details");
  cards_.insertNamed(nullptr, &tabs_, "tabs");
  cards_.insertNamed(nullptr, &hierarchy_, "hierarchy");
  const std::string attributes = br::GetText("ObjInspector", 1, "Attributes");
  tabs_.insertNamed(nullptr, &attributes_, attributes.c_str());
}

InspectorPanel::~InspectorPanel() = default;

void InspectorPanel::clearDetails() {
  attributes_.Clear();
  internal_.Clear();
  external_.Clear();
  lights_.Clear();
  hierarchy_.Clear();
  description_.Clear();
  nationalDescription_.Clear();
  picture_.FillNames(nullptr, std::string());
}

void InspectorPanel::showFilledTabs() {
  const bool pictureWasShown = picture_.getParent() == &tabs_;
  // The list was filled while its view may not have existed: a tab put in now shows the
  // first picture (stepping back from the first one stays on it).
  if (showTab(picture_, picture_.HasContent(), 6, "Pictorial representation") && !pictureWasShown &&
      !picture_.pictures().Shown())
    picture_.ShowPrevious();
  showTab(description_, description_.HasContent(), 7, "Textual description");
  showTab(nationalDescription_, nationalDescription_.HasContent(), 65, "Textual description in national language");
  showTab(internal_, internal_.HasContent(), 8, "Internal services/shops");
  showTab(external_, external_.HasContent(), 9, "External services/shops");
  showTab(lights_, lights_.HasContent(), 10, "Lights");
  if (tabs_.isValid()) tabs_.doLayout();
}

int InspectorPanel::tabPlace(const toolkit::cXComponent& panel) const {
  const toolkit::cXComponent* const order[] = {&attributes_, &picture_, &description_, &nationalDescription_,
                                               &internal_, &external_, &lights_};
  int place = 0;
  for (const toolkit::cXComponent* tab : order) {
    if (tab == &panel) break;
    if (tab->getParent() == &tabs_) ++place;
  }
  return place;
}

bool InspectorPanel::showTab(toolkit::cXComponent& panel, bool content, long textId, const char* title) {
  const bool shown = panel.getParent() == &tabs_;
  if (content && !shown) {
    const std::string text = br::GetText("ObjInspector", textId, title);
    tabs_.insertAtNamed(tabPlace(panel), nullptr, &panel, text.c_str());
  } else if (!content && shown) {
    if (tabs_.getSelectedPage() > 0) tabs_.selectPage(0, false);
    tabs_.removeComponent(&panel, false);
  }
  return panel.getParent() == &tabs_;
}

void InspectorPanel::showCard(int card) {
  auto* cards = static_cast<toolkit::TabLayout*>(cards_.getLayout());
  if (!cards || cards->selectedIndex == card) return;
  cards->selectedIndex = card;
  if (cards_.isValid()) cards_.doLayout();
}

int InspectorPanel::shownCard() const {
  const auto* cards = static_cast<const toolkit::TabLayout*>(cards_.getLayout());
  return cards ? cards->selectedIndex : kCardDetails;
}

int InspectorPanel::onAction(toolkit::ToolkitEvent& event) {
  if (event.source != &tree_) return 0;
  owner_.TreeItemChosen(static_cast<LPARAM>(event.params[0]),
                        event.params[1] == toolkit::ContainedWindow::kTreeDoubleClick);
  return 1;
}

}  // namespace br::inspector
