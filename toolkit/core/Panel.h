#pragma once
// The plain container that controls and panels are built from.

#include <memory>

#include "toolkit/core/Container.h"

namespace toolkit {

class Panel : public Container {
public:
  // Without a layout a Panel arranges its children by a BorderLayout with no gaps.
  // `id` becomes the user id; user value 1 starts at 7.
  explicit Panel(std::unique_ptr<Layout> layout = nullptr);
  Panel(const char* text, int id, std::unique_ptr<Layout> layout = nullptr);

  const ClassRecord* getClassRecord() const override;
};

}  // namespace toolkit
