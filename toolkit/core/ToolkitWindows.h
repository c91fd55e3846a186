#pragma once
// The toolkit's window procedure and what it needs: the table HWND ->
// (component, previous window procedure) and the window classes
// "Brine_AWTATL<kind>", one per peer kind.

#include <windows.h>

#include <memory>
#include <string>

namespace toolkit {

class cXComponent;

class ToolkitWindows {
public:
  static LRESULT CALLBACK windowProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam);

  static std::string className(int peerKind);
  // Registers the class of the kind unless it already is (with this procedure).
  static bool registerClass(int peerKind);
  // For module unload: a class left registered would point into unloaded code.
  static void unregisterClasses();
  static HINSTANCE moduleInstance();
  // Common controls are initialised the first time a window of a system class is made.
  static void initCommonControls();

  // Table of the toolkit's windows.
  static void enter(HWND hwnd, cXComponent* component, WNDPROC previous);
  // Installs the toolkit procedure on a window of another class (remembering the
  // old one, unless it already is the toolkit's) and enters it.
  static void subclass(HWND hwnd, cXComponent* component);
  static cXComponent* componentOf(HWND hwnd);
  static WNDPROC previousProcOf(HWND hwnd);
  static size_t windowCount();

  // The default processing for messages that no native procedure takes
  // (DefWindowProcA unless replaced, e.g. to watch what reaches it). Answers the
  // previous one; null restores DefWindowProcA.
  static WNDPROC setDefaultProcedure(WNDPROC procedure);

  // While a toolkit window procedure runs on this thread, or a Busy scope is open, the
  // components handed to deleteWhenIdle wait until the outermost one has returned: a
  // component's own call may still be on the stack when its owner lets it go (a host that
  // closes its window from inside a selection event the table is still delivering).
  class Busy {
  public:
    Busy();
    ~Busy();
    Busy(const Busy&) = delete;
    Busy& operator=(const Busy&) = delete;
  };
  static void deleteWhenIdle(std::unique_ptr<cXComponent> component);

  // The component whose window CreateWindowEx is making on this thread, so that
  // the window's first messages (WM_NCCREATE, WM_CREATE) already reach it.
  class Creating {
  public:
    explicit Creating(cXComponent* component);
    ~Creating();
    Creating(const Creating&) = delete;
    Creating& operator=(const Creating&) = delete;

  private:
    cXComponent* previous_;
  };
};

}  // namespace toolkit
