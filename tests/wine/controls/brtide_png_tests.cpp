// "brtide day ... --png FILE [--size WxH]": the picture it writes is the TidesWindow
// control's own picture of that day, pixel for pixel; bad options fail clearly.
#include "tests/wine/common/station_folder.h"
#include "tests/wine/controls/graph_test_support.h"
#include "tests/wine/host/brtide_process.h"

#include <doctest/doctest.h>

#include <objidl.h>
#include <gdiplus.h>

#include <string>

using namespace br::test;

namespace {

std::string Narrow(const std::wstring& text) {
  std::string out;
  for (wchar_t c : text) out += static_cast<char>(c);  // the test's paths are ASCII
  return out;
}

std::wstring TempFile(const wchar_t* name) {
  wchar_t folder[MAX_PATH];
  GetTempPathW(MAX_PATH, folder);
  return std::wstring(folder) + name;
}

// The PNG's pixels as 0x00BBGGRR, or empty when GDI+ cannot read it.
std::vector<COLORREF> ReadPng(const std::wstring& path, int& width, int& height) {
  std::vector<COLORREF> pixels;
  Gdiplus::GdiplusStartupInput input;
  ULONG_PTR token = 0;
  if (Gdiplus::GdiplusStartup(&token, &input, nullptr) != Gdiplus::Ok) return pixels;
  Gdiplus::GpBitmap* bitmap = nullptr;
  if (Gdiplus::DllExports::GdipCreateBitmapFromFile(path.c_str(), &bitmap) == Gdiplus::Ok) {
    UINT w = 0, h = 0;
    Gdiplus::DllExports::GdipGetImageWidth(bitmap, &w);
    Gdiplus::DllExports::GdipGetImageHeight(bitmap, &h);
    width = static_cast<int>(w);
    height = static_cast<int>(h);
    for (UINT y = 0; y < h; ++y) {
      for (UINT x = 0; x < w; ++x) {
        Gdiplus::ARGB argb = 0;
        Gdiplus::DllExports::GdipBitmapGetPixel(bitmap, x, y, &argb);
        pixels.push_back(RGB((argb >> 16) & 0xFF, (argb >> 8) & 0xFF, argb & 0xFF));
      }
    }
    Gdiplus::DllExports::GdipDisposeImage(bitmap);
  }
  Gdiplus::GdiplusShutdown(token);
  return pixels;
}

const std::vector<TestStation> kStations = {{"Harbour", 2903, -270, 0, {{0, 4000, 0}, {29, 2000, 1100}}}};

}  // namespace

TEST_CASE("brtide day --png writes the TidesWindow picture of the day") {
  StationFolder folder(kStations);
  const std::wstring png = TempFile(L"brtide_day_picture.png");
  DeleteFileW(png.c_str());
  const ProcessResult run = RunBrtide({"day", "--folder", Narrow(folder.Path()), "--port", "0", "--date",
                                       "2023-06-21", "--png", Narrow(png), "--size", "400x240"});
  CAPTURE(run.err);
  REQUIRE(run.exitCode == 0);
  CHECK(run.out.find("Picture of the day: ") != std::string::npos);
  CHECK(run.out.find("(400 x 240 pixels)") != std::string::npos);
  int width = 0, height = 0;
  const std::vector<COLORREF> written = ReadPng(png, width, height);
  REQUIRE(width == 400);
  REQUIRE(height == 240);

  // The same day drawn by the control directly.
  DllUnderTest dll;
  ITidesDatabase* database = OpenedDatabase(dll, folder.Path());
  ITidesPort* port = PortAt(database, 0);
  database->Release();
  GraphControl graph(dll);
  REQUIRE(graph->SetPort(port) == S_OK);
  REQUIRE(graph->Calculate(1.0, 45098.0) == S_OK);  // 2023-06-21
  Canvas drawn(400, 240);
  REQUIRE(DrawControl(graph.Get(), drawn) == S_OK);
  int differing = 0;
  for (int y = 0; y < 240; ++y)
    for (int x = 0; x < 400; ++x)
      if (written[static_cast<std::size_t>(y) * 400 + x] != drawn.At(x, y)) ++differing;
  CHECK(differing == 0);
  CHECK(drawn.Count(kCurveColour, 0, 0, 400, 240) > 300);
  CHECK(drawn.Count(kDaylightColour, 0, 0, 400, 240) > 10000);

  graph.Release();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
  DeleteFileW(png.c_str());
}

// An empty --png name and the default size are the native brtide suites' (argument parser,
// picture size); here the process's failure to write.
TEST_CASE("brtide day --png: an unwritable file fails with exit status 1") {
  StationFolder folder(kStations);
  const std::string base = Narrow(folder.Path());
  const std::string unwritable = Narrow(TempFile(L"no_such_folder\\deeper\\day.png"));
  const ProcessResult run = RunBrtide({"day", "--folder", base, "--port", "0", "--date", "2023-06-21", "--png", unwritable});
  CHECK(run.exitCode == 1);
  CHECK(run.err.find("cannot write the picture file") != std::string::npos);
}
