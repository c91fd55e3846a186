// brdesk: the tide desk. Interactive by default; with --screenshot it lays out,
// selects the row, writes the whole window to a PNG file and exits.
#include "host/brdesk/DeskWindow.h"

#include <shellapi.h>

#include <cstdio>
#include <sstream>
#include <string>
#include <vector>

namespace {

std::string Narrow(const wchar_t* text) {
  const int n = WideCharToMultiByte(CP_ACP, 0, text, -1, nullptr, 0, nullptr, nullptr);
  std::string out(n > 0 ? n - 1 : 0, '\0');
  if (n > 1) WideCharToMultiByte(CP_ACP, 0, text, -1, &out[0], n, nullptr, nullptr);
  return out;
}

int Fail(const std::string& message, int status = 1) {
  std::fprintf(stderr, "brdesk: %s\n", message.c_str());
  return status;
}

void Pump() {
  MSG message;
  while (PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE)) {
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
}

int Run(const br::brdesk::DeskOptions& options) {
  br::brdesk::DeskWindow desk(options);
  std::string error;
  if (!desk.Create(error)) return Fail(error);
  ShowWindow(desk.Handle(), options.screenshot.empty() ? SW_SHOWDEFAULT : SW_SHOWNOACTIVATE);
  UpdateWindow(desk.Handle());
  if (!desk.LoadPorts(error)) return Fail(error);
  Pump();
  if (options.select > 0 && !desk.SelectRow(options.select)) return Fail("there is no row " + std::to_string(options.select));
  Pump();
  if (!options.screenshot.empty()) {
    std::wstring path(options.screenshot.begin(), options.screenshot.end());
    if (!desk.SaveScreenshot(path, error)) return Fail(error);
    std::printf("%s\n", desk.Status().c_str());
    return 0;
  }
  MSG message;
  while (GetMessageW(&message, nullptr, 0, 0) > 0) {
    // The list's keys first, as an OLE container does; then the dialog keys.
    if (desk.TranslateListKey(message)) continue;
    if (!IsDialogMessageW(desk.Handle(), &message)) {
      TranslateMessage(&message);
      DispatchMessageW(&message);
    }
  }
  return 0;
}

}  // namespace

int WINAPI wWinMain(HINSTANCE, HINSTANCE, PWSTR, int) {
  int count = 0;
  wchar_t** words = CommandLineToArgvW(GetCommandLineW(), &count);
  std::vector<std::string> arguments;
  for (int i = 1; i < count; ++i) arguments.push_back(Narrow(words[i]));
  LocalFree(words);
  br::brdesk::DeskOptions options;
  std::string error;
  if (!br::brdesk::ParseDeskOptions(arguments, options, error)) return Fail(error, 2);
  if (options.help) {
    std::ostringstream usage;
    br::brdesk::WriteDeskUsage(usage);
    std::fputs(usage.str().c_str(), stdout);
    return 0;
  }
  if (FAILED(OleInitialize(nullptr))) return Fail("OLE cannot start");
  const int status = Run(options);
  OleUninitialize();
  return status;
}
