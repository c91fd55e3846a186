// brchart: the chart program's stand-in. Interactive by default; with --screenshot it
// draws the chart (with the objects of the --click pixels picked and highlighted) into a
// PNG file, prints what was picked and exits without showing a window.
#include <windows.h>
#include <shellapi.h>

#include <cstdio>
#include <sstream>
#include <string>
#include <vector>

#include "host/brchart/ChartSession.h"
#include "host/brchart/ChartWindow.h"
#include "host/brchart/chart_options.h"
#include "host/brchart/chart_plan.h"
#include "host/brchart/chart_scene_file.h"
#include "host/brtide/png_file.h"

namespace {

using namespace br::brchart;

std::string Narrow(const wchar_t* text) {
  const int n = WideCharToMultiByte(CP_ACP, 0, text, -1, nullptr, 0, nullptr, nullptr);
  std::string out(n > 0 ? n - 1 : 0, '\0');
  if (n > 1) WideCharToMultiByte(CP_ACP, 0, text, -1, &out[0], n, nullptr, nullptr);
  return out;
}

int Fail(const std::string& message, int status = kExitFailed) {
  std::fprintf(stderr, "brchart: %s\n", message.c_str());
  return status;
}

std::string ProgramFolder() {
  std::vector<wchar_t> path(MAX_PATH);
  for (;;) {
    const DWORD n = GetModuleFileNameW(nullptr, path.data(), static_cast<DWORD>(path.size()));
    if (n == 0) return ".";
    if (n < path.size()) break;
    path.resize(path.size() * 2);
  }
  return FolderOf(Narrow(path.data()));
}

// One line per click, then one per object picked there: "  name ACRONYM label".
void PrintPicks(ChartSession& session, const ChartClick& click) {
  session.Pick(click.x, click.y);
  std::printf("click %ld,%ld %s: %zu picked\n", click.x, click.y, session.PositionAt(click.x, click.y).c_str(),
              session.Picked().size());
  for (std::size_t object : session.Picked())
    std::printf("  %s %s %s\n", session.Scene().objects[object].name.c_str(), AcronymOf(session.Scene(), object).c_str(),
                LabelOf(session.Scene(), object).c_str());
}

int Run(const ChartOptions& options) {
  const std::string folder = ProgramFolder();
  const std::string scenePath = options.scene.empty() ? folder + "\\harbour\\harbour.json" : options.scene;
  const std::string catalogue = options.catalogue.empty() ? folder + "\\s57" : options.catalogue;
  br::chartscene::SceneModel scene;
  std::string error;
  if (!LoadChartScene(scenePath, catalogue, scene, error)) return Fail(error);
  ChartDisplay display;
  if (!ChooseDisplay(scene, options, display, error)) return Fail(error);
  ChartSession session(std::move(scene), display);

  // The host's objects are needed to pick; without them the chart is still drawn.
  const bool hostOpen = session.Host().Open(scenePath, session.Display().projection->name, error);
  if (!hostOpen && !options.clicks.empty()) return Fail(error);

  ChartWindow window(session);
  if (!window.Create(error)) return Fail(error);
  if (!hostOpen) window.SetNote("no picking: " + error);
  for (const ChartClick& click : options.clicks) {
    if (options.screenshot.empty()) window.PickAt(click.x, click.y);
    else PrintPicks(session, click);
  }
  if (!options.screenshot.empty() && !options.clicks.empty())
    window.PickAt(options.clicks.back().x, options.clicks.back().y);
  if (!options.select.empty()) {
    if (!window.SelectNamed(options.select)) return Fail("the scene has no object " + options.select);
    if (!options.screenshot.empty())
      std::printf("selected %s %s %s\n", options.select.c_str(),
                  AcronymOf(session.Scene(), session.Picked().front()).c_str(),
                  LabelOf(session.Scene(), session.Picked().front()).c_str());
  }
  if (!options.tab.empty() && !window.ShowInspectorTab(options.tab))
    return Fail("the inspector shows no tab " + options.tab);
  if (!options.screenshot.empty()) {
    // The window as it would look, never shown: chart, depth panel and status line.
    int width = 0, height = 0;
    const std::vector<std::uint32_t> pixels = window.Pixels(width, height);
    if (pixels.empty()) return Fail("the chart cannot be drawn");
    std::wstring path(options.screenshot.size(), L'\0');
    path.resize(static_cast<std::size_t>(MultiByteToWideChar(CP_ACP, 0, options.screenshot.c_str(),
                                                            static_cast<int>(options.screenshot.size()), &path[0],
                                                            static_cast<int>(path.size()))));
    if (!br::brtide::WritePngFile(path, pixels.data(), width, height, error)) return Fail(error);
    std::printf("wrote %s (%dx%d)\n", options.screenshot.c_str(), width, height);
    std::printf("status: %s\n", window.Status().c_str());
    if (window.HasInspector()) {
      const std::string guid = window.InspectedGuid();
      const std::string name = window.InspectedName();
      std::printf("inspected %s%s%s\n", guid.empty() ? "nothing" : guid.c_str(), name.empty() ? "" : " ", name.c_str());
      for (const std::string& line : window.InspectorTreeLines()) std::printf("tree: %s\n", line.c_str());
    }
    return kExitOk;
  }
  ShowWindow(window.Handle(), SW_SHOWDEFAULT);
  UpdateWindow(window.Handle());
  MSG message;
  while (GetMessageW(&message, nullptr, 0, 0) > 0) {
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
  return kExitOk;
}

}  // namespace

int WINAPI wWinMain(HINSTANCE, HINSTANCE, PWSTR, int) {
  int count = 0;
  wchar_t** words = CommandLineToArgvW(GetCommandLineW(), &count);
  std::vector<std::string> arguments;
  for (int i = 1; i < count; ++i) arguments.push_back(Narrow(words[i]));
  LocalFree(words);
  ChartOptions options;
  std::string error;
  if (!ParseChartOptions(arguments, options, error)) return Fail(error, kExitUsage);
  if (options.help) {
    std::ostringstream usage;
    WriteChartUsage(usage);
    std::fputs(usage.str().c_str(), stdout);
    return kExitOk;
  }
  if (FAILED(OleInitialize(nullptr))) return Fail("OLE cannot start");
  int status = kExitFailed;
  try {
    status = Run(options);
  } catch (const std::exception& e) {
    status = Fail(e.what());
  }
  OleUninitialize();
  return status;
}
