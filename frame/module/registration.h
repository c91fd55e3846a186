// Registry entries of the classes and of the type library.
//
// For class X with identifier {clsid} every row writes, under HKEY_CLASSES_ROOT:
//   BR_Info.X.1 = "X Class", \CLSID = {clsid}
//   BR_Info.X   = "X Class", \CLSID = {clsid}, \CurVer = BR_Info.X.1
//   CLSID\{clsid} = "X Class" with ProgID, VersionIndependentProgID, Programmable,
//                   InprocServer32 (module path, ThreadingModel=Apartment), TypeLib = {libid}
// and for controls also BR_Info.X.1\Insertable and, under CLSID\{clsid}, Control,
// Insertable, ToolboxBitmap32 ("path, N"), MiscStatus ("0", \1 = "131473"), Version = "1.0".
// CLSID\{clsid} is replaced whole on registration and removed whole on unregistration;
// CLSID itself is never touched.
#pragma once

#include "frame/module/ClassEntry.h"

#include <string>

namespace br::module {

HRESULT WriteClassKeys(const ClassEntry& row, const std::wstring& modulePath, const GUID& libid) noexcept;
// Removes the three keys of the row; keys that are already gone count as removed.
HRESULT RemoveClassKeys(const ClassEntry& row) noexcept;

// Registers the type library embedded in the module file (TYPELIB 1).
HRESULT RegisterTypeLibrary(const std::wstring& modulePath) noexcept;
// Unregisters it by its identity, version, locale and system kind; not registered is success.
HRESULT UnregisterTypeLibrary(const std::wstring& modulePath) noexcept;

// Registry text of a GUID: "{XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX}".
std::wstring GuidText(const GUID& guid);

}  // namespace br::module
