#pragma once
// Presses the buttons of "BRCL Error" message boxes from a second thread, the
// way a user would, and notes what each box showed.

#include <windows.h>

#include <atomic>
#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

struct SeenBox {
  std::string text;
  bool hasAbortRetryIgnore = false;
  bool errorIcon = false;
  std::string note;  // whatever the per-box check wants to remember
};

class BoxPresser {
public:
  // Presses buttons (IDABORT, IDRETRY, IDIGNORE) in order on the boxes of the
  // given process; boxes beyond the script get Abort so that nothing hangs.
  // onBox runs when a box is found, before its button is pressed.
  BoxPresser(DWORD processId, std::vector<int> buttons,
             std::function<std::string()> onBox = nullptr);
  ~BoxPresser();

  // Stops looking after the last expected box has closed or the wait is over.
  std::vector<SeenBox> Finish();

private:
  void Run();

  DWORD m_processId;
  std::vector<int> m_buttons;
  std::function<std::string()> m_onBox;
  std::atomic<bool> m_stop{false};
  std::mutex m_lock;
  std::vector<SeenBox> m_seen;
  std::thread m_thread;
};
