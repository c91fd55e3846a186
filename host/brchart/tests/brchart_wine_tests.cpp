// brchart run as a person runs it: its exit codes, what it prints for a click, and the
// pixels of its picture at known places of the sample harbour.
#include <doctest/doctest.h>

#include <windows.h>
#include <objidl.h>
#include <gdiplus.h>

#include <cstdio>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "host/brchart/chart_plan.h"
#include "host/brchart/chart_scene_file.h"

using namespace br::brchart;

namespace {

const std::string kProgram = "Z:" BRCHART_EXE;

struct Run {
  DWORD exit = 0xFFFF;
  std::string out;
  std::string err;
};

std::string ReadAll(const std::wstring& path) {
  std::ifstream in(path.c_str(), std::ios::binary);
  std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  // The program writes text-mode lines.
  std::string lines;
  for (char c : text)
    if (c != '\r') lines += c;
  return lines;
}

std::wstring Wide(const std::string& text) { return std::wstring(text.begin(), text.end()); }

std::wstring TempPath(const wchar_t* name) {
  wchar_t folder[MAX_PATH];
  GetTempPathW(MAX_PATH, folder);
  return std::wstring(folder) + name;
}

HANDLE Inheritable(const std::wstring& path) {
  SECURITY_ATTRIBUTES sa{sizeof(sa), nullptr, TRUE};
  return CreateFileW(path.c_str(), GENERIC_WRITE, FILE_SHARE_READ, &sa, CREATE_ALWAYS, FILE_ATTRIBUTE_NORMAL, nullptr);
}

Run Brchart(const std::string& arguments) {
  // Files of their own per run: a child that is slow to let go of its handles never
  // stands in the next run's way.
  static int runs = 0;
  const std::wstring stem = L"brchart_test_" + std::to_wstring(GetCurrentProcessId()) + L"_" + std::to_wstring(++runs);
  const std::wstring outPath = TempPath((stem + L"_out.txt").c_str()), errPath = TempPath((stem + L"_err.txt").c_str());
  HANDLE out = Inheritable(outPath), err = Inheritable(errPath);
  REQUIRE(out != INVALID_HANDLE_VALUE);
  REQUIRE(err != INVALID_HANDLE_VALUE);
  STARTUPINFOW start{};
  start.cb = sizeof(start);
  start.dwFlags = STARTF_USESTDHANDLES;
  start.hStdOutput = out;
  start.hStdError = err;
  start.hStdInput = GetStdHandle(STD_INPUT_HANDLE);
  std::wstring line = L"\"" + Wide(kProgram) + L"\" " + Wide(arguments);
  PROCESS_INFORMATION process{};
  const BOOL made = CreateProcessW(nullptr, &line[0], nullptr, nullptr, TRUE, 0, nullptr, nullptr, &start, &process);
  CloseHandle(out);
  CloseHandle(err);
  REQUIRE_MESSAGE(made, "cannot start " << kProgram);
  REQUIRE(WaitForSingleObject(process.hProcess, 120000) == WAIT_OBJECT_0);
  Run run;
  GetExitCodeProcess(process.hProcess, &run.exit);
  CloseHandle(process.hProcess);
  CloseHandle(process.hThread);
  run.out = ReadAll(outPath);
  run.err = ReadAll(errPath);
  DeleteFileW(outPath.c_str());
  DeleteFileW(errPath.c_str());
  return run;
}

std::string Folder() { return FolderOf(kProgram); }

// The sample scene as brchart draws it, to find its features' pixels.
struct Harbour {
  br::chartscene::SceneModel scene;
  ChartDisplay display;
  std::vector<DrawItem> plan;
  Harbour() {
    std::string error;
    REQUIRE_MESSAGE(LoadChartScene(Folder() + "/harbour/harbour.json", Folder() + "/s57", scene, error), error);
    REQUIRE(ChooseDisplay(scene, ChartOptions{}, display, error));
    plan = PlanChart(scene, display);
  }
  br::chartscene::PixelPoint At(const std::string& name) const {
    for (const DrawItem& item : plan)
      if (scene.objects[item.object].name == name) return item.shape.front();
    FAIL("not drawn: " << name);
    return {};
  }
};

class Png {
public:
  explicit Png(const std::wstring& path) {
    Gdiplus::GdiplusStartupInput input;
    Gdiplus::GdiplusStartup(&token_, &input, nullptr);
    bitmap_ = Gdiplus::Bitmap::FromFile(path.c_str());
  }
  ~Png() {
    delete bitmap_;
    Gdiplus::GdiplusShutdown(token_);
  }
  bool Ok() const { return bitmap_ && bitmap_->GetLastStatus() == Gdiplus::Ok; }
  UINT Width() const { return bitmap_->GetWidth(); }
  UINT Height() const { return bitmap_->GetHeight(); }
  Rgb At(int x, int y) const {
    Gdiplus::Color c;
    bitmap_->GetPixel(x, y, &c);
    return Rgb{c.GetR(), c.GetG(), c.GetB()};
  }

private:
  ULONG_PTR token_ = 0;
  Gdiplus::Bitmap* bitmap_ = nullptr;
};

std::string Text(const Rgb& c) {
  char t[16];
  std::snprintf(t, sizeof t, "#%02X%02X%02X", c.red, c.green, c.blue);
  return t;
}

}  // namespace

