#pragma once
// The script processor (usp10.dll), loaded on demand from the system folder only,
// so that a DLL of the same name planted beside the host or in the current
// directory is never run. Available only when all twelve entry points were found.

#include <windows.h>

#include <usp10.h>

namespace toolkit {

// The entry points the text engine calls, in the order they are looked up.
struct ScriptEntryPoints {
  decltype(&::ScriptItemize) itemize = nullptr;
  decltype(&::ScriptShape) shape = nullptr;
  decltype(&::ScriptPlace) place = nullptr;
  decltype(&::ScriptGetLogicalWidths) getLogicalWidths = nullptr;
  decltype(&::ScriptBreak) breakText = nullptr;
  decltype(&::ScriptLayout) layout = nullptr;
  decltype(&::ScriptStringOut) stringOut = nullptr;
  decltype(&::ScriptTextOut) textOut = nullptr;
  decltype(&::ScriptFreeCache) freeCache = nullptr;
  decltype(&::ScriptStringFree) stringFree = nullptr;
  decltype(&::ScriptString_pSize) stringSize = nullptr;
  decltype(&::ScriptStringAnalyse) stringAnalyse = nullptr;
};

class ScriptLibrary {
public:
  ScriptLibrary() = default;
  ~ScriptLibrary();
  ScriptLibrary(const ScriptLibrary&) = delete;
  ScriptLibrary& operator=(const ScriptLibrary&) = delete;

  // Loads `fileName` (a bare file name: a name with a folder or drive is refused)
  // from the system folder and looks its entry points up, stopping at the first
  // missing one. A previously loaded library is released first. False for a null
  // or empty name, a missing file or a missing entry point; a library found
  // without all its entry points stays loaded (but unused) until the next load.
  bool load(const wchar_t* fileName);

  bool available() const { return available_; }
  HMODULE module() const { return module_; }
  const ScriptEntryPoints& entry() const { return entry_; }

private:
  void release();

  HMODULE module_ = nullptr;
  bool available_ = false;
  ScriptEntryPoints entry_;
};

}  // namespace toolkit
