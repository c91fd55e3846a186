#include "toolkit/dialogs/ModalDialog.h"

#include <cstring>
#include <new>

#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/layout/BorderLayout.h"
#include "toolkit/layout/FlowLayout.h"
#include "toolkit/widgets/Button.h"
#include "toolkit/widgets/Label.h"
#include "toolkit/widgets/cXEdit2.h"

namespace toolkit {

namespace {

constexpr std::int32_t kCentredRows = 68;  // FlowLayout alignment
const char* const kButtonNames[] = {"OK", "NO", "CANCEL"};

// The dialog that the next dialog window of this thread belongs to. It is bound by
// the window's first message; a scope clears it on return, so a box opened from a
// box (or a dialog that failed before its first message) leaves nothing behind.
thread_local ModalDialog* t_pending = nullptr;

class PendingDialog {
public:
  explicit PendingDialog(ModalDialog* dialog) : previous_(t_pending) { t_pending = dialog; }
  ~PendingDialog() { t_pending = previous_; }
  PendingDialog(const PendingDialog&) = delete;
  PendingDialog& operator=(const PendingDialog&) = delete;

private:
  ModalDialog* previous_;
};

void append(std::vector<WORD>& out, DWORD value) {
  out.push_back(LOWORD(value));
  out.push_back(HIWORD(value));
}

// An in-memory template: an empty bordered popup; the input box adds the edit control
// 201. Sizes are 0: the dialog takes its owner's rectangle when it is shown.
std::vector<WORD> dialogTemplate(DialogKind kind) {
  std::vector<WORD> t;
  append(t, WS_POPUP | WS_BORDER | WS_CLIPCHILDREN);
  append(t, 0);                                      // extended style
  t.push_back(kind == DialogKind::kInput ? 1 : 0);   // items
  for (int i = 0; i < 4; ++i) t.push_back(0);        // x, y, cx, cy
  t.push_back(0);                                    // no menu
  t.push_back(0);                                    // the dialog class
  t.push_back(0);                                    // no title
  if (kind == DialogKind::kInput) {
    if (t.size() % 2) t.push_back(0);                // items start on a DWORD
    append(t, WS_CHILD | WS_VISIBLE | WS_TABSTOP | ES_AUTOHSCROLL | ES_LEFT);
    append(t, 0);
    for (int i = 0; i < 4; ++i) t.push_back(0);
    t.push_back(static_cast<WORD>(ModalDialog::kEditId));
    t.push_back(0xFFFF);
    t.push_back(0x0081);                             // the predefined edit class
    t.push_back(0);                                  // no text
    t.push_back(0);                                  // no creation data
  }
  return t;
}

RECT toRECT(const Rect& r) { return RECT{r.left, r.top, r.right, r.bottom}; }
Rect toRect(const RECT& r) { return Rect{r.left, r.top, r.right, r.bottom}; }

}  // namespace

int ModalDialog::showMessage(cXComponent& owner, const char* text, unsigned style, const char* buttonText) {
  try {
    ModalDialog dialog(owner, DialogKind::kMessage, text, style, buttonText);
    return dialog.run();
  } catch (const std::bad_alloc&) {
    SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    return kDialogFailed;
  }
}

int ModalDialog::showInput(cXComponent& owner, const char* prompt, std::string& result, unsigned style) {
  try {
    ModalDialog dialog(owner, DialogKind::kInput, prompt, style, nullptr);
    const int answer = dialog.run();
    if (dialog.textWasTaken()) result = dialog.typedText();
    return answer;
  } catch (const std::bad_alloc&) {
    SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    return kDialogFailed;
  }
}

ModalDialog::ModalDialog(cXComponent& owner, DialogKind kind, const char* text, unsigned style,
                         const char* buttonText)
    : owner_(owner), kind_(kind), style_(style), message_(text ? text : ""),
      buttonText_(buttonText ? buttonText : "") {}

ModalDialog::~ModalDialog() { release(); }

int ModalDialog::run() {
  const HWND ownerWindow = owner_.getHandle();
  if (!ownerWindow) {
    // Nothing to lie over, and no owner whose input could be held: never a loop.
    SetLastError(ERROR_INVALID_WINDOW_HANDLE);
    return kDialogFailed;
  }
  const std::vector<WORD> layout = dialogTemplate(kind_);
  const PendingDialog pending(this);
  const INT_PTR answer = DialogBoxIndirectParamA(
      ToolkitWindows::moduleInstance(), reinterpret_cast<LPCDLGTEMPLATEA>(layout.data()), ownerWindow,
      &ModalDialog::dialogProc, 0);
  dialog_ = nullptr;
  return answer == -1 ? kDialogFailed : static_cast<int>(answer);
}

INT_PTR CALLBACK ModalDialog::dialogProc(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  auto* self = reinterpret_cast<ModalDialog*>(GetWindowLongPtrA(hwnd, DWLP_USER));
  if (!self && t_pending && message != WM_NCDESTROY) {
    self = t_pending;
    t_pending = nullptr;
    self->dialog_ = hwnd;
    SetWindowLongPtrA(hwnd, DWLP_USER, reinterpret_cast<LONG_PTR>(self));
  }
  if (!self) return FALSE;
  if (message == WM_NCDESTROY) {
    SetWindowLongPtrA(hwnd, DWLP_USER, 0);
    return FALSE;
  }
  try {
    return self->handle(message, wParam, lParam);
  } catch (...) {
    // Nothing may unwind through the platform's dialog code. A box that cannot be
    // built or laid out is one that could not be shown.
    SetLastError(ERROR_CANNOT_MAKE);
    EndDialog(hwnd, kDialogFailed);
    return TRUE;
  }
}

INT_PTR ModalDialog::handle(UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_INITDIALOG:
      if (!build()) {
        SetLastError(ERROR_CANNOT_MAKE);
        EndDialog(dialog_, kDialogFailed);
        return TRUE;
      }
      if (HWND field = edit()) {
        SetFocus(field);
        return FALSE;  // the focus is set
      }
      return TRUE;
    case WM_SHOWWINDOW:
      // Only when the dialog itself becomes visible, not when its owner is shown.
      if (wParam && lParam == 0) {
        placeOverOwner();
        fill();
      }
      return FALSE;
    case WM_SIZE:
      fill();
      return TRUE;
    case WM_CLOSE:
      finish(kDialogCancel);  // the close command always ends the box
      return TRUE;
    case WM_COMMAND:
      if (lParam != 0 && reinterpret_cast<HWND>(lParam) == edit()) return FALSE;  // the field's notifications
      if (LOWORD(wParam) == IDCANCEL) {
        const int result = dialogEscapeResult(kind_, style_);
        if (result != kDialogIgnored) finish(result);
        return TRUE;
      }
      if (LOWORD(wParam) == IDOK) {
        if (dialogEnterPressesOk(kind_, style_)) finish(dialogResult(kind_, style_, "OK"));
        return TRUE;
      }
      return FALSE;
    case WM_DESTROY:
      release();
      return FALSE;
    default:
      return FALSE;
  }
}