TEST_CASE("brchart's exit codes: usage, wrong command lines, scenes it cannot use") {
  const Run help = Brchart("--help");
  CHECK(help.exit == kExitOk);
  CHECK(help.out.find("--screenshot FILE") != std::string::npos);

  const Run unknown = Brchart("--selected x");
  CHECK(unknown.exit == kExitUsage);
  CHECK(unknown.err.find("unknown option --selected") != std::string::npos);
  CHECK(Brchart("--select").exit == kExitUsage);

  const Run nobody = Brchart("--select nobody --screenshot Z:/tmp/brchart_nobody.png");
  CHECK(nobody.exit == kExitFailed);
  CHECK(nobody.err.find("the scene has no object nobody") != std::string::npos);
  CHECK(GetFileAttributesW(L"Z:/tmp/brchart_nobody.png") == INVALID_FILE_ATTRIBUTES);
  CHECK(Brchart("--click 12").exit == kExitUsage);

  const std::wstring picture = TempPath(L"brchart_never.png");
  const Run missing = Brchart("--scene Z:/nonexistent/chart.json --screenshot \"" + std::string(picture.begin(), picture.end()) + "\"");
  CHECK(missing.exit == kExitFailed);
  CHECK(missing.err.find("cannot open the scene Z:/nonexistent/chart.json") != std::string::npos);
  CHECK(GetFileAttributesW(picture.c_str()) == INVALID_FILE_ATTRIBUTES);

  const Run projection = Brchart("--projection nowhere --screenshot x.png");
  CHECK(projection.exit == kExitFailed);
  CHECK(projection.err.find("the scene has no projection nowhere") != std::string::npos);

  const Run unwritable = Brchart("--screenshot Z:/nonexistent/folder/chart.png");
  CHECK(unwritable.exit == kExitFailed);
  CHECK_FALSE(unwritable.err.empty());
}

TEST_CASE("a click picks through the host's hit test, what lies on top first") {
  Harbour harbour;
  const auto beacon = harbour.At("fillettes-beacon");
  const Run run = Brchart("--screenshot Z:/tmp/brchart_pick.png --click " + std::to_string(beacon.x) + "," +
                          std::to_string(beacon.y) + " --click 5,5");
  REQUIRE(run.exit == kExitOk);
  // The beacon and its light (symbols) first, then the track over it, the depth area and the meta objects.
  const std::size_t first = run.out.find("  fillettes-beacon BCNLAT Fillettes\n");
  const std::size_t light = run.out.find("  fillettes-light LIGHTS Fillettes light\n");
  const std::size_t depth = run.out.find("  depth-area DEPARE");
  const std::size_t quality = run.out.find("  quality M_QUAL");
  REQUIRE(first != std::string::npos);
  CHECK(first < light);
  CHECK(light < depth);
  CHECK(depth < quality);
  CHECK(run.out.find("kerviniou-buoy") == std::string::npos);
  CHECK(run.out.find(": 10 picked\n") != std::string::npos);
  // The top-left corner lies outside every drawn object: only the chart-wide meta objects.
  const std::size_t corner = run.out.find("click 5,5 ");
  REQUIRE(corner != std::string::npos);
  CHECK(run.out.find(": 6 picked\n", corner) != std::string::npos);
  CHECK(run.out.find("depth-area", corner) == std::string::npos);
  CHECK(run.out.find("wrote Z:/tmp/brchart_pick.png (1554x790)") != std::string::npos);
  // The picks went to BR_Info's object inspector as records: it shows them under the header of
  // their dataset (FR5BR010 in the identity's last 8 bytes), which it has selected.
  CHECK(run.out.find("inspected {00000000-0000-0000-4652-354252303130}\n") != std::string::npos);
  CHECK(run.out.find("no inspector") == std::string::npos);
  // The position of the pixel, from the projection's inverse.
  CHECK(run.out.find("click 5,5 48\xC2\xB0" "22.559'N 004\xC2\xB0" "36.135'W") != std::string::npos);
  DeleteFileW(L"Z:/tmp/brchart_pick.png");
}

