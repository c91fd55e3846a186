// Keeps a control alive while a container call runs into it: the container may release
// its last reference from inside one of its own notifications.
#pragma once

#include <unknwn.h>

namespace br::control {

class OwnerHold {
public:
  explicit OwnerHold(IUnknown& owner) noexcept : owner_(owner) { owner_.AddRef(); }
  ~OwnerHold() { owner_.Release(); }
  OwnerHold(const OwnerHold&) = delete;
  OwnerHold& operator=(const OwnerHold&) = delete;

private:
  IUnknown& owner_;
};

}  // namespace br::control
