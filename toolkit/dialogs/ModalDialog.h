#pragma once
// The toolkit's modal message box and one-line input box. The dialog window is the
// platform's (its modal loop, Esc and Enter handling); what it shows is a tree of
// toolkit components rooted in this container, which fills the dialog. The dialog
// lies exactly over the asking component's window, however large or small that is.
//
// The object lives on the caller's stack for one call: built on WM_INITDIALOG, run,
// released on WM_DESTROY. Buttons are told apart by their child names ("OK", "NO",
// "CANCEL"; see dialog_plan.h), so a relabelled button keeps its meaning.

#include <windows.h>

#include <memory>
#include <string>
#include <vector>

#include "toolkit/core/Panel.h"
#include "toolkit/dialogs/logic/dialog_plan.h"

namespace toolkit {

class cXEdit2;

class ModalDialog : public Panel {
public:
  // The native typing field of the input box, laid over the place-holder named "EDIT".
  static constexpr int kEditId = 201;

  // Run a box over `owner`'s window. Results: IDOK, IDYES, IDNO, IDCANCEL, or -1 when
  // the owner has no window or the platform could not show the dialog (the last error
  // is left for the caller). The input box copies the typed text to `result` when its
  // OK button (or Enter) ends it, and leaves `result` alone otherwise.
  static int showMessage(cXComponent& owner, const char* text, unsigned style, const char* buttonText);
  static int showInput(cXComponent& owner, const char* prompt, std::string& result, unsigned style);

  ModalDialog(cXComponent& owner, DialogKind kind, const char* text, unsigned style, const char* buttonText);
  ~ModalDialog() override;

  // Runs the modal loop; answers the dialog result.
  int run();
  // The text of the typing field as read when OK ended the box.
  const std::string& typedText() const { return typed_; }
  bool textWasTaken() const { return textTaken_; }

  // A button's action, bubbled up from the button row.
  int onAction(ToolkitEvent& event) override;

private:
  static INT_PTR CALLBACK dialogProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam);
  INT_PTR handle(UINT message, WPARAM wParam, LPARAM lParam);
  bool build();  // false when the components' windows could not be made
  void release();
  void fill();
  void placeOverOwner();
  void placeEdit();
  void finish(int result);
  HWND edit() const;

  cXComponent& owner_;
  DialogKind kind_;
  unsigned style_;
  std::string message_;
  std::string buttonText_;
  std::string typed_;
  bool textTaken_ = false;
  HWND dialog_ = nullptr;
  cXEdit2* placeholder_ = nullptr;
  std::vector<std::unique_ptr<cXComponent>> parts_;  // what build made, in order
};

}  // namespace toolkit