TEST_CASE("the picture: the scene's colours at known features, the pick highlighted") {
  Harbour harbour;
  const auto beacon = harbour.At("fillettes-beacon");
  const auto buoy = harbour.At("kerviniou-buoy");
  const auto lighthouse = harbour.At("portzic-tower");
  const std::wstring path = TempPath(L"brchart_picture.png");
  const std::string file(path.begin(), path.end());
  const Run run = Brchart("--screenshot \"" + file + "\" --click " + std::to_string(beacon.x) + "," +
                          std::to_string(beacon.y));
  REQUIRE(run.exit == kExitOk);
  // Every pick is in its tree, the beacon and its light each with the other under it.
  CHECK(run.out.find("tree: * DataSet FR5BR010   BREST\ntree: Beacon, lateral Fillettes\ntree:   Light Fillettes light\n"
                     "tree: Light Fillettes light\ntree:   Beacon, lateral Fillettes\ntree: Recommended track\n") !=
        std::string::npos);
  {
    Png png(path);
    REQUIRE(png.Ok());
    // The chart at its projection's size, the depth panel beside it, the status line under both.
    CHECK(png.Width() == 1024 + 110 + 420);  // and the object inspector
    CHECK(png.Height() == 768 + 22);
    // North of the depth area: the sea (chart colour 28, palette "day" index 5).
    CHECK(Text(png.At(0, 0)) == "#D4EAEE");
    CHECK(Text(png.At(1023, 40)) == "#D4EAEE");
    // Inside the 10-20 m depth area (colour 29, index 4).
    CHECK(Text(png.At(512, 700)) == "#61B7FF");
    CHECK(Text(png.At(900, 150)) == "#61B7FF");
    // The buoy's first colour (green), the beacon's (red), a building square (black).
    CHECK(Text(png.At(buoy.x, buoy.y)) == "#00A000");
    // (Its light's flare stands on the beacon's centre and leans north-east.)
    CHECK(Text(png.At(beacon.x - 2, beacon.y + 2)) == "#DC0000");
    CHECK(Text(png.At(lighthouse.x, lighthouse.y)) == "#000000");
    // The picked beacon has a red ring 10 pixels out.
    CHECK(Text(png.At(beacon.x + 10, beacon.y)) == "#FF0000");
    CHECK(Text(png.At(beacon.x - 10, beacon.y)) == "#FF0000");
    CHECK(Text(png.At(buoy.x + 10, buoy.y)) != "#FF0000");
    // The depth panel (BR_Info's contours view) in the same palette: the shallowest band
    // (colour 21, index 1) at the top, the deep water (28, index 5) at the bottom.
    CHECK(Text(png.At(1024 + 55, 60)) == "#C9EDFC");
    CHECK(Text(png.At(1024 + 55, 700)) == "#D4EAEE");
  }
  // The status line names the position of the click and what it picked; no panel note.
  CHECK(run.out.find("status: 48\xC2\xB0") != std::string::npos);
  CHECK(run.out.find("10 objects: Fillettes (BCNLAT), Fillettes light (LIGHTS)") != std::string::npos);
  CHECK(run.out.find("no depth panel") == std::string::npos);
  // BR_Info's chart legend at that position (the variation grows with the years: its value
  // is the legend suite's to check).
  CHECK(run.out.find("'W   [1:22000, depths Meters, soundings Lowest astronomical tide, WGS 84, "
                     "zone of confidence A2, variation ") != std::string::npos);
  CHECK(run.out.find("no legend") == std::string::npos);
  DeleteFileW(path.c_str());
}

