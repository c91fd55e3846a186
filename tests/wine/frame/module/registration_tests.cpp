// Registration writes and removes the class keys and the type library, with the control
// keys for controls only. Leaves the DLL registered.
#include "frame/module/registration.h"
#include "tests/wine/common/DllUnderTest.h"

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

// A REG_SZ value under HKEY_CLASSES_ROOT (L"": the default value), "<missing>" if none.
std::wstring Value(const std::wstring& path, const wchar_t* name = L"") {
  wchar_t buffer[1024] = {};
  DWORD bytes = sizeof buffer;
  const LONG rc = RegGetValueW(HKEY_CLASSES_ROOT, path.c_str(), name, RRF_RT_REG_SZ, nullptr, buffer, &bytes);
  return rc == ERROR_SUCCESS ? buffer : L"<missing>";
}

bool SamePath(const std::wstring& a, const std::wstring& b) { return _wcsicmp(a.c_str(), b.c_str()) == 0; }

const std::wstring kTypeLibKey = L"TypeLib\\" + GuidText(LIBID_BR_INFOLib) + L"\\1.0";

struct Row {
  const wchar_t* name;
  const CLSID* clsid;
  bool control;
  const wchar_t* toolboxBitmap;
};
// One plain row and three control rows (one without events): the other rows take the same paths.
const Row kRows[] = {{L"TidesPort", &CLSID_TidesPort, false, nullptr},
                     {L"XObjectInspector", &CLSID_XObjectInspector, true, L", 103"},
                     {L"TidesWindow", &CLSID_TidesWindow, true, L", 109"},
                     {L"XContoursView", &CLSID_XContoursView, true, L", 116"},
                     {L"XPICREPView", &CLSID_XPICREPView, true, L", 118"}};

}  // namespace

TEST_CASE("DllRegisterServer writes the class keys and the type library; DllUnregisterServer removes them") {
  br::test::DllUnderTest dll;
  REQUIRE(dll.RegisterServer() == S_OK);
  for (const Row& p : kRows) {
    const std::wstring name = p.name, progId = L"BR_Info." + name, clsid = GuidText(*p.clsid);
    const std::wstring key = L"CLSID\\" + clsid;
    INFO("class ", std::string(name.begin(), name.end()));
    CHECK(Value(progId + L".1") == name + L" Class");
    CHECK(Value(progId + L".1\\CLSID") == clsid);
    CHECK(KeyExists(progId + L".1\\Insertable") == p.control);
    CHECK(Value(progId + L"\\CLSID") == clsid);
    CHECK(Value(progId + L"\\CurVer") == progId + L".1");
    CHECK(Value(key) == name + L" Class");
    CHECK(Value(key + L"\\ProgID") == progId + L".1");
    CHECK(Value(key + L"\\VersionIndependentProgID") == progId);
    CHECK(KeyExists(key + L"\\Programmable"));
    CHECK(SamePath(Value(key + L"\\InprocServer32"), dll.Path()));
    CHECK(Value(key + L"\\InprocServer32", L"ThreadingModel") == L"Apartment");
    CHECK(Value(key + L"\\TypeLib") == GuidText(LIBID_BR_INFOLib));
    for (const wchar_t* entry : {L"Control", L"Insertable", L"MiscStatus", L"ToolboxBitmap32", L"Version"})
      CHECK(KeyExists(key + L"\\" + entry) == p.control);
    if (p.control) {
      CHECK(SamePath(Value(key + L"\\ToolboxBitmap32"), dll.Path() + p.toolboxBitmap));
      CHECK(Value(key + L"\\MiscStatus\\1") == L"131473");
    }
  }
  // The type library is registered under the module's own path.
  CHECK(Value(kTypeLibKey) == L"BR_Info 1.0 Type Library");
  CHECK(SamePath(Value(kTypeLibKey + (sizeof(void*) == 8 ? L"\\409\\win64" : L"\\409\\win32")), dll.Path()));

  CHECK(dll.UnregisterServer() == S_OK);
  for (const Row& p : kRows) {
    CHECK_FALSE(KeyExists(std::wstring(L"BR_Info.") + p.name));
    CHECK_FALSE(KeyExists(std::wstring(L"BR_Info.") + p.name + L".1"));
    CHECK_FALSE(KeyExists(L"CLSID\\" + GuidText(*p.clsid)));
  }
  CHECK_FALSE(KeyExists(kTypeLibKey));
  CHECK(KeyExists(L"CLSID"));
  CHECK(dll.UnregisterServer() == S_OK);  // nothing left to remove is no failure
  CHECK(KeyExists(L"CLSID"));
  REQUIRE(dll.RegisterServer() == S_OK);  // leave it registered
  CHECK(dll.CanUnloadNow() == S_OK);
}