bool ModalDialog::build() {
  release();
  const auto part = [this](cXComponent* made) {
    parts_.emplace_back(made);
    return made;
  };
  Container* buttonRow = nullptr;
  if (kind_ == DialogKind::kMessage) {
    insertNamed("Center", part(new Label(message_.c_str(), Label::kCenter)), "TEXT");
    auto* row = new Panel(std::make_unique<FlowLayout>(kCentredRows, 5, 0, false));
    part(row);
    row->setInsets(0, 0, 0, 10);
    insertNamed("South", row, "BUTTONS");
    buttonRow = row;
  } else {
    auto* centre = new Panel();
    part(centre);
    centre->setInsets(0, 0, 0, 10);
    centre->insertNamed("Center", part(new Label(message_.c_str(), Label::kCenter)), "TEXT");
    placeholder_ = new cXEdit2(0);
    centre->insertNamed("South", part(placeholder_), "EDIT");
    insertNamed("Center", centre, "PROMPT");
    auto* row = new Panel(std::make_unique<FlowLayout>(kCentredRows, 5, 0, false));
    part(row);
    row->setInsets(0, 10, 0, 10);
    insertNamed("South", row, "BUTTONS");
    buttonRow = row;
  }
  for (const DialogButton& spec : dialogButtons(kind_, style_, buttonText_.c_str())) {
    auto* button = new Button(spec.label.c_str());
    part(button);
    button->setInsets(spec.insets.left, spec.insets.top, spec.insets.right, spec.insets.bottom);
    buttonRow->add(button, spec.name.c_str());
  }

  if (!create(dialog_)) return false;
  // The native field lies over the components: they must not paint over it.
  modifyStyle(0, WS_CLIPSIBLINGS, 0);
  if (HFONT font = owner_.getFont()) lendFont(font);
  if (HWND field = edit()) {
    SendMessageA(field, EM_LIMITTEXT, 0, 0);  // no length limit
    SendMessageA(field, WM_SETFONT, reinterpret_cast<WPARAM>(owner_.getFont()), FALSE);
    SetWindowPos(field, HWND_TOP, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
  }
  fill();
  return true;
}

void ModalDialog::release() {
  placeholder_ = nullptr;
  // Later parts first (buttons before their row). One of them may still be on the
  // stack (its click ended the box): the toolkit deletes it once its call returns.
  while (!parts_.empty()) {
    std::unique_ptr<cXComponent> part = std::move(parts_.back());
    parts_.pop_back();
    removeComponent(part.get(), false);
    ToolkitWindows::deleteWhenIdle(std::move(part));
  }
}

void ModalDialog::fill() {
  if (!dialog_ || !isValid()) return;
  RECT client{};
  GetClientRect(dialog_, &client);
  setBounds(0, 0, client.right - client.left, client.bottom - client.top, true, true);
  doLayout();
  placeEdit();
}

void ModalDialog::placeOverOwner() {
  if (!owner_.isValid()) return;
  const RECT r = owner_.getWindowRect();
  SetWindowPos(dialog_, nullptr, r.left, r.top, r.right - r.left, r.bottom - r.top,
               SWP_NOZORDER | SWP_NOACTIVATE);
}

void ModalDialog::placeEdit() {
  const HWND field = edit();
  if (!field || !placeholder_ || !placeholder_->isValid()) return;
  // The place-holder's window rectangle is on the screen; the field is the dialog's child.
  RECT r = placeholder_->getWindowRect();
  MapWindowPoints(nullptr, dialog_, reinterpret_cast<POINT*>(&r), 2);
  const RECT e = toRECT(dialogEditPlacement(toRect(r)));
  SetWindowPos(field, nullptr, e.left, e.top, e.right - e.left, e.bottom - e.top, SWP_NOZORDER | SWP_NOREDRAW);
  InvalidateRect(field, nullptr, TRUE);
}

HWND ModalDialog::edit() const {
  return kind_ == DialogKind::kInput && dialog_ ? GetDlgItem(dialog_, kEditId) : nullptr;
}

void ModalDialog::finish(int result) {
  if (!dialog_) return;
  if (kind_ == DialogKind::kInput && result == kDialogYes) {
    // Only the OK button (or Enter) takes the text; it is read whole.
    if (HWND field = edit()) {
      const int length = GetWindowTextLengthA(field);
      std::string text(static_cast<std::size_t>(length > 0 ? length : 0) + 1, '\0');
      const int got = GetWindowTextA(field, &text[0], length + 1);
      text.resize(got > 0 ? static_cast<std::size_t>(got) : 0);
      typed_ = std::move(text);
    } else {
      typed_.clear();
    }
    textTaken_ = true;
  }
  EndDialog(dialog_, result);
}

int ModalDialog::onAction(ToolkitEvent& event) {
  for (const char* name : kButtonNames) {
    if (event.source != nullptr && findNamed(name) == event.source) {
      finish(dialogResult(kind_, style_, name));
      return 1;
    }
  }
  finish(dialogResult(kind_, style_, ""));
  return 1;
}

}  // namespace toolkit
