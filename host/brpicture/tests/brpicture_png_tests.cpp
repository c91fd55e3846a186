// "brpicture FILE --png OUT": the PNG holds the XPICREPView drawing of the picture at the
// zoom asked for; a file that is no picture exits with 2 and still writes the failure text.
#include "tests/wine/common/image_files.h"

#include <doctest/doctest.h>

#include <objidl.h>
#include <gdiplus.h>

#include <string>
#include <vector>

using namespace br::test;

namespace {

// brpicture.exe beside the folder of this test program.
std::wstring ProgramPath() {
  wchar_t self[MAX_PATH] = {};
  GetModuleFileNameW(nullptr, self, MAX_PATH);
  std::wstring path = self;
  path.resize(path.find_last_of(L'\\'));
  path.resize(path.find_last_of(L'\\') + 1);
  return path + L"brpicture.exe";
}

DWORD Run(const std::wstring& arguments) {
  std::wstring line = L"\"" + ProgramPath() + L"\" " + arguments;
  STARTUPINFOW startup{};
  startup.cb = sizeof startup;
  PROCESS_INFORMATION process{};
  REQUIRE(CreateProcessW(nullptr, line.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr, &startup, &process));
  WaitForSingleObject(process.hProcess, 60000);
  DWORD code = 0xFFFF;
  GetExitCodeProcess(process.hProcess, &code);
  CloseHandle(process.hThread);
  CloseHandle(process.hProcess);
  return code;
}

struct Png {
  UINT width = 0;
  UINT height = 0;
  std::vector<COLORREF> pixels;
  COLORREF At(UINT x, UINT y) const { return pixels[y * width + x]; }
};

Png Read(const std::wstring& path) {
  namespace gp = Gdiplus::DllExports;
  Png png;
  ULONG_PTR token = 0;
  Gdiplus::GdiplusStartupInput input;
  REQUIRE(Gdiplus::GdiplusStartup(&token, &input, nullptr) == Gdiplus::Ok);
  Gdiplus::GpBitmap* bitmap = nullptr;
  if (gp::GdipCreateBitmapFromFile(path.c_str(), &bitmap) == Gdiplus::Ok) {
    gp::GdipGetImageWidth(bitmap, &png.width);
    gp::GdipGetImageHeight(bitmap, &png.height);
    for (UINT y = 0; y < png.height; ++y)
      for (UINT x = 0; x < png.width; ++x) {
        Gdiplus::ARGB argb = 0;
        gp::GdipBitmapGetPixel(bitmap, x, y, &argb);
        png.pixels.push_back(AsColour(argb));
      }
    gp::GdipDisposeImage(bitmap);
  }
  Gdiplus::GdiplusShutdown(token);
  return png;
}

}  // namespace

TEST_CASE("brpicture --png writes the zoomed picture") {
  PictureFolder folder(L"brpicture_png");
  REQUIRE(WriteBmp24(folder.File(L"p.bmp"), CornerPattern(60, 40)));
  const std::wstring out = folder.File(L"out.png");
  REQUIRE(Run(L"\"" + folder.File(L"p.bmp") + L"\" --zoom 50 --png \"" + out + L"\"") == 0);
  const Png png = Read(out);
  REQUIRE(png.width == 30);
  REQUIRE(png.height == 20);
  CHECK(png.At(0, 0) == AsColour(kCornerColours[0]));
  CHECK(png.At(29, 0) == AsColour(kCornerColours[1]));
  CHECK(png.At(0, 19) == AsColour(kCornerColours[2]));
  CHECK(png.At(29, 19) == AsColour(kCornerColours[3]));
  CHECK(png.At(15, 10) == AsColour(kPatternGrey));

  SUBCASE("--size and a darker palette") {
    REQUIRE(Run(L"\"" + folder.File(L"p.bmp") + L"\" --palette 3 --shade 75 --size 80x50 --png \"" + out + L"\"") == 0);
    const Png shaded = Read(out);
    REQUIRE(shaded.width == 80);
    REQUIRE(shaded.height == 50);
    CHECK(GetGValue(shaded.At(30, 20)) >= 24);
    CHECK(GetGValue(shaded.At(30, 20)) <= 26);
    // Past the picture: the view's background.
    CHECK(shaded.At(70, 45) == shaded.At(79, 49));
    CHECK(shaded.At(70, 45) != shaded.At(30, 20));
  }
}

TEST_CASE("brpicture on a file that is no picture: exit 2 and the failure text drawn") {
  PictureFolder folder(L"brpicture_broken");
  REQUIRE(WriteBroken(folder.File(L"x.png")));
  const std::wstring out = folder.File(L"out.png");
  CHECK(Run(L"\"" + folder.File(L"x.png") + L"\" --png \"" + out + L"\"") == 2);
  const Png png = Read(out);
  REQUIRE(png.width == 400);
  REQUIRE(png.height == 100);
  const COLORREF background = png.At(0, 0);
  int ink = 0;
  for (COLORREF c : png.pixels) ink += c != background;
  CHECK(ink > 100);
  CHECK(Run(L"--zoom 50") == 1);
}
