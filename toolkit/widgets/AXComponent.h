#pragma once
// A component that hosts an embedded control, made by class identifier,
// through the platform's control-hosting window ("AtlAxWin" of atl.dll). The
// hosting window fills the component; the owner reaches the control through
// getControl and listens to it through the control's own events.

#include <objbase.h>

#include "toolkit/core/cXComponent.h"

namespace toolkit {

class AXComponent : public cXComponent {
public:
  static constexpr const char* kHostClass = "AtlAxWin";

  AXComponent();
  ~AXComponent() override;

  const ClassRecord* getClassRecord() const override;

  // The component's window; then the control, when a class id was given.
  bool create(HWND parentHwnd) override;
  // Hosts a control of the class (replacing one hosted before). Without a
  // window yet, the class id is kept and the control made with the window.
  // Answers whether a control is hosted now (false also while waiting).
  bool create(const CLSID& classId);

  // QueryInterface on the hosted control; E_FAIL when none is hosted.
  HRESULT getControl(REFIID iid, void** object) const;
  bool isHosting() const { return control_ != nullptr; }
  HWND hostWindow() const;
  const CLSID& classId() const { return classId_; }

  void validate() override;
  int onResized(ToolkitEvent& event) override;

  // Loads atl.dll and registers its hosting window class, once per process.
  static bool hostingAvailable();

private:
  bool host();
  void release();
  void fitHost();

  CLSID classId_ = CLSID_NULL;
  HWND host_ = nullptr;
  IUnknown* control_ = nullptr;
};

}  // namespace toolkit
