// One row of the class table: what the module registers and creates for a class.
#pragma once

#include "frame/com/ClassFactory.h"

namespace br::module {

enum class ClassKind { PlainObject, Control };

struct ClassEntry {
  const CLSID* clsid;
  const wchar_t* name;       // "TidesPort": programmatic identifiers BR_Info.TidesPort(.1)
  ClassKind kind;
  int toolboxBitmap;         // controls: the number written to ToolboxBitmap32
  br::com::CreateInstanceFunction createInstance;
  IClassFactory* classObject;  // made on first request and cached until unload
};

// A plain object row: { PlainObjectRow<TidesPort>(L"TidesPort") }.
template <class T>
constexpr ClassEntry PlainObjectRow(const wchar_t* name) {
  return ClassEntry{T::kClass.clsid, name, ClassKind::PlainObject, 0, &br::com::CreateInstance<T>, nullptr};
}
template <class T>
constexpr ClassEntry ControlRow(const wchar_t* name, int toolboxBitmap) {
  return ClassEntry{T::kClass.clsid, name, ClassKind::Control, toolboxBitmap, &br::com::CreateInstance<T>, nullptr};
}

}  // namespace br::module
