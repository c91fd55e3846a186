#include "toolkit/core/Panel.h"

#include "toolkit/base/class_records.h"
#include "toolkit/layout/BorderLayout.h"

namespace toolkit {

Panel::Panel(std::unique_ptr<Layout> layout) : Panel(nullptr, 0, std::move(layout)) {}

Panel::Panel(const char* text, int id, std::unique_ptr<Layout> layout) {
  if (text) text_ = text;
  userId_ = id;
  userValue1_ = 7;
  setLayout(layout ? std::move(layout) : std::make_unique<BorderLayout>(0, 0));
}

const ClassRecord* Panel::getClassRecord() const { return &records::Panel; }

}  // namespace toolkit
