// brtide: tide tables from the command line through the BR_Info library; see --help.
#include <windows.h>
#include <objbase.h>
#include <shellapi.h>

#include <fcntl.h>
#include <io.h>

#include <cstdio>
#include <exception>
#include <iostream>
#include <new>
#include <string>
#include <vector>

#include "host/brtide/brtide_app.h"
#include "host/brtide/requests.h"
#include "host/brtide/wide_text.h"

namespace {

// The arguments as UTF-8, whatever the console's code page.
std::vector<std::string> Utf8Arguments() {
  std::vector<std::string> args;
  int count = 0;
  LPWSTR* wide = CommandLineToArgvW(GetCommandLineW(), &count);
  if (!wide) return args;
  for (int i = 1; i < count; ++i) args.push_back(br::brtide::Utf8FromWide(wide[i], wcslen(wide[i])));
  LocalFree(wide);
  return args;
}

}  // namespace

int main() {
  // Output is UTF-8 with plain line feeds, the same in a console, a pipe or a file.
  SetConsoleOutputCP(CP_UTF8);
  _setmode(_fileno(stdout), _O_BINARY);
  _setmode(_fileno(stderr), _O_BINARY);

  if (FAILED(CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED))) {
    std::cerr << "brtide: COM cannot be initialised\n";
    return br::brtide::kExitFailure;
  }
  int status = br::brtide::kExitFailure;
  try {
    status = br::brtide::RunBrtide(Utf8Arguments(), std::cout, std::cerr);
  } catch (const std::bad_alloc&) {
    std::cerr << "brtide: out of memory\n";
  } catch (const std::exception& e) {
    std::cerr << "brtide: " << e.what() << '\n';
  }
  std::cout.flush();
  CoUninitialize();
  return status;
}
