#include "host/brpicture/picture_options.h"

#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <cwchar>

namespace br::brpicture {

namespace {

// A whole decimal number in [low, high], nothing else in the text.
bool WholeNumber(const std::wstring& text, long low, long high, long& value) {
  if (text.empty()) return false;
  wchar_t* end = nullptr;
  errno = 0;
  const long long parsed = std::wcstoll(text.c_str(), &end, 10);
  if (errno != 0 || *end != L'\0' || parsed < low || parsed > high) return false;
  value = static_cast<long>(parsed);
  return true;
}

bool Size(const std::wstring& text, int& width, int& height) {
  const std::wstring::size_type x = text.find_first_of(L"xX");
  long w = 0, h = 0;
  if (x == std::wstring::npos || !WholeNumber(text.substr(0, x), 1, 10000, w) ||
      !WholeNumber(text.substr(x + 1), 1, 10000, h))
    return false;
  width = static_cast<int>(w);
  height = static_cast<int>(h);
  return true;
}

}  // namespace

const char kPictureUsage[] =
    "usage: brpicture FILE [--zoom PERCENT] [--palette 0..4] [--shade -100..100] [--png OUT] [--size WxH]\n"
    "  shows the picture in the XPICREPView control; with --png writes the control's drawing\n"
    "  (the zoomed picture's size unless --size is given) to OUT instead\n";

bool ParsePictureOptions(const std::vector<std::wstring>& args, PictureOptions& options, std::string& error) {
  for (size_t i = 0; i < args.size(); ++i) {
    const std::wstring& arg = args[i];
    if (arg.size() > 2 && arg.compare(0, 2, L"--") == 0) {
      if (i + 1 >= args.size()) {
        error = "an option wants a value";
        return false;
      }
      const std::wstring& value = args[++i];
      long number = 0;
      if (arg == L"--png") {
        options.png = value;
      } else if (arg == L"--zoom") {
        if (!WholeNumber(value, 1, 100000, number)) {
          error = "--zoom wants a percentage from 1 to 100000";
          return false;
        }
        options.zoom = number;
      } else if (arg == L"--palette") {
        if (!WholeNumber(value, 0, 4, number)) {
          error = "--palette wants 0 to 4";
          return false;
        }
        options.palette = static_cast<int>(number);
      } else if (arg == L"--shade") {
        if (!WholeNumber(value, -100, 100, number)) {
          error = "--shade wants a whole number from -100 to 100";
          return false;
        }
        options.shade = static_cast<double>(number);
      } else if (arg == L"--size") {
        if (!Size(value, options.width, options.height)) {
          error = "--size wants WIDTHxHEIGHT, each 1 to 10000";
          return false;
        }
      } else {
        error = "unknown option";
        return false;
      }
    } else if (options.file.empty()) {
      options.file = arg;
    } else {
      error = "one picture file only";
      return false;
    }
  }
  if (options.file.empty()) {
    error = "no picture file";
    return false;
  }
  return true;
}

}  // namespace br::brpicture
