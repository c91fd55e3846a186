#include <doctest/doctest.h>

#include "toolkit/base/ClassRecords.h"
#include "toolkit/base/Object.h"

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
}  // namespace

TEST_CASE("isKindOf walks the parent chain") {
  const struct {
    const ClassRecord *record, *of;
    bool kind;
  } rows[] = {
      {&records::Panel, &records::Panel, true},       {&records::Panel, &records::Object, true},
      {&records::Container, &records::Panel, false},  {&records::Choice, &records::Container, false},
      {&records::cXPictDescr_AXPictDescr, &records::AXComponent, true},
      {&records::cXPictDescr_AXPictDescr, &records::cXPictDescr, false}};
  for (const auto& r : rows) {
    CAPTURE(r.record->name);
    CHECK(isKindOf(r.record, r.of) == r.kind);
  }
  CHECK_FALSE(isKindOf(static_cast<const ClassRecord*>(nullptr), &records::Object));
  CHECK_FALSE(isKindOf(&records::Panel, nullptr));

  Stand tree(&records::cXTextDescr);
  CHECK(isKindOf(&tree, &records::ContainedWindow));
  CHECK_FALSE(isKindOf(static_cast<const Object*>(nullptr), &records::Object));
}

TEST_CASE("whichOf answers the index of the first matching record") {
  // Picking each layout by its record is the layout engine suite's (every layout kind, and an unknown one).
  Stand panel(&records::Panel);
  CHECK(whichOf(static_cast<const Object*>(nullptr), &records::Panel) == -1);
  // Earlier records win; a null record ends the list.
  CHECK(whichOf(&panel, &records::cXComponent, &records::Panel) == 0);
  CHECK(whichOf(&panel, &records::Choice, nullptr, &records::Panel) == -1);
  CHECK(whichOf(&panel, &records::Choice, &records::Container) == 1);
}
