// brpicture's command line: a picture file and what to do with it.
//   brpicture FILE [--zoom PERCENT] [--palette 0..4] [--shade -100..100] [--png OUT] [--size WxH]
// Without --png the picture is shown in a window; with it the view's drawing is written as PNG.
#pragma once

#include <string>
#include <vector>

namespace br::brpicture {

struct PictureOptions {
  std::wstring file;
  std::wstring png;     // empty: show a window
  long zoom = 100;
  int palette = 0;
  double shade = 0.0;   // the shading of the chosen palette
  int width = 0;        // 0: the zoomed picture's size
  int height = 0;
};

// False with a one-line message for an unknown option, a missing or bad value, or no file.
bool ParsePictureOptions(const std::vector<std::wstring>& args, PictureOptions& options, std::string& error);

extern const char kPictureUsage[];

}  // namespace br::brpicture
