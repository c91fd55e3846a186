// Registration writes and removes exactly the class keys and the type library, with the
// control keys for controls. Leaves the DLL registered.
#include "frame/module/registration.h"
#include "tests/wine/common/dll_under_test.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <string>

using br::module::GuidText;

namespace {

bool KeyExists(const std::wstring& path) {
  HKEY key = nullptr;
  if (RegOpenKeyExW(HKEY_CLASSES_ROOT, path.c_str(), 0, KEY_READ, &key) != ERROR_SUCCESS) return false;
  RegCloseKey(key);
  return true;
}

// A REG_SZ value under HKEY_CLASSES_ROOT ("" name: the default value); "<missing>" if none.
std::wstring Value(const std::wstring& path, const wchar_t* name = L"") {
  wchar_t buffer[1024] = {};
  DWORD bytes = sizeof buffer - sizeof(wchar_t);
  DWORD type = 0;
  HKEY key = nullptr;
  if (RegOpenKeyExW(HKEY_CLASSES_ROOT, path.c_str(), 0, KEY_READ, &key) != ERROR_SUCCESS) return L"<missing>";
  const LONG rc = RegQueryValueExW(key, name, nullptr, &type, reinterpret_cast<BYTE*>(buffer), &bytes);
  RegCloseKey(key);
  if (rc != ERROR_SUCCESS || type != REG_SZ) return L"<missing>";
  return buffer;
}

bool SamePath(const std::wstring& a, const std::wstring& b) { return _wcsicmp(a.c_str(), b.c_str()) == 0; }

const wchar_t* const kControlEntries[] = {L"Control", L"Insertable", L"MiscStatus", L"ToolboxBitmap32", L"Version"};

std::wstring TypeLibKey() { return L"TypeLib\\" + GuidText(LIBID_BR_INFOLib) + L"\\1.0"; }

}  // namespace

TEST_CASE("DllUnregisterServer removes the class keys and the type library, never CLSID") {
  br::test::DllUnderTest dll;
  REQUIRE(dll.RegisterServer() == S_OK);
  REQUIRE(KeyExists(L"BR_Info.TidesPort"));

  CHECK(dll.UnregisterServer() == S_OK);
  // A plain object's keys and a control's (with its Insertable programmatic identifier).
  for (const auto& [name, clsid] : {std::pair{L"TidesPort", &CLSID_TidesPort}, std::pair{L"TidesWindow", &CLSID_TidesWindow}}) {
    const std::wstring progId = std::wstring(L"BR_Info.") + name;
    CHECK_FALSE(KeyExists(progId));
    CHECK_FALSE(KeyExists(progId + L".1"));
    CHECK_FALSE(KeyExists(L"CLSID\\" + GuidText(*clsid)));
  }
  CHECK_FALSE(KeyExists(TypeLibKey()));
  CHECK(KeyExists(L"CLSID"));

  CHECK(dll.UnregisterServer() == S_OK);  // nothing left to remove is no failure
  CHECK(KeyExists(L"CLSID"));

  REQUIRE(dll.RegisterServer() == S_OK);  // leave it registered
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("DllRegisterServer writes the keys of a plain object and the type library") {
  br::test::DllUnderTest dll;
  // A stale entry under the class key goes: the class key is replaced whole.
  const std::wstring classKey = L"CLSID\\" + GuidText(CLSID_TidesPort);
  HKEY stale = nullptr;
  REQUIRE(RegCreateKeyExW(HKEY_CLASSES_ROOT, (classKey + L"\\Stale").c_str(), 0, nullptr, 0, KEY_WRITE, nullptr,
                          &stale, nullptr) == ERROR_SUCCESS);
  RegCloseKey(stale);

  REQUIRE(dll.RegisterServer() == S_OK);
  CHECK_FALSE(KeyExists(classKey + L"\\Stale"));

  struct Row {
    const wchar_t* name;
    const CLSID* clsid;
    bool control;
  };
  // One plain row and one control row: the other rows take the same paths.
  for (const Row& p : {Row{L"TidesPort", &CLSID_TidesPort, false}, Row{L"TidesWindow", &CLSID_TidesWindow, true}}) {
    const std::wstring name = p.name;
    const std::wstring progId = L"BR_Info." + name;
    const std::wstring clsid = GuidText(*p.clsid);
    const std::wstring key = L"CLSID\\" + clsid;
    INFO("class ", std::string(name.begin(), name.end()));
    CHECK(Value(progId + L".1") == name + L" Class");
    CHECK(Value(progId + L".1\\CLSID") == clsid);
    CHECK(KeyExists(progId + L".1\\Insertable") == p.control);
    CHECK(Value(progId) == name + L" Class");
    CHECK(Value(progId + L"\\CLSID") == clsid);
    CHECK(Value(progId + L"\\CurVer") == progId + L".1");
    CHECK(Value(key) == name + L" Class");
    CHECK(Value(key + L"\\ProgID") == progId + L".1");
    CHECK(Value(key + L"\\VersionIndependentProgID") == progId);
    CHECK(KeyExists(key + L"\\Programmable"));
    CHECK(SamePath(Value(key + L"\\InprocServer32"), dll.Path()));
    CHECK(Value(key + L"\\InprocServer32", L"ThreadingModel") == L"Apartment");
    CHECK(Value(key + L"\\TypeLib") == GuidText(LIBID_BR_INFOLib));
    for (const wchar_t* entry : kControlEntries) CHECK(KeyExists(key + L"\\" + entry) == p.control);
    if (p.control) {
      CHECK(SamePath(Value(key + L"\\ToolboxBitmap32"), dll.Path() + L", 109"));
      CHECK(Value(key + L"\\MiscStatus") == L"0");
      CHECK(Value(key + L"\\MiscStatus\\1") == L"131473");
      CHECK(Value(key + L"\\Version") == L"1.0");
    }
  }

  // The version-independent identifier resolves through CurVer.
  CLSID resolved = {};
  CHECK(CLSIDFromProgID(L"BR_Info.TidesPort", &resolved) == S_OK);
  CHECK(IsEqualCLSID(resolved, CLSID_TidesPort));

  // The type library is registered from the module file.
  CHECK(Value(TypeLibKey()) == L"BR_Info 1.0 Type Library");
  const wchar_t* platform = sizeof(void*) == 8 ? L"\\409\\win64" : L"\\409\\win32";
  CHECK(SamePath(Value(TypeLibKey() + platform), dll.Path()));
  ITypeLib* registered = nullptr;
  CHECK(LoadRegTypeLib(LIBID_BR_INFOLib, 1, 0, 0x0409, &registered) == S_OK);
  if (registered) registered->Release();

  // Objects come from the registry as any client makes them.
  ITidesDatabase* database = nullptr;
  CHECK(CoCreateInstance(CLSID_TidesDatabase, nullptr, CLSCTX_INPROC_SERVER, IID_ITidesDatabase,
                         reinterpret_cast<void**>(&database)) == S_OK);
  if (database) database->Release();
  CoFreeUnusedLibraries();
}
