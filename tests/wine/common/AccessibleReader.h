// What an accessibility client reads of a window: its client object through
// oleacc (AccessibleObjectFromWindow, AccessibleChildren), and the WinEvents the
// process announces. The suites read the toolkit's widgets and the controls
// through these, as a screen reader would.
#pragma once

#include <windows.h>
#include <oleacc.h>

#include <string>
#include <vector>

namespace br::test {

class AccessibleReader {
public:
  // The client object of `window` (OBJID_CLIENT); null when there is none.
  explicit AccessibleReader(HWND window);
  ~AccessibleReader();
  AccessibleReader(const AccessibleReader&) = delete;
  AccessibleReader& operator=(const AccessibleReader&) = delete;

  IAccessible* get() const { return object_; }

  // -1 (count, role, state) or "<failed>" (name) when the call fails.
  long ChildCount() const;
  std::wstring Name(long child = CHILDID_SELF) const;
  std::wstring Value(long child = CHILDID_SELF) const;
  long Role(long child = CHILDID_SELF) const;
  long State(long child = CHILDID_SELF) const;
  // The children's names as AccessibleChildren hands the children out.
  std::vector<std::wstring> ChildNames() const;
  // The child ids get_accSelection names (one, or several through an enumerator).
  std::vector<long> Selection() const;
  long Focus() const;  // the focused child, or -1

private:
  IAccessible* object_ = nullptr;
};

VARIANT ChildId(long child);

// The WinEvents of this process between two event numbers, delivered to this thread's
// message queue (out of context) and recorded while the object lives.
class WinEventLog {
public:
  struct Event {
    DWORD event;
    HWND window;
    LONG object;
    LONG child;
  };

  WinEventLog(DWORD first, DWORD last);
  ~WinEventLog();
  WinEventLog(const WinEventLog&) = delete;
  WinEventLog& operator=(const WinEventLog&) = delete;

  // Delivers what is queued, then answers every event recorded for `window`.
  std::vector<Event> For(HWND window);
  void Clear();

private:
  HWINEVENTHOOK hook_ = nullptr;
};

}  // namespace br::test