TEST_CASE("--select rings one object by name and names it in the status line") {
  Harbour harbour;
  const auto buoy = harbour.At("kerviniou-buoy");
  const auto beacon = harbour.At("fillettes-beacon");
  const std::wstring path = TempPath(L"brchart_select.png");
  const std::string file(path.begin(), path.end());
  // A click first, then the selection: the selection wins.
  const Run run = Brchart("--click " + std::to_string(beacon.x) + "," + std::to_string(beacon.y) +
                          " --select kerviniou-buoy --screenshot \"" + file + "\"");
  REQUIRE(run.exit == kExitOk);
  CHECK(run.out.find("selected kerviniou-buoy BOYLAT Kerviniou\n") != std::string::npos);
  // The object's own position, the legend there, then the selection.
  const std::size_t status = run.out.find("status: 48\xC2\xB0" "20.520'N 004\xC2\xB0" "35.880'W   [1:22000, ");
  REQUIRE(status != std::string::npos);
  // The inspector chooses it too, and says so.
  CHECK(run.out.find("]   selected: Kerviniou (BOYLAT)   inspected: Kerviniou (BOYLAT)\n", status) != std::string::npos);
  {
    Png png(path);
    REQUIRE(png.Ok());
    CHECK(Text(png.At(buoy.x + 10, buoy.y)) == "#FF0000");
    CHECK(Text(png.At(buoy.x, buoy.y)) == "#00A000");
    CHECK(Text(png.At(beacon.x + 10, beacon.y)) != "#FF0000");  // the click's pick is replaced
  }
  DeleteFileW(path.c_str());
}

TEST_CASE("--select chooses the object in the inspector's tree, with its light under it") {
  const std::wstring path = TempPath(L"brchart_tree.png");
  const std::string file(path.begin(), path.end());
  const Run run = Brchart("--select fillettes-beacon --screenshot \"" + file + "\"");
  REQUIRE(run.exit == kExitOk);
  // The dataset header first, the beacon chosen beside it, its light one level down.
  const std::size_t header = run.out.find("tree: DataSet FR5BR010   BREST\n");
  REQUIRE(header != std::string::npos);
  const std::size_t beacon = run.out.find("\ntree: * Beacon, lateral Fillettes\n", header);
  CHECK(beacon != std::string::npos);
  CHECK(run.out.find("\ntree:   Light Fillettes light\n", beacon) != std::string::npos);
  // The object itself is what the inspector reports chosen, not the header.
  CHECK(run.out.find("inspected {") != std::string::npos);
  CHECK(run.out.find("} fillettes-beacon\n") != std::string::npos);
  CHECK(run.out.find("inspected: Fillettes (BCNLAT)") != std::string::npos);
  {
    // The tree and the details fill the inspector's height: near its foot both still show
    // their white window, not the grey of the window behind a strip at the top.
    Harbour harbour;
    Png png(path);
    REQUIRE(png.Ok());
    const int chartWidth = harbour.display.projection->width, chartHeight = harbour.display.projection->height;
    CHECK(png.Width() == static_cast<UINT>(chartWidth + 110 + 420));
    const int left = chartWidth + 110, foot = chartHeight - 40;
    CHECK(Text(png.At(left + 420 * 35 / 100 / 2, foot)) == "#FFFFFF");
    CHECK(Text(png.At(left + 420 * 35 / 100 + 420 * 65 / 100 / 2, foot)) == "#FFFFFF");
  }
  DeleteFileW(path.c_str());
}

TEST_CASE("--tab brings a details tab forward; a tab the object does not show is refused") {
  const std::wstring path = TempPath(L"brchart_tab.png");
  const std::string file(path.begin(), path.end());
  SUBCASE("the lit beacon's lights") {
    const Run run = Brchart("--select fillettes-beacon --tab Lights --screenshot \"" + file + "\"");
    CHECK(run.exit == kExitOk);
    CHECK(run.err.empty());
  }
  SUBCASE("a buoy without a light has no lights tab") {
    const Run run = Brchart("--select kerviniou-buoy --tab Lights --screenshot \"" + file + "\"");
    CHECK(run.exit == kExitFailed);
    CHECK(run.err == "brchart: the inspector shows no tab Lights\n");
  }
  SUBCASE("the tidal stream diamond is chosen in the tree") {
    const Run run = Brchart("--select goulet-stream --screenshot \"" + file + "\"");
    REQUIRE(run.exit == kExitOk);
    CHECK(run.out.find("\ntree: * Tidal stream panel data Goulet\n") != std::string::npos);
    CHECK(run.out.find("} goulet-stream\n") != std::string::npos);
  }
  DeleteFileW(path.c_str());
}
