// The library's type library, loaded once from the module file (resource TYPELIB 1) and
// kept until the module unloads; IDispatch of every class is served from its type infos.
#pragma once

#include <windows.h>
#include <oaidl.h>

namespace br::com {

class TypeLibrary {
public:
  // The type library with one reference for the caller.
  static HRESULT Get(ITypeLib** out) noexcept;
  // Type information of one interface or class of the library, one reference for the caller.
  static HRESULT TypeInfoOf(REFGUID guid, ITypeInfo** out) noexcept;
  // Drops the cached library and type infos (module detach).
  static void Unload() noexcept;
};

}  // namespace br::com
