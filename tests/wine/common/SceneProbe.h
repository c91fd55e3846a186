// The stand-in chart host (chartscene.dll, registered in the suite's prefix) as tests see
// it from outside: its counters and injected faults, reached through its exports in the
// very module COM loads. The module is pinned, so its counters survive every CoUninitialize.
#pragma once

#include <windows.h>

#include <string>

namespace br::test {

class SceneProbe {
public:
  // Loads the registered chartscene.dll (REQUIREs it).
  SceneProbe();

  long Counter(const char* name) const { return counter_(name); }
  // result 0 removes the fault.
  void SetFault(const char* operation, HRESULT result) const { setFault_(operation, result); }
  // A wrong answer with success (kind: the stand-in's Misanswer, 1 to 5; 0 removes it).
  void SetMisanswer(const char* operation, int kind) const { setMisanswer_(operation, kind); }
  // Removes the faults and the wrong answers.
  void ClearFaults() const { clearFaults_(); }

  const std::wstring& Path() const { return path_; }

private:
  std::wstring path_;
  long(WINAPI* counter_)(const char*) = nullptr;
  void(WINAPI* setFault_)(const char*, HRESULT) = nullptr;
  void(WINAPI* clearFaults_)() = nullptr;
  void(WINAPI* setMisanswer_)(const char*, int) = nullptr;
};

// Sets a process environment variable for its lifetime (the stand-in reads them when a
// component is made), restoring the earlier state afterwards.
class ScopedEnvironment {
public:
  ScopedEnvironment(const wchar_t* name, const wchar_t* value);
  ~ScopedEnvironment();
  ScopedEnvironment(const ScopedEnvironment&) = delete;
  ScopedEnvironment& operator=(const ScopedEnvironment&) = delete;

private:
  std::wstring name_;
  std::wstring old_;
  bool hadOld_ = false;
};

}  // namespace br::test
