#include "toolkit/text/ScriptLibrary.h"

#include "toolkit/core/system_library.h"

#include <string>

namespace toolkit {
namespace {

template <typename Fn>
bool find(HMODULE module, const char* name, Fn& out) {
  out = reinterpret_cast<Fn>(reinterpret_cast<void*>(GetProcAddress(module, name)));
  return out != nullptr;
}

}  // namespace

ScriptLibrary::~ScriptLibrary() { release(); }

void ScriptLibrary::release() {
  available_ = false;
  entry_ = ScriptEntryPoints{};
  if (module_) FreeLibrary(module_);
  module_ = nullptr;
}

bool ScriptLibrary::load(const wchar_t* fileName) {
  release();
  module_ = LoadSystemLibrary(fileName);
  if (!module_) return false;

  ScriptEntryPoints& e = entry_;
  available_ = find(module_, "ScriptItemize", e.itemize) && find(module_, "ScriptShape", e.shape) &&
               find(module_, "ScriptPlace", e.place) && find(module_, "ScriptGetLogicalWidths", e.getLogicalWidths) &&
               find(module_, "ScriptBreak", e.breakText) && find(module_, "ScriptLayout", e.layout) &&
               find(module_, "ScriptStringOut", e.stringOut) && find(module_, "ScriptTextOut", e.textOut) &&
               find(module_, "ScriptFreeCache", e.freeCache) && find(module_, "ScriptStringFree", e.stringFree) &&
               find(module_, "ScriptString_pSize", e.stringSize) &&
               find(module_, "ScriptStringAnalyse", e.stringAnalyse);
  return available_;
}

}  // namespace toolkit
