// "brtide day ... --png FILE --size WxH": below its title the picture it writes is the
// TidesWindow control's own picture of that day, pixel for pixel; an unwritable file fails;
// on the station's clock the heights are the port's an hour earlier. (Other option errors,
// sizes and the title's text: the native brtide suites.)
#include "tests/wine/common/StationFolder.h"
#include "tests/wine/common/GraphControl.h"
#include "host/brtide/picture_title.h"
#include "host/brtide/tests/brtide_process.h"

#include <doctest/doctest.h>

#include <objidl.h>
#include <gdiplus.h>

#include <string>

using namespace br::test;

TEST_CASE("brtide day --png writes the TidesWindow picture of the day") {
  StationFolder folder({{"Harbour", 2903, -270, 0, {{0, 4000, 0}, {29, 2000, 1100}}}});
  wchar_t temp[MAX_PATH];
  GetTempPathW(MAX_PATH, temp);
  const std::wstring png = std::wstring(temp) + L"brtide_day_picture.png";
  DeleteFileW(png.c_str());
  const std::string pngName(png.begin(), png.end()), folderName(folder.Path().begin(), folder.Path().end());
  const ProcessResult run = RunBrtide({"day", "--folder", folderName, "--port", "0", "--date", "2023-06-21", "--png",
                                       pngName, "--size", "400x240"});
  CAPTURE(run.err);
  REQUIRE(run.exitCode == 0);
  CHECK(run.out.find("(400 x 240 pixels)") != std::string::npos);

  // The same day drawn by the control directly, in the picture below the title.
  const int graphHeight = 240 - br::brtide::kPictureTitleHeight;
  DllUnderTest dll;
  ITidesDatabase* database = OpenedDatabase(dll, folder.Path());
  ITidesPort* port = PortAt(database, 0);
  database->Release();
  GraphControl graph(dll);
  REQUIRE(graph->SetPort(port) == S_OK);
  REQUIRE(graph->Calculate(1.0, 45098.0) == S_OK);  // 2023-06-21
  Canvas drawn(400, graphHeight);
  REQUIRE(DrawControl(graph.Get(), drawn) == S_OK);
  CHECK(drawn.Count(kDaylightColour, 0, 0, 400, graphHeight) > 10000);

  Gdiplus::GdiplusStartupInput input;
  ULONG_PTR token = 0;
  REQUIRE(Gdiplus::GdiplusStartup(&token, &input, nullptr) == Gdiplus::Ok);
  Gdiplus::GpBitmap* bitmap = nullptr;
  REQUIRE(Gdiplus::DllExports::GdipCreateBitmapFromFile(png.c_str(), &bitmap) == Gdiplus::Ok);
  UINT width = 0, height = 0;
  Gdiplus::DllExports::GdipGetImageWidth(bitmap, &width);
  Gdiplus::DllExports::GdipGetImageHeight(bitmap, &height);
  CHECK(width == 400);
  CHECK(height == 240);
  int differing = 0, titleInk = 0;
  for (UINT y = 0; y < 240 && width == 400 && height == 240; ++y) {
    for (UINT x = 0; x < 400; ++x) {
      Gdiplus::ARGB argb = 0;
      Gdiplus::DllExports::GdipBitmapGetPixel(bitmap, x, y, &argb);
      const COLORREF colour = RGB((argb >> 16) & 0xFF, (argb >> 8) & 0xFF, argb & 0xFF);
      if (y < static_cast<UINT>(br::brtide::kPictureTitleHeight)) {
        titleInk += colour != RGB(255, 255, 255);
      } else if (colour != drawn.At(static_cast<int>(x), static_cast<int>(y) - br::brtide::kPictureTitleHeight)) {
        ++differing;
      }
    }
  }
  CHECK(differing == 0);
  CHECK(titleInk > 200);
  Gdiplus::DllExports::GdipDisposeImage(bitmap);
  Gdiplus::GdiplusShutdown(token);

  graph.Release();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
  DeleteFileW(png.c_str());

  // A file it cannot write: exit status 1 and the reason.
  const ProcessResult bad = RunBrtide({"day", "--folder", folderName, "--port", "0", "--date", "2023-06-21", "--png",
                                       pngName + ".missing\\day.png"});
  CHECK(bad.exitCode == 1);
  CHECK(bad.err.find("cannot write the picture file") != std::string::npos);
}

TEST_CASE("brtide day --station-time: the day from the station's midnight, an hour before this computer's") {
  // Zone -1 (UTC+1) with the suite's computer on UTC: the station's 00:00 is 23:00 UTC the day before.
  StationFolder folder({{"Harbour", 2903, -270, -1, {{0, 4000, 0}, {29, 2000, 1100}, {15, 700, 300}}}});
  const std::string folderName(folder.Path().begin(), folder.Path().end());
  const ProcessResult station = RunBrtide({"day", "--folder", folderName, "--port", "0", "--date", "2023-06-21", "--csv",
                                           "--station-time", "--step", "0.5"});
  const ProcessResult before = RunBrtide({"day", "--folder", folderName, "--port", "0", "--date", "2023-06-20", "--csv",
                                          "--step", "0.5"});
  REQUIRE((station.exitCode == 0 && before.exitCode == 0));
  const auto row = [](const std::string& csv, const std::string& time) {
    const std::size_t at = csv.find("\n" + time + ",");
    return at == std::string::npos ? std::string() : csv.substr(at + 1, csv.find('\n', at + 1) - at - 1);
  };
  const std::string first = row(station.out, "2023-06-21T00:00:00+01:00");
  REQUIRE(!first.empty());
  CHECK(first.substr(first.find(',')) == row(before.out, "2023-06-20T23:00:00+00:00").substr(first.find(',')));
  CHECK(station.out.find("+00:00") == std::string::npos);  // every time on the station's clock

  wchar_t temp[MAX_PATH];
  GetTempPathW(MAX_PATH, temp);
  const std::wstring png = std::wstring(temp) + L"brtide_station_time.png";
  const std::string pngName(png.begin(), png.end());
  const ProcessResult picture = RunBrtide({"day", "--folder", folderName, "--port", "0", "--date", "2023-06-21", "--png",
                                           pngName, "--station-time"});
  CHECK(picture.exitCode == 0);
  CHECK(GetFileAttributesW(png.c_str()) != INVALID_FILE_ATTRIBUTES);
  DeleteFileW(png.c_str());
}
