#include "BoxPresser.h"

namespace {

constexpr const char* BOX_CAPTION = "BRCL Error";

struct Search {
  DWORD processId;
  HWND found;
};

BOOL CALLBACK FindBox(HWND window, LPARAM parameter) {
  auto* search = reinterpret_cast<Search*>(parameter);
  DWORD owner = 0;
  GetWindowThreadProcessId(window, &owner);
  char caption[64] = "";
  char className[64] = "";
  GetWindowTextA(window, caption, sizeof caption);
  GetClassNameA(window, className, sizeof className);
  if (owner == search->processId && IsWindowVisible(window) &&
      lstrcmpA(caption, BOX_CAPTION) == 0 && lstrcmpA(className, "#32770") == 0) {
    search->found = window;
    return FALSE;
  }
  return TRUE;
}

// The box's message is its longest static text.
BOOL CALLBACK CollectText(HWND child, LPARAM parameter) {
  auto* text = reinterpret_cast<std::string*>(parameter);
  char className[32] = "";
  GetClassNameA(child, className, sizeof className);
  if (lstrcmpiA(className, "Static") == 0) {
    char buffer[1024] = "";
    GetWindowTextA(child, buffer, sizeof buffer);
    if (lstrlenA(buffer) > static_cast<int>(text->size())) {
      *text = buffer;
    }
  }
  return TRUE;
}

// The box's icon is the static control showing one.
BOOL CALLBACK FindIcon(HWND child, LPARAM parameter) {
  auto* icon = reinterpret_cast<HICON*>(parameter);
  char className[32] = "";
  GetClassNameA(child, className, sizeof className);
  if (lstrcmpiA(className, "Static") == 0 && (GetWindowLongA(child, GWL_STYLE) & SS_TYPEMASK) == SS_ICON) {
    *icon = reinterpret_cast<HICON>(SendMessageA(child, STM_GETICON, 0, 0));
    return FALSE;
  }
  return TRUE;
}

}  // namespace

BoxPresser::BoxPresser(DWORD processId, std::vector<int> buttons,
                       std::function<std::string()> onBox)
    : m_processId(processId), m_buttons(std::move(buttons)), m_onBox(std::move(onBox)),
      m_thread([this] { Run(); }) {}

BoxPresser::~BoxPresser() {
  m_stop = true;
  if (m_thread.joinable()) {
    m_thread.join();
  }
}

std::vector<SeenBox> BoxPresser::Finish() {
  m_stop = true;
  if (m_thread.joinable()) {
    m_thread.join();
  }
  std::lock_guard<std::mutex> guard(m_lock);
  return m_seen;
}

void BoxPresser::Run() {
  std::size_t pressed = 0;
  while (!m_stop) {
    Search search{m_processId, nullptr};
    EnumWindows(FindBox, reinterpret_cast<LPARAM>(&search));
    if (search.found == nullptr) {
      Sleep(20);
      continue;
    }
    const HWND box = search.found;
    Sleep(100);  // let the box finish its set-up before it is looked at
    SeenBox seen;
    EnumChildWindows(box, CollectText, reinterpret_cast<LPARAM>(&seen.text));
    seen.hasAbortRetryIgnore = GetDlgItem(box, IDABORT) && GetDlgItem(box, IDRETRY) &&
                               GetDlgItem(box, IDIGNORE);
    HICON icon = nullptr;
    EnumChildWindows(box, FindIcon, reinterpret_cast<LPARAM>(&icon));
    seen.errorIcon = icon != nullptr && icon == LoadIconA(nullptr, IDI_HAND);
    if (m_onBox) {
      seen.note = m_onBox();
    }
    {
      std::lock_guard<std::mutex> guard(m_lock);
      m_seen.push_back(seen);
    }
    const int button = pressed < m_buttons.size() ? m_buttons[pressed] : IDABORT;
    ++pressed;
    PostMessageA(box, WM_COMMAND, MAKEWPARAM(button, BN_CLICKED),
                 reinterpret_cast<LPARAM>(GetDlgItem(box, button)));
    for (int wait = 0; IsWindow(box) && wait < 500; ++wait) {
      Sleep(10);
    }
  }
}
