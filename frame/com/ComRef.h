// One counted reference to a COM interface, released when the holder goes. The held
// pointer is always nulled before it is released: a release may run a destructor that
// calls back into the object holding the reference.
//
//   ComRef<ITidesPort> port;
//   if (FAILED(unknown->QueryInterface(IID_ITidesPort, port.OutVoid()))) return;
//   ComRef<IDispatch> dispatch = port.Query<IDispatch>(IID_IDispatch);
//   ComRef<ITidesPort> held(port_.Get());   // a reference of its own for one call
#pragma once

#include <unknwn.h>

#include <cstddef>
#include <utility>

namespace br::com {

template <class I>
class ComRef {
public:
  ComRef() noexcept = default;
  ComRef(std::nullptr_t) noexcept {}
  // Shares p: the holder takes a reference of its own.
  explicit ComRef(I* p) noexcept : p_(p) {
    if (p_) p_->AddRef();
  }
  ComRef(const ComRef& other) noexcept : ComRef(other.p_) {}
  ComRef(ComRef&& other) noexcept : p_(std::exchange(other.p_, nullptr)) {}
  ~ComRef() { Reset(); }

  // The old reference goes only after the new one is in place.
  ComRef& operator=(ComRef other) noexcept {
    std::swap(p_, other.p_);
    return *this;
  }

  // Takes over a reference the caller already owns (an out-parameter filled elsewhere).
  static ComRef Adopt(I* p) noexcept {
    ComRef held;
    held.p_ = p;
    return held;
  }

  I* Get() const noexcept { return p_; }
  I* operator->() const noexcept { return p_; }
  explicit operator bool() const noexcept { return p_ != nullptr; }

  // Lets the reference go (if any) and hands out the slot for an out-parameter.
  I** Out() noexcept {
    Reset();
    return &p_;
  }
  void** OutVoid() noexcept { return reinterpret_cast<void**>(Out()); }

  // Hands the reference to the caller (an out-parameter of ours).
  I* Detach() noexcept { return std::exchange(p_, nullptr); }

  void Reset() noexcept {
    if (I* held = std::exchange(p_, nullptr)) held->Release();
  }

  // Another interface of the same object; empty when it is refused.
  template <class J>
  ComRef<J> Query(REFIID iid) const noexcept {
    ComRef<J> face;
    // A refused interface leaves no reference, whatever the callee left in the slot.
    if (p_ && FAILED(p_->QueryInterface(iid, face.OutVoid()))) face.Detach();
    return face;
  }
  template <class J>
  ComRef<J> Query() const noexcept {
    return Query<J>(__uuidof(J));
  }

private:
  I* p_ = nullptr;
};

}  // namespace br::com
