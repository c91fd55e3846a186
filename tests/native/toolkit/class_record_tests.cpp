#include <doctest/doctest.h>

#include <cstring>

#include "toolkit/base/ClassRecords.h"
#include "toolkit/base/Object.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/FlowLayout.h"
#include "toolkit/layout/GridLayout.h"
#include "toolkit/layout/SplitterLayout.h"
#include "toolkit/layout/TabLayout.h"

using namespace toolkit;

namespace {
// Stands for an object of any class, by its record.
class Stand : public Object {
public:
  explicit Stand(const ClassRecord* record) : record_(record) {}
  const ClassRecord* getClassRecord() const override { return record_; }

private:
  const ClassRecord* record_;
};

int layoutIndex(const Object* object) {
  return whichOf(object, &records::FlowLayout, &records::BorderLayout, &records::GridLayout,
                 &records::TabLayout, &records::SplitterLayout);
}
}  // namespace

TEST_CASE("the record tree: names and parents") {
  CHECK(records::Object.parent == nullptr);
  CHECK(records::cXComponent.parent == &records::Object);
  CHECK(records::Layout.parent == &records::Object);
  CHECK(records::Panel.parent == &records::Container);
  CHECK(records::Choice.parent == &records::ContainedWindow);
  CHECK(records::Check.parent == &records::Button);
  CHECK(records::cAttrViewPanel_Tbl.parent == &records::cP_SHPanel);
  CHECK(std::strcmp(records::cXPictDescr_AXPictDescr.name, "cXPictDescr::AXPictDescr") == 0);
  CHECK(std::strcmp(records::cXEdit2.name, "cXEdit2") == 0);
  CHECK(records::cXEdit2.parent == &records::cXComponent);
}

TEST_CASE("isKindOf walks the parent chain") {
  CHECK(isKindOf(&records::Panel, &records::Panel));
  CHECK(isKindOf(&records::Panel, &records::Container));
  CHECK(isKindOf(&records::Panel, &records::cXComponent));
  CHECK(isKindOf(&records::Panel, &records::Object));
  CHECK_FALSE(isKindOf(&records::Container, &records::Panel));
  CHECK_FALSE(isKindOf(&records::Choice, &records::Container));
  CHECK(isKindOf(&records::cAttrViewPanel_Tbl, &records::Container));
  CHECK(isKindOf(&records::cXPictDescr_AXPictDescr, &records::AXComponent));
  CHECK_FALSE(isKindOf(&records::cXPictDescr_AXPictDescr, &records::cXPictDescr));
  CHECK(isKindOf(&records::RadioButton, &records::Button));
  CHECK_FALSE(isKindOf(&records::GridLayout, &records::cXComponent));
  CHECK_FALSE(isKindOf(static_cast<const ClassRecord*>(nullptr), &records::Object));
  CHECK_FALSE(isKindOf(&records::Panel, nullptr));

  Stand tree(&records::cXTextDescr);
  CHECK(isKindOf(&tree, &records::ContainedWindow));
  CHECK_FALSE(isKindOf(static_cast<const Object*>(nullptr), &records::Object));
}

TEST_CASE("whichOf answers the index of the first matching record") {
  GridLayout grid(1, 2);
  FlowLayout flow;
  BorderLayout border;
  TabLayout tabs;
  SplitterLayout splitter;
  CHECK(layoutIndex(&flow) == 0);
  CHECK(layoutIndex(&border) == 1);
  CHECK(layoutIndex(&grid) == 2);
  CHECK(layoutIndex(&tabs) == 3);
  CHECK(layoutIndex(&splitter) == 4);

  Stand panel(&records::Panel);
  Stand plainLayout(&records::Layout);
  CHECK(layoutIndex(&panel) == -1);
  CHECK(layoutIndex(&plainLayout) == -1);
  CHECK(layoutIndex(nullptr) == -1);

  // Earlier records win; a null record ends the list.
  CHECK(whichOf(&panel, &records::cXComponent, &records::Panel) == 0);
  CHECK(whichOf(&panel, &records::Choice, nullptr, &records::Panel) == -1);
  CHECK(whichOf(&panel, &records::Choice, &records::Container) == 1);
}
