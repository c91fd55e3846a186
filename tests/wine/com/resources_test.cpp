// Resources of BR_Info.dll: version block, string 100, type library, cursor, bitmaps,
// the empty dialog template.
#include "tests/wine/common/dll_under_test.h"

#include <doctest/doctest.h>

#include <string>
#include <vector>

namespace {

std::wstring VersionString(const std::vector<BYTE>& block, const wchar_t* name) {
  std::wstring path = std::wstring(L"\\StringFileInfo\\040904B0\\") + name;
  void* value = nullptr;
  UINT length = 0;
  if (!VerQueryValueW(block.data(), path.c_str(), &value, &length) || !value) return L"<missing>";
  return std::wstring(static_cast<const wchar_t*>(value));
}

}  // namespace

TEST_CASE("version block: BR_Info Module, internal name BR_Info, US English") {
  const std::wstring path = br::test::BuiltDllPath();
  DWORD ignored = 0;
  const DWORD size = GetFileVersionInfoSizeW(path.c_str(), &ignored);
  REQUIRE(size > 0);
  std::vector<BYTE> block(size);
  REQUIRE(GetFileVersionInfoW(path.c_str(), 0, size, block.data()));
  CHECK(VersionString(block, L"FileDescription") == L"BR_Info Module");
  CHECK(VersionString(block, L"InternalName") == L"BR_Info");
  CHECK(VersionString(block, L"OriginalFilename") == L"BR_Info.DLL");
  struct Translation {
    WORD language, codePage;
  };
  Translation* translation = nullptr;
  UINT length = 0;
  REQUIRE(VerQueryValueW(block.data(), L"\\VarFileInfo\\Translation", reinterpret_cast<void**>(&translation), &length));
  REQUIRE(length >= sizeof(Translation));
  CHECK(translation->language == 0x0409);
  VS_FIXEDFILEINFO* fixed = nullptr;
  REQUIRE(VerQueryValueW(block.data(), L"\\", reinterpret_cast<void**>(&fixed), &length));
  CHECK(fixed->dwFileType == VFT_DLL);
  CHECK(HIWORD(fixed->dwFileVersionMS) == 1);
}

TEST_CASE("string 100, type library 1, cursor 203, bitmaps and dialog 206") {
  br::test::DllUnderTest dll;
  HMODULE module = dll.Handle();
  wchar_t text[64] = {};
  REQUIRE(LoadStringW(module, 100, text, 64) > 0);
  CHECK(std::wstring(text) == L"BR_Info");
  CHECK(FindResourceW(module, MAKEINTRESOURCEW(1), L"TYPELIB") != nullptr);

  HCURSOR cursor = LoadCursorW(module, MAKEINTRESOURCEW(203));
  REQUIRE(cursor != nullptr);
  ICONINFO iconInfo = {};
  REQUIRE(GetIconInfo(cursor, &iconInfo));
  CHECK(!iconInfo.fIcon);
  CHECK(iconInfo.xHotspot == 15);
  CHECK(iconInfo.yHotspot == 15);
  if (iconInfo.hbmMask) DeleteObject(iconInfo.hbmMask);
  if (iconInfo.hbmColor) DeleteObject(iconInfo.hbmColor);

  // 204: the picture tool bar strip, twelve 16-pixel images.
  HBITMAP toolbar = LoadBitmapW(module, MAKEINTRESOURCEW(204));
  REQUIRE(toolbar != nullptr);
  BITMAP bm = {};
  GetObjectW(toolbar, sizeof bm, &bm);
  CHECK(bm.bmWidth == 12 * 16);
  CHECK(bm.bmHeight == 16);
  DeleteObject(toolbar);
  for (int id = 205; id <= 210; ++id) {
    HBITMAP strip = LoadBitmapW(module, MAKEINTRESOURCEW(id));
    CHECK_MESSAGE(strip != nullptr, "bitmap ", id);
    if (strip) DeleteObject(strip);
  }
  HBITMAP named = LoadBitmapW(module, L"IDB_TVINFO_PORT_COLOR_NEW");
  REQUIRE(named != nullptr);
  GetObjectW(named, sizeof bm, &bm);
  CHECK(bm.bmHeight == 16);
  CHECK(bm.bmWidth % 16 == 0);
  DeleteObject(named);

  // The empty dialog template: DIALOGEX, no controls, the "MS Shell Dlg" font.
  HRSRC dialog = FindResourceA(module, MAKEINTRESOURCEA(206), RT_DIALOG);
  REQUIRE(dialog != nullptr);
  const auto* bytes = static_cast<const BYTE*>(LockResource(LoadResource(module, dialog)));
  const DWORD size = SizeofResource(module, dialog);
  REQUIRE(size > 26);
  CHECK(*reinterpret_cast<const WORD*>(bytes + 2) == 0xFFFF);  // DIALOGEX signature
  CHECK(*reinterpret_cast<const WORD*>(bytes + 16) == 0);     // no controls
  const std::wstring raw(reinterpret_cast<const wchar_t*>(bytes), size / sizeof(wchar_t));
  CHECK(raw.find(L"MS Shell Dlg") != std::wstring::npos);
}
