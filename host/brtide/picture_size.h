// The size of the tide graph picture that "brtide day --png FILE [--size WxH]" writes.
// Portable.
#pragma once

#include <string>

namespace br::brtide {

struct PictureSize {
  int width = 600;
  int height = 300;
};

// Smallest and largest side a picture may have, in pixels.
inline constexpr int kPictureMinSide = 64;
inline constexpr int kPictureMaxSide = 8192;

// "WxH" (or "WXH") with whole numbers in kPictureMinSide..kPictureMaxSide; false and a
// one-line message otherwise.
bool ParsePictureSize(const std::string& text, PictureSize& size, std::string& error);

}  // namespace br::brtide
